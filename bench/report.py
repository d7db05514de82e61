#!/usr/bin/python3
"""Prints the tables of a benchmark run and, as its last lines, the important ratios:

    report.py BENCHMARKS.json SERVICE.json

Either file may be missing, for example after a run with a filter. Times are medians of processor
time, which is least affected by other work on the machine.
"""

import json
import math
import pathlib
import re
import sys


class Benchmarks:
    """The medians of a run: by name, the processor time in microseconds and the counters."""

    def __init__(self, results):
        rows = results.get("benchmarks", [])
        self.failed = [row["name"] for row in rows if row.get("error_occurred")]
        medians = [row for row in rows if row.get("aggregate_name") == "median"]
        medians.sort(key=lambda row: (row["family_index"], row["per_family_instance_index"]))
        self.rows = {row["run_name"]: row for row in medians}
        self.fits = {row["run_name"]: row["big_o"] for row in rows if "big_o" in row}

    def time(self, name):
        row = self.rows[name]
        return row["cpu_time"] * {"ns": 1e-3, "us": 1, "ms": 1e3}[row["time_unit"]]

    def groups(self, prefix):
        """The benchmarks `prefix`/<case>/<count> as {case: [(count, time), ...]}."""
        found = {}
        for name in self.rows:
            match = re.fullmatch(rf"{prefix}/(\w+)/(\d+)", name)
            if match:
                found.setdefault(match[1], []).append((int(match[2]), self.time(name)))
        return {case: sorted(series) for case, series in found.items()}


def print_table(title, rows):
    """Print rows of texts, the first with the column names. Columns after the first are numbers."""
    widths = [max(map(len, column)) for column in zip(*rows)]
    print(f"\n{title}")
    for row in rows:
        cells = [row[0].ljust(widths[0])]
        cells += [cell.rjust(width) for cell, width in zip(row[1:], widths[1:])]
        print("  " + "  ".join(cells))


def report_requests(benchmarks):
    names = [name.split("/")[1] for name in benchmarks.rows if name.startswith("road/")]
    rows = [("request", "service us", "floor us", "ratio")]
    ratios = []
    for name in names:
        if f"floor/{name}" not in benchmarks.rows:
            continue
        road, floor = benchmarks.time(f"road/{name}"), benchmarks.time(f"floor/{name}")
        rows.append((name, f"{road:.2f}", f"{floor:.2f}", f"{road / floor:.2f}"))
        ratios.append(f"{name} {road / floor:.2f}")
    if ratios:
        print_table("Requests on a driver that costs nothing, and the JSON library alone", rows)
        yield f"service to floor: {', '.join(ratios)} (goal for getProperty: at most 2.00)"


def exponent(series):
    """The power of the count with which the time grows, by least squares: 1 linear, 2 quadratic."""
    points = [(math.log(count), math.log(time)) for count, time in series]
    mean_x, mean_y = (sum(axis) / len(points) for axis in zip(*points))
    return (sum((x - mean_x) * (y - mean_y) for x, y in points)
            / sum((x - mean_x) ** 2 for x, _ in points))


def report_growth(benchmarks):
    rows = [("what grows", "from", "to", "us", "us each", "exponent", "fit")]
    exponents = []
    for case, series in benchmarks.groups("growth").items():
        count, time = series[-1]
        exponents.append((exponent(series), case))
        rows.append((case, str(series[0][0]), str(count), f"{time:.0f}", f"{time / count:.4f}",
                     f"{exponents[-1][0]:.2f}", benchmarks.fits.get(f"growth/{case}", "")))
    if exponents:
        print_table("Growing requests: exponent 1 is linear, 2 quadratic", rows)
        yield "steepest growth, as an exponent: {:.2f} ({})".format(*max(exponents))


def report_sessions(benchmarks):
    rows = [("requests with open sessions", "sessions", "us", "to one session")]
    ratios = []
    for prefix in ("sessionsGetProperty", "sessionsOpenAndClose"):
        for case, series in benchmarks.groups(prefix).items():
            one = series[0][1]
            rows += [(f"{prefix}/{case}", str(count), f"{time:.2f}", f"{time / one:.2f}")
                     for count, time in series]
            ratios.append(f"{prefix}/{case} {series[-1][0]}: {series[-1][1] / one:.2f}")
    if ratios:
        print_table("Open sessions: 1.00 is flat", rows)
        yield f"most sessions to one: {', '.join(ratios)}"


def report_failures(benchmarks):
    names = {"as it is": "failure/translated",
             "every script compiled each time": "failure/compiledEachTime"}
    if not set(names.values()) <= set(benchmarks.rows):
        return
    rows = [("a failure in words", "us", "peak KiB")]
    rows += [(label, f"{benchmarks.time(name):.0f}",
              f"{benchmarks.rows[name]['peakBytes'] / 1024:.0f}") for label, name in names.items()]
    print_table("Failures", rows)
    kept = benchmarks.rows[names["as it is"]]["keptBytes"]
    print(f"  bytecode kept in the process: {kept / 1024:.0f} KiB")
    fast, plain = names.values()
    memory = benchmarks.rows[plain]["peakBytes"] / benchmarks.rows[fast]["peakBytes"]
    yield (f"failure, plain to fast: time {benchmarks.time(plain) / benchmarks.time(fast):.1f} "
           f"(goal: at least 8), memory {memory:.1f} (goal: at least 2)")


def report_doubles(benchmarks):
    ratios = []
    for digits in ("3", "17"):
        names = [f"doubles/{kind}Of{digits}Digits" for kind in ("nearest", "rough")]
        if set(names) <= set(benchmarks.rows):
            nearest, rough = map(benchmarks.time, names)
            ratios.append(f"{digits} digits {nearest / rough:.2f}")
    if ratios:
        yield f"parsing doubles, nearest to one unit off: {', '.join(ratios)}"


def report_service(service):
    if not service:
        return
    rates = service["requests_per_second"]
    bare = next(iter(rates.values()))
    print_table("Over HTTP", [("requests", "in a second", "to fixed text")] + [
        (kind, f"{rate:.0f}", f"{rate / bare:.2f}") for kind, rate in rates.items()])
    print_table("Memory of the process", [("resident", "MiB")] + [
        (moment, f"{kib / 1024:.1f}") for moment, kib in service["resident_kib"].items()])
    print_table("Start", [("until it listens", "ms")] + [
        (what, f"{time:.1f}") for what, time in service["start_ms"].items()])
    others = [f"{kind} {rate / bare:.2f}" for kind, rate in list(rates.items())[1:]]
    yield f"requests in a second to those of a fixed text: {', '.join(others)}"


def read(path):
    return json.loads(path.read_text()) if path.exists() else {}


def main():
    benchmarks, service = map(read, map(pathlib.Path, sys.argv[1:3]))
    measured = Benchmarks(benchmarks)
    ratios = []
    for report in (report_requests, report_growth, report_sessions, report_failures,
                   report_doubles):
        ratios += report(measured)
    ratios += report_service(service)
    print("\nRatios")
    for line in ratios:
        print(line)
    if measured.failed:
        raise SystemExit(f"failed: {', '.join(measured.failed)}")


if __name__ == "__main__":
    main()
