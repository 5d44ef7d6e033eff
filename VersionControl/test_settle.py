"""Settles the conflicts of real merges with ovrin settle, from a script.

    pytest-3 VersionControl/test_settle.py --installed build/release/installed
"""

import json
import shutil

import pytest

from systems import can_mount
from test_systems import (CONFLICT_AND_MORE, CONFLICT_AND_OBJECTS, HEADER, ONE_CONFLICT, components,
                          game_object, scene)
from user import FAILED, LEFT_OPEN

NAMES = ["a b.ovrin", "'quoted\" $x.ovrin", "tab\there.ovrin", "line\nfeed.ovrin", "-dash.ovrin", "Hafen \u2693=1.ovrin",
         "*[a].ovrin", ":(top)a.ovrin"]
MANY = [HEADER + "".join(game_object(number, layer, "Boat", 1) for number in range(1, 51)) for layer in (1, 2, 5)]


def places(boat, pier, order=(0, 0)):
    """A boat and a pier, which stand below these Transforms, 11 being the boat's and 41 the pier's."""
    return HEADER + "".join(
        f"--- !o!1 &{number}\nGameObject:\n  m_Component:\n  - component: {{fileID: {number + 1}}}\n"
        f"  m_Name: {name}\n--- !o!4 &{number + 1}\nTransform:\n  m_GameObject: {{fileID: {number}}}\n"
        f"  m_Father: {{fileID: {father}}}\n  m_RootOrder: {place}\n"
        for number, name, father, place in ((10, "Boat", boat, order[0]), (40, "Pier", pier, order[1])))


# Theirs puts the pier below the boat, and ours the boat below the pier.
LOOP = places(0, 0), places(0, 11, (1, 0)), places(41, 0, (0, 1))
CONTRADICTION = "--set", "11.Transform.m_Father=ours", "--set", "41.Transform.m_Father=theirs"


def test_fifty_conflicts_take_three_commands(user):
    user.sides(*MANY)
    user.git("merge", "topic", fails=True)
    user.ovrin("settle", "--take", "theirs")
    user.git("commit", "-qm", "merged")
    assert user.committed() == MANY[1]


@pytest.mark.parametrize("name", NAMES)
def test_any_name_is_settled(user, name):
    user.conflict(*ONE_CONFLICT, name)
    assert json.loads(user.ovrin("status", "--json", status=LEFT_OPEN))["scenes"][0]["path"] == name
    user.ovrin("settle", "--take", "theirs", "--", name)
    user.git("commit", "-qm", "merged")
    assert user.committed(name) == ONE_CONFLICT[1]


@pytest.mark.parametrize("command", ["rebase", "cherry-pick"])
def test_next_step_is_that_of_the_operation(user, command):
    user.sides(*ONE_CONFLICT)
    user.git(command, "topic", fails=True)
    user.ovrin("settle", "--take", "theirs")
    assert user.words().endswith(f"Next: git {command} --continue\n")
    user.git(command, "--continue", GIT_EDITOR="true")
    # In a rebase ours is what the commits are brought onto.
    assert user.committed() == ONE_CONFLICT[2 if command == "rebase" else 1]


def test_what_was_decided_before_is_proposed_in_a_rebase_that_repeats_it(user):
    user.start()
    layers = [scene(f"{layer} Lantern 1") for layer in (1, 2, 1, 2, 5)]
    user.commit(layers[0])
    user.git("checkout", "-qb", "topic")
    for text in layers[1:4]:
        user.commit(text)
    user.git("checkout", "-q", "main")
    user.commit(layers[4])
    user.git("checkout", "-q", "topic")
    user.git("rebase", "main", fails=True)
    user.ovrin("settle", "--take", "proposed", status=FAILED)
    assert "Nothing was decided before" in user.words()
    user.ovrin("settle", "--take", "ours")
    user.git("rebase", "--continue", fails=True)  # from 2 back to 1, which is new
    user.ovrin("settle", "--take", "ours")
    user.git("rebase", "--continue", fails=True)  # as the first one
    assert "    proposed: ours\n" in user.ovrin("settle", "--list", status=LEFT_OPEN)
    listed = json.loads(user.ovrin("settle", "--list", "--json", status=LEFT_OPEN))["scenes"][0]
    assert [conflict["proposed"] for conflict in listed["conflicts"]] == ["ours"]
    user.ovrin("settle", status=LEFT_OPEN)
    assert "--take proposed" in user.words()
    user.ovrin("settle", "--take", "proposed")
    user.git("rebase", "--continue")
    assert user.committed() == layers[4]


def test_merge_and_rebase_that_meet_the_same_swap_its_sides(user):
    user.conflict(*ONE_CONFLICT)
    user.ovrin("settle", "--take", "theirs")
    user.git("reset", "-q", "--hard")
    user.git("rebase", "topic", fails=True)
    user.ovrin("settle", "--take", "proposed")  # theirs of the merge is ours now
    assert user.read() == ONE_CONFLICT[1]


def test_decisions_of_a_merge_that_was_given_up_are_proposed_in_the_next(user):
    user.conflict(*(components(name, 1).replace("m_Layer: 0", f"m_Layer: {name[0]}") for name in ("1", "2", "5")))
    user.ovrin("settle", "--set", "*.GameObject.m_Layer=theirs", status=LEFT_OPEN)
    user.git("merge", "--abort")
    user.git("merge", "topic", fails=True)
    listed = json.loads(user.ovrin("settle", "--list", "--json", status=LEFT_OPEN))["scenes"][0]["conflicts"]
    assert [(conflict["property"], conflict["state"], conflict["proposed"]) for conflict in listed] == [
        ("m_Layer", "open", "theirs"), ("m_Name", "open", None)]


def test_scene_that_cant_be_read_is_listed_as_open(user):
    user.conflict(*(text + "--- !o!114 &99\nBehaviour:\n  m_A: [1\n" for text in ONE_CONFLICT))
    assert "No scene" not in user.ovrin("settle", "--list", status=LEFT_OPEN)
    listed = json.loads(user.ovrin("settle", "--list", "--json", status=LEFT_OPEN))["scenes"][0]
    assert "can't be read" in listed["problem"] and listed["conflicts"] == []


def test_broken_file_of_earlier_decisions_is_told_once(user):
    user.conflict(*ONE_CONFLICT)
    user.write("ovrin decisions 1 what\n", ".git/ovrin/decisions")
    user.ovrin("settle", "--list", status=LEFT_OPEN)
    assert ".git/ovrin/decisions can't be made out" in user.words()
    user.ovrin("settle", "--take", "theirs")
    assert "made out" not in user.words() and user.read() == ONE_CONFLICT[1]


def test_file_that_was_changed_by_hand_is_not_replaced_unasked(user):
    user.conflict(*ONE_CONFLICT)
    by_hand = scene("7 Lantern 1")
    user.write(by_hand)
    user.ovrin("settle", "--take", "theirs", status=LEFT_OPEN)
    assert user.read() == by_hand
    assert "--as-is" in user.words() and "--overwrite" in user.words()
    user.ovrin("settle", "--overwrite")
    assert user.read() == ONE_CONFLICT[1]
    user.git("commit", "-qm", "merged")


@pytest.mark.parametrize("link", ["scene.ovrin", "folder"])
def test_nothing_is_written_through_a_link(user, link):
    name = user.name if link == user.name else "folder/scene.ovrin"
    (user.here / "folder").mkdir()
    user.conflict(*ONE_CONFLICT, name)
    outside = user.home / "outside"
    (user.here / link).rename(outside)
    (user.here / link).symlink_to(outside)
    user.ovrin("settle", "--take", "theirs", "--overwrite", status=LEFT_OPEN)
    assert user.read(name) == ONE_CONFLICT[2] and "link" in user.words() and user.records() != []


def test_status_in_the_midst_of_a_merge_forgets_nothing(user):
    user.sides(*ONE_CONFLICT)
    user.git("config", "merge.ovrin.driver", "ovrin merge -- %O %A %B %A %P; code=$?; ovrin status; exit $code")
    user.git("merge", "topic", fails=True)
    user.git("commit", "-qam", "too early", fails=True)
    assert "1 open conflict" in user.words()


def test_hand_made_result_is_taken_unless_it_holds_markers(user):
    user.conflict(*ONE_CONFLICT)
    user.write(scene("7 Lantern 1") + "<<<<<<< ours\n")
    user.ovrin("settle", "--as-is", user.name, status=FAILED)
    assert user.records() != []
    user.write(scene("7 Lantern 1"))
    user.ovrin("settle", "--as-is", user.name)
    user.git("commit", "-qm", "merged")
    assert user.committed() == scene("7 Lantern 1")


def test_merge_that_was_given_up_is_forgotten_with_a_word(user):
    user.conflict(*ONE_CONFLICT)
    user.git("merge", "--abort")
    # Where git is at work it may be the merge that is being made.
    user.write("", ".git/index.lock")
    user.ovrin("status")
    (user.here / ".git/index.lock").unlink()
    assert user.records() == [".merge"]
    user.write(scene("9 Lantern 1"))
    user.git("commit", "-qam", "another change")
    assert user.ovrin("status") == "No scene has open conflicts.\n"
    assert "scene.ovrin is forgotten" in user.words()


def test_decision_that_matches_nothing_changes_nothing(user):
    user.conflict(*CONFLICT_AND_MORE)
    for wrong in (["--set", "10.GameObject.m_Layer=theirs", "--set", "10.GameObject.m_None=ours"],
                  ["--set", "Lamp.m_Layer"], ["--set", "Lamp.m_Layer=mine"], ["--take", "ours", "--under", "Nothing"],
                  ["--take", "ours", "nothing.ovrin"], ["--take", "ours", "/"], ["-i", "nothing"], ["--undo"]):
        user.ovrin("settle", *wrong, status=FAILED)
        assert user.words().startswith("ovrin: ")
    assert user.records() == [".merge"]
    assert user.read() == scene("5 Lamp 3")


def test_decisions_are_kept_and_taken_back(user):
    base, theirs, ours = (components(name, 1).replace("m_Layer: 0", f"m_Layer: {name[0]}")
                          for name in ("1 Lantern", "2 Lamp", "5 Light"))
    user.conflict(base, theirs, ours)
    user.ovrin("settle", "--set", "5 Light.m_Layer=theirs", status=LEFT_OPEN)
    listed = json.loads(user.ovrin("settle", "--list", "--json", status=LEFT_OPEN))["scenes"][0]
    assert {conflict["property"]: (conflict["state"], conflict["decided"]) for conflict in listed["conflicts"]} == {
        "m_Layer": ("settled", "theirs"), "m_Name": ("open", None)}
    assert listed["open"] == 1 and listed["ours"] == "main" and listed["theirs"] == "topic"
    assert user.read() == ours
    user.ovrin("settle", "--undo", status=LEFT_OPEN)
    assert ": 2 open conflicts (" in user.words()
    user.ovrin("settle", "--set", "*.GameObject.m_Layer=theirs", "--take", "base")
    assert user.read() == base.replace("m_Layer: 1", "m_Layer: 2")


def test_file_of_decisions_gives_what_the_engine_gives(user):
    user.conflict(*CONFLICT_AND_OBJECTS)
    for text, name in zip(CONFLICT_AND_OBJECTS, ("base", "theirs", "ours")):
        user.write(text, name)
    user.write("Conflict handling:\nLeft *.GameObject.m_Layer\nRight 10.GameObject.m_Layer\n"
               "Base 10.GameObject.m_Name\n", "decisions")
    user.run("OvrinMerge", "merge", "--force", "--fallback", "none", "-i", "decisions", "base", "theirs", "ours",
             "expected")
    user.ovrin("settle", "-i", "decisions")
    assert user.read() == user.read("expected")


def test_only_the_named_files_are_settled_from_where_the_user_is(user):
    (user.here / "inner").mkdir()
    files = ("one.ovrin", "inner/two.ovrin", "inner/three.ovrin")
    user.conflicts(dict.fromkeys(files, ONE_CONFLICT))
    top, user.here = user.here, user.here / "inner"
    user.ovrin("settle", "--take", "theirs", "two.ovrin")
    assert "Still unmerged: inner/three.ovrin and 1 more" in user.words()
    user.ovrin("settle", "--take", "base", ".")
    user.here = top
    user.ovrin("settle", "--take", "ours", str(top / "one.ovrin"))
    assert [user.read(name) for name in files] == [ONE_CONFLICT[2], ONE_CONFLICT[1], ONE_CONFLICT[0]]
    user.git("commit", "-qm", "merged")


def test_kept_decision_that_matches_nothing_is_told(user):
    user.conflict(scene("1 Lantern 1"), scene("2 Lantern 3"), scene("5 Lantern 4"))
    user.ovrin("settle", "--set", "10.GameObject.m_Layer=theirs", status=LEFT_OPEN)
    progress, = (user.here / ".git/ovrin").glob("*.progress")
    progress.write_text(progress.read_text(encoding="utf-8").replace("m_Layer", "m_Other"), encoding="utf-8")
    user.ovrin("settle", "--list", status=LEFT_OPEN)
    assert "match nothing in this merge have no effect: 10.GameObject.m_Other;" in user.words()


def test_sides_that_contradict_each_other_in_a_loop_of_parents_are_told(user):
    user.conflict(*LOOP)
    user.ovrin("settle", *CONTRADICTION, status=LEFT_OPEN)
    words = "would still be below each other: take one side for all of them"
    assert f"taken: ours, but with the sides that are taken, the objects {words}" in user.ovrin(
        "settle", "--list", status=LEFT_OPEN)
    assert f"you took theirs (topic), but with the sides that are taken, the objects {words}" in user.run(
        "sh", "-c", "ovrin settle --prompt </dev/null", fails=True)
    user.ovrin("settle", "--take", "theirs")


def test_merge_without_the_driver_is_settled_as_well(user):
    user.sides(*CONFLICT_AND_MORE)
    user.git("-c", "merge.ovrin.driver=false", "merge", "topic", fails=True)
    assert user.records() == []
    assert "scene.ovrin: 1 open conflict" in user.ovrin("status", status=LEFT_OPEN)
    user.ovrin("settle", "--take", "theirs")
    user.git("commit", "-qm", "merged")
    assert user.committed() == scene("2 Lamp 3")


def test_another_merge_of_the_file_makes_earlier_decisions_void(user):
    user.sides(*CONFLICT_AND_MORE)
    user.git("checkout", "-qb", "other", "topic")
    user.commit(scene("8 Lantern 3"))
    user.git("checkout", "-q", "main")
    user.git("merge", "topic", fails=True)
    user.git("merge", "--abort")
    user.git("-c", "merge.ovrin.driver=false", "merge", "other", fails=True)
    user.ovrin("settle", "--take", "theirs")
    assert "was merged again without ovrin" in user.words()
    assert user.read() == scene("8 Lamp 3")


def test_scene_that_one_side_removed_is_told_with_the_way_out(user):
    user.sides(*ONE_CONFLICT)
    user.git("rm", "-q", user.name)
    user.git("commit", "-qm", "removed")
    user.git("merge", "topic", fails=True)
    assert "git rm" in user.ovrin("status", status=LEFT_OPEN)
    user.ovrin("settle", "--take", "ours", status=LEFT_OPEN)


def test_scene_that_both_added_waits_for_a_look(user):
    user.conflict(None, scene("1 Lantern 1"), HEADER + game_object(20, 7, "Boat", 1))
    user.ovrin("settle", status=LEFT_OPEN)
    assert "Both sides added the scene" in user.words()
    user.git("commit", "-qam", "too early", fails=True)
    user.ovrin("settle", "--take", "ours")
    user.git("commit", "-qm", "merged")
    assert "Lantern" in user.committed() and "Boat" in user.committed()


# At the call of git that would take the result into the index, before or after it.
@pytest.mark.parametrize("moment", ["kill -9 $PPID; exit", 'GIT "$@"; kill -9 $PPID; exit'])
def test_settling_that_was_killed_is_completed_by_the_next(user, moment):
    user.conflict(*CONFLICT_AND_MORE)
    git = shutil.which("git")
    user.fake("git", f'case "$*" in *update-index*) {moment.replace("GIT", git)};; esac\nexec {git} "$@"')
    user.ovrin("settle", "--take", "theirs", status=-9)
    (user.fakes / "git").unlink()
    user.git("commit", "-qam", "too early", fails=True)
    user.ovrin("settle")
    user.git("commit", "-qm", "merged")
    assert user.committed() == scene("2 Lamp 3") and user.records() == []


ON_FULL_DISK = """
    mount -t tmpfs -o size=600k none .
    cd "$PWD"
    cp -R "$1/." .
    cat /dev/zero >rest 2>/dev/null || true
    before=$(cat scene.ovrin)
    ! ovrin settle --take theirs
    [ "$(cat scene.ovrin)" = "$before" ]
    [ -n "$(git ls-files --unmerged)" ]
    rm rest
    ovrin settle --take theirs
    grep -q "m_Layer: 2" scene.ovrin"""


@pytest.mark.skipif(not can_mount(), reason="disks can't be mounted here")
def test_full_disk_loses_nothing(user):
    user.conflict(*MANY)
    for sample in (user.here / ".git/hooks").glob("*.sample"):
        sample.unlink()
    full = user.home / "full"
    full.mkdir()
    copied, user.here = user.here, full
    user.run("unshare", "-rm", "sh", "-ec", ON_FULL_DISK, "sh", str(copied))


@pytest.mark.skipif(not shutil.which("hg"), reason="hg is not installed")
def test_mercurial_is_told_of_the_settled_scene(user):
    user.run("hg", "init", ".")
    user.run("ovrin", "setup")
    with open(user.home / ".hgrc", "a", encoding="utf-8") as settings:
        settings.write("\n[ui]\nusername = Tester\n")
    for text, back in zip(ONE_CONFLICT, ("", "0", "")):
        user.write(text)
        user.run("hg", "commit", "-qA", "-m", "change", user.name)
        if text == ONE_CONFLICT[1]:
            user.run("hg", "update", "-q", "0")
    user.run("hg", "merge", fails=True)
    assert "scene.ovrin: 1 open conflict" in user.ovrin("status", status=LEFT_OPEN)
    user.ovrin("settle", "--take", "theirs")
    assert user.words().endswith("Next: hg commit\n")
    user.run("hg", "commit", "-m", "merged")
    assert user.run("hg", "cat", user.name) == ONE_CONFLICT[1]
    assert [path.name for path in (user.here / ".hg/ovrin").iterdir()] == ["decisions"]


@pytest.mark.skipif(not shutil.which("svnadmin"), reason="svn is not installed")
def test_subversion_is_told_of_the_settled_scene(user):
    repository = f"file://{user.home}/repository".replace(" ", "%20")
    user.run("svnadmin", "create", f"{user.home}/repository")
    user.run("svn", "checkout", "-q", repository, ".")
    user.run("ovrin", "setup")
    base, theirs, ours = CONFLICT_AND_OBJECTS
    user.write(base)
    user.run("svn", "add", "-q", user.name)
    for text in (base, theirs):
        user.write(text)
        user.run("svn", "commit", "-qm", "change")
    user.run("svn", "update", "-qr", "1")
    user.write(ours)
    user.run("svn", "update", "--force-interactive", "--accept", "launch", fails=None)
    assert "scene.ovrin: 1 open conflict" in user.ovrin("status", status=LEFT_OPEN)
    user.ovrin("settle", "--take", "theirs")
    assert user.run("svn", "status") == f"M       {user.name}\n"
    user.run("svn", "commit", "-qm", "merged")
    assert "m_Layer: 2" in user.read() and "&30" in user.read()
