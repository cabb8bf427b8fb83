#!/usr/bin/env python3
"""Counts the instructions of requests and holds them against the kept table.

usage: bench/instructions.py BUILD_DIRECTORY [--update]

valgrind's callgrind counts what the processor executes from the call into the function table to its
return. The figures repeat whatever else the machine does, so that a check can tell a change of a few
per cent. bench/instructions.json keeps the figures of each request; what differs from them by more
than the tolerance fails, in either direction: a gain has to be kept too, with --update.

The limits that the provider is to keep are checked with the counted figures: see LIMITS.
"""

import argparse
import concurrent.futures
import json
import os
import pathlib
import re
import subprocess
import sys
import tempfile

TABLE = pathlib.Path(__file__).resolve().parent / "instructions.json"

# Processors with other vector instructions run other variants of the C library's string functions.
TOLERANCE = 0.1

ENUM = ("EnumInstances", "*LeaseAndWarranty_EnumInstances*", "*callEnumInstances*")
NAMES = ("EnumInstanceNames", "*LeaseAndWarranty_EnumInstanceNames*", "*callEnumInstanceNames*")
GET = ("GetInstance.middle", "*LeaseAndWarranty_GetInstance*", "*callGetInstance*")
CREATE = ("CreateInstance", "*LeaseAndWarranty_CreateInstance*", "*callCreateInstance*")
MODIFY = ("ModifyInstance", "*LeaseAndWarranty_ModifyInstance*", "*callModifyInstance*")
DELETE = ("DeleteInstance", "*LeaseAndWarranty_DeleteInstance*", "*callDeleteInstance*")
LOAD = ("Load", "*RecordCache<*>::RecordCache*", "*readRows*")

# Request with the functions between whose calls and returns the two sides are counted; class; records.
MEASURED = [
    *((request, f"VELKO_{kind}", size) for kind in ("Lease", "Warranty") for request in (LOAD, ENUM, NAMES, GET)
      for size in (1000, 10000)),
    *((request, f"VELKO_{kind}", 1000) for kind in ("Lease", "Warranty") for request in (CREATE, MODIFY, DELETE)),
    (GET, "VELKO_Lease", 10),
]

# Those that are counted behind the gate, too, with the gate's function. After the floor, once, the benchmark asks the
# provider alone and gated in turns.
GATED = [(ENUM, "VELKO_Lease", 1000, "gate::*Entry<*enumerateInstances*>::call(*char const??)"),
         (GET, "VELKO_Lease", 10, "gate::*Entry<*getInstance*>::call(*char const??)")]
GATE_TURNS = 10

# Highest ratio of provider to floor.
RATIO_LIMITS = {("EnumInstances", "VELKO_Lease", 1000): 3.0}

# The most that the gate may add: a part of what the provider takes, and what takes less than 10 microseconds as long as
# a processor executes one instruction a nanosecond.
GATE_PART_LIMITS = {("EnumInstances", "VELKO_Lease", 1000): 0.05}
GATE_LIMITS = {("GetInstance.middle", "VELKO_Lease", 10): 10000}

# Highest growth of the instructions a record from 1,000 to 10,000 records.
GROWTH_LIMIT = 1.1


def count(program, request, function):
    """The instructions that one request takes inside of a function, or of several that match."""
    with tempfile.TemporaryDirectory() as directory:
        command = ["valgrind", "--tool=callgrind", "--compress-strings=no",
                   f"--callgrind-out-file={directory}/out", f"--toggle-collect={function}", str(program),
                   f"--benchmark_filter=^{re.escape(request)}/manual_time$", "--benchmark_min_time=0"]
        done = subprocess.run(command, capture_output=True, text=True, check=False)
    collected = re.search(r"Collected : (\d+)", done.stderr)
    if done.returncode != 0 or collected is None or int(collected[1]) == 0:
        sys.exit(f"{request} could not be counted:\n{done.stdout}{done.stderr}")
    return int(collected[1])


def added_by_gate(gated, all_calls, floor):
    """What the gate adds to a request: those that are gated, without those of the provider alone."""
    return (gated - (all_calls - gated - floor)) // GATE_TURNS


def measure(program):
    """{request name: instructions}, of both sides of each request; of the side gate, what the gate adds."""
    work = []
    for (operation, provider, floor), class_name, size in MEASURED:
        for side, function in (("provider", provider), ("floor", floor)):
            work.append((f"{operation}/{class_name}/{side}/{size}", function))
    for (operation, _, call), class_name, size, gate in GATED:
        work += [(f"{operation}/{class_name}/gate/{size}", function) for function in (gate, call)]
    with concurrent.futures.ThreadPoolExecutor(os.cpu_count()) as workers:
        numbers = workers.map(lambda one: count(program, *one), work)
        counted = dict(zip(work, numbers))
    counts = {name: number for (name, _), number in counted.items()}
    for (operation, _, call), class_name, size, gate in GATED:
        name, floor = (f"{operation}/{class_name}/{side}/{size}" for side in ("gate", "floor"))
        counts[name] = added_by_gate(counted[name, gate], counted[name, call], counts[floor])
    return counts


def show(counts):
    print(f"{'request':<52}{'provider':>14}{'floor':>14}{'ratio':>8}{'a record':>12}")
    for (operation, _, _), class_name, size in MEASURED:
        provider, floor = (counts[f"{operation}/{class_name}/{side}/{size}"] for side in ("provider", "floor"))
        print(f"{f'{operation} {class_name} {size}':<52}{provider:>14,}{floor:>14,}{provider / floor:>8.2f}"
              f"{provider / size:>12,.1f}")
    print(f"\n{'request behind the gate':<52}{'provider':>14}{'gate adds':>14}{'part':>8}")
    for (operation, _, _), class_name, size, _ in GATED:
        provider, gate = (counts[f"{operation}/{class_name}/{side}/{size}"] for side in ("provider", "gate"))
        print(f"{f'{operation} {class_name} {size}':<52}{provider:>14,}{gate:>14,}{gate / provider:>8.1%}")


def broken_gate_limits(counts):
    limits = dict(GATE_LIMITS)
    for (operation, class_name, size), part in GATE_PART_LIMITS.items():
        limits[operation, class_name, size] = part * counts[f"{operation}/{class_name}/provider/{size}"]
    for (operation, class_name, size), limit in limits.items():
        added = counts[f"{operation}/{class_name}/gate/{size}"]
        if added > limit:
            yield f"{operation} {class_name} {size}: the gate adds {added:,} instructions, allowed are {limit:,.0f}"


def broken_limits(counts):
    for (operation, class_name, size), limit in RATIO_LIMITS.items():
        provider, floor = (counts[f"{operation}/{class_name}/{side}/{size}"] for side in ("provider", "floor"))
        if provider > limit * floor:
            yield f"{operation} {class_name} {size}: {provider / floor:.2f} times the floor, allowed are {limit}"
    yield from broken_gate_limits(counts)
    for name, number in counts.items():
        small = counts.get(name.replace("/provider/10000", "/provider/1000"))
        if name.endswith("/provider/10000") and number > GROWTH_LIMIT * 10 * small:
            yield f"{name}: {number / 10 / small:.2f} times as many instructions a record as with 1,000 records"


def differences(counts, kept):
    for name in sorted(counts.keys() | kept.keys()):
        if name not in counts or name not in kept:
            yield f"{name}: is only {'counted' if name in counts else 'kept'}"
        elif abs(counts[name] - kept[name]) > TOLERANCE * kept[name]:
            yield f"{name}: {counts[name]:,} instructions, kept are {kept[name]:,} ({counts[name] / kept[name] - 1:+.1%})"


def main():
    parser = argparse.ArgumentParser(description="Counts instructions and holds them against the kept table.")
    parser.add_argument("build_directory", type=pathlib.Path)
    parser.add_argument("--update", action="store_true", help="keep the figures as the table")
    arguments = parser.parse_args()
    counts = measure(arguments.build_directory / "bin" / "provider_benchmark")
    show(counts)
    problems = list(broken_limits(counts))
    if arguments.update:
        TABLE.write_text(json.dumps(counts, indent=4) + "\n", encoding="utf-8")
    else:
        problems += differences(counts, json.loads(TABLE.read_text(encoding="utf-8")))
    for problem in problems:
        print(problem, file=sys.stderr)
    if problems:
        sys.exit("Measure again with --update where the difference is meant.")


if __name__ == "__main__":
    main()
