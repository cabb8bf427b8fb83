#!/usr/bin/env python3
"""Tells how often the enumerations of leases miss the processor's caches, in the provider and in the floor.

usage: bench/misses.py BUILD_DIRECTORY

valgrind's callgrind plays the caches, so the figures repeat whatever machine counts. Its caches are small, so that
10,000 leases overflow them as 1,000,000 do those of a real processor.
"""

import argparse
import concurrent.futures
import os
import pathlib
import re
import subprocess
import sys
import tempfile

import instructions

CACHES = ["--I1=32768,8,64", "--D1=32768,8,64", "--LL=1048576,16,64"]
SIZES = (100, 1000, 10000)


def events(program, request, function):
    """{event: count} inside of a function, as callgrind names the events."""
    with tempfile.TemporaryDirectory() as directory:
        command = ["valgrind", "--tool=callgrind", "--cache-sim=yes", *CACHES, "--compress-strings=no",
                   f"--callgrind-out-file={directory}/out", f"--toggle-collect={function}", str(program),
                   f"--benchmark_filter=^{re.escape(request)}/manual_time$", "--benchmark_min_time=0"]
        done = subprocess.run(command, capture_output=True, text=True, check=False)
        names = re.search(r"Events\s*: (.+)", done.stderr)
        counts = re.search(r"Collected : ([\d ]+)", done.stderr)
    if done.returncode != 0 or names is None or counts is None or counts[1].startswith("0 "):
        sys.exit(f"{request} could not be counted:\n{done.stdout}{done.stderr}")
    return dict(zip(names[1].split(), map(int, counts[1].split())))


def row(one, size, counted):
    """Instructions, accesses to data, and misses of the first and of the last cache, all a record."""
    accesses, first, last = (sum(counted[event] for event in names)
                             for names in (("Dr", "Dw"), ("D1mr", "D1mw"), ("DLmr", "DLmw")))
    cells = " | ".join(f"{number / size:,.1f}" for number in (counted["Ir"], accesses, first, last))
    return f"| {one[0]} | {one[1]} | {size:,} | {cells} |"


def main():
    parser = argparse.ArgumentParser(description="Tells how often enumerations miss the processor's caches.")
    parser.add_argument("build_directory", type=pathlib.Path)
    program = parser.parse_args().build_directory / "bin" / "provider_benchmark"
    work = [((operation, side), size, function) for operation, *functions in (instructions.ENUM, instructions.NAMES)
            for side, function in zip(("provider", "floor"), functions) for size in SIZES]
    with concurrent.futures.ThreadPoolExecutor(os.cpu_count()) as workers:
        counted = workers.map(lambda each: events(program, f"{each[0][0]}/VELKO_Lease/{each[0][1]}/{each[1]}", each[2]),
                              work)
        print("| Request | Side | Records | Instructions | Accesses | Misses of the first cache | of the last |")
        print("|---|---|---:|---:|---:|---:|---:|")
        for (one, size, _), counts in zip(work, counted):
            print(row(one, size, counts), flush=True)


if __name__ == "__main__":
    main()
