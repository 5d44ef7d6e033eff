"""Breaks what ovrin doctor looks at, each in its own way, and sees it found and cured.

    pytest-3 VersionControl/test_doctor.py --installed build/release/installed
"""

import json
import os
import pathlib
import shutil
import subprocess
import tempfile
import time

import pytest

from systems import System
from test_systems import HEADER, ONE_CONFLICT, scene

POINTER = "version https://git-lfs.github.com/spec/v1\noid sha256:0\nsize 1\n"
OLD_INCLUDE = "/usr/share/ovrinmerge/gitconfig"


class User(System):
    def doctor(self, *options, status=None, **environment):
        """What each check found, by its code: the state, the text and the cure."""
        done = subprocess.run(["ovrin", "doctor", "--json", *options], cwd=self.here,
                              env=self.environment | environment, stdout=subprocess.PIPE, check=False)
        assert status in (None, done.returncode), done.stdout.decode()
        return {check.pop("code"): check for check in json.loads(done.stdout)["checks"]}

    def state(self, code, *options, **environment):
        return self.doctor(*options, **environment)[code]["state"]

    def git(self, *arguments):
        return self.run("git", *arguments)

    def commit(self, text, name=None):
        self.write(text, name)
        self.git("add", "-A")
        self.git("commit", "-qm", "change")


@pytest.fixture(name="bare")
def fixture_bare(request):
    """A user without anything, in a folder that is no repository."""
    installed = pathlib.Path(request.config.getoption("--installed")).resolve()
    with tempfile.TemporaryDirectory() as folder:
        user = User(installed, pathlib.Path(folder))
        user.fake("kdiff3", "exit 1")
        yield user


@pytest.fixture(name="user")
def fixture_user(bare):
    """The same in a repository with a scene, and all set up."""
    bare.git("init", "-qb", "main", ".")
    for name, value in (("user.name", "Tester"), ("user.email", "tester@example.org")):
        bare.git("config", "--global", name, value)
    bare.run("ovrin", "setup")
    bare.commit(scene("1 Lantern 1"))
    return bare


def test_what_is_set_up_is_healthy(user):
    found = user.doctor(status=0)
    assert {check["state"] for check in found.values()} <= {"ok", "note"}
    lines = user.run("ovrin", "doctor").splitlines()
    assert [line.split()[1].rstrip(":") for line in lines] == list(found)


def test_a_machine_without_anything_is_not_ill(bare):
    found = bare.doctor(status=0)
    assert found["git-driver"]["state"] == "note" and "ovrin setup git" in found["git-driver"]["cure"]
    assert found["line-ends"]["state"] == "skipped"


def unset_driver(user):
    user.run("ovrin", "setup", "--undo")
    user.write("*.ovrin merge=ovrin\n", ".gitattributes")


def old_driver(user):
    user.git("config", "--global", "merge.ovrin.driver", "ovrinmerge-vcs merge %O %A %B %A %P")


def local_driver(user):
    user.git("config", "merge.ovrin.driver", "/path/to/OvrinMerge merge --force --fallback none %O %B %A %A")


def unset_attributes(user):
    (user.home / ".config/git/attributes").unlink()


def vanished_program(user):
    user.run("ovrin", "setup", "git", "--program", "/nowhere/ovrin")


def old_include(user):
    user.git("config", "--global", "--add", "include.path", OLD_INCLUDE)


def automatic_line_ends(user):
    user.git("config", "--global", "core.autocrlf", "true")
    unset_attributes(user)


def old_mercurial(user):
    (user.home / ".hgrc").write_text("[merge-tools]\novrin.args = ovrinmerge-vcs merge $base $local\n")


def vanished_mercurial(user):
    user.run("ovrin", "setup", "hg", "--program", "/nowhere/ovrin")


def old_subversion(user):
    (user.home / ".subversion/config").write_text("[helpers]\nmerge-tool-cmd = ovrinmerge-vcs\n")


@pytest.mark.parametrize("break_it,code,word", [
    (unset_driver, "git-driver", "merges them by lines and says nothing"), (old_driver, "git-driver", "another driver"),
    (local_driver, "git-driver", "another driver"), (unset_attributes, "git-attributes", "by lines"),
    (vanished_program, "git-path", "/nowhere/ovrin"), (old_include, "old-setup", OLD_INCLUDE),
    (automatic_line_ends, "line-ends", "line ends of"), (old_mercurial, "mercurial", "ovrinmerge-vcs"),
    (vanished_mercurial, "mercurial", "/nowhere/ovrin"), (old_subversion, "subversion", "ovrinmerge-vcs")])
def test_what_set_up_cures_is_found_and_fixed(user, break_it, code, word):
    break_it(user)
    found = user.doctor(status=1)[code]
    assert found["state"] == "problem" and word in found["text"] and found["cure"]
    done = user.doctor("--fix", status=0)
    assert "fixed" in [check["state"] for check in done.values()]
    assert user.state(code) == "ok"
    user.doctor(status=0)


def test_old_lines_are_told_with_a_cure_for_each(user):
    user.git("config", "--global", "mergetool.ovrinsettle.cmd", "ovrinmerge-vcs settle \"$BASE\"")
    found = user.doctor(status=1)["old-setup"]
    assert "mergetool.ovrinsettle.cmd" in found["text"]
    user.run("sh", "-c", found["cure"])
    assert user.state("old-setup") == "ok"


def test_attributes_of_somebody_else_are_told_and_kept(user):
    user.commit("*.ovrin merge=theirs\n", ".gitattributes")
    found = user.doctor("--fix", status=1)["git-attributes"]
    assert "theirs" in found["text"] and user.name in found["text"]
    user.run("ovrin", "setup", "git", "--local")
    assert user.state("git-attributes") == "ok"


@pytest.mark.parametrize("version,state", [("1.8.3.1", "problem"), ("2.37.9", "problem"), ("2.39.2 (Any)", "note"), ("2.50.0", "ok")])
def test_an_old_git_is_told_with_what_it_lacks(user, version, state):
    git = shutil.which("git", path=user.bare_path)
    user.fake("git", f'[ "$1" = --version ] && echo "git version {version}" || exec {git} "$@"')
    assert user.state("git-version") == state


def test_a_program_that_only_the_shell_finds_is_told(user):
    user.run("ovrin", "setup", "git", "--program", "ovrin")
    assert user.state("git-path") == "note"


def test_the_guard_is_missed_and_told_where_git_passes_it_over(user):
    assert user.state("guard") == "note"
    user.run("ovrin", "setup", "--local")
    assert user.state("guard") == "ok"
    hook = user.here / ".git/hooks/pre-commit"
    hook.chmod(0o644)
    found = user.doctor(status=1)["guard"]
    user.run("sh", "-c", found["cure"])
    assert user.state("guard") == "ok"
    hook.write_text("#!/bin/sh\nexec pre-commit hook-impl\n")
    assert user.state("guard") == "note"
    user.write("- id: ovrin-guard\n", ".pre-commit-config.yaml")
    assert user.state("guard") == "ok"


def test_line_ends_that_attributes_ask_for_are_told(user):
    user.write("* text eol=crlf\n", ".gitattributes")
    assert user.state("line-ends", "--fix") == "problem"
    user.write("* text eol=crlf\n*.ovrin -text\n", ".gitattributes")
    assert user.state("line-ends") == "ok"
    user.write(scene("1 Lantern 1").replace("\n", "\r\n"))
    assert user.state("line-ends") == "problem"


def test_scenes_in_lfs_are_told(user):
    user.write(POINTER)
    assert user.state("lfs") == "problem"
    user.write(scene("1 Lantern 1"))
    assert user.state("lfs") == "ok"
    user.write("*.ovrin filter=lfs\n", ".gitattributes")
    assert user.state("lfs") == "problem"


def test_scenes_of_another_tag_authority_are_told(user):
    user.write(scene("1 Lantern 1").replace("ovrin.dev", "example.org"))
    found = user.doctor(status=1)["tag-authority"]
    assert found["state"] == "problem" and "-DOVRIN_TAG_AUTHORITY=example.org" in found["cure"]
    user.write(HEADER)
    assert user.state("tag-authority") == "ok"


def test_merge_tools_that_are_not_there_are_told(user):
    user.use_tool("")
    assert "/nowhere/tool" in user.doctor(status=1)["merge-tools"]["text"]
    user.use_tool("exit 0")
    assert user.state("merge-tools") == "ok"
    (user.home / ".mergespecfile.txt").write_text("")
    assert user.state("merge-tools") == "problem"


@pytest.fixture(name="forgotten")
def fixture_forgotten():
    """Files as OvrinMerge leaves them, three hours old."""
    files = []
    for letter in "abc":
        descriptor, name = tempfile.mkstemp(prefix="MERGE", dir="/tmp")
        os.close(descriptor)
        target = f"/tmp/MERGE{letter}{os.getpid() % 100000:05d}"
        os.rename(name, target)
        os.utime(target, (time.time() - 3 * 3600,) * 2)
        files.append(target)
    yield files
    for name in files:
        pathlib.Path(name).unlink(missing_ok=True)


def test_forgotten_files_are_removed_unless_somebody_has_them(user, forgotten):
    gone, held, young = forgotten
    os.utime(young)
    with open(held, encoding="utf-8"):
        assert user.state("temporary-files") == "problem"
        assert user.state("temporary-files", "--fix") == "fixed"
        assert [os.path.exists(name) for name in (gone, held, young)] == [False, True, True]
        assert user.state("temporary-files") == "ok"


def test_open_conflicts_are_told(user):
    _, theirs, ours = ONE_CONFLICT
    user.git("checkout", "-qb", "theirs")
    user.commit(theirs)
    user.git("checkout", "-q", "main")
    user.commit(ours)
    user.run("git", "merge", "theirs", fails=True)
    found = user.doctor(status=1)["open-conflicts"]
    assert found["state"] == "problem" and user.name in found["text"]
    user.git("merge", "--abort")
    assert user.state("open-conflicts", "--fix") in ("ok", "fixed")


@pytest.mark.parametrize("system,create", [("hg", ["hg", "init", "."]), ("svn", ["sh", "-c", (
    'svnadmin create "$HOME/r" && svn checkout -q "file://$HOME/r" .')])])
def test_a_repository_of_another_system_is_looked_at(bare, system, create):
    if not shutil.which(system):
        pytest.skip(f"{system} is not installed")
    code = {"hg": "mercurial", "svn": "subversion"}[system]
    bare.run(*create)
    bare.write(scene("1 Lantern 1"))
    bare.run(system, "add", bare.name)
    assert bare.state(code) == "problem"
    assert bare.state(code, "--fix") == "fixed"
    assert bare.state(code) == "ok"
    other = {"hg": "HGMERGE", "svn": "SVN_MERGE"}[system]
    assert bare.state(code, **{other: "mine"}) == "problem"


def test_what_cannot_be_looked_at_is_no_health(user):
    git = shutil.which("git", path=user.bare_path)
    user.fake("git", f'[ "$1" = --version ] && exit 3 || exec {git} "$@"')
    assert user.doctor(status=2)["git-version"]["state"] == "unknown"
    assert user.doctor("--fix", status=2, HOME="")["subversion"]["state"] == "unknown"
