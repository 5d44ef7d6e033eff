"""Where the facts of this folder find what they check, and how they tell that there was nothing to check."""

import pathlib
import tempfile

import pytest

from user import User

SKIPPED = 77


def pytest_addoption(parser):
    parser.addoption("--installed", required=True, help="the tree of files that an installation made")


@pytest.hookimpl(trylast=True)
def pytest_sessionfinish(session, exitstatus):
    results = session.config.pluginmanager.get_plugin("terminalreporter").stats
    if exitstatus == pytest.ExitCode.OK and not results.get("passed"):
        session.exitstatus = SKIPPED


@pytest.fixture(name="user")
def fixture_user(request):
    """Somebody in an empty folder, with an empty home directory."""
    installed = pathlib.Path(request.config.getoption("--installed")).resolve()
    with tempfile.TemporaryDirectory(prefix="a user's ") as folder:
        yield User(installed, pathlib.Path(folder))
