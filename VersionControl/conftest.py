"""Where the facts of this folder find what they check, and how they tell that there was nothing to check."""

import pathlib
import tempfile

import pytest

from page import Page
from test_systems import ONE_CONFLICT
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


@pytest.fixture(name="web_user")
def fixture_web_user(request, user):
    """The same where ovrin has pages."""
    program = pathlib.Path(request.config.getoption("--installed"), "bin/ovrin").resolve()
    if not program.with_name("ovrin-web").exists():
        pytest.skip("ovrin was built without ovrin-web")
    return user


@pytest.fixture(name="page")
def fixture_page(request, web_user):
    """A page that settles the conflict of three scenes, which a test may choose."""
    web_user.conflict(*getattr(request, "param", ONE_CONFLICT))
    with Page(web_user, "settle", "--web", "--no-browser") as page:
        yield page
