"""What ovrin check looks at in a working tree, and what it tells of it."""

import json
import pathlib
import tempfile

import pytest

from systems import Git
from test_systems import HEADER, ONE_CONFLICT, scene

BROKEN = HEADER + "--- !o!9 &1\nNote:\n  m_Link: {fileID: 7}\n"


@pytest.fixture(name="stranger")
def fixture_stranger(request):
    installed = pathlib.Path(request.config.getoption("--installed")).resolve()
    with tempfile.TemporaryDirectory() as folder:
        yield Git(installed, pathlib.Path(folder))


@pytest.fixture(name="user")
def fixture_user(stranger):
    stranger.start()
    return stranger


def check(user, *options, status):
    """The findings as (file, code)."""
    told = user.run("sh", "-c", 'ovrin check --json "$@"; echo $?', "sh", *options)
    output, _, found = told.rstrip("\n").rpartition("\n")
    assert int(found) == status, user.log.read_text(encoding="utf-8")
    return [(finding["file"], finding["code"]) for finding in json.loads(output)["findings"]] if output else None


def test_index_counts_and_not_the_working_tree(user):
    user.commit(scene("1 Lantern 1"))
    user.write(BROKEN)
    assert check(user, "--staged", status=0) == []
    user.run("git", "add", "--all")
    user.write(scene("1 Lantern 1"))
    assert check(user, "--staged", status=1) == [(user.name, "dangling-reference")]
    assert check(user, status=0) == []


def test_names_are_bytes(user):
    names = ["-b.ovrin", "a\tb\n.ovrin", "\u00e4 \u201c.prefab"]
    for name in names:
        user.write(BROKEN, name)
    user.run("git", "add", "--all")
    for options in ([], ["--staged"], ["--all"]):
        assert [file for file, _ in check(user, *options, status=1)] == names


def test_new_and_changed_scenes_are_looked_at_without_arguments(user):
    user.write(BROKEN, "old.ovrin")
    user.commit(scene("1 Lantern 1"))
    user.write(BROKEN, "new.ovrin")
    user.write("no scene", "note.txt")
    user.write("fileFormatVersion: 2\n", "old.ovrin.meta")
    assert check(user, status=1) == [("new.ovrin", "dangling-reference"), ("old.ovrin", "dangling-reference")]
    (user.here / "old.ovrin").unlink()
    user.run("git", "rm", "-q", "--cached", "--ignore-unmatch", "old.ovrin")
    assert check(user, "--all", status=0) == []


def test_open_conflict_is_a_finding_until_it_is_settled(stranger):
    stranger.sides(*ONE_CONFLICT)
    stranger.merge(fails=True)
    for options in ([], ["--staged"], [stranger.name]):
        assert (stranger.name, "open-conflict") in check(stranger, *options, status=1)
    stranger.abort()
    assert check(stranger, status=0) == []


def test_without_a_working_tree_scenes_must_be_named(stranger):
    stranger.write(BROKEN)
    check(stranger, status=2)
    assert check(stranger, stranger.name, status=1) == [(stranger.name, "dangling-reference")]


def test_what_cannot_be_checked_fails_and_the_rest_is_told(user):
    user.write(BROKEN)
    assert check(user, "missing.ovrin", user.name, status=2) == [(user.name, "dangling-reference")]
    check(user, "--baseline", "missing.json", user.name, status=2)
    check(user, "--staged", user.name, status=2)
    assert check(user, "--staged", status=0) == []


def test_baseline_accepts_what_was_there(user):
    user.write(BROKEN)
    user.run("sh", "-c", 'ovrin check --json "$1" >baseline.json', "sh", user.name, fails=True)
    user.write(BROKEN.replace("  m_Link", "  m_First: {fileID: 8}\n  m_Link"))
    assert check(user, "--baseline", "baseline.json", user.name, status=1) == [(user.name, "dangling-reference")]
    user.write(BROKEN.replace("  m_Link", "  m_First: 8\n  m_Link"))
    assert check(user, "--baseline", "baseline.json", user.name, status=0) == []
