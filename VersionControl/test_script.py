"""What becomes of the script between version control and the program when the world misbehaves."""

import pathlib
import shutil
import subprocess
import tempfile

import pytest

from systems import System
from test_systems import scene

# Fills a disk of some kilobytes that holds the result and its decisions, and lets the script work there.
ON_FULL_DISK = """
    mount -t tmpfs -o size=16k none disk
    cp ours disk/result
    cp decisions disk/result.conflicts
    ! cat /dev/zero >disk/rest
    ! ovrinmerge-vcs "$1" base ours theirs disk/result
    cmp decisions disk/result.conflicts
    cmp ours disk/result
    [ "$(ls -A disk | wc -l)" -eq 3 ]"""


@pytest.fixture(name="user")
def fixture_user(request):
    installed = pathlib.Path(request.config.getoption("--installed")).resolve()
    with tempfile.TemporaryDirectory() as folder:
        yield System(installed, pathlib.Path(folder))


def can_mount():
    return shutil.which("unshare") and subprocess.run(
        ["unshare", "-rm", "mount", "-t", "tmpfs", "none", "/mnt"], stderr=subprocess.DEVNULL, check=False).returncode == 0


@pytest.mark.skipif(not can_mount(), reason="disks can't be mounted here")
@pytest.mark.parametrize("action", ["settle", "tool"])
def test_full_disk_loses_neither_decisions_nor_the_file(user, action):
    for name, text in (("base", scene("1 Lantern 3")), ("theirs", scene("2 Lantern 3")), ("ours", scene("5 Lamp 1"))):
        user.write(text, name)
    user.write("Conflict handling:\n" + "".join(f"Left {number}.m_None\n" for number in range(400)), "decisions")
    user.use_tool('seq 2000 >"$4"')
    (user.here / "disk").mkdir()
    user.run("unshare", "-rm", "sh", "-ec", ON_FULL_DISK, "sh", action)


def test_nothing_stays_behind_an_end(user):
    user.fake("OvrinMerge", "kill -TERM $PPID")
    user.write(scene("1 Lantern 1"), "ours")
    (user.here / "scratch").mkdir()
    user.run("ovrinmerge-vcs", "merge", *["ours"] * 5, fails=True, TMPDIR=str(user.here / "scratch"))
    assert not any((user.here / "scratch").iterdir())
