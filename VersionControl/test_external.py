"""Hands the conflicts of merges to the merge tool of the user's choice.

    pytest-3 VersionControl/test_external.py --installed build/release/installed
"""

import pytest

from test_systems import CONFLICT_AND_MORE, scene
from user import FAILED


def test_merge_tool_settles_what_it_is_shown(user):
    user.use_tool('cp "$1" shown; cp "$3" "$4"')
    user.conflict(*CONFLICT_AND_MORE)
    user.git("mergetool", "--no-prompt", "--tool", "ovrin-external")
    assert user.read("shown") == scene("1 Lamp 3")
    assert user.read() == scene("5 Lamp 3") and user.records() == []
    user.git("commit", "-qm", "merged")


@pytest.mark.parametrize("script", ["exit 1", "true", "kill -9 $$", None])
def test_merge_tool_that_fails_leaves_the_conflict(user, script):
    user.use_tool(script)
    user.conflict(*CONFLICT_AND_MORE)
    before = user.read()
    scratch = user.home / "scratch"
    scratch.mkdir()
    user.git("mergetool", "--no-prompt", "--tool", "ovrin-external", fails=True, TMPDIR=str(scratch))
    assert user.read() == before and user.records() == [".merge"]
    assert not any(scratch.iterdir())


@pytest.mark.parametrize("base", ["", None])
def test_merge_tool_is_shown_no_objects_where_there_is_no_base(user, base):
    user.start()
    user.use_tool('cp "$1" shown; cp "$2" "$4"')
    versions = {"-ours": scene("5 Lantern 1"), "-theirs": scene("2 Lantern 1"), "-result": "before\n"}
    for name, text in versions.items():
        user.write(text, name)
    if base is not None:
        user.write(base, "-base")
    user.ovrin("settle", "--with-tool", "--", "-base", "-ours", "-theirs", "-result")
    assert "m_Layer" not in user.read("shown") and user.read("-result") == versions["-theirs"]
    user.ovrin("settle", "--with-tool", "--", "-base", "-nothing", "-theirs", "-result", status=FAILED)
    assert user.read("-result") == versions["-theirs"] and "-result is as it was" in user.words()
