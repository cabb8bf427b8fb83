#!/usr/bin/env python3
"""Runs the benchmarks and writes docs/performance-figures.md and the picture docs/performance.svg.

usage: bench/report.py BUILD_DIRECTORY [--min-time SECONDS] [--runs N] [--print]

gnuplot draws the picture (Debian package gnuplot-nox).

With --print, prints the figures and writes no file. Writes nothing unless every benchmark ran and every answer was
right. Fails if a reachable limit was missed.
"""

import argparse
import json
import os
import pathlib
import subprocess
import sys
import tempfile

HERE = pathlib.Path(__file__).resolve().parent
DOCUMENT = HERE.parent / "docs" / "performance-figures.md"
PICTURE = HERE.parent / "docs" / "performance.svg"
INSTRUCTIONS = HERE / "instructions.json"
SEARCHES = (("Getting a lease", ("GetInstance.middle", "VELKO_Lease")),
            ("From the computer to its lease", ("AssociatorNames.fromComputer", "VELKO_LeaseSetting")))
PLOTTED = [*((operation, "VELKO_Lease") for operation in ("Load", "EnumInstances", "EnumInstanceNames", "ModifyInstance")),
           *(case for what, case in SEARCHES)]
HEAD = "<!-- Written by script/benchmark. -->\n\n# Performance figures\n\n"
SIDES = ("provider", "baseline")
NOT_SHOWN = {100, 100000}  # numbers of records that only the picture shows
# Loading is timed separately, other requests alternately with the baseline. Searches are also timed separately, because
# the baseline scans its table, which then replaces the provider's data in the processor's caches.
TIMED = "^Load/|/both/|/gate/|^(GetInstance|AssociatorNames.fromComputer).*/provider/"
# Limits of the time per record in the largest table: name, operation, and the work that determines the time.
LARGEST = (("Enumerating leases", "EnumInstances", "the object manager's instances"),
           ("Enumerating their names", "EnumInstanceNames", "the object manager's paths"),
           ("Loading leases", "Load", "reading the file"),
           ("Rewriting their file", "ModifyInstance", "one system call per line"))


def run(program, min_time):
    """Returns the result of the benchmark program, which is Google Benchmark's JSON."""
    command = [program, "--benchmark_format=json", f"--benchmark_min_time={min_time}", f"--benchmark_filter={TIMED}"]
    done = subprocess.run(command, stdout=subprocess.PIPE, text=True, check=False)
    if done.returncode != 0:
        sys.exit(f"{program} failed; nothing is reported")
    return json.loads(done.stdout)


def measured(results):
    """Returns {(operation, class): {size: {side: nanoseconds}}} in the order of the program: the best time of the runs.

    The sides "alone" and "gated" are measured alternately, where the gate is measured.
    """
    cases = {}
    units = {"ns": 1, "us": 1e3, "ms": 1e6, "s": 1e9}
    in_turn = {"both": SIDES, "gate": ("alone", "gated")}
    for one in (benchmark for result in results for benchmark in result["benchmarks"]):
        operation, class_name, side, size = one["name"].split("/")[:4]
        times = cases.setdefault((operation, class_name), {}).setdefault(int(size), {})
        measured_here = {side: one["real_time"] * units[one["time_unit"]]}
        if side in in_turn:
            measured_here = {name: one[name] * 1e9 for name in in_turn[side]}
        for name, time in measured_here.items():
            times[name] = min(time, times.get(name, time))
    for case, sizes in cases.items():
        for size, times in sizes.items():
            if not set(SIDES) <= set(times):
                sys.exit(f"{case} with {size} records lacks the provider or the baseline")
    return cases


def time_text(nanoseconds):
    for unit, length in (("s", 1e9), ("ms", 1e6), ("µs", 1e3)):
        if nanoseconds >= length:
            return f"{nanoseconds / length:.3g} {unit}"
    return f"{nanoseconds:.3g} ns"


def ratio_text(times):
    ratio = times["provider"] / times["baseline"]
    return f"{ratio:.1f}" if ratio < 99.95 else f"{ratio:,.0f}"


def is_end(case):
    """Returns whether a case gets the first or last record, which takes the same time as getting the middle one."""
    return case[0].endswith((".first", ".last"))


def table(head, rows):
    lines = ["| " + " | ".join(head) + " |", "|---|---|" + "---:|" * (len(head) - 2)]
    lines += ["| " + " | ".join(row) + " |" for row in rows]
    return "\n".join(lines) + "\n"


def table_by_size(cases, cell, head):
    """Returns a table with a row per request and class and a column per number of records. `cell` formats the times."""
    sizes = sorted({size for by_size in cases.values() for size in by_size} - NOT_SHOWN)
    rows = [[operation, class_name, *(cell(by_size[size]) if size in by_size else "" for size in sizes)]
            for (operation, class_name), by_size in cases.items()]
    return table([*head, *(f"{size:,}" for size in sizes)], rows)


def requests_tables(cases):
    """Returns the provider's times and their ratio to the baseline's: a table of requests with several sizes, and one
    of requests with a single size."""
    def cell(times):
        return f"{time_text(times['provider'])} ({ratio_text(times)})"
    several = {case: by_size for case, by_size in cases.items() if len(by_size) > 1 and not is_end(case)}
    rows = [[operation, class_name, f"{size:,}", cell(times)] for (operation, class_name), by_size in cases.items()
            if len(by_size) == 1 for size, times in by_size.items()]
    return (table_by_size(several, cell, ["Request", "Class"]) + "\n" +
            table(["Request", "Class", "Records", "Time"], rows))


def gate_table(cases):
    """Returns the time that the gate adds, and its share of the request's time without the gate."""
    def cell(times):
        added = times["gated"] - times["alone"]
        return f"{added / 1e3:+.1f} µs ({added / times['alone']:+.1%})"
    gated = {case: {size: times for size, times in by_size.items() if "gated" in times}
             for case, by_size in cases.items() if not is_end(case)}
    return table_by_size({case: by_size for case, by_size in gated.items() if by_size}, cell, ["Request", "Class"])


def memories(results):
    """Yields (class, size, counters) of each loaded table that is large enough for separate memory pages."""
    for one in results[-1]["benchmarks"]:
        operation, class_name, side, size = one["name"].split("/")[:4]
        if (operation, side) == ("Load", "provider") and int(size) >= 10000:
            yield class_name, int(size), one


def memory_table(results):
    """Returns the memory per record. The table reserves room for more records, whose pages are not in use."""
    rows = []
    for class_name, size, one in memories(results):
        memory, stored, pieces = one["bytes_per_record"], one["file_per_record"], one["pieces_per_record"]
        record = memory - pieces
        cells = (stored, memory, record, pieces, one["table_per_record"] - record)
        rows.append([class_name, f"{size:,}", *(f"{cell:.0f}" for cell in cells), f"{memory / stored:.2f}"])
    return table(["Class", "Records", "Bytes per record in the file", "in memory", "of that the record",
                  "of that its strings", "also reserved", "Ratio of memory to file"], rows)


def growth(by_size, side="provider"):
    """Returns the time per record with 1,000,000 records, relative to 10,000."""
    return by_size[1000000][side] / 1000000 / (by_size[10000][side] / 10000)


class Limit:
    """A limit, the measured value, and whether it is reachable."""

    def __init__(self, what, measured_here, at_most, bound, is_reachable=True):
        self.what, self.measured, self.at_most, self.bound = what, measured_here, at_most, bound
        self.is_kept = measured_here <= at_most
        self.is_broken = is_reachable and not self.is_kept


def limits_of(cases, results):
    leases = {operation: by_size for (operation, class_name), by_size in cases.items() if class_name == "VELKO_Lease"}
    enumeration = leases["EnumInstances"][1000]
    gated = enumeration["gated"] / enumeration["alone"] - 1
    added = leases["GetInstance.middle"][10]["gated"] - leases["GetInstance.middle"][10]["alone"]
    counted = json.loads(INSTRUCTIONS.read_text(encoding="utf-8"))
    counted_part = counted["EnumInstances/VELKO_Lease/gate/1000"] / counted["EnumInstances/VELKO_Lease/provider/1000"]
    limits = [Limit("Enumerating 1,000 leases, relative to the baseline", enumeration["provider"] / enumeration["baseline"], 3,
                    "the broker calls, which the baseline makes too")]
    for what, case in SEARCHES:
        few, many = (cases[case][size]["provider"] for size in (10, 1000000))
        limits += [Limit(f"{what}: time among 1,000,000, relative to 10", many / few, 2, "one lookup in the index"),
                   Limit("The same in microseconds", many / 1e3, 20, "the same")]
    limits += [Limit(f"{what}: time per record with 1,000,000, relative to 10,000", growth(leases[operation]), 1.5,
                     f"{bound}; the baseline: {growth(leases[operation], 'baseline'):.2f}")
               for what, operation, bound in LARGEST]
    limits += [Limit(f"Memory of {class_name} among 10,000, relative to its size in the file",
                     one["bytes_per_record"] / one["file_per_record"], 2,
                     "the record layout, and one allocation per longer string", False)
               for class_name, size, one in memories(results) if size == 10000]
    limits += [Limit("Gate, enumerating 1,000 leases: added time in percent", 100 * gated, 5,
                     "collecting the complete response before it is returned"),
               Limit("The same in instructions", 100 * counted_part, 5, "the same"),
               Limit("Gate, getting one of 10 leases: added microseconds", added / 1e3, 10,
                     "its lock and its objects")]
    return limits


def limits_table(limits):
    return table(["What", "What bounds it", "At most", "Measured", ""],
                 [[limit.what, limit.bound, f"{limit.at_most:g}", f"{limit.measured:.3g}",
                   "kept" if limit.is_kept else "**missed**"] for limit in limits])


def draw(cases):
    """Plots the time of some requests, of provider and baseline, against the number of records."""
    columns = [cases[case] for case in PLOTTED]
    lines = []
    for size in sorted({size for by_size in columns for size in by_size}):
        cells = [f"{by_size[size][side] / 1e9:.6g}" if size in by_size else "-"
                 for by_size in columns for side in SIDES]
        lines.append(" ".join([str(size), *cells]))
    with tempfile.NamedTemporaryFile("w", suffix=".dat") as data:
        data.write("\n".join(lines) + "\n")
        data.flush()
        subprocess.run(["gnuplot", "-e", f"data='{data.name}'; picture='{PICTURE}'", HERE / "plot.gp"], check=True)


def processor():
    with open("/proc/cpuinfo", encoding="utf-8") as file:
        for line in file:
            if line.startswith("model name"):
                return line.split(":", 1)[1].strip()
    return "unknown processor"


def machine(context):
    return (f"Machine: {os.cpu_count()} cores, {processor()}. Compiler: {context['compiler']}, "
            f"build type {context['build_type']}.\n")


def figures(cases, limits, results):
    return "\n".join([
        machine(results[0]["context"]),
        "## Limits\n",
        limits_table(limits),
        "## Requests\n",
        "Time of the provider by number of records; in parentheses its ratio to the baseline's.\n",
        requests_tables(cases),
        "## Time that the gate adds\n",
        gate_table(cases),
        "## Memory of the loaded records\n",
        memory_table(results),
    ])


def main():
    parser = argparse.ArgumentParser(description="Runs the benchmarks and reports their figures.")
    parser.add_argument("build_directory", type=pathlib.Path)
    parser.add_argument("--min-time", type=float, default=0.1, metavar="SECONDS",
                        help="minimum time of each benchmark")
    parser.add_argument("--runs", type=int, default=1, metavar="N",
                        help="number of runs; reports the best time of each benchmark")
    parser.add_argument("--print", action="store_true", help="print the figures and write no file")
    arguments = parser.parse_args()
    program = arguments.build_directory / "bin" / "provider_benchmark"
    results = [run(program, arguments.min_time) for _ in range(arguments.runs)]
    cases = measured(results)
    limits = limits_of(cases, results)
    text = figures(cases, limits, results)
    if arguments.print:
        print(text)
    else:
        draw(cases)
        DOCUMENT.write_text(HEAD + text, encoding="utf-8")
    broken = [f"{limit.what}: {limit.measured:.3g}, at most {limit.at_most:g}" for limit in limits if limit.is_broken]
    if broken:
        sys.exit("Reachable limits were missed:\n" + "\n".join(broken))


if __name__ == "__main__":
    main()
