"""Sets version control up with ovrin setup and takes that back, in configurations of all kinds.

    pytest-3 VersionControl/test_setup.py --installed build/release/installed
"""

import os
import pathlib
import shutil
import tempfile

import pytest

from systems import System
from test_systems import scene

# What a person may have had in a configuration of sections. The names mean nothing to any system.
SECTIONS = {
    "empty": b"",
    "usual": b"[alpha]\none = 1\n",
    "no line end": b"[alpha]\none = 1",
    "blank lines at the end": b"[alpha]\none = 1\n\n\n",
    "long line ends": b"[alpha]\r\none = 1\r\n",
    "long line ends, the last missing": b"[alpha]\r\none = 1",
    "comment at the end": b"[alpha]\none = 1\n# >>> mine >>>",
    "bytes of another encoding": b"[alpha]\none = \xe4\n",
}
LINES = {"empty": b"", "usual": b"*.png binary\n", "no line end": b"*.png binary", "long line ends": b"*.png binary\r\n"}
SCRIPTS = {"usual": b"#!/bin/sh\nexec true\n", "no line end": b"#!/usr/bin/env bash", "bash -e": b"#!/bin/bash -e\nexit 0\n"}
FILES = {".gitconfig": SECTIONS, ".hgrc": SECTIONS, ".subversion/config": SECTIONS, ".config/git/attributes": LINES}


@pytest.fixture(name="user")
def fixture_user(request):
    installed = pathlib.Path(request.config.getoption("--installed")).resolve()
    with tempfile.TemporaryDirectory(prefix="a user's ") as folder:
        yield System(installed, pathlib.Path(folder))


def tree(folder):
    """Every file, link and folder below: bytes, target or nothing, and the mode."""
    found = {}
    for path in sorted(folder.rglob("*")):
        content = os.readlink(path) if path.is_symlink() else path.read_bytes() if path.is_file() else None
        found[str(path.relative_to(folder))] = content, path.lstat().st_mode
    return found


def put(path, content, mode=0o644):
    path.parent.mkdir(parents=True, exist_ok=True)
    path.write_bytes(content)
    path.chmod(mode)


def words(user):
    """What the last command had to say besides its results."""
    return user.log.read_text(encoding="utf-8")


def driver(user, *scope):
    return user.run("git", "config", *scope, "--get", "merge.ovrin.driver", fails=None)


@pytest.mark.parametrize("name,start", [(name, start) for name in FILES for start in FILES[name]])
def test_undo_gives_back_each_byte(user, name, start):
    put(user.home / name, FILES[name][start])
    before = tree(user.home)
    user.run("ovrin", "setup")
    done = tree(user.home)
    assert "ovrin" in done[name][0].decode("latin-1")
    told = user.run("ovrin", "setup")
    assert told.count("has its lines already") == 4 and tree(user.home) == done
    assert " merge " in driver(user, "--global")
    user.run("ovrin", "setup", "--undo")
    assert tree(user.home) == before


def test_undo_leaves_nothing_where_nothing_was(user):
    user.run("ovrin", "setup")
    assert sorted(path.name for path in user.home.iterdir()) == [".config", ".gitconfig", ".hgrc", ".subversion"]
    user.run("ovrin", "setup", "--undo")
    assert tree(user.home) == {}
    user.run("ovrin", "setup", "--undo")
    assert "nothing that setup wrote" in words(user)


def test_dry_run_tells_the_same_and_writes_nothing(user):
    planned = user.run("ovrin", "setup", "--dry-run")
    assert tree(user.home) == {}
    assert user.run("ovrin", "setup") == planned
    done = tree(user.home)
    planned = user.run("ovrin", "setup", "--undo", "--dry-run")
    assert tree(user.home) == done
    assert user.run("ovrin", "setup", "--undo") == planned


@pytest.mark.parametrize("name", FILES)
def test_undo_keeps_what_somebody_wrote_meanwhile(user, name):
    put(user.home / name, b"[alpha]\none = 1")
    user.run("ovrin", "setup")
    with open(user.home / name, "ab") as file:
        file.write(b"[omega]\nlast = 1\n")
    user.run("ovrin", "setup", "--undo")
    assert (user.home / name).read_bytes() == b"[alpha]\none = 1\n[omega]\nlast = 1\n"


def test_undo_keeps_what_git_wrote_among_our_lines(user):
    user.run("ovrin", "setup", "git")
    user.run("git", "config", "--global", "diff.ovrin.textconv", "mine")
    user.run("git", "config", "--global", "user.name", "Tester")
    user.run("ovrin", "setup", "git", "--undo")
    assert "textconv = mine" in words(user)
    assert user.run("git", "config", "--global", "--list") == "diff.ovrin.textconv=mine\nuser.name=Tester\n"


def test_setup_again_puts_changed_lines_right(user):
    user.run("ovrin", "setup", "git", "--program", "/old/ovrin")
    user.run("git", "config", "--global", "user.name", "Tester")
    user.run("ovrin", "setup", "git", "--program", "ovrin")
    assert driver(user).startswith("ovrin merge ")
    assert "/old/" not in (user.home / ".gitconfig").read_text()
    user.run("ovrin", "setup", "git", "--undo")
    assert user.run("git", "config", "--global", "--list") == "user.name=Tester\n"


def test_a_section_that_git_removes_takes_nothing_of_ours(user):
    put(user.home / ".gitconfig", b"[alpha]\n\tone = 1\n")
    user.run("ovrin", "setup", "git")
    user.run("git", "config", "--global", "--remove-section", "alpha")
    user.run("ovrin", "setup", "git", "--undo")
    assert (user.home / ".gitconfig").read_bytes() == b""


def test_a_torn_block_is_told_and_left(user):
    user.run("ovrin", "setup", "git")
    user.run("git", "config", "--global", "--remove-section", "mergetool.ovrin")
    torn = (user.home / ".gitconfig").read_bytes()
    user.run("ovrin", "setup", "git", "--undo", fails=True)
    assert "take out the rest by hand" in words(user)
    assert (user.home / ".gitconfig").read_bytes() == torn


@pytest.mark.parametrize("broken", [b"[alpha", b"[alpha]\n\tone = 1\\", b"[alpha]\n\tone = \"1"])
def test_a_configuration_that_would_be_read_differently_is_left(user, broken):
    put(user.home / ".gitconfig", broken)
    user.run("ovrin", "setup", "git", fails=True)
    assert ".gitconfig" in words(user) or "config" in words(user)
    assert (user.home / ".gitconfig").read_bytes() == broken


def test_links_stay_links(user):
    put(user.home / "dotfiles/config", b"[alpha]\n\tone = 1\n")
    (user.home / ".gitconfig").symlink_to("dotfiles/config")
    (user.home / ".hgrc").symlink_to("dotfiles/hgrc")
    before = tree(user.home)
    user.run("ovrin", "setup")
    assert os.readlink(user.home / ".gitconfig") == "dotfiles/config" and (user.home / "dotfiles/hgrc").exists()
    user.run("ovrin", "setup", "--undo")
    assert tree(user.home) == before


def test_git_is_set_up_where_git_looks(user):
    put(user.home / "x/git/config", b"[core]\n\tattributesFile = ~/my attributes\n")
    user.run("ovrin", "setup", "git", XDG_CONFIG_HOME=str(user.home / "x"))
    assert (user.home / "my attributes").exists() and not (user.home / ".gitconfig").exists()
    user.run("ovrin", "setup", "git", GIT_CONFIG_GLOBAL=str(user.home / "named"))
    assert b"ovrin merge" in (user.home / "named").read_bytes()
    user.run("ovrin", "setup", "git", fails=True, GIT_CONFIG_GLOBAL="/dev/null")
    for home in ("", "relative"):
        user.run("ovrin", "setup", fails=True, HOME=home)
        assert "HOME" in words(user)


def test_a_file_that_refuses_is_told_and_the_others_are_done(user):
    (user.home / ".config/git/attributes").mkdir(parents=True)
    user.run("ovrin", "setup", fails=True)
    assert "attributes: Is a directory" in words(user)
    assert driver(user) and (user.home / ".hgrc").exists()


def test_what_is_not_installed_is_told_only_where_it_is_named(user):
    for program in ("ovrin", "git", "env"):
        (user.fakes / program).symlink_to(shutil.which(program, path=user.environment["PATH"]))
    alone = {"PATH": str(user.fakes)}
    assert {line.split(":")[0] for line in user.run("ovrin", "setup", **alone).splitlines() if line[0] != " "} == {"git"}
    assert words(user) == ""
    user.run("ovrin", "setup", "hg", fails=True, **alone)
    assert "hg is not installed" in words(user)
    (user.fakes / "git").unlink()
    user.run("ovrin", "setup", fails=True, **alone)


@pytest.mark.parametrize("line", ["merge-tool-cmd = theirs", "Merge-Tool-Cmd: theirs "])
def test_the_subversion_tool_of_somebody_else_stays(user, line):
    put(user.home / ".subversion/config", f"[Helpers]\n{line}\n[auth]\n".encode())
    before = tree(user.home)
    user.run("ovrin", "setup", "svn", fails=True)
    assert "merge-tool-cmd = theirs" in words(user) and tree(user.home) == before
    put(user.home / ".subversion/config", b"[helpers]\nmerge-tool-cmd = ovrinmerge-vcs\n")
    user.run("ovrin", "setup", "svn")


def repository(user):
    user.run("git", "init", "-qb", "main", ".")
    user.run("git", "config", "--global", "user.name", "Tester")
    user.run("git", "config", "--global", "user.email", "tester@example.org")
    return user.here / ".git"


def commit(user, fails=False):
    user.run("git", "commit", "--allow-empty", "-qm", "change", fails=fails)


@pytest.mark.parametrize("script", [None, *SCRIPTS])
def test_local_setup_adds_a_guard_and_undo_takes_it_back(user, script):
    data = repository(user)
    if script:
        put(data / "hooks/pre-commit", SCRIPTS[script], 0o755)
    before = tree(data)
    user.run("ovrin", "setup", "--local", "--program", "ovrin")
    assert "*.prefab -text merge=ovrin" in words(user)
    assert user.run("git", "check-attr", "merge", "a.ovrin") == "a.ovrin: merge: ovrin\n"
    user.fake("ovrin", '[ "$*" = "status --guard" ] && exit 1')
    commit(user, fails=True)
    user.fake("ovrin", "exit 0")
    commit(user)
    (user.fakes / "ovrin").unlink()
    commit(user, fails=None)
    user.run("ovrin", "setup", "--local", "--undo")
    left = {name: content for name, content in tree(data).items() if name in before}
    assert {name: content for name, content in left.items() if "hooks" in name or name in ("config", "info")} == {
        name: content for name, content in before.items() if "hooks" in name or name in ("config", "info")}
    assert not (data / "info/attributes").exists()


def test_the_guard_lets_those_commit_who_lack_the_program(user):
    repository(user)
    user.run("ovrin", "setup", "--local", "--program", "ovrin")
    user.run("git", "commit", "--allow-empty", "-qm", "change", PATH=user.bare_path)
    assert "not installed" in words(user)


@pytest.mark.parametrize("content,mode,told", [
    (b"#!/usr/bin/python3\n", 0o755, "no shell script"), (b"\x7fELF\0", 0o755, "no shell script"),
    (b"#!/bin/sh\n", 0o644, "not executable"), (b"#!/bin/sh\r\n", 0o755, "no shell script")])
def test_the_hook_of_somebody_else_stays(user, content, mode, told):
    hook = repository(user) / "hooks/pre-commit"
    put(hook, content, mode)
    user.run("ovrin", "setup", "--local", fails=True)
    assert told in words(user) and hook.read_bytes() == content
    assert driver(user, "--local")


def test_a_changed_guard_is_told_and_left(user):
    hook = repository(user) / "hooks/pre-commit"
    user.run("ovrin", "setup", "--local")
    hook.write_text(hook.read_text().replace("exit 1", "exit 0"))
    for arguments in ([], ["--undo"]):
        user.run("ovrin", "setup", "--local", *arguments, fails=True)
        assert "somebody changed" in words(user) and "exit 0" in hook.read_text()


@pytest.mark.parametrize("hooks,place", [("my hooks", "here/my hooks"), ("~/hooks", "home/hooks")])
def test_the_guard_goes_where_git_looks_for_hooks(user, hooks, place):
    repository(user)
    user.run("git", "config", "core.hooksPath", hooks)
    (user.here / "deep").mkdir()
    user.run("sh", "-c", "cd deep && ovrin setup --local --program ovrin")
    hook = user.home.parent / place / "pre-commit"
    assert hook.exists()
    user.fake("ovrin", "exit 1")
    commit(user, fails=True)
    (user.fakes / "ovrin").unlink()
    user.run("ovrin", "setup", "--local", "--undo")
    assert not hook.parent.exists()


def test_a_linked_working_tree_shares_the_setup(user):
    repository(user)
    commit(user)
    user.run("git", "worktree", "add", "-q", "../other")
    user.run("sh", "-c", "cd ../other && ovrin setup --local")
    assert driver(user, "--local") and (user.here / ".git/hooks/pre-commit").exists()
    user.run("git", "clone", "-q", "--bare", ".", "../bare")
    user.run("sh", "-c", "cd ../bare && ovrin setup --local")
    assert not (user.here / "../bare/hooks/pre-commit").exists()


def test_mercurial_alone_is_set_up_in_its_repository(user):
    user.run("hg", "init", ".")
    user.run("ovrin", "setup", "--local")
    assert tree(user.home) == {}
    assert "merge -- $base" in user.run("hg", "config", "merge-tools.ovrin.args")
    user.run("ovrin", "setup", "--local", "--undo")
    assert not (user.here / ".hg/hgrc").exists()
    user.run("ovrin", "setup", "svn", "--local", fails=True)
    user.run("sh", "-c", "cd / && ovrin setup --local", fails=True)


@pytest.mark.parametrize("name", ["with blank", "quo'te", 'dou"ble', "per%Ocent", "do$HOME", "ha#sh;"])
def test_any_path_of_the_program_can_be_called(user, name):
    program = user.home / name / "ovrin"
    put(program, b'#!/bin/sh\necho "$@" >"$HOME/called"\nexit 1\n', 0o755)
    shutil.copy(program, f"{program}-svn")
    repository(user)
    put(user.here / "a.ovrin", b"1\n")
    user.run("git", "add", ".")
    commit(user)
    user.run("ovrin", "setup", "--global", "--program", str(program))
    user.run("git", "checkout", "-qb", "theirs")
    put(user.here / "a.ovrin", b"2\n")
    user.run("git", "commit", "-qam", "change")
    user.run("git", "checkout", "-q", "main")
    put(user.here / "a.ovrin", b"3\n")
    user.run("git", "commit", "-qam", "change")
    user.run("git", "merge", "theirs", fails=True)
    assert (user.home / "called").read_text().startswith("merge --base-label ")
    assert user.run("hg", "config", "merge-tools.ovrin.executable") == "env\n"


def test_the_hooks_of_the_framework_can_be_called(user):
    repository(user)
    put(user.here / "a.ovrin", scene("1 Lantern 1").encode())
    listed = (pathlib.Path(__file__).parent.parent / ".pre-commit-hooks.yaml").read_text(encoding="utf-8")
    entries = [line.split()[1:] for line in listed.splitlines() if line.startswith("  entry: ovrin ")]
    assert len(entries) == listed.count("- id: ") == 2
    for entry in entries:
        user.run(*entry, *(["a.ovrin"] if "check" in entry else []))
