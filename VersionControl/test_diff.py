"""What "ovrin diff" tells in repositories of git, Mercurial and Subversion.

    pytest-3 VersionControl/test_diff.py --installed build/release/installed
"""

import json
import pathlib
import shutil
import subprocess
import tempfile

import pytest

from systems import Git, Mercurial, Subversion, has_terminals
from test_systems import HEADER, game_object, scene

ODD_NAMES = ["the scene's \"$x\".ovrin", "-dash.ovrin", "tab\tand\nline.ovrin", "Träger 港.ovrin", "*.ovrin"]
MARKERS = "<<<<<<< ours\n=======\n>>>>>>> theirs\n"


def make(request, system):
    if not shutil.which(system.program):
        pytest.skip(f"{system.program} is not installed")
    installed = pathlib.Path(request.config.getoption("--installed")).resolve()
    with tempfile.TemporaryDirectory() as folder:
        yield system(installed, pathlib.Path(folder))


@pytest.fixture(name="git")
def fixture_git(request):
    for git in make(request, Git):
        git.run("git", "init", "-qb", "main", ".")
        for name, value in (("user.name", "Tester"), ("user.email", "tester@example.org")):
            git.run("git", "config", "--global", name, value)
        git.write("*.ovrin diff=ovrin\n", ".gitattributes")
        commit_all(git)
        yield git


def commit_all(git):
    git.run("git", "add", "--all", ".")
    git.run("git", "commit", "-qm", "change")


def diff(system, *words, fails=False):
    return system.run("ovrin", "diff", *words, fails=fails)


def as_json(system, *words):
    """Of each file, by path: status and counts, or why it isn't compared by objects."""
    files = json.loads(diff(system, "--json", *words))["files"]
    return {file["path"]: (file["status"], *(file.get(count) for count in ("added", "removed", "changed")))
            for file in files}


def words_on_errors(system):
    return system.log.read_text(encoding="utf-8")


def test_git_versions_are_those_of_its_own_diff(git):
    for words in ("1 Lantern 1", "2 Lantern 1", "2 Lamp 1"):
        git.commit(scene(words), "a.ovrin")
    git.write(scene("2 Lamp 0"), "a.ovrin")
    assert "m_Visible: 1 → 0" in diff(git)
    assert diff(git, "--staged") == ""
    git.run("git", "add", "a.ovrin")
    assert diff(git) == "" and "m_Visible" in diff(git, "--staged") and "m_Visible" in diff(git, "HEAD")
    assert "m_Name: Lantern → Lamp" in diff(git, "HEAD^", "HEAD")
    assert diff(git, "HEAD~2..HEAD^") == diff(git, "HEAD~2", "HEAD^", "--", "a.ovrin")
    assert "m_Name: Lamp → Lantern" in diff(git, "HEAD...HEAD^") or diff(git, "HEAD...HEAD^") == ""


def test_git_new_deleted_and_renamed_scenes(git):
    git.write(scene("1 Lantern 1 5 6"), "old.ovrin")
    git.write(scene("1 Gone 1"), "gone.ovrin")
    git.write("text\n", "notes.txt")
    commit_all(git)
    git.run("git", "mv", "old.ovrin", "new.ovrin")
    git.write(scene("1 Lamp 1 5 6"), "new.ovrin")
    git.run("git", "rm", "-q", "gone.ovrin")
    git.write(HEADER + "".join(game_object(number, 7, "Other", 1) for number in range(70, 90)), "added.ovrin")
    git.write("other text\n", "notes.txt")
    git.run("git", "add", "--all")
    expected = {"new.ovrin": ("renamed", 0, 0, 1), "gone.ovrin": ("removed", 0, 1, 0),
                "added.ovrin": ("added", 20, 0, 0), "notes.txt": ("changed", None, None, None)}
    assert as_json(git, "HEAD") == as_json(git, "--staged") == expected
    told = diff(git, "HEAD")
    assert "new.ovrin, renamed from old.ovrin\n" in told and "+other text\n" in told
    commit_all(git)
    assert as_json(git, "HEAD^", "HEAD") == expected


def test_git_odd_names_reach_everywhere(git):
    for name in ODD_NAMES:
        git.write(scene("1 Lantern 1"), name)
    commit_all(git)
    for name in ODD_NAMES:
        git.write(scene("2 Lantern 1"), name)
    assert as_json(git) == {name: ("changed", 0, 0, 1) for name in ODD_NAMES}
    assert as_json(git, "--", "./-dash.ovrin") == {"-dash.ovrin": ("changed", 0, 0, 1)}
    assert as_json(git, "--", "-dash.ovrin") == {"-dash.ovrin": ("changed", 0, 0, 1)}
    commit_all(git)
    assert len(as_json(git, "HEAD^", "HEAD")) == len(ODD_NAMES)
    git.run("git", "config", "diff.ovrin.command", "ovrin diff --external --")
    assert git.run("git", "diff", "HEAD^", "HEAD").count("m_Layer: 1 → 2") == len(ODD_NAMES)


def test_git_calls_it_as_external_diff(git):
    git.run("git", "config", "diff.ovrin.command", "ovrin diff --external --")
    git.commit(scene("1 Lantern 1 5 6"), "a.ovrin")
    git.run("git", "mv", "a.ovrin", "b.ovrin")
    git.commit(scene("2 Lantern 1 5 6"), "b.ovrin")
    assert "m_Layer: 1 → 2" in git.run("git", "log", "-p", "--ext-diff", "-1")
    assert "b.ovrin, renamed from a.ovrin\n" in git.run("git", "diff", "-M", "HEAD^", "HEAD")
    assert "b.ovrin, added\n" in git.run("git", "diff", "--no-renames", "HEAD^", "HEAD")
    git.write(scene("1 Lantern 1") + MARKERS, "b.ovrin")
    assert "+<<<<<<< ours\n" in git.run("git", "diff")


def test_git_unmerged_scenes_are_told(git):
    git.run("git", "config", "diff.ovrin.command", "ovrin diff --external --")
    git.commit(scene("1 Lantern 1"), "a.ovrin")
    git.run("git", "checkout", "-qb", "theirs")
    git.commit(scene("2 Lantern 1"), "a.ovrin")
    git.run("git", "checkout", "-q", "main")
    git.commit(scene("3 Lantern 1"), "a.ovrin")
    git.run("git", "merge", "theirs", fails=True)
    told = "a.ovrin, not merged yet: \"ovrin status\" tells what is open\n"
    assert diff(git) == told + "\n" and told in git.run("git", "diff", "--cached")
    assert as_json(git) == {"a.ovrin": ("unmerged", None, None, None)}


def test_git_unreadable_scenes_are_shown_by_lines(git):
    git.commit(scene("1 Lantern 1"), "a.ovrin")
    git.write(scene("1 Lantern 1") + MARKERS, "a.ovrin")
    told = diff(git)
    assert "holds conflict markers" in told and "+<<<<<<< ours\n" in told
    git.write(HEADER + "--- !o!1 &10\nGameObject: [\n", "a.ovrin")
    assert "+GameObject: [\n" in diff(git)


def test_git_bare_repositories_and_folders(git):
    (git.here / "deep").mkdir()
    git.commit(scene("1 Lantern 1"), "deep/a.ovrin")
    git.commit(scene("2 Lantern 1"), "deep/a.ovrin")
    git.run("git", "clone", "-q", "--bare", ".", "bare.git")
    git.here = git.here / "bare.git"
    assert as_json(git, "HEAD^", "HEAD") == {"deep/a.ovrin": ("changed", 0, 0, 1)}
    diff(git, fails=True)
    assert "without a working tree" in words_on_errors(git)
    git.here = git.here.parent / "deep"
    assert as_json(git, "HEAD^", "--", "a.ovrin") == {"deep/a.ovrin": ("changed", 0, 0, 1)}


def test_git_what_matches_nothing_is_told(git):
    git.commit(scene("1 Lantern 1"), "main.ovrin")
    git.write("a branch's name", "main")
    for words in (["nowhere"], ["--", "nowhere"], ["HEAD", "nowhere"], ["main"], ["--unknown"]):
        diff(git, *words, fails=True)
        assert words[-1] in words_on_errors(git)
    git.run("git", "add", "main")
    assert list(as_json(git, "HEAD", "--", "main")) == ["main"]


def test_status_tells_differences_if_asked(git):
    git.commit(scene("1 Lantern 1"), "a.ovrin")
    diff(git, "--exit-code")
    git.write(scene("2 Lantern 1"), "a.ovrin")
    diff(git)
    diff(git, "--exit-code", fails=True)


def test_two_files_need_no_repository(git):
    git.here = git.home
    git.write(scene("1 Lantern 1"), "a.ovrin")
    git.write(scene("2 Lantern 1"), "b.ovrin")
    assert diff(git, "a.ovrin", "b.ovrin") == "b.ovrin, compared with a.ovrin\n  changed  Lantern (10)\n" \
                                              "             m_Layer: 1 → 2\n\n"
    assert as_json(git, "/dev/null", "a.ovrin") == {"a.ovrin": ("added", 1, 0, 0)}
    assert as_json(git, "a.ovrin", "a.ovrin") == {}
    diff(git, "a.ovrin", "nowhere.ovrin", fails=True)


def test_colour_is_for_those_who_want_it(git):
    git.commit(scene("1 Lantern 1"), "a.ovrin")
    git.write(scene("2 Lantern 1"), "a.ovrin")
    assert "\033[" not in diff(git) and "\033[" in diff(git, "--color", "always")


@pytest.mark.skipif(not has_terminals(), reason="terminals can't be made here")
def test_colour_and_pages_are_for_terminals(git):
    git.write("#!/bin/sh\nsed 's/^/paged: /'\n", "pager")
    (git.here / "pager").chmod(0o755)
    git.commit(scene("1 Lantern 1"), "a.ovrin")
    git.write(scene("2 Lantern 1"), "a.ovrin")
    setting = git.environment | {"GIT_PAGER": "./pager", "TERM": "xterm"}
    shown = {}
    for variables in ({}, {"NO_COLOR": "1"}):
        shown[len(variables)] = subprocess.run(["script", "-qc", "ovrin diff", "/dev/null"], cwd=git.here,
                                               env=setting | variables, stdin=subprocess.DEVNULL, text=True,
                                               stdout=subprocess.PIPE, check=True, timeout=60).stdout
    assert "paged: " in shown[0] and "\033[" in shown[0]
    assert "paged: a.ovrin" in shown[1] and "\033[" not in shown[1]


@pytest.mark.parametrize("kind", [Mercurial, Subversion])
def test_working_copies_of_others(request, kind):
    for system in make(request, kind):
        name = "Träger @2.ovrin"
        if kind is Mercurial:
            system.run("hg", "init", ".")
            call = ("hg", "--config", "ui.username=Tester")
        else:
            system.environment["LC_ALL"] = "C.UTF-8"
            system.run("svnadmin", "create", f"{system.home}/repository")
            system.run("svn", "checkout", "-q", f"file://{system.home}/repository", ".")
            call = ("svn",)
        system.write(scene("1 Lantern 1"), name)
        system.write("text\n", "notes.txt")
        for file in (name, "notes.txt"):
            system.run(call[0], "add", "-q", file if kind is Mercurial else file + "@")
        system.run(*call, "commit", "-qm", "change") if kind is Subversion else system.run(*call, "commit", "-m", "c")
        system.write(scene("2 Lantern 1"), name)
        system.write("other\n", "notes.txt")
        assert as_json(system) == {name: ("changed", 0, 0, 1), "notes.txt": ("changed", None, None, None)}
        assert "m_Layer: 1 → 2" in diff(system) and "+other\n" in diff(system)
        system.run(*call, "commit", "-qm", "change") if kind is Subversion else system.run(*call, "commit", "-m", "c")
        revisions = ("0", "1") if kind is Mercurial else ("1", "2")
        assert as_json(system, *revisions)[name] == ("changed", 0, 0, 1)
        assert as_json(system, revisions[0], "--", "notes.txt") == {"notes.txt": ("changed", None, None, None)}
        diff(system, "--staged", fails=True)
        assert "Only git has an index" in words_on_errors(system)
