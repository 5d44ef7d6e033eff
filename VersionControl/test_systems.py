"""Merges, settles and compares scenes with real version control systems through the installed set-up.

    pytest-3 VersionControl --installed build/release/installed -k mercurial

A fact starts in an empty folder, with an empty home directory and nothing of the user's own settings.
"""

import pathlib
import re
import shutil
import tempfile

import pytest

from systems import Git, Mercurial, Subversion

HEADER = "%YAML 1.1\n%TAG !o! tag:ovrin.dev,2011:\n"


def game_object(number, layer, name, visible, between=""):
    return (f"--- !o!1 &{number}\nGameObject:\n  m_Layer: {layer}\n  m_Name: {name}\n"
            f"{between}  m_Visible: {visible}\n")


def scene(words, between=""):
    """The scene "LAYER NAME VISIBLE [ID]": an object so short that changes of different fields meet in a
    merge by lines, unless fields stand between them; and another object of that id at the end."""
    layer, name, visible, *boats = words.split()
    return (HEADER + game_object(10, layer, name, visible, between)
            + "".join(game_object(number, 0, "Boat", 1) for number in boats))


def components(name, *ids):
    listed = "".join(f"  - component: {{fileID: {number}}}\n" for number in ids)
    return f"{HEADER}--- !o!1 &10\nGameObject:\n  m_Component:\n{listed}  m_Name: {name}\n  m_Layer: 0\n"


# Base, theirs and ours.
OTHER_FIELDS = scene("1 Lantern 1"), scene("2 Lantern 1"), scene("1 Lamp 1")
ONE_CONFLICT = scene("1 Lantern 1"), scene("2 Lantern 1"), scene("5 Lantern 1")
CONFLICT_AND_MORE = scene("1 Lantern 1"), scene("2 Lantern 3"), scene("5 Lamp 1")
OTHER_ELEMENTS = components("base", 1, 2), components("base", 1, 3, 2), components("ours", 1, 4, 2)
OTHER_OBJECTS = scene("1 Lantern 1"), scene("1 Lantern 1 20"), scene("1 Lantern 1 30")
CONFLICT_AND_OBJECTS = scene("1 Lantern 1"), scene("2 Lantern 3 20"), scene("5 Lamp 1 30")

NUMBERS = "".join(f"{number}\n" for number in range(1, 10))

# What may become of a program, as shell commands; None is its absence.
FAILURES = ["exec /nowhere/program", "exit 1", "exit 3", "kill -9 $$", "kill -SEGV $$", None]


@pytest.fixture(name="system")
def fixture_system(request):
    if not shutil.which(request.param.program):
        pytest.skip(f"{request.param.program} is not installed")
    installed = pathlib.Path(request.config.getoption("--installed")).resolve()
    with tempfile.TemporaryDirectory() as folder:
        yield request.param(installed, pathlib.Path(folder))


def holds_for(*systems):
    names = [system.__name__.lower() for system in systems]
    return pytest.mark.parametrize("system", systems, ids=names, indirect=True)


@holds_for(Git, Mercurial)
def test_merge_combines_fields(system):
    system.sides(*OTHER_FIELDS)
    system.merge()
    assert "conflict" not in system.report
    assert not system.is_open()
    assert system.read() == scene("2 Lamp 1")
    system.conclude()


@holds_for(Git, Mercurial, Subversion)
def test_merge_combines_objects(system):
    system.sides(*OTHER_OBJECTS)
    system.merge()
    assert not system.is_open()
    assert system.read() == scene("1 Lantern 1 20") + game_object(30, 0, "Boat", 1)
    system.conclude()


@holds_for(Git, Mercurial)
def test_merge_combines_lists(system):
    system.sides(*OTHER_ELEMENTS)
    system.merge()
    assert system.read() == components("ours", 1, 3, 4, 2)
    system.conclude()


@holds_for(Git)
@pytest.mark.parametrize("sides", [OTHER_FIELDS, OTHER_ELEMENTS, OTHER_OBJECTS])
def test_a_merge_by_lines_would_tear_the_same(system, sides):
    for name, text in zip(("base", "theirs", "ours"), sides):
        system.write(text, name)
    system.run("git", "merge-file", "ours", "base", "theirs", fails=True)


@holds_for(Git, Mercurial)
def test_other_files_are_merged_by_lines(system):
    system.sides(NUMBERS, NUMBERS.replace("1", "one"), NUMBERS.replace("9", "nine"), "numbers.txt")
    system.merge()
    assert system.read("numbers.txt") == NUMBERS.replace("1", "one").replace("9", "nine")


def settle_conflict_and_objects(system):
    """Takes theirs after a merge of CONFLICT_AND_OBJECTS that left ours."""
    assert system.read() == scene("5 Lamp 3 20") + game_object(30, 0, "Boat", 1)
    system.run("ovrin", "settle", "--take", "theirs")
    assert not system.is_open()
    assert system.read() == scene("2 Lamp 3 20") + game_object(30, 0, "Boat", 1)
    system.conclude()


@holds_for(Mercurial, Subversion)
@pytest.mark.parametrize("name", ["a b.ovrin", "'quoted\" $x.ovrin", "-dash.ovrin", "Hafen \u2693=1.ovrin", "*[a].ovrin"])
def test_any_name_is_merged_recorded_and_settled(system, name):
    system.name = name
    system.sides(*CONFLICT_AND_OBJECTS)
    system.merge(fails=True)
    assert system.is_open()
    settle_conflict_and_objects(system)


# What is set up for all repositories of a user meets files of other programs, too.
@holds_for(Git, Mercurial)
def test_what_is_no_scene_but_for_its_name_is_merged_by_lines(system):
    system.sides(NUMBERS, NUMBERS.replace("1", "one"), NUMBERS.replace("9", "nine"), "numbers.meta")
    system.merge()
    assert "numbers.meta is no scene" in system.report
    assert system.read("numbers.meta") == NUMBERS.replace("1", "one").replace("9", "nine")


@holds_for(Git, Mercurial)
def test_what_is_no_scene_keeps_its_conflicts_between_markers(system):
    system.sides("1\n", "2\n", "3\n", "number.meta")
    system.merge(fails=True)
    assert system.read("number.meta") == "<<<<<<< ours\n3\n=======\n2\n>>>>>>> theirs\n"
    system.abort()


@holds_for(Git, Mercurial)
def test_conflict_stays_open_with_its_report(system):
    system.sides(*CONFLICT_AND_MORE)
    system.merge(fails=True)
    assert f"ovrin: {system.name}: 1 open conflict" in system.report
    assert re.search(r"\nLamp \(10, .*\n  m_Layer: .*\n +base +1.*\n +ours +5.*\n +theirs +2.*\n", system.report)
    assert system.is_open()
    # What isn't open is merged; at what is open stands ours.
    assert system.read() == scene("5 Lamp 3")
    assert system.versions() == CONFLICT_AND_MORE
    system.conclude(fails=True)
    system.abort()
    assert system.read() == scene("5 Lamp 1")


@holds_for(Git, Mercurial)
def test_taking_theirs_settles_a_conflict_and_keeps_the_rest(system):
    system.sides(*CONFLICT_AND_MORE)
    system.merge(fails=True)
    system.run("ovrin", "settle", "--take", "theirs")
    assert not system.is_open()
    assert system.read() == scene("2 Lamp 3")
    system.conclude()


@holds_for(Subversion)
def test_what_subversion_leaves_is_merged_and_settled_in_the_same_way(system):
    system.sides(*CONFLICT_AND_OBJECTS)
    system.merge()
    assert f"ovrin: {system.name}: 1 open conflict" in system.report
    assert system.is_open()
    assert system.versions() == CONFLICT_AND_OBJECTS
    settle_conflict_and_objects(system)


@holds_for(Git, Mercurial)
def test_both_added_stays_open_and_loses_nothing(system):
    theirs, ours = scene("2 Lantern 1"), scene("5 Lantern 1 20")
    system.sides(None, theirs, ours)
    system.merge(fails=True)
    assert "Both sides added the file" in system.report
    assert system.is_open()
    assert system.read() == ours
    assert system.versions() == (theirs, ours)
    system.run("ovrin", "settle", "--take", "theirs")
    assert not system.is_open()
    assert system.read() == scene("2 Lantern 1 20")


@holds_for(Git, Mercurial)
def test_both_added_is_looked_through_even_without_a_conflict(system):
    system.sides(None, scene("1 Lantern 1"), HEADER + game_object(20, 7, "Boat", 1))
    system.merge(fails=True)
    assert system.is_open()
    assert "m_Name: Lantern" in system.read()
    assert "m_Name: Boat" in system.read()


# Mercurial merges by lines where it doesn't find a tool: far apart, so that this would be clean.
@holds_for(Git, Mercurial)
def test_failing_program_merges_nothing(system):
    between = "".join(f"  m_Field{number}: 0\n" for number in range(9))
    system.sides(*(scene(words, between) for words in ("1 Lantern 1", "2 Lantern 1", "1 Lantern 3")))
    for failure in FAILURES:
        system.merge_with(failure)
        assert system.is_open(), failure
        system.abort()
    system.merge()
    assert system.read() == scene("2 Lantern 3", between)


@holds_for(Subversion)
@pytest.mark.parametrize("failure", FAILURES)
def test_failing_program_leaves_the_conflict(system, failure):
    system.sides(*CONFLICT_AND_OBJECTS)
    system.merge_with(failure)
    assert system.is_open()
    assert system.versions() == CONFLICT_AND_OBJECTS


@holds_for(Git)
@pytest.mark.parametrize("script", ["exit 1", "true", "kill -9 $$", None])
def test_failing_merge_tool_leaves_the_conflict(system, script):
    system.use_tool(script)
    system.sides(*CONFLICT_AND_OBJECTS)
    system.merge_with_tool(fails=True)
    assert system.is_open()
    assert system.versions() == CONFLICT_AND_OBJECTS


@holds_for(Git)
def test_merge_tool_is_shown_the_premerged_files(system):
    system.use_tool('cp "$1" shown.base; cp "$2" shown.left; cp "$3" shown.right; cp "$3" "$4"')
    system.sides(*CONFLICT_AND_MORE)
    system.merge_with_tool()
    # Only the layer is left to differ.
    assert system.read("shown.base") == scene("1 Lamp 3")
    assert system.read("shown.left") == scene("2 Lamp 3")
    assert system.read("shown.right") == system.read() == scene("5 Lamp 3")
    assert not system.is_open()


@holds_for(Git)
@pytest.mark.parametrize("command", ["rebase", "cherry-pick"])
def test_rebase_and_cherry_pick_combine_fields_and_stop_at_conflicts(system, command):
    system.sides(*OTHER_FIELDS)
    system.run("git", command, "theirs")
    assert not system.is_open()
    assert system.read() == scene("2 Lamp 1")
    system.commit(scene("5 Lamp 1"))
    system.run("git", "checkout", "-q", "theirs")
    system.commit(scene("7 Lantern 1"))
    system.run("git", command, "main", fails=True)
    assert system.is_open()
    system.run("git", command, "--abort")


@holds_for(Git)
def test_stash_pop_combines_fields_and_stops_at_conflicts(system):
    system.sides(scene("1 Lantern 1"), scene("2 Lantern 1"), scene("1 Lantern 3"))
    system.write(scene("1 Lamp 3"))
    system.run("git", "stash", "-q")
    system.merge()
    system.run("git", "stash", "pop")
    assert system.read() == scene("2 Lamp 3")
    system.run("git", "stash", "-q")
    system.commit(scene("2 Boat 3"))
    system.run("git", "stash", "pop", fails=True)
    assert system.is_open()
    assert len(system.run("git", "stash", "list").splitlines()) == 1


# Each side merged the other's first change and settled the conflict in its own way: two bases.
@holds_for(Git)
def test_criss_cross_base_holds_no_conflict_markers(system):
    system.sides(*ONE_CONFLICT)
    system.run("git", "branch", "first")
    system.merge(fails=True)
    system.commit(scene("5 Lantern 1"))
    system.run("git", "checkout", "-q", "theirs")
    system.run("git", "merge", "-q", "first", fails=True)
    system.commit(scene("2 Lantern 1"))
    system.commit(scene("2 Lamp 1"))
    system.run("git", "checkout", "-q", "main")
    system.commit(scene("5 Lantern 3"))
    assert len(system.run("git", "merge-base", "--all", "main", "theirs").splitlines()) == 2
    system.merge(fails=True)
    assert system.report.count("open conflict,") == 1
    assert system.is_open()
    assert system.versions()[0] == scene("1 Lantern 1")
    assert system.read() == scene("5 Lamp 3")


@holds_for(Git)
@pytest.mark.parametrize("ours", ["", "no scene", scene("1 Lantern 1") + "<<<<<<< ours\n"])
def test_unreadable_side_merges_nothing(system, ours):
    system.sides(scene("1 Lantern 1"), scene("2 Lantern 1"), ours)
    system.merge(fails=True)
    assert system.is_open()
    assert system.read() == ours


@holds_for(Mercurial)
def test_conflicts_of_other_files_are_not_ours_to_merge(system):
    system.sides("1\n", "2\n", "3\n", "number.txt")
    system.fake("ovrin", "touch called; exit 1")
    system.run("hg", "merge", "--config", "ui.merge=", fails=True)
    assert not system.exists("called")


@holds_for(Subversion)
def test_merge_of_a_branch_combines_objects(system):
    base, theirs, ours = OTHER_OBJECTS
    system.sides(base, base, base)
    system.run("svn", "copy", "-q", system.name, "branch.ovrin")
    system.run("svn", "commit", "-qm", "copied")
    system.write(theirs, "branch.ovrin")
    system.commit(ours)
    system.run("svn", "update", "-q")
    branch = f"{system.repository}/branch.ovrin"
    system.run("svn", "merge", "--force-interactive", "--accept", "launch", branch, system.name)
    assert not system.is_open()
    assert system.read() == theirs + game_object(30, 0, "Boat", 1)


@holds_for(Git)
def test_diff_lists_changes_instead_of_lines(system):
    system.start()
    system.commit(scene("1 Lantern 1"))
    system.write(scene("2 Lantern 1"))
    out = system.run("git", "diff")
    assert re.search("m_Layer.*1 . 2", out)
    assert "\n@@" not in out
    system.commit(scene("2 Lantern 1"))
    assert "m_Layer" in system.run("git", "log", "-1", "--ext-diff", "-p")


@holds_for(Git)
def test_diff_shows_added_removed_and_unmerged_files(system):
    system.sides(*ONE_CONFLICT)
    assert re.search(r"added +Lantern \(10\)", system.run("git", "show", "--ext-diff", "-p", "HEAD~"))
    assert re.search(r"added +Lantern \(10\)", system.run("git", "diff", "HEAD~2", "HEAD"))
    assert re.search(r"removed +Lantern \(10\)", system.run("git", "diff", "HEAD", "HEAD~2"))
    system.merge(fails=True)
    system.run("git", "diff")


@holds_for(Git)
def test_diff_of_a_file_that_is_no_scene_is_by_lines(system):
    system.start()
    system.commit(scene("1 Lantern 1"))
    system.write("no scene\n")
    assert "\n+no scene\n" in system.run("git", "diff")
