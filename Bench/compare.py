#!/usr/bin/env python3
"""Measures OvrinMerge against the line merge and against the YAML library's loader, side by side in one run.

Every comparison runs its commands in turns (A B A B ...) after one warm-up each, so that a machine that others use
slows all of them alike. A ratio is the median of the ratios of runs that stood next to each other. The output is
Markdown; README.md beside this script says what the tables mean.
"""

import argparse
import os
import shutil
import statistics
import subprocess
import sys
import tempfile

from measure import Command, known, measure, own_peak, ratio
from plot import write_log_plot

MB = 1 << 20
HERE = os.path.dirname(os.path.abspath(__file__))


def number(value, form="%.2f"):
    return "n/a" if value is None else form % value


def seconds(command):
    return number(command.median("wall"), "%.4f")


def megabytes(command):
    if command.failure:
        return "n/a"
    return "%.0f" % (command.median("peak") / MB) if known(command, "peak") else "<= %.0f" % (own_peak() / MB)


def table(heads, rows):
    print("| " + " | ".join(heads) + " |")
    print("|" + "---|" * len(heads))
    for row in rows:
        print("| " + " | ".join(str(cell) for cell in row) + " |")
    print()


class Scene:
    """A directory of generated files."""

    def __init__(self, directory):
        self.directory = directory
        self.base, self.left, self.right = (self.path(n + ".ovrin") for n in ("base", "left", "right"))

    def path(self, name):
        return os.path.join(self.directory, name)

    def sides(self):
        return [self.base, self.left, self.right]

    def total(self):
        return sum(os.path.getsize(path) for path in self.sides())


class Bench:
    """The programs, the directory for the scenes, and the rows that were asked for."""

    def __init__(self, options):
        self.options = options
        self.tool = options.binary or os.path.join(options.build, "OvrinMerge")
        self.generator = os.path.join(options.build, "Bench", "GenerateScene")
        self.floor = os.path.join(options.build, "Bench", "LoaderFloor")
        self.merge_floor = os.path.join(options.build, "Bench", "MergeFloor")
        self.reader = os.path.join(options.build, "Bench", "ReaderBench")
        self.git = shutil.which("git") or "git"
        self.directory = tempfile.mkdtemp(prefix="ovrin-bench-", dir=options.directory)
        self.scenes = {}
        self.curves = {}  # name -> [(bytes of a file, seconds)]
        self.findings = []

    # Scenes and commands

    def scene(self, *arguments):
        """The scene of these generator arguments; made once."""
        key = " ".join(arguments)
        if key not in self.scenes:
            directory = os.path.join(self.directory, str(len(self.scenes)))
            os.mkdir(directory)
            subprocess.run([self.generator, "--seed", str(self.options.seed), *arguments, directory], check=True,
                           stdout=subprocess.DEVNULL)
            self.scenes[key] = Scene(directory)
        return self.scenes[key]

    def sized(self, megabytes, *arguments):
        return self.scene("--size", str(int(megabytes * MB)), *arguments)

    def drop_scenes(self):
        for scene in self.scenes.values():
            shutil.rmtree(scene.directory)
        self.scenes = {}

    def merge(self, scene, *options, name="merge"):
        report = [] if "-o" in options else ["-o", os.devnull]
        argv = [self.tool, "merge", "--fallback", "none", *report, *options, *scene.sides(), scene.path("out.ovrin")]
        return Command(" ".join([name, *(o for o in options if o == "--nothreads")]), argv, (0, 2))

    def line_merge(self, scene):
        argv = [self.git, "merge-file", "-p", scene.left, scene.base, scene.right]
        return Command("git merge-file", argv, range(128))  # the status is the number of conflicts

    def loader(self, paths, *options):
        return Command(" ".join(["loader alone", *options]), [self.floor, *options, *paths])

    def copying(self, scene):
        return Command("MergeFloor", [self.merge_floor, *scene.sides(), scene.path("floor.ovrin")])

    def big(self):
        """Size of the big scenes in MB."""
        return 5 if self.options.quick else 50

    def runs(self, megabytes):
        """Small files cost little and scatter much: they get more runs."""
        return self.options.runs * (1 if megabytes > 5 else 4)

    def finding(self, work, ours, other, wanted, scale=1.0):
        """A line of the summary: our command against another, or alone if other is None."""
        self.findings.append([
            work, seconds(ours), other.name if other else "", seconds(other) if other else "",
            number(ratio(ours, other, "wall", scale), "%.3g") if other else "",
            megabytes(ours), number(ratio(ours, other, "peak")) if other else "", wanted])

    # Rows

    def row_merge(self):
        """The whole merge at several sizes, against the loader and the line merge."""
        measured = {}
        for size in self.options.sizes:
            scene = self.sized(size)
            commands = [self.merge(scene), self.merge(scene, "--nothreads"), self.loader(scene.sides()),
                        self.loader(scene.sides(), "--nothreads"), self.line_merge(scene)]
            measure(commands, self.runs(size))
            measured[size] = (scene.total(), commands)
        self.print_merge_table(measured)
        self.print_growth_table(measured)
        for total, commands in measured.values():
            for command in commands:
                if not command.failure:
                    self.curves.setdefault(command.name, []).append((total / 3, command.median("wall")))
        self.drop_scenes()

    def print_merge_table(self, measured):
        print("### Whole merge\n")
        print("1 % of the objects edited on each side. Loader: the one with the same threading.\n")
        rows = []
        for size, (total, commands) in measured.items():
            threaded, single, line = commands[2:]
            for command in commands:
                floor = single if "--nothreads" in command.name else threaded
                peak = command.median("peak") if known(command, "peak") else None
                rows.append(["3 x %g MB" % size, command.name, seconds(command),
                             number(command.median("cpu"), "%.4f"), megabytes(command), number(ratio(command, floor)),
                             number(ratio(command, line)), number(peak / total if peak is not None else None)])
        table(["files", "command", "wall s", "user + system s", "peak MB", "wall / loader", "wall / git",
               "peak / files"], rows)

    def print_growth_table(self, measured):
        if 1 not in measured:
            return
        print("### Time per MB, relative to that at 1 MB\n")
        unit_total, unit = measured[1]
        names = [command.name for command in unit]
        rows = []
        for size, (total, commands) in measured.items():
            cells = []
            for command, at_one in zip(commands, unit):
                failed = command.failure or at_one.failure
                cells.append(None if failed else
                             command.median("wall") / total / (at_one.median("wall") / unit_total))
            rows.append(["3 x %g MB" % size, *map(number, cells)])
        table(["files", *names], rows)

    def compare(self, work, ours, others, wanted, megabytes):
        """Measures our command against others and notes a finding for each."""
        measure([ours, *others], self.runs(megabytes))
        for other, goal in zip(others, wanted):
            self.finding(work, ours, other, goal)

    def row_edited(self):
        """A few objects edited, against the line merge."""
        scene = self.sized(self.big())
        self.compare("merge 3 x %d MB, 1 %% of the objects edited on each side" % self.big(), self.merge(scene),
                     [self.line_merge(scene)], ["time 0.5, memory 1.0"], self.big())
        self.drop_scenes()

    def row_floor(self):
        """The same against a program that only reads, cuts, compares and writes. Needs MergeFloor likewise."""
        scene = self.sized(self.big())
        for state, memory_at_hand in (("", True), (", memory as it comes", False)):
            ours, floor = self.merge(scene), self.copying(scene)
            measure([ours, floor], self.runs(self.big()), memory_at_hand)
            self.finding("merge 3 x %d MB, 1 %% edited%s" % (self.big(), state), ours, floor, "time 3")
        self.drop_scenes()

    def row_disjoint(self):
        """Every object edited on both sides, in different fields."""
        scene = self.sized(self.big(), "--mode", "disjoint", "--edited", "1")
        self.compare("merge 3 x %d MB, every object edited on both sides" % self.big(), self.merge(scene),
                     [self.line_merge(scene)], ["time 1.0"], self.big())
        self.drop_scenes()

    def row_reading(self):
        """Reading one file on one thread, against the loader. Needs ReaderBench in the build directory."""
        scene = self.sized(self.big())
        for state, memory_at_hand, wanted in (("", True, "time 0.125"), (", memory as it comes", False, "")):
            ours = Command("reader", [self.reader, scene.base])
            loader = self.loader([scene.base], "--nothreads")
            measure([ours, loader], 3 * self.runs(self.big()), memory_at_hand)
            self.finding("reading %d MB on one thread%s" % (self.big(), state), ours, loader, wanted)
        self.drop_scenes()

    def row_growth(self):
        """Time per MB of a very big merge against that of a small one."""
        size = self.options.growth_size or (10 if self.options.quick else 200)
        small, big = self.sized(1), self.sized(size)
        ours, unit = self.merge(big), self.merge(small, name="merge of 3 x 1 MB")
        measure([ours, unit], self.options.runs)
        self.finding("growth: merge 3 x %g MB, time per MB" % size, ours, unit, "time 1.2, memory below 4 GB",
                     scale=small.total() / big.total())
        self.drop_scenes()

    def row_small(self):
        """Small files, where starting up counts."""
        for kilobytes, wanted in ((10, "time 2.0"), (100, "10 ms")):
            scene = self.sized(kilobytes / 1024, "--edited", "0.1")  # 1 % of so few objects may be none
            self.compare("merge 3 x %d KB" % kilobytes, self.merge(scene), [self.line_merge(scene)], [wanted], 0)
        self.drop_scenes()

    def row_diff(self):
        """`diff` and `strip` of two files."""
        scene = self.sized(self.big())
        pair = [scene.base, scene.right]
        line_diff = Command("git diff --no-index", [self.git, "--no-pager", "diff", "--no-index", *pair], (0, 1))
        ours = Command("diff", [self.tool, "diff", *pair, scene.path("out.txt")])
        strip = Command("strip", [self.tool, "strip", *pair, scene.path("out.ovrin")])
        loader = self.loader(pair)
        measure([ours, line_diff, loader, strip], self.runs(self.big()))
        work = " of two %d MB files, 1 %% edited" % self.big()
        self.finding("diff" + work, ours, line_diff, "time 0.5")
        self.finding("diff" + work, ours, loader, "time 1.5")
        self.finding("strip" + work, strip, loader, "")
        self.drop_scenes()

    def row_lists(self):
        """One long list that both sides edit."""
        length = 20000 if self.options.quick else 200000
        for kind, work in (("keyed", "keyed"), ("equal", "by equality")):
            scene = self.scene("--mode", "bigbase-list", str(length), kind)
            self.compare("one list of %d elements, %s" % (length, work), self.merge(scene),
                         [self.line_merge(scene)], ["1 s"], 5)
        self.drop_scenes()

    def row_conflicts(self):
        """Many conflicts and as many decisions."""
        count = 5000 if self.options.quick else 50000
        scene = self.scene("--mode", "conflicts", str(count))
        ours = self.merge(scene, "--describe", "-i", scene.path("resolve.txt"), "-o", scene.path("report.txt"))
        work = "%d conflicts, --describe, a resolve file of as many lines" % count
        self.compare(work, ours, [self.line_merge(scene)], ["2 s"], 50)
        self.drop_scenes()

    def row_removal(self):
        """Removing half of the objects, against adding them."""
        count = str(10000 if self.options.quick else 100000)
        removing = self.merge(self.scene("--mode", "remove", "--objects", count), name="removing")
        adding = self.merge(self.scene("--mode", "add", "--objects", count), name="adding")
        self.compare("removing half of %s objects on one side" % count, removing, [adding], ["time 1.0"], 50)
        self.drop_scenes()

    def row_stages(self):
        """Where one merge spends its time, by the tool's own timers."""
        print("### Stages of a merge of 3 x %d MB, --nothreads\n" % self.big())
        command = self.merge(self.sized(self.big()), "--nothreads", "--timing")
        command.run()
        if command.failure:
            print("n/a (%s)\n" % command.failure)
            return
        runs = [self.stage_times(command.argv) for _ in range(self.options.runs)]
        whole = statistics.median(run[-1][1] for run in runs)
        rows = []
        for at, (name, _) in enumerate(runs[0]):
            median = statistics.median(run[at][1] for run in runs)
            rows.append([name, "%d" % median, "%.1f %%" % (100.0 * median / max(whole, 1))])
        table(["stage", "ms", "share"], rows)
        self.drop_scenes()

    @staticmethod
    def stage_times(argv):
        """(name, milliseconds) of each timer; the root stands last."""
        text = subprocess.run(argv, stdout=subprocess.PIPE, stderr=subprocess.DEVNULL, text=True).stdout
        stages = []
        for line in text.splitlines():
            name, found, time_text = line.rpartition(": ")
            if found and time_text.isdigit():
                indent = len(name) - len(name.lstrip())
                stages.append(("&nbsp;" * indent + name.lstrip(), int(time_text)))
        return stages

    def print_findings(self):
        if not self.findings:
            return
        print("### Each against its measure\n")
        table(["work", "ours s", "against", "its s", "time ratio", "ours peak MB", "memory ratio", "wanted at most"],
              self.findings)


ROWS = [name[len("row_"):] for name in vars(Bench) if name.startswith("row_")]


def parse_arguments():
    row_help = "\n".join("  %-10s %s" % (name, getattr(Bench, "row_" + name).__doc__) for name in ROWS)
    parser = argparse.ArgumentParser(description=__doc__.split("\n")[0], epilog="rows:\n" + row_help,
                                     formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("--build", required=True, help="build directory of the bench preset")
    parser.add_argument("--binary", help="OvrinMerge to measure (default: the one in the build directory)")
    parser.add_argument("--rows", default=",".join(ROWS), help="what to measure, a list with commas (default: all)")
    parser.add_argument("--sizes", help="MB per file in the row merge (default 0.1,1,10,50)")
    parser.add_argument("--growth-size", type=float, help="MB per file in the row growth (default 200)")
    parser.add_argument("--runs", type=int, help="runs of each command on big files (default 5)")
    parser.add_argument("--quick", action="store_true", help="small inputs and few runs: does everything work?")
    parser.add_argument("--seed", type=int, default=1)
    parser.add_argument("--directory", help="where the temporary directory for the scenes goes")
    parser.add_argument("--svg", metavar="FILE", help="draw time against size, from the row merge")
    parser.add_argument("--commit", action="store_true", help="name the commit at the head of the output")
    options = parser.parse_args()
    options.rows = options.rows.split(",")
    unknown = set(options.rows) - set(ROWS)
    if unknown:
        parser.error("unknown rows: " + ", ".join(sorted(unknown)))
    options.runs = options.runs or (1 if options.quick else 5)
    sizes = options.sizes or ("0.1,1" if options.quick else "0.1,1,10,50")
    options.sizes = [float(size) for size in sizes.split(",")]
    return options


def main():
    options = parse_arguments()
    bench = Bench(options)
    for program in (bench.tool, bench.reader):
        if not os.path.exists(program):
            print("n/a below: there is no " + program, file=sys.stderr)
    try:
        if options.commit:
            head = subprocess.run([bench.git, "-C", HERE, "rev-parse", "--short", "HEAD"], stdout=subprocess.PIPE,
                                  text=True, check=True).stdout.strip()
            print("Commit %s, %d processors, medians of %d runs.\n" % (head, os.cpu_count(), options.runs))
        for row in options.rows:
            print("measuring " + row, file=sys.stderr)
            getattr(bench, "row_" + row)()
        bench.print_findings()
        if options.svg:
            write_log_plot(options.svg, bench.curves, "size of each of the three files", "wall time")
    finally:
        shutil.rmtree(bench.directory)


if __name__ == "__main__":
    main()
