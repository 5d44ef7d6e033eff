"""Somebody who settles the conflicts of real merges with ovrin."""

import subprocess

from systems import System

DONE, LEFT_OPEN, FAILED = 0, 1, 2


class User(System):
    """Somebody who has called "ovrin setup", and works in git unless told otherwise."""

    name = "scene.ovrin"

    def git(self, *arguments, fails=False, **environment):
        return self.run("git", *arguments, fails=fails, **environment)

    def start(self):
        self.git("init", "-qb", "main", ".")
        self.git("config", "--global", "user.name", "Tester")
        self.git("config", "--global", "user.email", "tester@example.org")
        self.run("ovrin", "setup")
        self.run("ovrin", "setup", "--local")
        self.commit("words\n", "readme")

    def commit(self, text, name=None):
        self.write(text, name)
        self.git("add", "--", "./" + (name or self.name))
        self.git("commit", "-qm", "change")

    def sides(self, base, theirs, ours, name=None):
        self.start()
        if base is not None:
            self.commit(base, name)
        self.git("checkout", "-qb", "topic")
        self.commit(theirs, name)
        self.git("checkout", "-q", "main")
        self.commit(ours, name)

    def conflict(self, base, theirs, ours, name=None):
        self.sides(base, theirs, ours, name)
        self.git("merge", "topic", fails=True)

    def conflicts(self, scenes):
        """A merge of several scenes: base, theirs and ours of each name."""
        self.start()
        for side, branch in enumerate((("main",), ("-b", "topic"), ("main",))):
            self.git("checkout", "-q", *branch)
            for name, versions in scenes.items():
                self.write(versions[side], name)
            self.git("add", ".")
            self.git("commit", "-qm", "change")
        self.git("merge", "topic", fails=True)

    def ovrin(self, *arguments, status=DONE, **environment):
        """What it prints; what it says besides is in `words`. With "status" as None it may end in any way."""
        with self.log.open("w", encoding="utf-8") as errors:
            done = subprocess.run(["ovrin", *arguments], cwd=self.here, env=self.environment | environment,
                                  stdin=subprocess.DEVNULL, stdout=subprocess.PIPE, stderr=errors, check=False)
        assert status in (None, done.returncode), f"{arguments}\n{done.stdout.decode()}\n{self.words()}"
        return done.stdout.decode()

    def words(self):
        return self.log.read_text(encoding="utf-8")

    def committed(self, name=None):
        return self.git("show", f"HEAD:{name or self.name}")

    def records(self):
        return sorted(path.suffix for path in (self.here / ".git/ovrin").glob("*.*"))
