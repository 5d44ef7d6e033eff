"""Version control systems as the facts in this folder need them, all through the same few methods."""

import os
import shutil
import subprocess

SECONDS_TO_END = 60


def can_mount():
    return shutil.which("unshare") and subprocess.run(
        ["unshare", "-rm", "mount", "-t", "tmpfs", "none", "/mnt"], stderr=subprocess.DEVNULL, check=False).returncode == 0


def has_terminals():
    return shutil.which("script") and subprocess.run(
        ["script", "-qc", "true", "/dev/null"], stdin=subprocess.DEVNULL, stdout=subprocess.DEVNULL,
        stderr=subprocess.DEVNULL, check=False).returncode == 0


class System:
    """A repository in a folder, and the user who works on a scene in it."""

    name = "the scene's $x.ovrin"
    driver = "ovrin"

    def __init__(self, installed, folder):
        self.home = folder / "home"
        self.here = folder / "here"
        self.fakes = folder / "fakes"
        self.log = folder / "log"
        for made in (self.home, self.here, self.fakes):
            made.mkdir()
        foreign = ("XDG_CONFIG_HOME", "GIT_DIR", "GIT_WORK_TREE", "GIT_EXTERNAL_DIFF", "HGMERGE", "SVN_MERGE")
        self.environment = {name: value for name, value in os.environ.items() if name not in foreign}
        self.bare_path = self.environment["PATH"]
        self.environment |= {"HOME": str(self.home), "GIT_CONFIG_NOSYSTEM": "1", "EDITOR": "false", "LC_ALL": "C.UTF-8",
                             "PATH": f"{self.fakes}:{installed}/bin:{self.bare_path}"}

    def run(self, *command, fails=False, answer="", **environment):
        """What the command prints. It must fail or succeed as told; with "fails" as None it may do either."""
        # A tool that wants to talk to a person finds no terminal, and nothing that it could take for one.
        with self.log.open("w", encoding="utf-8") as errors:
            done = subprocess.run(command, cwd=self.here, env=self.environment | environment, input=answer,
                                  stdout=subprocess.PIPE, stderr=errors, text=True, start_new_session=True,
                                  timeout=SECONDS_TO_END, check=False)
        failed = done.returncode != 0
        assert fails in (None, failed), f"{command}\n{done.stdout}\n{self.log.read_text(encoding='utf-8')}"
        return done.stdout

    @property
    def report(self):
        """What the last command said besides its results."""
        return self.log.read_text(encoding="utf-8")

    def write(self, text, name=None):
        (self.here / (name or self.name)).write_text(text, encoding="utf-8")

    def read(self, name=None):
        return (self.here / (name or self.name)).read_text(encoding="utf-8")

    def exists(self, name):
        return (self.here / name).exists()

    def fake(self, program, script):
        """Puts a script in the place of a program."""
        (self.fakes / program).write_text(f"#!/bin/sh\n{script}\n", encoding="utf-8")
        (self.fakes / program).chmod(0o755)

    def use_tool(self, script):
        """Makes a script the merge tool; its $1, $2, $3 and $4 are base, left, right and result."""
        command = f"\"/bin/sh\" -c '{script}' tool" if script else '"/nowhere/tool"'
        line = f'* use {command} "%b" "%l" "%r" "%d"\n'
        (self.home / ".mergespecfile.txt").write_text(line, encoding="utf-8")

    def set_up(self):
        """As a user does it; the program is called by a name that may be that of a fake."""
        self.run("ovrin", "setup", self.command, "--program", "ovrin")

    def merge_with(self, failure):
        """Merges where the program that version control calls is what the failure tells."""
        if failure is None:
            self.merge(fails=True, PATH=self.bare_path)
        else:
            self.fake(self.driver, failure)
            self.merge(fails=True)
            (self.fakes / self.driver).unlink()


class Git(System):
    program = command = "git"

    def start(self):
        self.run("git", "init", "-qb", "main", ".")
        for name, value in (("user.name", "Tester"), ("user.email", "tester@example.org")):
            self.run("git", "config", "--global", "--add", name, value)
        self.set_up()
        self.commit("empty", "readme")

    def commit(self, text, name=None):
        self.write(text, name)
        self.run("git", "add", name or self.name)
        self.run("git", "commit", "-qm", "change")

    def sides(self, base, theirs, ours, name=None):
        """Commits the three, where there is a base; theirs is on a branch of that name, ours on main."""
        self.start()
        if base is not None:
            self.commit(base, name)
        self.run("git", "checkout", "-qb", "theirs")
        self.commit(theirs, name)
        self.run("git", "checkout", "-q", "main")
        self.commit(ours, name)

    def merge(self, fails=False, **environment):
        return self.run("git", "merge", "theirs", fails=fails, **environment)

    def is_open(self):
        return self.run("git", "ls-files", "--unmerged", self.name) != ""

    def versions(self):
        """Base, theirs and ours of an open file, as the system keeps them; without a base the other two."""
        listed = self.run("git", "ls-files", "--unmerged", self.name)
        stages = [stage for stage in (1, 3, 2) if f" {stage}\t" in listed]
        return tuple(self.run("git", "show", f":{stage}:{self.name}") for stage in stages)

    def merge_with_tool(self, fails=False):
        self.merge(fails=True)
        self.mergetool("ovrin-external", fails)

    def mergetool(self, tool, fails):
        before = self.read()
        self.run("git", "mergetool", "--no-prompt", "--tool", tool, fails=fails, answer="n\n")
        assert not fails or self.read() == before

    def conclude(self, fails=False):
        """Commits what git didn't commit by itself."""
        self.run("git", "commit", "--allow-empty", "-qm", "merged", fails=fails)
        assert self.run("git", "rev-list", "--count", "--merges", "HEAD") == ("0\n" if fails else "1\n")

    def abort(self):
        self.run("git", "merge", "--abort")


class Mercurial(System):
    program = command = "hg"

    def start(self):
        self.run("hg", "init", ".")
        (self.home / ".hgrc").write_text("[ui]\nusername = Tester\n", encoding="utf-8")
        self.set_up()
        self.commit("empty", "readme")

    def commit(self, text, name=None):
        self.write(text, name)
        self.run("hg", "commit", "-qA", "-m", "change", "--", f"path:{name or self.name}")

    def sides(self, base, theirs, ours, name=None):
        self.start()
        self.revisions = ("1",)
        if base is not None:
            self.commit(base, name)
            self.revisions = ("1", "2")
        fork = self.run("hg", "identify", "--num").strip()
        self.commit(theirs, name)
        self.run("hg", "update", "-q", fork)
        self.commit(ours, name)

    def merge(self, fails=False, **environment):
        return self.run("hg", "merge", fails=fails, **environment)

    def is_open(self):
        listed = self.run("hg", "resolve", "--list")
        assert listed in (f"U {self.name}\n", f"R {self.name}\n")
        return listed.startswith("U")

    def versions(self):
        committed = (self.run("hg", "cat", "-r", revision, "--", f"path:{self.name}") for revision in self.revisions)
        return (*committed, self.read(f"{self.name}.orig"))

    def conclude(self, fails=False):
        self.run("hg", "commit", "-m", "merged", fails=fails)

    def abort(self):
        self.run("hg", "update", "-qC", ".")


class Subversion(System):
    """Merges by lines and comes to us with what is left. Objects that both sides add at the end are that."""

    program = "svnadmin"
    command = "svn"
    driver = "ovrin-svn"

    def start(self):
        self.repository = f"file://{self.home}/repository"
        self.run("svnadmin", "create", f"{self.home}/repository")
        self.run("svn", "checkout", "-q", self.repository, ".")
        self.set_up()  # the checkout wrote a configuration of the usual sections

    def commit(self, text):
        self.write(text)
        self.run("svn", "commit", "-qm", "change")

    def sides(self, base, theirs, ours):
        """Theirs is committed, ours stands in the working copy."""
        self.start()
        self.write(base)
        self.run("svn", "add", "-q", "--", self.name)
        self.commit(base)
        self.commit(theirs)
        self.run("svn", "update", "-qr", "1")
        self.write(ours)

    def merge(self, fails=None, **environment):
        """Its status tells nothing."""
        del fails
        # Without a terminal no tool is called, unless Subversion is told to act as if at one.
        command = "svn", "update", "--force-interactive", "--accept", "launch"
        return self.run(*command, fails=None, **environment)

    def is_open(self):
        return self.run("svn", "status", "--", self.name).startswith("C ")

    def versions(self):
        return tuple(self.read(f"{self.name}.{name}") for name in ("r1", "r2", "mine"))

    def conclude(self):
        self.run("svn", "commit", "-qm", "merged")
