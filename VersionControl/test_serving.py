"""How ovrin with a page begins and ends: its browser, its server, other users.

    pytest-3 VersionControl/test_serving.py --installed build/release/installed
"""

import os
import pathlib
import shutil
import signal
import subprocess
import sys
import time

import pytest

from page import Page, has_ended, interrupt, seconds_since
from test_systems import ONE_CONFLICT
from user import FAILED, LEFT_OPEN


def test_page_that_is_gone_ends_the_program_and_a_reload_does_not(page):
    for pause in (2, 0):
        with page.connect() as stream:
            stream.sendall(f"GET /{page.token}/api/alive HTTP/1.1\r\nHost: {page.host}\r\n\r\n".encode())
            assert b"text/event-stream" in stream.recv(4096)
        time.sleep(pause)
    begun = time.monotonic()
    gate = page.gate()
    status, said = page.end()
    assert status == LEFT_OPEN and 5 < seconds_since(begun) < 15 and "1 open conflict" in said
    assert has_ended(gate)


@pytest.mark.parametrize("end", [signal.SIGKILL, signal.SIGTERM, signal.SIGSEGV])
def test_dead_server_is_told_and_nothing_is_lost(page, end):
    page.step("take", item=0, side="theirs")
    os.kill(page.gate(), end)
    status, said = page.end()
    assert status == FAILED and "ovrin-web" in said and "Nothing is lost" in said
    page.user.ovrin("settle")
    assert page.user.read() == ONE_CONFLICT[1]


@pytest.mark.parametrize("end", [signal.SIGKILL, signal.SIGINT, signal.SIGTERM, signal.SIGHUP])
def test_server_does_not_outlive_the_program(page, end):
    gate = page.gate()
    page.step("take", item=0, side="theirs")
    os.kill(page.process.pid, end)
    status, _ = page.end()
    assert status == (-end if end == signal.SIGKILL else LEFT_OPEN)
    assert has_ended(gate)
    page.user.ovrin("settle")


def test_interrupt_ends_both(page):
    gate = page.gate()
    interrupt(page)
    status, said = page.end()
    assert status == LEFT_OPEN and "kept" in said and has_ended(gate)


def test_port_is_the_wanted_one_and_nobody_elses(page):
    user = page.user
    user.ovrin("settle", "--web", "--no-browser", "--port", page.port, status=FAILED)
    assert page.port in user.words() and "--port" in user.words()


def test_browser_is_opened_without_a_shell(web_user):
    web_user.conflict(*ONE_CONFLICT)
    web_user.fake("my-browser", 'readlink /proc/$$/fd/[0-9] > "$HOME/files"; printf "%s\\n" "$#" "$@" > "$HOME/opened"')
    with Page(web_user, "settle", "--web", BROWSER="no-such-program:my-browser --new $(touch x) %s") as page:
        opened = web_user.home / "opened"
        while not (opened.exists() and opened.read_text().endswith("\n")):
            time.sleep(0.05)
        assert opened.read_text().splitlines() == ["4", "--new", "$(touch", "x)", page.address]
    assert not web_user.exists("x")
    # Besides what it opened itself it has nothing: neither the server's socket nor the repository's files.
    own = {str(web_user.fakes / "my-browser"), str(web_user.home / "files")}
    assert set((web_user.home / "files").read_text().splitlines()) <= {"/dev/null"} | own


@pytest.mark.parametrize("browser", ["no-such-program", "false"])
def test_browser_that_cannot_be_opened_is_told(web_user, browser):
    web_user.conflict(*ONE_CONFLICT)
    with Page(web_user, "settle", "--web", BROWSER=browser) as page:
        assert "Ctrl-C" in page.process.stderr.readline().decode()
        assert "open the address yourself" in page.process.stderr.readline().decode()
        assert page.get("session")["open"] == 1


def test_nothing_to_settle_serves_nothing(user):
    user.start()
    user.ovrin("settle", "--web", "--no-browser")
    assert "No scene has open conflicts" in user.words()


def test_without_the_server_the_other_ways_are_told(user, tmp_path):
    user.conflict(*ONE_CONFLICT)
    installed = pathlib.Path(shutil.which("ovrin", path=user.environment["PATH"])).resolve().parent
    for name in ("ovrin", "mergerules.txt", "mergespecfile.txt"):
        shutil.copy(installed / name, tmp_path)
    user.ovrin("settle", "--web", status=FAILED, PATH=f"{tmp_path}:{user.environment['PATH']}")
    assert "ovrin-web" in user.words() and '"ovrin settle"' in user.words()


@pytest.mark.skipif(os.getuid() != 0 or not shutil.which("setpriv"), reason="needs root to be two users")
def test_another_user_who_knows_the_address_gets_nothing(web_user):
    """Command lines are public, and that of the browser has the address."""
    as_other = ["setpriv", "--reuid", "12345", "--regid", "12345", "--clear-groups"]
    installed = pathlib.Path(shutil.which("ovrin", path=web_user.environment["PATH"])).resolve().parent
    if subprocess.run([*as_other, "test", "-r", installed / "mergerules.txt"], check=False).returncode != 0:
        pytest.skip("another user can't reach the programs that are tried")
    web_user.conflict(*ONE_CONFLICT)
    here = pathlib.Path(web_user.here).parent
    for folder, _, names in os.walk(here):
        for name in (folder, *(os.path.join(folder, name) for name in names)):
            os.chown(name, 12345, 12345, follow_symlinks=False)
    web_user.fake("as-other", f'exec {" ".join(as_other)} "$@"')
    with Page(web_user, "settle", "--web", "--no-browser", program=["as-other", "ovrin"]) as page:
        ask = [sys.executable, "-c", "import sys, urllib.request; urllib.request.urlopen(sys.argv[1])", f"{page.address}api/session"]
        for other, fails in (("12345", False), ("12346", True)):
            web_user.run("setpriv", "--reuid", other, "--regid", other, "--clear-groups", *ask, fails=fails)
            assert ("403" in web_user.report) == fails
