"""Settles the conflicts of real merges in a real terminal, whose screens are compared as text.

    pytest-3 VersionControl/test_terminal.py --installed build/release/installed
"""

import os
import shlex
import shutil
import signal
import subprocess
import time

import pytest

from car import car, merge_cars
from systems import can_mount, has_terminals
from test_settle import MANY
from test_systems import CONFLICT_AND_MORE, HEADER, ONE_CONFLICT, game_object, scene

pytestmark = [pytest.mark.skipif(not shutil.which("tmux"), reason="tmux is not installed"),
              pytest.mark.skipif(not has_terminals(), reason="terminals can't be made here")]

SECONDS = 30
# A name of wide characters and a combining mark, as files have it, and what a lantern's keeper would do to a terminal.
ODD = [HEADER + game_object(1, layer, r'"\u706F\u53F0 n\u0308 \x1B]0;gone\x07"', 1) for layer in (1, 2, 5)]


class Terminal:
    """A terminal of its own in which the user's shell runs."""

    def __init__(self, user, socket, **environment):
        self.user = user
        self.socket = socket
        settings = user.environment | {"PS1": "$ ", "TERM": "xterm-256color"} | environment
        self.tmux("-f", "/dev/null", "new-session", "-d", "-x", "80", "-y", "24", "-c", str(user.here),
                  # The server brings a TERM and variables of its own.
                  shlex.join(["env", "-i", *(f"{name}={value}" for name, value in settings.items()), "sh"]))
        self.see("$")

    def tmux(self, *arguments):
        return subprocess.run(["tmux", "-u", "-S", self.socket, *arguments], env=self.user.environment, check=True,
                              stdout=subprocess.PIPE, text=True).stdout

    def screen(self, *options):
        return self.tmux("capture-pane", "-p", *options)

    def see(self, *words):
        """Waits until all of these are on the screen, and returns it."""
        until = time.monotonic() + SECONDS
        while not all(word in (screen := self.screen()) for word in words):
            assert time.monotonic() < until, f"{words} aren't in\n{screen}"
            time.sleep(0.02)
        return screen

    def press(self, *keys):
        self.tmux("send-keys", *keys)

    def run(self, command):
        self.tmux("send-keys", "-l", f"clear; {command}; echo status $?")
        self.press("C-j")  # what was killed may leave a terminal that knows no Enter

    def close(self):
        self.tmux("kill-server")


@pytest.fixture(name="terminal")
def fixture_terminal(user):
    opened = []

    def make(**environment):
        opened.append(Terminal(user, f"{user.home}/terminal{len(opened)}", **environment))
        return opened[-1]

    yield make
    for one in opened:
        one.close()


def test_walk_ends_with_what_the_script_gives(user, terminal):
    user.conflict(*CONFLICT_AND_MORE)
    screen = terminal()
    screen.run("ovrin settle")
    shown = screen.see("1 of 1 open · scene.ovrin", "merge: ours is main, theirs is topic", "f Finish")
    assert "m_Layer: both changed it" in shown and "o ours  main" in shown
    screen.press("t")
    screen.see("0 of 1 open", "theirs (topic)", "All is settled: f")
    screen.press("f")
    screen.see("scene.ovrin is settled.", "Next: git commit", "status 0")
    assert user.records() == []
    user.git("commit", "-qm", "merged")
    assert user.committed() == scene("2 Lamp 3")


def test_component_comes_back_with_what_it_requires(user, terminal):
    merge_cars(user)
    screen = terminal()
    screen.run("ovrin settle")
    screen.see("Car · Engine", "remove Car · Engine and what needs it")
    screen.press("t")
    screen.see("0 of 1 open", "f finishes")
    screen.press("o")
    assert " ! " not in screen.see("Engine: ours (main)", "f finishes")
    screen.press("f")
    screen.see("status 0")
    assert user.read() == car("Engine", "Wheel")


def test_fifty_conflicts_of_three_scenes_take_three_keys(user, terminal):
    parts = [[HEADER + "".join("--- " + text.split("--- ")[i] for i in part) for text in MANY]
             for part in (range(1, 18), range(18, 35), range(35, 51))]
    names = ["a.ovrin", "b.ovrin", "c.ovrin"]
    user.conflicts(dict(zip(names, parts)))
    screen = terminal()
    screen.run("ovrin settle")
    screen.see("50 of 50 open · a.ovrin")
    screen.press("a")
    screen.see("Which side for all that is open, in all scenes?")
    screen.press("t")
    screen.see("0 of 50 open", "50 conflicts settled")
    screen.press("f")
    screen.see("c.ovrin is settled.", "status 0")
    user.git("commit", "-qm", "merged")
    assert [user.committed(name) for name in names] == [versions[1] for versions in parts]


@pytest.mark.parametrize("number", [signal.SIGKILL, signal.SIGTERM, signal.SIGHUP, None])
def test_what_was_decided_outlives_the_program(user, terminal, number):
    user.conflicts({"a.ovrin": ONE_CONFLICT, "b.ovrin": ONE_CONFLICT})
    screen = terminal()
    screen.run("sh -c 'echo $$ >process; exec ovrin settle'")
    screen.see("2 of 2 open")
    screen.press("t")
    screen.see("1 of 2 open · b.ovrin")
    if number:
        os.kill(int(user.read("process")), number)
    else:
        screen.press("C-c")
    if number != signal.SIGKILL:
        assert "n Next" not in screen.see("what you decided is kept", "$")
    screen.run("stty sane")
    screen.see("status 0")  # what the first one left on the screen is gone
    screen.run("ovrin settle")
    screen.see("1 of 2 open · b.ovrin")
    screen.press("u")
    screen.see("2 of 2 open · a.ovrin")
    screen.press("q")
    screen.see("2 open conflicts left", "status 1")
    assert user.read("a.ovrin") == ONE_CONFLICT[2]


def test_terminal_is_left_as_it_was(user, terminal):
    user.conflict(*ONE_CONFLICT)
    screen = terminal()
    screen.run("stty -a >before")
    for end in ("q", "C-c"):
        screen.run("ovrin settle")
        screen.see("1 of 1 open")
        screen.press(end)
        screen.see("ovrin settle\" goes on")
        screen.run("stty -a >after; cmp before after && echo alike")
        assert "1 of 1 open" not in screen.see("alike")


def test_screen_follows_the_size_of_its_window(user, terminal):
    user.conflict(*ONE_CONFLICT)
    screen = terminal()
    screen.run("ovrin settle")
    screen.see("1 of 1 open")
    screen.tmux("resize-window", "-x", "160", "-y", "50")
    wide = screen.see("b base", "a All open  g As before").splitlines()
    assert any("b base" in line and "o ours" in line and "t theirs" in line for line in wide)
    screen.tmux("resize-window", "-x", "60", "-y", "20")
    screen.see("This window has 60 x 20 characters")
    screen.tmux("resize-window", "-x", "80", "-y", "24")
    screen.see("1 of 1 open", "f Finish")


@pytest.mark.parametrize("locale", ["C.UTF-8", "C", "de_XX.UTF-8"])
def test_locale_says_which_characters_are_shown(user, terminal, locale):
    user.conflict(*ODD)
    screen = terminal(LC_ALL=locale)
    screen.run("ovrin settle")
    shown = screen.see("1 of 1 open", "]0;gone")
    assert r"\x1b]0;gone\x07" in shown
    if locale == "C":
        assert r"\u706f\u53f0 n\u0308" in shown and shown.isascii()
    else:
        assert "灯台 n\u0308" in shown and "│" in shown


# As a keyboard or a paste of another locale brings them, and what is cut in the midst of a character.
@pytest.mark.parametrize("locale", ["C.UTF-8", "C"])
def test_bytes_that_are_no_characters_do_no_harm(user, terminal, locale):
    user.conflict(*ONE_CONFLICT)
    screen = terminal(LC_ALL=locale)
    screen.run("ovrin settle")
    screen.see("1 of 1 open")
    for stray in (["e4"], ["80"], ["e2", "9a"], ["f4", "90", "80", "80"], ["e0", "81", "b4"], ["ff"]):
        screen.tmux("send-keys", "-H", *stray)
        screen.see("That key does nothing here")
        screen.press("n")
    screen.press("/", "x")
    screen.tmux("send-keys", "-H", "e2", "9a", "93", "e4")
    screen.see("Search: x⚓_" if locale == "C.UTF-8" else "Search: x\\u2693_")
    screen.press("Escape", "t")
    screen.see("0 of 1 open")


def test_colours_are_left_out_on_request(user, terminal):
    user.conflict(*ONE_CONFLICT)
    colours = []
    for setting in ("", "1"):
        screen = terminal(NO_COLOR=setting)
        screen.run("ovrin settle")
        screen.see("1 of 1 open")
        colours.append("\x1b[3" in screen.screen("-e").replace("\x1b[39m", ""))
    assert colours == [True, False]


@pytest.mark.parametrize("name", ["dumb", "unheard-of", ""])
def test_terminal_without_a_screen_is_asked_by_prompts(user, terminal, name):
    user.conflict(*CONFLICT_AND_MORE)
    screen = terminal(TERM=name)
    screen.run("ovrin settle")
    screen.see("1 of 1 open · scene.ovrin", "    theirs  2    topic", "o ours, t theirs, b base")
    screen.press("t", "Enter")
    screen.see("0 of 1 open")
    screen.press("f", "Enter")
    screen.see("scene.ovrin is settled.", "status 0")
    assert user.read() == scene("2 Lamp 3")


def test_prompts_take_their_answers_from_a_pipe(user):
    user.conflict(*CONFLICT_AND_MORE)
    told = user.run("sh", "-c", "printf 'b\n' | ovrin settle --prompt", fails=True)
    assert "1 of 1 open" in told and "0 of 1 open" in told
    assert "settled, base" in user.ovrin("settle", "--list")
    user.run("sh", "-c", "printf 'u\nt\nf\n' | ovrin settle --prompt")
    assert user.read() == scene("2 Lamp 3")


def test_file_that_was_changed_by_hand_is_asked_about(user, terminal):
    user.conflict(*ONE_CONFLICT)
    user.write(scene("7 Lantern 1"))
    screen = terminal()
    screen.run("ovrin settle")
    screen.see("1 of 1 open")
    screen.press("t", "f")
    screen.see("was changed by hand", "y yes")
    screen.press("y")
    screen.see("scene.ovrin is settled.", "status 0")
    assert user.read() == ONE_CONFLICT[1]


def test_mergetool_of_git_settles_one_scene_after_the_other(user, terminal):
    user.conflicts({"a.ovrin": ONE_CONFLICT, "b.ovrin": ONE_CONFLICT})
    screen = terminal()
    screen.run("git mergetool --no-prompt --tool ovrin")
    screen.see("1 of 1 open · a.ovrin")
    screen.press("t", "f")
    screen.see("1 of 1 open · b.ovrin")
    screen.press("q")
    screen.see("merge of b.ovrin failed")
    screen.press("n", "Enter")
    screen.see("status 1")
    assert user.read("b.ovrin") == ONE_CONFLICT[2]
    assert user.git("ls-files", "--unmerged", "a.ovrin") == ""
    user.ovrin("settle", "--take", "base")
    user.git("commit", "-qm", "merged")
    assert user.committed("a.ovrin") == ONE_CONFLICT[1]


def test_scene_that_both_added_is_looked_through(user, terminal):
    user.conflict(None, scene("1 Lantern 1"), HEADER + game_object(20, 7, "Boat", 1))
    screen = terminal()
    screen.run("ovrin settle")
    screen.see("1 of 1 open", "Both sides added this scene", "  Lantern", "  Boat")
    screen.press("Enter")
    screen.see("0 of 1 open")
    screen.press("Enter")
    screen.see("scene.ovrin is settled.", "status 0")
    user.git("commit", "-qm", "merged")
    assert "Lantern" in user.committed() and "Boat" in user.committed()


def test_what_follows_from_a_decision_is_told_and_mended(user, terminal):
    def version(layer, target, *lanterns):
        return (HEADER + "".join(game_object(10, layer, name, 1) for name in lanterns)
                + f"--- !o!1 &20\nGameObject:\n  m_Name: Keeper\n  m_Target: {{fileID: {target}}}\n")

    user.conflict(version(1, 0, "Lantern"), version(1, 0), version(5, 10, "Lantern"))
    screen = terminal()
    screen.run("ovrin settle")
    screen.see("theirs removed it and ours changed it")
    screen.press("t")
    screen.see("Keeper: m_Target refers to Lantern, which was removed by theirs", "1 keep Lantern, too")
    screen.press("1")
    assert " ! " not in screen.see("Done: keep Lantern, too")
    screen.press("f")
    screen.see("scene.ovrin is settled.", "status 0")
    assert "Lantern" in user.read() and "{fileID: 10}" in user.read()


# Outside of the small disk files say when it is to be full.
WITH_A_SMALL_DISK = """
    mount -t tmpfs -o size=600k none "$HOME/full"
    cp -R . "$HOME/full"
    cd "$HOME/full"
    await() { while [ ! -e "$HOME/$1" ]; do sleep 0.05; done; }
    (await fill; cat /dev/zero >rest 2>/dev/null; touch "$HOME/filled"
     await empty; rm rest; touch "$HOME/emptied") >/dev/null 2>&1 &
    ovrin settle"""


def wait_for(path):
    until = time.monotonic() + SECONDS
    while not path.exists():
        assert time.monotonic() < until, path
        time.sleep(0.02)


@pytest.mark.skipif(not can_mount(), reason="disks can't be mounted here")
def test_full_disk_under_the_screen_is_told_and_keeps_no_step(user, terminal):
    user.conflict(*MANY)
    for sample in (user.here / ".git/hooks").glob("*.sample"):
        sample.unlink()
    (user.home / "full").mkdir()
    user.write(WITH_A_SMALL_DISK, "run")
    screen = terminal()
    screen.tmux("resize-window", "-x", "200", "-y", "50")  # long paths are told
    screen.run("unshare -rm sh run")
    screen.see("50 of 50 open")
    screen.press("t")
    screen.see("49 of 50 open")
    (user.home / "fill").touch()
    wait_for(user.home / "filled")
    for key in ("t", "T", "u"):
        screen.press(key)
        screen.see("49 of 50 open", "No space left on device", "stays as it was")
        screen.press("n")
    (user.home / "empty").touch()
    wait_for(user.home / "emptied")
    screen.press("a", "o")
    screen.see("0 of 50 open")
    screen.press("u", "q")
    screen.see("49 open conflicts left", "status 1")
