"""Merges scenes with git through ovrin merge, in all the ways in which git merges.

    pytest-3 VersionControl/test_merge.py --installed build/release/installed
"""

import concurrent.futures
import os
import subprocess

import pytest

from systems import can_mount
from test_systems import CONFLICT_AND_MORE, HEADER, ONE_CONFLICT, OTHER_FIELDS, game_object, scene
from user import LEFT_OPEN

BASE, THEIRS, OURS = CONFLICT_AND_MORE
MERGED = scene("5 Lamp 3")  # with ours where both changed it
LAYER_LINES = "    base    1\n    ours    5    main\n    theirs  2    topic\n"
SECONDS_OF_LIFE = (0.001, 0.002, 0.003, 0.004, 0.006, 0.01, 0.02)


def unmerged(user):
    return user.git("ls-files", "--unmerged", "-z")


def short(user, commit):
    return user.git("rev-parse", "--short=7", commit).strip()


def test_report_tells_object_values_and_branches(user):
    user.conflict(*CONFLICT_AND_MORE)
    lamp = "Lamp (10, base and theirs: Lantern)\n  m_Layer: both changed it\n"
    assert f"ovrin: scene.ovrin: 1 open conflict, where the file has ours for now\n{lamp}{LAYER_LINES}" in user.words()
    assert "ovrin settle --take theirs" in user.words()
    assert user.read() == MERGED
    assert unmerged(user) and user.records() == [".merge"]


def test_what_to_do_next_is_told_once_for_all_scenes_of_a_merge(user):
    user.conflicts(dict.fromkeys(("a.ovrin", "b.ovrin"), ONE_CONFLICT))
    for _ in range(2):  # also of what the first merge has left
        assert user.words().count("open conflict, where") == 2 and user.words().count("Next: ") == 1
        user.git("merge", "--abort")
        user.git("merge", "topic", fails=True)


def test_merge_without_conflicts_says_nothing_and_leaves_nothing(user):
    user.sides(*OTHER_FIELDS)
    user.git("merge", "-q", "topic")
    assert "ovrin" not in user.words() and user.committed() == scene("2 Lamp 1")
    assert user.records() == [] and user.git("status", "--porcelain", "--ignored") == ""


@pytest.mark.parametrize("command, sides", [
    (["rebase", "topic"], "ours is topic, what you rebase onto; theirs is {main} (change), your own commit"),
    (["rebase", "--apply", "topic"], "ours is topic, what you rebase onto; theirs is {main}, your own commit"),
    (["pull", "-q", "--rebase", ".", "topic"], "ours is {topic}, what you rebase onto; theirs is {main} (change)"),
    (["cherry-pick", "topic"], "ours is main, what you have checked out; theirs is topic, the commit that you pick"),
    (["cherry-pick", "topic~1..topic"], "theirs is {topic} (change), the commit that you pick"),
])
def test_sides_are_called_by_what_they_are(user, command, sides):
    user.sides(*ONE_CONFLICT)
    expected = sides.format(main=short(user, "main"), topic=short(user, "topic"))
    user.git(*command, fails=True)
    assert expected in user.words()
    swapped = "rebase" in command[0] or "--rebase" in command
    assert user.read() == ONE_CONFLICT[1 if swapped else 2]


@pytest.mark.parametrize("command", [["checkout", "-m", "scene.ovrin"], ["restore", "--merge", "scene.ovrin"]])
def test_a_conflict_that_is_made_again_is_of_the_same_sides(user, command):
    user.sides(*ONE_CONFLICT)
    sides = f"ours is topic, what you rebase onto; theirs is {short(user, 'main')} (change)"
    user.git("rebase", "topic", fails=True)
    user.git(*command)
    assert sides in user.words()


def test_revert_and_stash_tell_what_comes_back(user):
    user.sides(*ONE_CONFLICT)
    user.commit(scene("7 Lantern 1"))
    user.git("revert", "--no-edit", "HEAD~1", fails=True)
    assert "theirs is parent of HEAD~1, what stood there before the commit that you revert" in user.words()
    user.git("revert", "--abort")
    user.write(scene("8 Lantern 1"))
    user.git("stash", "-q")
    user.commit(scene("9 Lantern 1"))
    user.git("stash", "pop", fails=True)
    assert "ours is main, what you have checked out; theirs is the stash, what you had put aside" in user.words()
    assert user.read() == scene("9 Lantern 1") and user.git("stash", "list") != ""


def test_merge_tree_gets_its_standard_output_and_nothing_is_open_afterwards(user):
    user.sides(*CONFLICT_AND_MORE)
    out = user.git("merge-tree", "--write-tree", "main", "topic", fails=True)
    assert LAYER_LINES in user.words() and "1 open conflict" not in out
    assert user.git("show", out.split("\n")[0] + ":scene.ovrin") == MERGED
    assert user.records() == [] and user.read() == OURS
    user.git("clone", "-q", "--bare", ".", "../bare.git")
    bare = user.here.parent / "bare.git"
    attributes = bare / "info/attributes"
    attributes.parent.mkdir(exist_ok=True)
    attributes.write_text("*.ovrin merge=ovrin\n", encoding="utf-8")
    assert user.git("-C", str(bare), "merge-tree", "--write-tree", "main", "topic", fails=True) == out
    assert not (bare / "ovrin").exists()


def test_merge_tree_leaves_an_open_merge_alone(user):
    user.conflict(*CONFLICT_AND_MORE)
    user.git("merge-tree", "--write-tree", "topic~1", "topic")
    user.git("merge-tree", "--write-tree", "main", "topic", fails=True)
    assert user.records() == [".merge"]


def test_two_working_trees_merge_at_once(user):
    user.sides(*CONFLICT_AND_MORE)
    user.git("worktree", "add", "-q", "-b", "second", "../second")
    folders = (user.here, user.here.parent / "second")

    def merge(folder):
        return subprocess.run(["git", "merge", "topic"], cwd=folder, env=user.environment, check=False,
                              stdout=subprocess.DEVNULL, stderr=subprocess.PIPE).stderr.decode()

    with concurrent.futures.ThreadPoolExecutor() as pool:
        reports = list(pool.map(merge, folders))
    assert "ours    5    main" in reports[0] and "ours    5    second" in reports[1]
    assert [(folder / user.name).read_text() for folder in folders] == [MERGED, MERGED]
    user.ovrin("settle", "--take", "theirs")
    assert (user.here / ".git/worktrees/second/ovrin").exists() and user.records() == []


# Each side merged the other's first change and settled the conflict in its own way: two bases.
def test_criss_cross_base_is_a_version_as_it_is(user):
    user.sides(*ONE_CONFLICT)
    user.git("branch", "first")
    for branch, other in (("main", "topic"), ("topic", "first")):
        user.git("checkout", "-q", branch)
        user.git("merge", "-q", other, fails=True)
        user.ovrin("settle", "--take", "ours")
        user.git("commit", "-qm", "merged")
    user.commit(scene("2 Lamp 1"))
    user.git("checkout", "-q", "main")
    user.commit(scene("5 Lantern 3"))
    user.git("merge", "topic", fails=True)
    assert user.words().count("1 open conflict,") == 1 and LAYER_LINES in user.words()
    assert user.read() == MERGED


def test_rerere_neither_settles_nor_forgets(user):
    user.sides(*ONE_CONFLICT)
    user.git("config", "rerere.enabled", "true")
    user.git("config", "rerere.autoUpdate", "true")
    for _ in range(2):
        user.git("merge", "topic", fails=True)
        assert unmerged(user) and user.records() == [".merge"]
        user.ovrin("settle", "--take", "theirs")
        user.git("commit", "-qm", "merged")
        user.git("reset", "-q", "--hard", "HEAD~1")


@pytest.mark.parametrize("name", [b"bytes \xff\xfe.ovrin", b"-dash 'quote\" $x\n\t\\.ovrin", "Hafen ⚓.ovrin".encode()])
def test_any_name_is_merged_and_written_down(user, name):
    name = os.fsdecode(name)
    user.sides(*CONFLICT_AND_MORE, name)
    user.run("sh", "-c", "git merge topic >merge.log", fails=True)  # which shows the name as it is
    assert user.read(name) == MERGED and user.records() == [".merge"]
    user.ovrin("settle", "--take", "theirs")
    assert unmerged(user) == "" and user.read(name) == scene("2 Lamp 3")


def test_user_chooses_what_stands_at_conflicts(user):
    user.sides(*CONFLICT_AND_MORE)
    for setting, environment, layer in (("base", {}, 1), ("base", {"OVRIN_TAKE": "theirs"}, 2), ("ours", {}, 5)):
        user.git("config", "ovrin.take", setting)
        user.git("merge", "topic", fails=True, **environment)
        assert user.read() == scene(f"{layer} Lamp 3") and unmerged(user)
        user.git("merge", "--abort")
    user.git("merge", "topic", fails=True, OVRIN_TAKE="mine")
    assert 'There is no side "mine"' in user.words() and "OVRIN_TAKE" in user.words()
    assert "put that right" in user.words() and "put a good version" not in user.words()
    assert user.read() == OURS and unmerged(user)
    user.ovrin("settle", "--take", "theirs")
    assert user.read() == scene("2 Lamp 3") and not unmerged(user)


def test_answers_that_cannot_be_written_are_told(user):
    for question in ("--version", "--help"):
        user.run("sh", "-c", f"ovrin {question} >/dev/full", fails=True)
        assert "Cannot write to standard output: No space left on device" in user.words()


def test_later_merge_without_conflicts_forgets_the_earlier(user):
    user.conflict(*ONE_CONFLICT)
    user.git("merge", "--abort")
    user.git("checkout", "-q", "-b", "other", "topic~1")
    user.commit(scene("1 Lamp 1"))
    user.git("checkout", "-q", "main")
    user.git("merge", "-q", "--no-edit", "other")
    assert user.records() == [] and user.read() == scene("5 Lamp 1")


def test_scene_that_both_added_is_looked_through_even_without_a_conflict(user):
    user.conflict(None, scene("1 Lantern 1"), HEADER + game_object(20, 7, "Boat", 1))
    assert "0 open conflicts" in user.words() and "Both sides added the file" in user.words()
    assert unmerged(user) and "m_Name: Lantern" in user.read() and "m_Name: Boat" in user.read()
    user.ovrin("status", status=LEFT_OPEN)


@pytest.mark.parametrize("ours, words", [
    ("", "ours is empty"),
    ("no scene\n", "ours is no scene"),
    (f"{BASE}<<<<<<< ours\n", "ours holds conflict markers"),
    (BASE.replace("Lantern", "Lan\0tern"), "ours is binary"),
    ("version https://git-lfs.github.com/spec/v1\noid sha256:1\n", "ours is a pointer of Git LFS"),
    (f"{BASE}  m_Layer: [\n", "ours can't be read, at object 10, line 3"),
])
def test_what_is_no_scene_is_told_for_what_it_is(user, ours, words):
    user.conflict(BASE, THEIRS, ours)
    assert f"scene.ovrin is not merged: {words}" in user.words()
    assert unmerged(user) and user.read() == ours and user.records() == []


def test_merge_that_cannot_be_written_down_tells_so_and_stays_open(user):
    user.sides(*CONFLICT_AND_MORE)
    (user.here / ".git/ovrin").write_text("in the way", encoding="utf-8")
    user.git("merge", "topic", fails=True)
    assert "The merge could not be written down: " in user.words() and LAYER_LINES in user.words()
    assert unmerged(user) and user.read() == MERGED


def test_read_only_file_is_merged_like_any_other(user):
    user.sides(*OTHER_FIELDS)
    (user.here / user.name).chmod(0o444)
    user.git("merge", "-q", "topic")
    assert user.committed() == scene("2 Lamp 1")


@pytest.mark.parametrize("seconds", SECONDS_OF_LIFE)
def test_driver_that_is_killed_loses_nothing(user, seconds):
    user.sides(*CONFLICT_AND_MORE)
    driver = user.git("config", "merge.ovrin.driver").strip()
    user.git("config", "--local", "merge.ovrin.driver", f"timeout -s KILL {seconds} {driver}")
    user.git("merge", "topic", fails=True)
    assert user.read() in (OURS, MERGED) and user.read() == (OURS if not unmerged(user) else user.read())
    user.git("reset", "-q", "--hard")
    user.git("config", "--local", "--unset", "merge.ovrin.driver")
    user.git("merge", "topic", fails=True)
    assert user.read() == MERGED and LAYER_LINES in user.words()
    assert user.git("status", "--porcelain") == f"UU {user.name}\n"


# Fills the disk of temporary files, which nothing needs; the folders are at hand in another place.
ON_FULL_TMP = """
    mount --bind "$1" /mnt && mount -t tmpfs -o size=4k none /tmp
    ! cat /dev/zero 2>/dev/null >/tmp/rest
    cd /mnt/here && HOME=/mnt/home git merge -q topic"""

# Leaves so many kilobytes in the working tree.
ON_FULL_TREE = """
    mkdir disk && mount -t tmpfs -o size=2m none disk && cp -a here/. disk && cd disk
    dd if=/dev/zero of=rest bs=1k count=2000 2>/dev/null || true
    truncate -s -"$1"k rest 2>/dev/null
    git merge -q topic >&2 && { git show HEAD:scene.ovrin; exit 0; }
    rm rest
    git show HEAD:scene.ovrin && git reset -q --hard && git merge -q topic >&2 && git show HEAD:scene.ovrin"""


@pytest.mark.skipif(not can_mount(), reason="disks can't be mounted here")
def test_full_temporary_folder_does_not_matter(user):
    user.sides(*OTHER_FIELDS)
    user.run("unshare", "-rm", "sh", "-ec", ON_FULL_TMP, "sh", str(user.here.parent))
    assert user.committed() == scene("2 Lamp 1")


@pytest.mark.skipif(not can_mount(), reason="disks can't be mounted here")
@pytest.mark.parametrize("kilobytes", [0, 4, 8, 16, 32, 64])
def test_full_working_tree_loses_nothing(user, kilobytes):
    user.sides(*OTHER_FIELDS)
    done = subprocess.run(["unshare", "-rm", "sh", "-c", ON_FULL_TREE, "sh", str(kilobytes)], cwd=user.here.parent,
                          env=user.environment, stdout=subprocess.PIPE, stderr=subprocess.PIPE, check=False)
    assert done.stdout.decode() in (scene("2 Lamp 1"), OTHER_FIELDS[2] + scene("2 Lamp 1")), done.stderr.decode()
    assert "is not merged" not in done.stderr.decode() or "Make room there" in done.stderr.decode()
