"""Where the facts of this folder find what they check, and how they tell that there was nothing to check."""

import pytest

SKIPPED = 77


def pytest_addoption(parser):
    parser.addoption("--installed", required=True, help="the tree of files that an installation made")


@pytest.hookimpl(trylast=True)
def pytest_sessionfinish(session, exitstatus):
    results = session.config.pluginmanager.get_plugin("terminalreporter").stats
    if exitstatus == pytest.ExitCode.OK and not results.get("passed"):
        session.exitstatus = SKIPPED
