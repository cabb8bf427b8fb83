#!/usr/bin/env python3
"""Counts the instructions of requests and compares them with a stored table.

usage: bench/instructions.py BUILD_DIRECTORY [--update]

valgrind's callgrind counts the instructions from the call into the function table to its return. The
figures do not depend on other work of the machine. bench/instructions.json stores the figure of each
request. A difference of more than 10 % is a failure, even if it is an improvement: store the new figure
with --update.

Also checks the counted figures against the limits of the provider, the gate and the host.
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

# Figures differ between processors, because the C library has string functions for different vector instructions.
TOLERANCE = 0.1

# The host sends each request with a call to this function.
CALL = "cimhost::callOperation*"

ENUM = ("EnumInstances", "*LeaseAndWarranty_EnumInstances*", CALL)
NAMES = ("EnumInstanceNames", "*LeaseAndWarranty_EnumInstanceNames*", CALL)
GET = ("GetInstance.middle", "*LeaseAndWarranty_GetInstance*", CALL)
CREATE = ("CreateInstance", "*LeaseAndWarranty_CreateInstance*", CALL)
MODIFY = ("ModifyInstance", "*LeaseAndWarranty_ModifyInstance*", CALL)
DELETE = ("DeleteInstance", "*LeaseAndWarranty_DeleteInstance*", CALL)
LOAD = ("Load", "*RecordCache<*>::RecordCache*", "*readRows*")

# Tuples of a request, a class and a number of records. A request names the functions in which the instructions of the
# provider and of the baseline are counted.
MEASURED = [
    *((request, f"VELKO_{kind}", size) for kind in ("Lease", "Warranty") for request in (LOAD, ENUM, NAMES, GET)
      for size in (1000, 10000)),
    *((request, f"VELKO_{kind}", 1000) for kind in ("Lease", "Warranty") for request in (CREATE, MODIFY, DELETE)),
    (GET, "VELKO_Lease", 10),
]

# Requests that are also counted behind the gate, with the gate's function. After one request to the baseline, the
# benchmark alternates between the provider alone and behind the gate.
GATED = [(ENUM, "VELKO_Lease", 1000, "*runOperation<*enumerateInstances,*char const??)"),
         (GET, "VELKO_Lease", 10, "*runOperation<*getInstance,*char const??)")]
GATE_TURNS = 10

# Highest ratio of provider to baseline.
RATIO_LIMITS = {("EnumInstances", "VELKO_Lease", 1000): 3.0}

# The most that the gate may add: as a share of the provider's instructions, and as a number of instructions, which take
# 10 microseconds at one instruction per nanosecond.
GATE_PART_LIMITS = {("EnumInstances", "VELKO_Lease", 1000): 0.05}
GATE_LIMITS = {("GetInstance.middle", "VELKO_Lease", 10): 10000}

# The host's objects are counted with the baseline and the allocator that cimhost links. The limit is per instance.
HOST = (ENUM, "VELKO_Lease", 1000)
HOST_ALLOCATOR = "libjemalloc.so.2"
HOST_LIMIT = 12000

# Highest growth of the instructions per record from 1,000 to 10,000 records.
GROWTH_LIMIT = 1.1


def count(program, request, function, preloaded=""):
    """Returns the instructions of one request in the functions that match a pattern."""
    with tempfile.TemporaryDirectory() as directory:
        command = ["valgrind", "--tool=callgrind", "--compress-strings=no",
                   f"--callgrind-out-file={directory}/out", f"--toggle-collect={function}", str(program),
                   f"--benchmark_filter=^{re.escape(request)}/manual_time$", "--benchmark_min_time=0"]
        done = subprocess.run(command, env={**os.environ, "LD_PRELOAD": preloaded}, capture_output=True, text=True,
                              check=False)
    collected = re.search(r"Collected : (\d+)", done.stderr)
    if done.returncode != 0 or collected is None or int(collected[1]) == 0:
        sys.exit(f"{request} could not be counted:\n{done.stdout}{done.stderr}")
    return int(collected[1])


def added_by_gate(gated, all_calls, baseline):
    """Returns the instructions that the gate adds to a request: those behind the gate minus those of the provider alone."""
    return (gated - (all_calls - gated - baseline)) // GATE_TURNS


def measure(program):
    """Returns {request name: instructions}. The side of a name is provider, baseline, host, or gate: what the gate adds."""
    work = []
    for (operation, provider, baseline), class_name, size in MEASURED:
        for side, function in (("provider", provider), ("baseline", baseline)):
            work.append((f"{operation}/{class_name}/{side}/{size}", function))
    for (operation, _, call), class_name, size, gate in GATED:
        work += [(f"{operation}/{class_name}/gate/{size}", function) for function in (gate, call)]
    (operation, _, call), class_name, size = HOST
    host = (f"{operation}/{class_name}/baseline/{size}", call, HOST_ALLOCATOR)
    work.append(host)
    with concurrent.futures.ThreadPoolExecutor(os.cpu_count()) as workers:
        numbers = workers.map(lambda one: count(program, *one), work)
        counted = dict(zip(work, numbers))
    host_count = counted.pop(host)
    counts = {name: number for (name, _), number in counted.items()}
    counts[f"{operation}/{class_name}/host/{size}"] = host_count
    for (operation, _, call), class_name, size, gate in GATED:
        name, baseline = (f"{operation}/{class_name}/{side}/{size}" for side in ("gate", "baseline"))
        counts[name] = added_by_gate(counted[name, gate], counted[name, call], counts[baseline])
    return counts


def show(counts):
    print(f"{'request':<52}{'provider':>14}{'baseline':>14}{'ratio':>8}{'per record':>12}")
    for (operation, _, _), class_name, size in MEASURED:
        provider, baseline = (counts[f"{operation}/{class_name}/{side}/{size}"] for side in ("provider", "baseline"))
        print(f"{f'{operation} {class_name} {size}':<52}{provider:>14,}{baseline:>14,}{provider / baseline:>8.2f}"
              f"{provider / size:>12,.1f}")
    (operation, _, _), class_name, size = HOST
    host = counts[f"{operation}/{class_name}/host/{size}"]
    print(f"\nThe host's objects, {operation} {class_name} {size}: {host / size:,.0f} per instance")
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
            yield f"{operation} {class_name} {size}: the gate adds {added:,} instructions; at most {limit:,.0f} are allowed"


def broken_limits(counts):
    for (operation, class_name, size), limit in RATIO_LIMITS.items():
        provider, baseline = (counts[f"{operation}/{class_name}/{side}/{size}"] for side in ("provider", "baseline"))
        if provider > limit * baseline:
            yield f"{operation} {class_name} {size}: {provider / baseline:.2f} times the baseline; at most {limit} is allowed"
    yield from broken_gate_limits(counts)
    (operation, _, _), class_name, size = HOST
    host = counts[f"{operation}/{class_name}/host/{size}"] / size
    if host > HOST_LIMIT:
        yield f"the host's objects: {host:,.0f} instructions per instance; at most {HOST_LIMIT:,} are allowed"
    for name, number in counts.items():
        small = counts.get(name.replace("/provider/10000", "/provider/1000"))
        if name.endswith("/provider/10000") and number > GROWTH_LIMIT * 10 * small:
            yield f"{name}: {number / 10 / small:.2f} times as many instructions per record as with 1,000 records"


def differences(counts, stored):
    for name in sorted(counts.keys() | stored.keys()):
        if name not in counts or name not in stored:
            yield f"{name}: {'counted, but not stored' if name in counts else 'stored, but not counted'}"
        elif abs(counts[name] - stored[name]) > TOLERANCE * stored[name]:
            yield f"{name}: {counts[name]:,} instructions; {stored[name]:,} are stored ({counts[name] / stored[name] - 1:+.1%})"


def main():
    parser = argparse.ArgumentParser(description="Counts instructions and compares them with the stored table.")
    parser.add_argument("build_directory", type=pathlib.Path)
    parser.add_argument("--update", action="store_true", help="store the figures as the table")
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
        sys.exit("If the difference is intended, measure again with --update.")


if __name__ == "__main__":
    main()
