"""A page that ovrin serves, as programs use it that aren't a browser."""

import http.client
import json
import os
import re
import select
import signal
import socket
import subprocess
import time

SECONDS_TO_WAIT = 30


class Page:
    """ovrin with a page that is open, until the end of the "with"."""

    def __init__(self, user, *command, program=("ovrin",), **environment):
        self.user = user
        self.lines = []
        self.process = subprocess.Popen([*program, *command], cwd=user.here, env=user.environment | environment,
                                        stdin=subprocess.DEVNULL, stdout=subprocess.DEVNULL, stderr=subprocess.PIPE,
                                        start_new_session=True)
        self.address = self.find_address()
        self.port, self.token = re.fullmatch(r"http://127\.0\.0\.1:(\d+)/([0-9a-f]{32})/", self.address).groups()
        self.host = f"127.0.0.1:{self.port}"

    def __enter__(self):
        return self

    def __exit__(self, *_):
        if self.process.poll() is None:
            self.process.kill()
        self.process.wait(SECONDS_TO_WAIT)
        self.process.stderr.close()

    def find_address(self):
        for line in self.process.stderr:
            self.lines.append(line.decode())
            if "http://" in self.lines[-1]:
                return self.lines[-1].split()[-1]
        raise AssertionError("".join(self.lines))

    def end(self):
        """Waits for the end. The exit status and what was said."""
        said = "".join(self.lines) + self.process.stderr.read().decode()
        return self.process.wait(SECONDS_TO_WAIT), said

    def gate(self):
        """The process of the server."""
        with open(f"/proc/{self.process.pid}/task/{self.process.pid}/children", encoding="ascii") as children:
            return int(children.read().split()[0])

    def connect(self):
        return socket.create_connection(("127.0.0.1", int(self.port)), SECONDS_TO_WAIT)

    def send(self, request):
        """The whole answer to bytes that are sent as they are, from a connection of their own."""
        answer = b""
        with self.connect() as connection:
            try:
                connection.sendall(request)
                while piece := connection.recv(65536):
                    answer += piece
            except ConnectionError:
                pass
        return answer

    def ask(self, path, body=None, method=None, **changed):
        """The status and the headers and the body of the answer. Headers are those of our page, save for what is changed,
        with "_" for "-", or taken away by None."""
        headers = {"Host": self.host}
        if body is not None:
            headers |= {"Origin": f"http://{self.host}", "Content-Type": "application/json"}
        headers |= {name.replace("_", "-"): value for name, value in changed.items()}
        connection = http.client.HTTPConnection("127.0.0.1", int(self.port), timeout=SECONDS_TO_WAIT)
        connection.putrequest(method or ("GET" if body is None else "POST"), path, skip_host=True,
                              skip_accept_encoding=True)
        for name, value in headers.items():
            if value is not None:
                connection.putheader(name, value)
        sent = None if body is None else body if isinstance(body, bytes) else json.dumps(body).encode()
        if sent is not None and "Content-Length" not in headers:
            connection.putheader("Content-Length", str(len(sent)))
        connection.endheaders(sent)
        answer = connection.getresponse()
        told = answer.status, answer.headers, answer.read()
        connection.close()
        return told

    def status(self, path, *arguments, **changed):
        return self.ask(path, *arguments, **changed)[0]

    def get(self, name, status=200):
        """What the model answers to a page of ours."""
        got, _, text = self.ask(f"/{self.token}/api/{name}")
        assert got == status, text
        return json.loads(text)

    def post(self, name, body, status=200):
        got, _, text = self.ask(f"/{self.token}/api/{name}", body)
        assert got == status, text
        return json.loads(text)

    def step(self, name, status=200, **body):
        return self.post(name, body | {"revision": self.get("session")["revision"]}, status)


def has_ended(process, seconds=5):
    """Whether a process, which may be nobody's child here, ends within some seconds."""
    try:
        watched = os.pidfd_open(process)
    except ProcessLookupError:
        return True
    try:
        return bool(select.select([watched], [], [], seconds)[0])
    finally:
        os.close(watched)


def interrupt(page):
    """What Ctrl-C does in a terminal."""
    os.killpg(page.process.pid, signal.SIGINT)


def seconds_since(begun):
    return time.monotonic() - begun
