"""Runs commands side by side and tells time and memory as ratios; compare.py says what for."""

import mmap
import os
import resource
import signal
import statistics
import subprocess
import sys
import tempfile
import threading
import time

TIME_LIMIT = 600  # seconds; a command that takes longer counts as failed


class Sample:
    """One run of one command: seconds of wall and of processor time, peak memory in bytes."""

    def __init__(self, wall, usage):
        self.wall = wall
        self.cpu = usage.ru_utime + usage.ru_stime
        self.peak = usage.ru_maxrss * 1024


class Command:
    """A command line, the exit statuses that mean success, and the samples of its runs.

    A command without a program, or one that fails, keeps no samples and shows as n/a.
    """

    def __init__(self, name, argv, accepted=(0,)):
        self.name = name
        self.argv = argv
        self.accepted = accepted
        self.samples = []
        self.failure = None if os.path.exists(argv[0]) else "no such program: " + argv[0]

    def run(self):
        if self.failure:
            return None
        with tempfile.TemporaryFile() as errors, open(os.devnull, "r+b") as null:
            actions = [(os.POSIX_SPAWN_DUP2, null.fileno(), 0), (os.POSIX_SPAWN_DUP2, null.fileno(), 1),
                       (os.POSIX_SPAWN_DUP2, errors.fileno(), 2)]
            start = time.perf_counter()
            pid = os.posix_spawn(self.argv[0], self.argv, os.environ, file_actions=actions)
            guard = threading.Timer(TIME_LIMIT, os.kill, (pid, signal.SIGKILL))
            guard.start()
            _, status, usage = os.wait4(pid, 0)
            wall = time.perf_counter() - start
            guard.cancel()
            self._judge(os.waitstatus_to_exitcode(status), errors)
        return None if self.failure else Sample(wall, usage)

    def _judge(self, code, errors):
        if code in self.accepted:
            return
        errors.seek(0)
        first_line = errors.read(500).decode(errors="replace").split("\n")[0]
        how = "exit status %d" % code if code >= 0 else "signal %d" % -code
        self.failure = "%s: %s" % (how, first_line) if first_line else how

    def median(self, what):
        """Median of "wall", "cpu" or "peak"; None if the command can't be run."""
        return None if self.failure else statistics.median(getattr(sample, what) for sample in self.samples)


def bring_memory(size):
    """Has another process touch that much memory and give it back, so that the system has it at hand.

    Where a host takes the free memory of a virtual machine away, the first touch of a page costs several times as
    much if nobody used it for some seconds: a command would pay for the time that its neighbour took. Huge pages,
    because the system hands out single pages again before it makes new huge ones of them.
    """
    touch = ("import mmap, sys; m = mmap.mmap(-1, int(sys.argv[1]), mmap.MAP_PRIVATE | mmap.MAP_ANONYMOUS); "
             "m.madvise(mmap.MADV_HUGEPAGE); m[::4096] = bytes(len(m[::4096]))")
    available = os.sysconf("SC_AVPHYS_PAGES") * mmap.PAGESIZE
    if size >= mmap.PAGESIZE:
        subprocess.run([sys.executable, "-c", touch, str(min(size, available // 2))], check=True)


def measure(commands, runs, memory_at_hand=True):
    """Runs the commands in turns and fills their samples."""
    first = [command.run() for command in commands]
    needed = max((sample.peak for sample in first if sample), default=0) if memory_at_hand else 0
    for _ in range(runs):
        for command in commands:
            bring_memory(2 * needed)
            sample = command.run()
            if sample:
                command.samples.append(sample)
    for command in commands:
        if command.failure and os.path.exists(command.argv[0]):
            print("%s failed (%s): %s" % (command.name, command.failure, " ".join(command.argv)), file=sys.stderr)


def ratio(ours, other, what="wall", scale=1.0):
    """Median over the runs of ours divided by the other command's neighbouring run; None if one is not known."""
    if not (known(ours, what) and known(other, what)):
        return None
    pairs = zip(ours.samples, other.samples)
    return scale * statistics.median(getattr(a, what) / getattr(b, what) for a, b in pairs)


def known(command, what):
    """Whether the command ran, and for "peak" whether what was measured is its own memory.

    A child is charged with what this script held when it started it, so that less than this can't be seen.
    """
    return not command.failure and (what != "peak" or command.median("peak") > own_peak())


def own_peak():
    return resource.getrusage(resource.RUSAGE_SELF).ru_maxrss * 1024
