#!/usr/bin/env python3
"""Measures what a merge of many scenes takes with ovrin as git's merge driver.

    Bench/version_control.py --build build/bench

Against the same with `true` as the driver, which is what git itself and the start of a program take; with a driver
that appends a line, so that git has a result to compress, to store and to check out, which it needn't with `true`;
and, for orientation, without a driver. All scenes are edited on both sides. These run in turns; a ratio is the
median of the ratios of runs that stood next to each other. The output is Markdown.
"""

import argparse
import os
import pathlib
import shutil
import statistics
import subprocess
import tempfile
import time

DRIVERS = {"ovrin": "ovrin merge --base-label %S --our-label %X --their-label %Y -- %O %A %B %A %P",
           "true": "true", "append": "echo >>%A", "no driver": None}


class Repository:
    """Scenes in three versions, and git in an empty home."""

    def __init__(self, folder, build):
        self.folder = folder
        self.environment = {name: value for name, value in os.environ.items() if not name.startswith("GIT_")}
        self.environment |= {"HOME": str(folder), "GIT_CONFIG_NOSYSTEM": "1",
                             "PATH": f"{build.resolve()}:{os.environ['PATH']}"}
        (folder / "tree").mkdir()
        self.git("init", "-qb", "main")
        for name, value in (("user.name", "Bench"), ("user.email", "bench@example.org"), ("gc.auto", "0"),
                            ("core.autocrlf", "false")):
            self.git("config", name, value)

    def git(self, *arguments, accepted=(0,)):
        done = subprocess.run(["git", *arguments], cwd=self.folder / "tree", env=self.environment, check=False,
                              stdout=subprocess.DEVNULL, stderr=subprocess.PIPE)
        assert done.returncode in accepted, (arguments, done.stderr.decode(errors="replace"))

    def commit(self, scenes, version):
        for number, scene in enumerate(scenes):
            shutil.copyfile(scene / f"{version}.ovrin", self.folder / "tree" / f"scene{number}.ovrin")
        self.git("add", ".")
        self.git("commit", "-qm", version)

    def fill(self, scenes):
        (self.folder / "tree/.gitattributes").write_text("*.ovrin merge=bench -text\n", encoding="utf-8")
        self.commit(scenes, "base")
        self.git("checkout", "-qb", "theirs")
        self.commit(scenes, "left")
        self.git("checkout", "-q", "main")
        self.commit(scenes, "right")
        self.git("repack", "-adq")

    def merge(self, driver):
        """Seconds that the merge took."""
        command = DRIVERS[driver]
        self.git("config", "--unset-all", "merge.bench.driver", accepted=(0, 5))
        if command:
            self.git("config", "merge.bench.driver", command)
        begin = time.perf_counter()
        self.git("merge", "-q", "--no-commit", "theirs", accepted=(0, 1))
        seconds = time.perf_counter() - begin
        self.git("reset", "-q", "--hard", "main")
        self.git("prune", "--expire=now")  # the results, which git would not store again
        shutil.rmtree(self.folder / "tree/.git/ovrin", ignore_errors=True)  # the conflicts that were written down
        return seconds


def generate(build, folder, options, conflicts):
    scenes = []
    for number in range(options.scenes):
        scenes.append(folder / f"scene{number}")
        scenes[-1].mkdir()
        subprocess.run([build / "Bench/GenerateScene", "--size", options.size, "--seed", str(number + 1), "--edited",
                        "0.1", "--conflicts", str(conflicts), scenes[-1]], check=True, stdout=subprocess.DEVNULL)
    return scenes


def measure(options, conflicts):
    """The medians of all drivers, and the ratios of the first to the others."""
    with tempfile.TemporaryDirectory(dir=options.directory) as folder:
        folder = pathlib.Path(folder)
        repository = Repository(folder, options.build)
        repository.fill(generate(options.build, folder, options, conflicts))
        runs = [{driver: repository.merge(driver) for driver in DRIVERS} for _ in range(options.runs + 1)][1:]
    medians = [statistics.median(run[driver] for run in runs) for driver in DRIVERS]
    ours, *others = DRIVERS
    return medians, [statistics.median(run[ours] / run[other] for run in runs) for other in others]


def main():
    parser = argparse.ArgumentParser(description=__doc__, formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("--build", type=pathlib.Path, default=pathlib.Path("build/bench"), help="where the programs are")
    parser.add_argument("--scenes", type=int, default=300)
    parser.add_argument("--size", default="100K", help="of a scene")
    parser.add_argument("--runs", type=int, default=7)
    parser.add_argument("--directory", help="for the repositories, instead of the temporary one")
    options = parser.parse_args()
    print(f"`git merge` of {options.scenes} scenes of {options.size}, all edited on both sides; medians of {options.runs}:\n")
    print("| conflicts in each | " + " | ".join(f"{driver} [s]" for driver in DRIVERS)
          + "".join(f" | ovrin / {driver}" for driver in list(DRIVERS)[1:]) + " |\n|" + "---|" * 2 * len(DRIVERS))
    for conflicts in (0, 1):
        medians, ratios = measure(options, conflicts)
        print("| " + " | ".join([str(conflicts), *(f"{median:.2f}" for median in medians),
                                 *(f"{ratio:.2f}" for ratio in ratios)]) + " |", flush=True)


main()
