#!/usr/bin/env python3
"""Times develop beside the tools that people use for the same, each as a whole process.

Usage: bench_develop.py [--runs N] [--sizes MPX,...] [--digest FILE] WINE_RUN BIN WORK SAMPLE

BIN has develop.exe and makephoto.exe, WORK takes the photos. For every size a photo of 3 to 2 is sharpened, PNG to
PNG, by each tool that is installed: the medians of N runs (3 unless told), in turns so that all meet the same noise.
Then 20 photos of 12 megapixels: develop takes them in one process, libvips one after the other. Last, spots that touch
one per cent of a photo against the full frame. The tools sharpen the stored values, develop linear light. What a run
measures replaces its like in DIGEST, the rest stays.
"""
import argparse
import json
import os
import pathlib
import shutil
import statistics
import subprocess
import sys
import time

AMOUNT, SIGMA = "0.8", "1.5"
PHOTOS, PHOTO_SIZE = 20, 12
PEERS = {
    "libvips": ("vips", lambda a, b: ["vips", "sharpen", a, b, "--sigma", SIGMA, "--x1", "0", "--m1", AMOUNT, "--m2",
                                      AMOUNT, "--y2", "100", "--y3", "100"]),
    "GraphicsMagick": ("gm", lambda a, b: ["gm", "convert", a, "-unsharp", f"0x{SIGMA}+{AMOUNT}+0", b]),
    "ImageMagick": ("convert", lambda a, b: ["convert", a, "-unsharp", f"0x{SIGMA}+{AMOUNT}+0", b]),
}


class Failed(Exception):
    pass


class Measure:
    """What a command took: seconds, seconds of all processors, MiB of memory at most."""

    def __init__(self, wall, cpu, memory):
        self.wall, self.cpu, self.memory = wall, cpu, memory

    @staticmethod
    def of(command):
        begin = time.monotonic()
        child = subprocess.Popen(command, stdout=subprocess.DEVNULL, stderr=subprocess.PIPE)
        errors = child.stderr.read().decode(errors="replace")
        _, status, usage = os.wait4(child.pid, 0)
        child.returncode = os.waitstatus_to_exitcode(status)
        if child.returncode != 0:
            raise Failed(f"{pathlib.Path(command[0]).name} failed: {errors.strip()}")
        return Measure(time.monotonic() - begin, usage.ru_utime + usage.ru_stime, usage.ru_maxrss / 1024)

    @staticmethod
    def median(runs):
        return Measure(*(statistics.median(getattr(run, field) for run in runs) for field in ("wall", "cpu", "memory")))

    @staticmethod
    def sum(runs):
        return Measure(sum(r.wall for r in runs), sum(r.cpu for r in runs), max(r.memory for r in runs))


class Bench:
    def __init__(self, options):
        self.runs = options.runs
        self.wine = [options.wine_run]
        self.bin = pathlib.Path(options.bin)
        self.work = pathlib.Path(options.work)
        self.sample = options.sample
        self.work.mkdir(parents=True, exist_ok=True)
        self.peers = {name: command for name, (program, command) in PEERS.items() if shutil.which(program)}

    def photo(self, megapixels):
        height = round((megapixels * 1e6 / 1.5) ** 0.5)
        path = self.work / f"photo-{megapixels}.png"
        if not path.exists():
            subprocess.run(self.program("makephoto", f"Z:{self.sample}", str(height * 3 // 2), str(height), f"Z:{path}"),
                           check=True)
        return path

    def program(self, name, *arguments):
        return [*self.wine, str(self.bin / f"{name}.exe"), *arguments]

    def develop(self, photos, *options):
        return self.program("develop", "--quiet", "--sharpen", AMOUNT, "--radius", SIGMA, *options, "--output",
                            f"Z:{self.work}/out", *(f"Z:{photo}" for photo in photos))

    def ways(self, photos):
        """Of each tool what it does with some photos; of many only the fastest, for the others would take minutes."""
        ways = {"develop": lambda: Measure.of(self.develop(photos))}
        for name, command in list(self.peers.items())[:1 if len(photos) > 1 else None]:
            ways[name] = lambda command=command: Measure.sum(
                [Measure.of(command(str(photo), str(self.work / "peer.png"))) for photo in photos])
        return ways

    def compare(self, photos, runs):
        ways = self.ways(photos)
        times = {name: [] for name in ways}
        for _ in range(runs):
            for name in list(times):
                try:
                    times[name].append(ways[name]())
                except Failed as failure:  # ImageMagick's own limits, for one
                    if name == "develop":
                        raise
                    print(f"bench: {name} is left out: {failure}")
                    del times[name]
        return {name: Measure.median(measures) for name, measures in times.items()}

    def spots(self, megapixels):
        """A spot on one per cent of the photo over its base, and all of it: the times that --report tells."""
        photo = self.photo(megapixels)
        height = round((megapixels * 1e6 / 1.5) ** 0.5)
        side = (0.01 * height * height * 1.5) ** 0.5
        text = self.work / "spots.txt"
        text.write_text(f"{height * 0.75:.1f} {height * 0.5:.1f} {side / 2:.1f} 1\n", encoding="ascii")
        subprocess.run(self.develop([photo]), check=True)
        base = self.work / f"base-{megapixels}.png"
        (self.work / "out" / photo.name).replace(base)
        command = [part for part in self.develop([photo], "--report", "--spots", f"Z:{text}", "--base", f"Z:{base}")
                   if part != "--quiet"]
        told = subprocess.run(command, check=True, capture_output=True, text=True, encoding="utf-8").stdout
        return next(line.strip() for line in told.splitlines() if "pixels processed" in line)


def row(name, what, measure, develop):
    print(f"{name:>16}  {what:<15} {measure.wall:8.2f} s {measure.cpu:8.2f} s {measure.memory:7.0f} MB "
          f"{measure.wall / develop.wall:6.2f}", flush=True)


def main():
    parser = argparse.ArgumentParser(description=__doc__, formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("--runs", type=int, default=3)
    parser.add_argument("--sizes", default="12,24,96")
    parser.add_argument("--digest")
    for name in ("wine_run", "bin", "work", "sample"):
        parser.add_argument(name)
    options = parser.parse_args()
    bench = Bench(options)
    missing = sorted(set(PEERS) - set(bench.peers))
    if missing:
        print(f"bench: not installed, so left out: {', '.join(missing)}")
    digest = {}
    if options.digest and pathlib.Path(options.digest).exists():
        digest = json.loads(pathlib.Path(options.digest).read_text(encoding="utf-8"))

    def table(what, measures):
        for name, measure in measures.items():
            row(what if name == "develop" else "", name, measure, measures["develop"])
        digest[what] = {name: {"wall_s": round(m.wall, 2), "cpu_s": round(m.cpu, 2), "memory_mb": round(m.memory)}
                        for name, m in measures.items()}

    print(f"{'':>16}  {'':<15} {'wall':>10} {'CPU':>10} {'memory':>10} {'ratio':>6}")
    sizes = [int(size) for size in options.sizes.split(",")]
    for megapixels in sizes:
        table(f"{megapixels} Mpx", bench.compare([bench.photo(megapixels)], bench.runs))
    if PHOTO_SIZE in sizes:
        copies = []
        for number in range(PHOTOS):
            copy = bench.work / f"many-{number:02}.png"
            if not copy.exists():
                os.link(bench.photo(PHOTO_SIZE), copy)
            copies.append(copy)
        table(f"{PHOTOS} x {PHOTO_SIZE} Mpx", bench.compare(copies, 1))
    for megapixels in (1, *sizes):
        print(f"{megapixels} Mpx, a spot: {bench.spots(megapixels)}", flush=True)
    if options.digest:
        pathlib.Path(options.digest).write_text(json.dumps(digest, indent=1) + "\n", encoding="utf-8")


if __name__ == "__main__":
    try:
        main()
    except Failed as failure:
        sys.exit(f"bench: {failure}")
