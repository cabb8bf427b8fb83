#!/usr/bin/env python3
"""Counts the cache misses of enumerations of leases, in the provider and in the baseline.

usage: bench/misses.py BUILD_DIRECTORY

valgrind's callgrind simulates the caches, so the figures do not depend on the machine. The simulated caches are small:
10,000 leases exceed them as 1,000,000 leases exceed the caches of a real processor.
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
    """Returns {event: count} in the functions that match a pattern. The events have callgrind's names."""
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
    """Returns a table row with instructions, data accesses, and misses of the first and last cache, all per record."""
    accesses, first, last = (sum(counted[event] for event in names)
                             for names in (("Dr", "Dw"), ("D1mr", "D1mw"), ("DLmr", "DLmw")))
    cells = " | ".join(f"{number / size:,.1f}" for number in (counted["Ir"], accesses, first, last))
    return f"| {one[0]} | {one[1]} | {size:,} | {cells} |"


def main():
    parser = argparse.ArgumentParser(description="Counts the cache misses of enumerations.")
    parser.add_argument("build_directory", type=pathlib.Path)
    program = parser.parse_args().build_directory / "bin" / "provider_benchmark"
    work = [((operation, side), size, function) for operation, *functions in (instructions.ENUM, instructions.NAMES)
            for side, function in zip(("provider", "baseline"), functions) for size in SIZES]
    with concurrent.futures.ThreadPoolExecutor(os.cpu_count()) as workers:
        counted = workers.map(lambda each: events(program, f"{each[0][0]}/VELKO_Lease/{each[0][1]}/{each[1]}", each[2]),
                              work)
        print("| Request | Side | Records | Instructions | Accesses | Misses of the first cache | of the last |")
        print("|---|---|---:|---:|---:|---:|---:|")
        for (one, size, _), counts in zip(work, counted):
            print(row(one, size, counts), flush=True)


if __name__ == "__main__":
    main()
