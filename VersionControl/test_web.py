"""Settles by the page that ovrin serves, and attacks it with sockets.

    pytest-3 VersionControl/test_web.py --installed build/release/installed
"""

import itertools
import json
import os
import pathlib
import random
import shutil
import signal
import sys
import time

import pytest

from page import Page, has_ended, interrupt, seconds_since
from test_settle import MANY
from test_systems import CONFLICT_AND_MORE, HEADER, ONE_CONFLICT, game_object, scene
from user import DONE, FAILED, LEFT_OPEN

POLICY = ("default-src 'none'; script-src 'self'; style-src 'self'; connect-src 'self'; img-src 'self'; base-uri 'none'; "
          "form-action 'none'; frame-ancestors 'none'")
SCRIPT = "<script>alert(1)</script>"
SCRIPTS = [HEADER + game_object(7, layer, f"'{SCRIPT}'", 1) for layer in (1, 2, 5)]


@pytest.fixture(autouse=True)
def fixture_server(request):
    program = pathlib.Path(request.config.getoption("--installed"), "bin/ovrin").resolve()
    if not program.with_name("ovrin-web").exists():
        pytest.skip("ovrin was built without ovrin-web")


@pytest.fixture(name="page")
def fixture_page(user, request):
    user.conflict(*getattr(request, "param", ONE_CONFLICT))
    with Page(user, "settle", "--web", "--no-browser") as page:
        yield page


def test_page_settles_as_the_terminal_does(page):
    assert page.get("session")["open"] == 1
    assert page.step("take", item=0, side="theirs")["settled"] == 1
    answer = page.step("finish", overwrite=False)
    assert answer["isOver"] and answer["finished"] == [page.user.name]
    status, said = page.end()
    assert status == DONE and "is settled" in said and "git commit" in said
    page.user.git("commit", "-qm", "merged")
    assert page.user.committed() == ONE_CONFLICT[1] and page.user.records() == []


def test_steps_are_undone_and_made_again(page):
    page.step("take", all=True, side="ours")
    assert page.step("undo")["session"]["open"] == 1
    assert page.step("redo")["session"]["isSettled"]
    page.step("redo", status=400)
    assert page.get("conflicts")["items"][0]["decided"] == "ours"


def test_leaving_keeps_decisions(page):
    page.step("take", item=0, side="theirs")
    page.post("leave", {})
    assert page.end()[0] == LEFT_OPEN
    page.user.ovrin("settle")
    assert page.user.read() == ONE_CONFLICT[1]


def test_a_page_that_has_not_seen_the_last_step_decides_nothing(page):
    seen = page.get("session")["revision"]
    page.step("take", item=0, side="theirs")
    page.post("take", {"item": 0, "side": "ours", "revision": seen}, 409)
    page.post("finish", {"overwrite": False, "revision": seen}, 409)
    assert page.get("conflicts")["items"][0]["decided"] == "theirs"


@pytest.mark.parametrize("page", [CONFLICT_AND_MORE], indirect=True)
def test_result_of_an_object_is_that_of_the_decisions(page):
    item = page.get("conflicts")["items"][0]
    page.step("take", item=0, side="base")
    rows = page.get(f"object?scene=0&id={item['id']}")["rows"]
    row = next(row for row in rows if row["item"] == 0)
    assert row["values"]["result"]["text"] == row["values"]["base"]["text"] != row["values"]["ours"]["text"]


@pytest.mark.parametrize("page", [MANY], indirect=True)
def test_objects_that_no_decision_is_about_keep_their_result(page):
    def result(item):
        rows = page.get(f"object?scene=0&id={item['id']}")["rows"]
        return next(row["values"]["result"]["text"] for row in rows if row["item"] == item["index"])
    first, second = page.get("conflicts?count=2")["items"]
    assert (result(first), result(second)) == ("5", "5")
    page.step("take", item=0, side="theirs")
    assert (result(first), result(second)) == ("2", "5")
    page.step("take", all=True, side="base")
    assert (result(first), result(second)) == ("2", "1")
    page.step("undo")
    page.step("undo")
    assert (result(first), result(second)) == ("5", "5")


@pytest.mark.parametrize("body", [
    b"", b"{", b"[]", b"null", b"\xff", b"[" * 60000, {}, {"item": 0}, {"item": 0, "side": "mine"}, {"item": -1, "side": "ours"},
    {"item": 1, "side": "ours"}, {"item": 2**64, "side": "ours"}, {"item": "0", "side": "ours"}, {"item": 0.5, "side": "ours"},
    {"item": 0, "side": 1}, {"item": 0, "side": "ours", "path": "/etc/passwd"}, {"all": 1, "side": "ours"},
    {"all": True, "item": 0, "side": "ours"}, {"problem": 0, "remedy": 0}, {"under": 5, "side": "ours"}])
def test_what_is_no_step_is_told_and_does_nothing(page, body):
    session = page.get("session")
    if isinstance(body, dict):
        body["revision"] = session["revision"]
    status, _, text = page.ask(f"/{page.token}/api/take", body)
    assert status == 400 and json.loads(text)["error"]
    assert page.get("session") == session


def test_wrong_secret_opens_nothing(page):
    other = ("0" if page.token[0] != "0" else "1") + page.token[1:]
    for path in ("/", "", "//", f"/{other}/", f"/{other}/api/session", f"/{page.token[:-1]}/", f"/{page.token}0/",
                 f"/{page.token}", f"/{page.token.upper()}x/", "/api/session", f"//{page.token}/", f"/x/{page.token}/"):
        assert page.status(path or "x") in (400, 404), path


@pytest.mark.parametrize("host", ["evil.example", "evil.example:{port}", "127.0.0.1", "localhost", "127.0.0.1:1", "[::1]:{port}",
                                  "127.0.0.2:{port}", "0.0.0.0:{port}", "127.0.0.1:{port}.evil.example", "127.0.0.1%3A{port}",
                                  "127.1:{port}", "evil@127.0.0.1:{port}", "localhost.:{port}", "", None])
def test_other_names_of_this_machine_are_refused(page, host):
    assert page.status(f"/{page.token}/api/session", Host=host and host.format(port=page.port)) == 403
    assert page.status(f"/{page.token}/api/session", Host=f"localhost:{page.port}") == 200


@pytest.mark.parametrize("changed", [
    {"Origin": "http://evil.example"}, {"Origin": "null"}, {"Origin": None}, {"Origin": "http://127.0.0.1"}, {"Origin": ""},
    {"Origin": "https://{host}"}, {"Origin": "http://{host}.evil.example"}, {"Origin": "http://localhost:{port}"},
    {"Sec_Fetch_Site": "cross-site"}, {"Sec_Fetch_Site": "same-site"}, {"Content_Type": "text/plain"}, {"Content_Type": None},
    {"Content_Type": "application/x-www-form-urlencoded"}, {"Content_Type": "multipart/form-data; boundary=x"},
    {"Content_Encoding": "gzip"}, {"Transfer_Encoding": "chunked"}, {"Expect": "100-continue"}])
def test_other_sites_decide_nothing(page, changed):
    changed = {name: value and value.format(host=page.host, port=page.port) for name, value in changed.items()}
    body = {"all": True, "side": "theirs", "revision": page.get("session")["revision"]}
    status, headers, _ = page.ask(f"/{page.token}/api/take", body, **changed)
    assert status in (400, 403, 415, 417)
    assert not [name for name in headers if name.lower().startswith("access-control")]
    assert page.get("session")["open"] == 1


def test_other_sites_read_nothing(page):
    for changed in ({"Origin": "http://evil.example"}, {"Sec_Fetch_Site": "cross-site"}):
        status, headers, text = page.ask(f"/{page.token}/api/session", **changed)
        assert status == 403 and "Access-Control-Allow-Origin" not in headers and page.user.name.encode() not in text


@pytest.mark.parametrize("method", ["PUT", "DELETE", "OPTIONS", "CONNECT", "TRACE", "PATCH", "PRI", "get"])
def test_other_methods_are_refused(page, method):
    assert page.status(f"/{page.token}/api/session", method=method) in (400, 405)


def test_steps_want_post_and_reading_wants_get(page):
    for step in ("take", "undo", "redo", "finish", "leave"):
        assert page.status(f"/{page.token}/api/{step}") == 405
    assert page.status(f"/{page.token}/api/session", {}) == 405
    assert page.status(f"/{page.token}/api/session", method="HEAD") == 200
    assert page.get("session")["open"] == 1


@pytest.mark.parametrize("path", [
    "../etc/passwd", "%2e%2e/etc/passwd", "..%2f..%2fetc/passwd", "./api/session", "api//session", "api/session/", "api/%73ession",
    "api/session%00", "api\\session", "api/session;x", "file:///etc/passwd", "api/session#x", "index.html/../api/session",
    "/etc/passwd", "\u00e4".encode().decode("latin-1"), "api/session?a=1&a=2", "api/session?%zz", "api/session?a=%"])
def test_path_tricks_lead_nowhere(page, path):
    head = f"GET /{page.token}/{path} HTTP/1.1\r\nHost: {page.host}\r\n\r\n".encode("latin-1")
    status = page.send(head).split(b" ")[1]
    assert status in (b"400", b"404")


def test_what_is_no_clear_request_is_refused(page):
    start, host = f"GET /{page.token}/api/session HTTP/1.1\r\n", f"Host: {page.host}\r\n"
    good = start + host + "\r\n"
    assert page.send(good.encode()).startswith(b"HTTP/1.1 200 ")
    for request in (start + host + host + "\r\n", start + "Host: evil.example\r\n" + host + "\r\n", start + "\r\n",
                    good.replace("1.1", "1.0", 1).replace(host, ""), good.replace("HTTP/1.1", "HTTP/2.0"),
                    good.replace("HTTP/1.1", "HTTP/0.9"), good.replace("\r\n", "\n"), good.replace(": ", " : ", 1),
                    good.replace("GET /", f"GET http://{page.host}/", 1), good.replace("GET ", "GET  ", 1),
                    good.replace("Host", " Host"), start + host + " folded\r\n\r\n", start + host + "X: a\x00b\r\n\r\n",
                    start + host + "X: a\rb\r\n\r\n", start + host + "no colon\r\n\r\n", good.replace("/api", "/a\tpi"),
                    start + host + "Content-Length: 5\r\n\r\nhello", start + host + "Content-Length: x\r\n\r\n",
                    start + host + "Transfer-Encoding: chunked\r\n\r\n0\r\n\r\n", start + host + "X: y\r\n" * 100 + "\r\n",
                    "GET\r\n\r\n", "\r\n\r\n", f"GET / HTTP/1.1\r\n{host}\r\n", "\x16\x03\x01\x02\x00\x01\r\n\r\n"):
        assert page.send(request.encode("latin-1"))[9:12] in (b"400", b"403", b"404"), request
    assert page.get("session")["open"] == 1


def test_what_follows_a_request_is_no_other_request(page):
    """Neither pipelined nor smuggled in a body."""
    step = json.dumps({"all": True, "side": "theirs", "revision": page.get("session")["revision"]})
    inner = (f"POST /{page.token}/api/take HTTP/1.1\r\nHost: {page.host}\r\nOrigin: http://{page.host}\r\n"
             f"Content-Type: application/json\r\nContent-Length: {len(step)}\r\n\r\n{step}")
    for outer in (f"GET /{page.token}/api/session HTTP/1.1\r\nHost: {page.host}\r\nConnection: keep-alive\r\n\r\n",
                  "GET / HTTP/1.1\r\nHost: evil.example\r\n\r\n"):
        assert page.send((outer + inner).encode()).count(b"HTTP/1.1 ") == 1
    assert page.get("session")["open"] == 1


def test_sizes_are_bounded(page):
    path = f"/{page.token}/api/take"
    assert page.status(path, b"x" * 65536) == 400
    assert page.status(path, b"x" * 65537) == 413
    for length in ("99999999999999999999999", "-1", "5, 5", "0x5", "+5", ""):
        assert page.status(path, b"{}", Content_Length=length) in (400, 411, 413), length
    assert page.status(f"/{page.token}/api/session?x=" + "y" * 5000) == 414
    long_head = f"GET /{page.token}/api/session HTTP/1.1\r\nHost: {page.host}\r\n"
    assert page.send((long_head + "X: " + "y" * 20000 + "\r\n\r\n").encode()) == b""
    assert page.send(b"x" * 1000000) == b""
    # What the library would make of these is never seen: many ranges, and a compressed answer.
    whole = page.ask(f"/{page.token}/api/session")[2]
    assert page.ask(f"/{page.token}/api/session", Range="bytes=" + "0-," * 2000 + "0-")[2] == whole
    assert page.ask(f"/{page.token}/api/session", Accept_Encoding="gzip, br")[2] == whole


def test_every_answer_has_the_headers(page):
    answers = [page.ask(path) for path in (f"/{page.token}/", f"/{page.token}/api/session", f"/{page.token}/api/none", "/")]
    answers += [page.ask(f"/{page.token}/api/session", method=method) for method in ("HEAD", "PUT")]
    answers += [page.ask(f"/{page.token}/api/take", {}), page.ask("/", Host="evil.example")]
    for status, headers, _ in answers:
        assert headers["Content-Security-Policy"] == POLICY, status
        assert headers["X-Content-Type-Options"] == "nosniff" and headers["Referrer-Policy"] == "no-referrer"
        assert headers["Cache-Control"] == "no-store" and headers["Cross-Origin-Resource-Policy"] == "same-origin"
        assert headers["Cross-Origin-Opener-Policy"] == "same-origin"
        assert not [name for name in headers if name.lower().startswith("access-control")]


def test_only_this_machine_is_listened_to(page):
    with open("/proc/net/tcp", encoding="ascii") as table, open("/proc/net/tcp6", encoding="ascii") as table6:
        lines = table.readlines()[1:] + table6.readlines()[1:]
    sockets = [line.split() for line in lines]
    listening = [socket[1] for socket in sockets if socket[1].endswith(f":{int(page.port):04X}") and socket[3] == "0A"]
    assert listening == [f"0100007F:{int(page.port):04X}"]


def test_secret_is_no_argument_and_no_variable(page):
    for process in (page.process.pid, page.gate()):
        for what in ("cmdline", "environ"):
            with open(f"/proc/{process}/{what}", "rb") as file:
                assert page.token.encode() not in file.read()


@pytest.mark.skipif(os.getuid() != 0 or not shutil.which("setpriv"), reason="needs root to be two users")
def test_another_user_who_knows_the_address_gets_nothing(user):
    """Command lines are public, and that of the browser has the address."""
    user.conflict(*ONE_CONFLICT)
    here = pathlib.Path(user.here).parent
    for folder, _, names in os.walk(here):
        for name in (folder, *(os.path.join(folder, name) for name in names)):
            os.chown(name, 12345, 12345, follow_symlinks=False)
    user.fake("as-other", 'exec setpriv --reuid 12345 --regid 12345 --clear-groups "$@"')
    with Page(user, "settle", "--web", "--no-browser", program=["as-other", "ovrin"]) as page:
        ask = [sys.executable, "-c", "import sys, urllib.request; urllib.request.urlopen(sys.argv[1])", f"{page.address}api/session"]
        for other, fails in (("12345", False), ("12346", True)):
            user.run("setpriv", "--reuid", other, "--regid", other, "--clear-groups", *ask, fails=fails)
            assert ("403" in user.report) == fails


@pytest.mark.parametrize("page", [SCRIPTS], indirect=True)
def test_scripts_for_names_stay_data(page):
    status, headers, text = page.ask(f"/{page.token}/api/conflicts")
    assert status == 200 and headers["Content-Type"] == "application/json"
    assert json.loads(text)["items"][0]["object"] == SCRIPT
    status, headers, text = page.ask(f"/{page.token}/{SCRIPT}")
    assert status == 400 and SCRIPT.encode() not in text


def test_who_says_nothing_keeps_nobody_out(page):
    begun = time.monotonic()
    silent = [page.connect() for _ in range(500)]
    half = [page.connect() for _ in range(100)]
    for connection in half:
        connection.sendall(b"GET / HT")
    assert page.get("session")["open"] == 1
    assert seconds_since(begun) < 10
    for connection in silent + half:
        connection.close()
    assert page.get("session")["open"] == 1


def test_slow_request_is_given_up(page):
    begun = time.monotonic()
    with page.connect() as connection:
        try:
            for byte in itertools.cycle(b"GET / HTTP/1.1\r\nX: y\r\nZ: "):
                connection.sendall(bytes([byte]))
                time.sleep(0.2)
                assert seconds_since(begun) < 20
        except ConnectionError:
            pass
    assert page.get("session")["open"] == 1


def test_number_of_pages_is_bounded(page):
    request = f"GET /{page.token}/api/alive HTTP/1.1\r\nHost: {page.host}\r\n\r\n".encode()
    streams = [page.connect() for _ in range(17)]
    for stream in streams:
        stream.sendall(request)
    statuses = sorted(stream.recv(12)[-3:] for stream in streams)
    assert statuses == [b"200"] * 16 + [b"503"]
    for stream in streams:
        stream.close()


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


def test_garbage_does_no_harm(page):
    chance = random.Random(7)
    words = [b"GET ", b"POST ", b"/", page.token.encode(), b"/api/take", b" HTTP/1.1", b"\r\n", b"\n", b"Host: ",
             page.host.encode(), b"Content-Length: ", b"-1", b"99999", b"\x00", b"%00", b"Transfer-Encoding: chunked", b"\r\n\r\n",
             b"Origin: http://", b"Content-Type: application/json", b"{}", b":", b" ", b"Range: bytes=0-", b"\xff\xfe"]
    for _ in range(300):
        page.send(b"".join(chance.choices(words, k=chance.randrange(1, 40))) + b"\r\n\r\n")
    assert page.get("session")["open"] == 1


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


def test_browser_is_opened_without_a_shell(user):
    user.conflict(*ONE_CONFLICT)
    user.fake("my-browser", 'readlink /proc/$$/fd/[0-9] > "$HOME/files"; printf "%s\\n" "$#" "$@" > "$HOME/opened"')
    with Page(user, "settle", "--web", BROWSER="no-such-program:my-browser --new $(touch x) %s") as page:
        opened = user.home / "opened"
        while not (opened.exists() and opened.read_text().endswith("\n")):
            time.sleep(0.05)
        assert opened.read_text().splitlines() == ["4", "--new", "$(touch", "x)", page.address]
    assert not user.exists("x")
    # Besides what it opened itself it has nothing: neither the server's socket nor the repository's files.
    own = {str(user.fakes / "my-browser"), str(user.home / "files")}
    assert set((user.home / "files").read_text().splitlines()) <= {"/dev/null"} | own


@pytest.mark.parametrize("browser", ["no-such-program", "false"])
def test_browser_that_cannot_be_opened_is_told(user, browser):
    user.conflict(*ONE_CONFLICT)
    with Page(user, "settle", "--web", BROWSER=browser) as page:
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


def test_scene_that_was_changed_by_hand_is_replaced_only_when_asked(page):
    page.user.write(scene("7 Lantern 1"))
    page.step("take", item=0, side="theirs")
    answer = page.step("finish", overwrite=False)
    assert not answer["isOver"] and page.user.name in answer["remarks"][0]
    assert page.step("finish", overwrite=True)["isOver"]
    assert page.end()[0] == DONE and page.user.read() == ONE_CONFLICT[1]
