"""What ovrin status keeps from commits, with the hook that ovrin setup --local writes.

    pytest-3 VersionControl/test_guard.py --installed build/release/installed
"""

import pytest

from test_systems import CONFLICT_AND_MORE, ONE_CONFLICT, scene
from user import FAILED


def test_commit_is_refused_until_the_conflict_is_settled(user):
    user.conflict(*CONFLICT_AND_MORE)
    user.git("commit", "-qam", "too early", fails=True)
    assert "scene.ovrin: 1 open conflict" in user.words()
    assert "settle --list" in user.words() and "--no-verify" in user.words()
    user.ovrin("settle", "--take", "theirs")
    assert user.words() == "scene.ovrin is settled.\nNext: git commit\n"
    user.git("commit", "-qm", "merged")
    assert user.committed() == scene("2 Lamp 3")
    assert user.records() == [] and user.git("status", "--porcelain") == ""
    assert user.ovrin("status") == "No scene has open conflicts.\n"


def test_stash_is_guarded_without_an_operation_under_way(user):
    user.sides(scene("1 Lantern 1"), scene("1 Lantern 1 20"), scene("5 Lantern 1"))
    user.write(scene("5 Lantern 4"))
    user.git("stash", "-q")
    user.commit(scene("5 Lantern 6"))
    user.git("stash", "pop", fails=True)
    user.git("commit", "-qam", "too early", fails=True)
    user.git("add", user.name)
    user.git("commit", "-qm", "too early", fails=True)
    user.write("other words\n", "readme")
    user.git("commit", "-qm", "another file", "--", "readme")
    user.git("commit", "-qam", "too early", fails=True)
    user.git("checkout", "-q", "HEAD", "--", user.name)
    assert user.ovrin("status") == "No scene has open conflicts.\n"
    assert "scene.ovrin is forgotten" in user.words()


@pytest.mark.parametrize("command,settled", [
    ("stash pop", "7 Lamp 3"), ("checkout -m topic", "7 Lantern 3"), ("cherry-pick -n topic", "2 Lamp 3"),
    ("merge --squash topic", "2 Lamp 3")])
def test_what_leaves_no_trace_of_itself_is_guarded_and_settled(user, command, settled):
    user.sides(*CONFLICT_AND_MORE)
    if command == "stash pop":
        user.write(scene("7 Lamp 3"))
        user.git("stash", "-q")
        user.commit(scene("6 Lamp 1"))
    if command == "checkout -m topic":
        user.write(scene("7 Lamp 1 20"))
        settled += " 20"
    user.git(*command.split(), fails=None)
    user.git("add", user.name)
    user.git("commit", "-qm", "too early", fails=True)
    user.ovrin("settle", "--take", "theirs")
    assert ("git stash drop" in user.words()) == (command == "stash pop")
    user.git("commit", "-qm", "settled")
    assert user.committed() == scene(settled)
    assert user.records() == []


def test_added_file_is_not_taken_for_a_settled_one(user):
    user.conflict(*ONE_CONFLICT)
    user.git("add", user.name)
    user.git("commit", "-qm", "too early", fails=True)
    user.ovrin("settle", "--as-is", user.name)
    user.git("commit", "-qm", "merged")
    assert user.committed() == ONE_CONFLICT[2]


def test_forgotten_conflict_leaves_the_file_to_the_user(user):
    user.conflict(*ONE_CONFLICT)
    user.ovrin("settle", "--forget", status=FAILED)
    user.ovrin("settle", "--forget", user.name)
    assert user.records() == [] and user.git("ls-files", "--unmerged") != ""
    user.git("commit", "-qam", "merged")


@pytest.mark.parametrize("backend", ["--merge", "--apply"])
def test_rebase_that_goes_on_by_itself_is_guarded_too(user, backend):
    user.sides(*CONFLICT_AND_MORE)
    user.git("rebase", backend, "topic", fails=True)
    user.git("add", user.name)
    user.git("rebase", "--continue", fails=True, GIT_EDITOR="true")
    assert "scene.ovrin: 1 open conflict" in user.words() and "--no-verify" not in user.words()
    user.ovrin("settle", "--take", "theirs")
    user.git("rebase", "--continue", GIT_EDITOR="true")
    assert user.committed() == scene("5 Lamp 3") and user.records() == []


@pytest.mark.parametrize("backend", ["--merge", "--apply"])
def test_commit_that_a_rebase_skips_holds_up_no_other(user, backend):
    user.sides(*ONE_CONFLICT)
    user.commit("other words\n", "readme")
    user.git("rebase", backend, "topic", fails=True)
    user.git("rebase", "--skip", GIT_EDITOR="true")
    assert user.git("show", "HEAD:readme") == "other words\n" and user.committed() == ONE_CONFLICT[1]
