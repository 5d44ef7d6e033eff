"""Previews merges with ovrin preview, and sees whether git merge then meets what was told.

    pytest-3 VersionControl/test_preview.py --installed build/release/installed
"""

import json
import os
import pathlib
import shutil
import subprocess
import tempfile

import pytest

from systems import System
from test_systems import scene


def different(mark, words="1 Lantern 1"):
    """A scene that git takes for no other one's new name."""
    return scene(words, "".join(f"  {mark}{number}: {mark}\n" for number in range(20)))


LINK = object()
A, B = different("a"), different("b")
LAYER, NAME, OTHER_LAYER = (different("a", words) for words in ("2 Lantern 1", "1 Lamp 1", "5 Lantern 1"))
ODD = "-o\"d'd\n\t\\ ~ä*?[1].ovrin"

# Base, theirs and ours as files, and the scenes that would conflict.
HISTORIES = {
    "nothing in common": ({"a.ovrin": A, "b.ovrin": B}, {"a.ovrin": LAYER}, {"b.ovrin": different("b", "2 x 1")}, []),
    "other fields": ({"a.ovrin": A}, {"a.ovrin": LAYER}, {"a.ovrin": NAME}, []),
    "the same change": ({"a.ovrin": A}, {"a.ovrin": LAYER}, {"a.ovrin": LAYER}, []),
    "one field": ({"a.ovrin": A}, {"a.ovrin": LAYER}, {"a.ovrin": OTHER_LAYER}, ["a.ovrin"]),
    "another extension": ({"a.prefab": A}, {"a.prefab": LAYER}, {"a.prefab": OTHER_LAYER}, ["a.prefab"]),
    "odd name": ({ODD: A}, {ODD: LAYER}, {ODD: OTHER_LAYER}, [ODD]),
    "renamed by ours": ({"a.ovrin": A}, {"a.ovrin": LAYER}, {"a.ovrin": None, "c.ovrin": OTHER_LAYER}, ["c.ovrin"]),
    "renamed by theirs": ({"a.ovrin": A}, {"a.ovrin": None, "c.ovrin": LAYER}, {"a.ovrin": NAME}, []),
    "renamed folder": ({"d/a.ovrin": A}, {"d/a.ovrin": None, "e/a.ovrin": LAYER}, {"d/a.ovrin": OTHER_LAYER},
                       ["e/a.ovrin"]),
    "added into a renamed folder": ({"d/a.ovrin": A}, {"d/a.ovrin": None, "e/a.ovrin": A}, {"d/b.ovrin": B},
                                    ["e/b.ovrin"]),
    "renamed differently": ({"a.ovrin": A}, {"a.ovrin": None, "t.ovrin": A}, {"a.ovrin": None, "o.ovrin": A},
                            ["o.ovrin"]),
    "renamed to one name": ({"a.ovrin": A, "b.ovrin": B}, {"a.ovrin": None, "c.ovrin": A},
                            {"b.ovrin": None, "c.ovrin": B}, ["c.ovrin"]),
    "added by both": ({"b.ovrin": B}, {"a.ovrin": LAYER}, {"a.ovrin": NAME}, ["a.ovrin"]),
    "added by both, the same": ({"b.ovrin": B}, {"a.ovrin": A}, {"a.ovrin": A}, []),
    "removed by ours": ({"a.ovrin": A, "b.ovrin": B}, {"a.ovrin": LAYER}, {"a.ovrin": None}, ["a.ovrin"]),
    "removed by theirs": ({"a.ovrin": A, "b.ovrin": B}, {"a.ovrin": None}, {"a.ovrin": LAYER}, ["a.ovrin"]),
    "removed and renamed": ({"a.ovrin": A}, {"a.ovrin": None, "c.ovrin": A}, {"a.ovrin": None, "b.ovrin": B},
                            ["c.ovrin"]),
    "folder of its name": ({"b.ovrin": B}, {"a.ovrin/b.txt": "b"}, {"a.ovrin": A}, ["a.ovrin"]),
    "link of its name": ({"a.ovrin": A}, {"a.ovrin": LINK}, {"a.ovrin": LAYER}, ["a.ovrin"]),
    "only others": ({"a.ovrin": A, "c": "1\n"}, {"c": "2\n"}, {"c": "3\n"}, []),
}


class Git(System):
    """A repository whose commits are sets of files, and a temporary directory of its own."""

    def __init__(self, installed, folder):
        super().__init__(installed, folder)
        self.scratch = folder / "a: \"temporary\" folder"
        self.scratch.mkdir()
        self.environment["TMPDIR"] = str(self.scratch)
        for name, value in (("user.name", "Tester"), ("user.email", "tester@example.org")):
            self.run("git", "config", "--global", name, value)

    def commit(self, files):
        for name, content in files.items():
            path = self.here / name
            path.parent.mkdir(parents=True, exist_ok=True)
            if path.is_symlink() or content is None:
                path.unlink()
            if content is LINK:
                path.unlink()
                path.symlink_to("elsewhere")
            elif content is not None:
                path.write_text(content, encoding="utf-8")
        self.run("git", "add", "--all", ".")
        self.run("git", "commit", "-qm", "change")

    def sides(self, base, theirs, ours, *_):
        self.run("git", "init", "-qb", "main", ".")
        self.commit(base)
        self.run("git", "checkout", "-qb", "theirs")
        self.commit(theirs)
        self.run("git", "checkout", "-q", "main")
        self.commit(ours)

    def preview(self, *arguments, status, folder="."):
        """The exact status counts. What was told on standard error is in `words`."""
        done = subprocess.run(("ovrin", "preview", *arguments), cwd=self.here / folder, env=self.environment, text=True,
                              capture_output=True, timeout=60, check=False)
        self.words = done.stderr
        assert done.returncode == status, f"{done.returncode}\n{done.stdout}\n{done.stderr}"
        assert not list(self.scratch.iterdir())
        return done.stdout

    def answer(self, *arguments, status, folder="."):
        return json.loads(self.preview(*arguments, "--json", status=status, folder=folder))

    def clone_of(self, depth):
        """Goes on in a shallow clone of all branches."""
        clone = self.home / "clone"
        self.run("git", "clone", "-q", "--depth", depth, "--no-single-branch", f"file://{self.here}", str(clone))
        self.here = clone

    def everything(self):
        """Bytes and times of all files. Objects that git finds to be there already get a new time."""
        paths = [path for path in self.here.rglob("*") if path.is_symlink() or path.is_file()]
        return {path: (os.readlink(path) if path.is_symlink() else path.read_bytes(),
                       "objects" not in path.parts and path.lstat().st_mtime_ns) for path in paths}

    def unmerged(self):
        listed = self.run("git", "ls-files", "--unmerged", "-z").split("\0")[:-1]
        return {entry.partition("\t")[2] for entry in listed}


@pytest.fixture(name="git")
def fixture_git(request):
    installed = pathlib.Path(request.config.getoption("--installed")).resolve()
    with tempfile.TemporaryDirectory() as folder:
        git = Git(installed, pathlib.Path(folder))
        git.run("ovrin", "setup", "git")
        yield git


def conflicting(answer):
    return [told["path"] for told in answer["scenes"] if told["verdict"] == "conflicts"]


@pytest.mark.parametrize("name", HISTORIES)
def test_merge_meets_what_was_told_and_preview_touches_nothing(git, name):
    git.sides(*HISTORIES[name])
    expected = HISTORIES[name][3]
    before = git.everything()
    answer = git.answer("theirs", status=1 if expected else 0)
    assert git.everything() == before
    assert conflicting(answer) == expected and answer["sum"]["unknown"] == 0
    git.run("git", "merge", "-q", "theirs", fails=None)
    scenes = {path.removesuffix("~HEAD").removesuffix("~theirs") for path in git.unmerged()} - {"c"}
    if name == "renamed differently":
        assert scenes == {"a.ovrin", "t.ovrin", "o.ovrin"}
    else:
        assert scenes == set(expected)


@pytest.mark.parametrize("layer,expected", [("1", []), ("6", ["a.ovrin"])])
def test_several_merge_bases_are_merged_as_git_does(git, layer, expected):
    git.sides({"a.ovrin": A}, {"a.ovrin": LAYER}, {"a.ovrin": different("a", "1 Lantern 3")})
    git.run("git", "branch", "old")
    git.run("git", "merge", "-q", "--no-edit", "theirs")
    git.commit({"a.ovrin": different("a", f"{layer} Lantern 3")})
    git.run("git", "checkout", "-q", "theirs")
    git.run("git", "merge", "-q", "--no-edit", "old")
    git.commit({"a.ovrin": different("a", "4 Lantern 3")})
    assert git.run("git", "merge-base", "--all", "main", "theirs").count("\n") == 2
    answer = git.answer("main", status=1 if expected else 0)
    git.run("git", "merge", "-q", "main", fails=None)
    assert set(conflicting(answer)) == git.unmerged() == set(expected)


def test_report_names_objects_and_sides(git):
    git.sides({"a.ovrin": A}, {"a.ovrin": LAYER}, {"a.ovrin": OTHER_LAYER})
    told = git.preview("theirs", status=1)
    assert told.startswith("a.ovrin: 1 conflict\n    Lantern (10)\n      m_Layer: both changed it\n")
    assert told.endswith("\n\n1 scene changed on both sides, 1 would conflict: a.ovrin\n") and git.words == ""
    conflict = git.answer("theirs", status=1)["scenes"][0]["conflicts"][0]
    assert conflict["path"] == "10.GameObject.m_Layer" and conflict["object"]["name"] == "Lantern"
    assert [conflict[side]["value"] for side in ("base", "ours", "theirs")] == ["1", "5", "2"]
    assert "### Merging ` theirs ` into ` main `: 1 of 1 scene " in git.preview("theirs", "--markdown", status=1)


def test_joined_parts_are_the_whole(git):
    names = [f"{number}.ovrin" for number in range(12)]
    git.sides(*({name: different(name, words) for name in names} for words in ("1 L 1", "2 L 1", "3 L 1")))
    files = [git.home / f"part {part}" for part in (3, 1, 2)]
    for file in files:
        file.write_text(git.preview("theirs", "--part", f"{file.name[-1]}/3", "--json", status=1))
        assert len(json.loads(file.read_text())["scenes"]) == 4
    for form in ([], ["--json"], ["--markdown"]):
        assert git.preview("--join", *map(str, files), *form, status=1) == git.preview("theirs", *form, status=1)
    git.preview("--join", *map(str, files[:2]), status=2)
    assert "there is no 2" in git.words
    git.preview("--join", str(files[0]), *map(str, files), status=2)
    assert "more than once" in git.words
    git.commit({"another": ""})
    files[0].write_text(git.preview("theirs", "--part", "3/3", "--json", status=1))
    git.preview("--join", *map(str, files), status=2)
    assert "different questions" in git.words


@pytest.mark.parametrize("text", ["version https://git-lfs.github.com/spec/v1\n", "no scene\n", "", A + "<<<<<<< x\n",
                                  A + "--- !o!4 &5\nA: [\n", "a\0b"])
def test_what_cannot_be_read_is_no_merge_without_conflicts(git, text):
    git.sides({"a.ovrin": A, "b.ovrin": B}, {"a.ovrin": text, "b.ovrin": B + " "}, {"a.ovrin": LAYER})
    told = git.preview("theirs", status=2)
    assert "1 that can't be told: a.ovrin" in told
    git.run("git", "merge", "-q", "theirs", fails=True)


def test_merge_by_lines_is_told(git):
    git.sides({"a.ovrin": A}, {"a.ovrin": LAYER}, {"a.ovrin": NAME, ".gitattributes": "*.ovrin !merge\n"})
    assert "a.ovrin: git would merge it by lines" in git.preview("theirs", status=1)
    assert "\"ovrin setup\" is the cure" in git.words


def test_nothing_to_do_is_told(git):
    git.sides({"a.ovrin": A}, {"a.ovrin": LAYER}, {"b.ovrin": B})
    git.preview("HEAD~1", status=0)
    assert "Nothing to do: HEAD~1 is merged into main already." in git.words
    git.run("git", "checkout", "-q", "main~1")
    assert git.preview("theirs", status=0).startswith("0 scenes") and git.words == ""


@pytest.mark.parametrize("revision,words", [("nowhere", "no revision \"nowhere\""), ("-x", "no revision \"-x\""),
                                            ("main:a.ovrin", "no revision"), ("", "Name the branch")])
def test_unknown_revision_is_told(git, revision, words):
    git.sides({"a.ovrin": A}, {"a.ovrin": LAYER}, {"a.ovrin": NAME})
    git.preview("--", revision, status=2)
    assert words in git.words


def test_histories_without_a_common_commit(git):
    git.sides({"a.ovrin": A}, {"a.ovrin": LAYER}, {"a.ovrin": NAME})
    git.run("git", "checkout", "-q", "--orphan", "new")
    git.preview("main", status=2)
    assert "no commit here yet on new" in git.words
    git.commit({"a.ovrin": B})
    git.preview("main", status=2)
    assert "no common history" in git.words


def test_shallow_clone_is_never_taken_for_a_whole_one(git):
    git.sides(*HISTORIES["one field"])
    git.clone_of("1")
    git.preview("origin/theirs", status=2)
    assert "--unshallow" in git.words and "fetch-depth" in git.words
    git.run("git", "fetch", "-q", "--depth", "2")
    assert conflicting(git.answer("origin/theirs", status=1)) == ["a.ovrin"]


def test_better_common_ancestor_may_be_cut_off(git):
    """Theirs is merged from a side branch of ours that the clone cuts off ahead of where the two meet."""
    git.sides({"a.ovrin": A}, {"b.ovrin": B}, {"c": "1"})
    git.run("git", "checkout", "-q", "theirs")
    for number in range(4):
        git.commit({"d": f"{number}"})
    git.run("git", "checkout", "-q", "main")
    git.run("git", "merge", "-q", "--no-edit", "theirs")
    git.run("git", "checkout", "-qb", "topic", "theirs~4")
    git.clone_of("3")
    git.run("git", "checkout", "-q", "main")
    git.preview("origin/topic", status=2)
    assert "--unshallow" in git.words


def test_any_kind_of_repository(git):
    git.sides({".gitattributes": "*.level merge=ovrin\n", "d/a.ovrin": A, "b.level": B},
              {"d/a.ovrin": LAYER, "b.level": different("b", "2 x 1")},
              {"d/a.ovrin": OTHER_LAYER, "b.level": different("b", "3 x 1")})
    whole = git.answer("theirs", status=1)
    assert conflicting(whole) == ["b.level", "d/a.ovrin"] == conflicting(git.answer("theirs", status=1, folder="d"))
    bare = git.home / "bare"
    git.run("git", "clone", "-q", "--bare", ".", str(bare))
    assert git.answer("theirs", status=1, folder=bare) == whole
    git.environment["GIT_DIR"] = str(bare)
    assert git.answer("theirs", status=1, folder="d") == whole
    del git.environment["GIT_DIR"]
    git.run("git", "worktree", "add", "-q", str(git.home / "linked"), "theirs")
    assert conflicting(git.answer("main", status=1, folder=git.home / "linked")) == ["b.level", "d/a.ovrin"]


def test_other_systems_are_told_that_it_needs_git(git):
    for folder, name in ((".hg", "Mercurial"), (".svn", "Subversion")):
        (git.here / folder).mkdir()
        git.preview("theirs", status=2)
        assert f"needs git: {name}" in git.words
        (git.here / folder).rmdir()
    git.preview("theirs", status=2)
    assert "no git repository" in git.words


def test_old_git_is_told(git):
    git.sides(*HISTORIES["one field"])
    git.fake("git", "echo git version 2.37.9.windows.1")
    git.preview("theirs", status=2)
    assert "needs git 2.38 or later; this is git 2.37" in git.words


@pytest.mark.parametrize("signal", ["INT", "TERM", "HUP"])
def test_signal_leaves_nothing_behind(git, signal):
    git.sides(*HISTORIES["one field"])
    real = shutil.which("git", path=git.bare_path)
    git.fake("git", f'case "$*" in *merge-tree*) kill -{signal} $PPID;; esac; exec {real} "$@"')
    git.preview("theirs", status={"INT": -2, "TERM": -15, "HUP": -1}[signal])


def test_missing_object_is_told(git):
    git.sides(*HISTORIES["one field"])
    blob = git.run("git", "rev-parse", "theirs:a.ovrin").strip()
    (git.here / ".git/objects" / blob[:2] / blob[2:]).unlink()
    git.preview("theirs", status=2)
    assert blob in git.words
