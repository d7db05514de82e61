#!/usr/bin/python3
"""Prints the tables of a benchmark run and, as its last lines, the important ratios:

    report.py RESULTS

RESULTS is the folder with what scripts/bench has measured: benchmarks.json, driver-4.json,
driver-4000.json, service.json and http-growth.json. Each may be missing, for example after a run with a
filter. The growth is drawn there as SVG pictures. Times are medians of processor time, which is least
affected by other work on the machine.
"""

import json
import math
import pathlib
import re
import sys

from plot import svg


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


FEW, MANY = "4", "4000"
MOST_OF_MANY = 1.1


def report_driver(few, many):
    """Calls of the simulated driver on a chassis of FEW and of MANY devices."""
    rows = [("calls of the simulated driver", f"{FEW} devices, ns", f"{MANY} devices, ns", "ratio")]
    for name in few.rows:
        case = name.removeprefix(f"driver/{FEW}/")
        if (other := f"driver/{MANY}/{case}") in many.rows:
            times = few.time(name) * 1e3, many.time(other) * 1e3
            ratio = times[1] / times[0]
            rows.append((case, *(f"{time:.0f}" for time in times), f"{ratio:.2f}"))
            if case == SUBJECT:
                yield (f"{SUBJECT} with the simulated driver, {MANY} devices to {FEW}: {ratio:.2f} "
                       f"(goal: at most {MOST_OF_MANY}{missed(ratio <= MOST_OF_MANY)})")
    if rows[1:]:
        print_table("The simulated driver, and a whole request with it", rows)


def exponent(series):
    """The power of the count with which the time grows, by least squares: 1 linear, 2 quadratic."""
    points = [(math.log(count), math.log(time)) for count, time in series]
    mean_x, mean_y = (sum(axis) / len(points) for axis in zip(*points))
    return (sum((x - mean_x) * (y - mean_y) for x, y in points)
            / sum((x - mean_x) ** 2 for x, _ in points))


MOST_EXPONENT = 1.04


def steepest(label, exponents):
    most, case = max(exponents)
    return (f"{label}, as an exponent: {most:.2f} ({case}; goal: at most {MOST_EXPONENT}"
            f"{missed(most < MOST_EXPONENT + 0.005)})")


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
        yield steepest("steepest growth", exponents)


def report_http_growth(series_of):
    rows = [("what grows over HTTP", "from", "to", "us", "us each", "exponent")]
    exponents = []
    for case, series in series_of.items():
        count, time = series[-1]
        exponents.append((exponent(series), case))
        rows.append((case, str(series[0][0]), str(count), f"{time:.0f}", f"{time / count:.4f}",
                     f"{exponents[-1][0]:.2f}"))
    if exponents:
        print_table("Growing requests over HTTP, processor time of the server", rows)
        yield steepest("steepest growth over HTTP", exponents)


def draw(folder, benchmarks, http_growth):
    in_process = benchmarks.groups("growth")
    failing = {case for case in in_process if case.endswith(("Name", "Deep", "Skipped"))}
    pictures = {
        "growth-in-process": {case: some for case, some in in_process.items()
                              if case not in failing},
        "growth-of-failures": {case: in_process[case] for case in sorted(failing)},
        "growth-over-http": http_growth,
    }
    for name, lines in pictures.items():
        if lines:
            (folder / f"{name}.svg").write_text(svg(lines, ("count", "microseconds")))


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
    names = {"a request with one unknown name": "failure/request",
             "its text alone": "failure/translated",
             "its text, every script compiled each time": "failure/compiledEachTime"}
    if not set(names.values()) <= set(benchmarks.rows):
        return
    rows = [("a failure", "us", "of it system", "peak KiB")]
    rows += [(label, f"{benchmarks.time(name):.0f}",
              f"{benchmarks.rows[name]['systemNs'] / 1000:.1f}",
              f"{benchmarks.rows[name]['peakBytes'] / 1024:.0f}") for label, name in names.items()]
    print_table("Failures", rows)
    request, fast, plain = names.values()
    kept = benchmarks.rows[request]["keptBytes"]
    print(f"  kept in the process: {kept / 1024:.0f} KiB")
    memory = benchmarks.rows[plain]["peakBytes"] / benchmarks.rows[fast]["peakBytes"]
    yield (f"failure, plain to fast: time {benchmarks.time(plain) / benchmarks.time(fast):.1f} "
           f"(goal: at least 8), memory {memory:.1f} (goal: at least 2)")
    good = "road/getProperty"
    if good in benchmarks.rows:
        yield (f"failing request: {benchmarks.time(request):.0f} us (goal: at most 80), "
               f"{benchmarks.time(request) / benchmarks.time(good):.1f} times getProperty "
               "(goal: at most 25)")


def report_doubles(benchmarks):
    ratios = []
    for digits in ("3", "17"):
        names = [f"doubles/{kind}Of{digits}Digits" for kind in ("nearest", "rough")]
        if set(names) <= set(benchmarks.rows):
            nearest, rough = map(benchmarks.time, names)
            ratios.append(f"{digits} digits {nearest / rough:.2f}")
    if ratios:
        yield f"parsing doubles, nearest to one unit off: {', '.join(ratios)}"


GOALS = {"fixed text, event loop": (0.9, 0.6), "libjson-rpc-cpp": (None, 1.1), "Node": (None, 1.5)}
SUBJECT = "getProperty"
MOST_USER_US = 7.0


def report_loads(loads):
    """Tables of what wrk measured, and the ratios with their goals: (one connection, more)."""
    for connections, kinds in loads.items():
        rows = [("requests", "in a second", "from", "to", "median us", "99 % us", "user us",
                 "system us", "switches")]
        for kind, measures in kinds.items():
            rate, least, most = measures["requests_per_second"]
            rows.append((kind, f"{rate:.0f}", f"{least:.0f}", f"{most:.0f}",
                         f"{measures['median_us'][0]:.0f}", f"{measures['p99_us'][0]:.0f}",
                         f"{measures['user_us'][0]:.1f}", f"{measures['system_us'][0]:.1f}",
                         f"{measures['switches'][0]:.2f}"))
        print_table(f"Over HTTP, connections: {connections}", rows)
        yield from ratios_of(connections, kinds)


def ratios_of(connections, kinds):
    rate = kinds[SUBJECT]["requests_per_second"][0]
    for peer, goals in GOALS.items():
        if peer not in kinds:
            yield f"{SUBJECT} to {peer}, {connections} connections: not measured"
            continue
        goal = goals[0 if connections == "1" else 1]
        ratio = rate / kinds[peer]["requests_per_second"][0]
        verdict = "" if goal is None else f" (goal: at least {goal}{missed(ratio >= goal)})"
        yield f"{SUBJECT} to {peer}, {connections} connections: {ratio:.2f}{verdict}"
    user = kinds[SUBJECT]["user_us"][0]
    yield (f"user time of {SUBJECT}, {connections} connections: {user:.1f} us "
           f"(goal: at most {MOST_USER_US}{missed(user <= MOST_USER_US)})")


def missed(reached):
    return "" if reached else "; missed"


def report_service(service):
    if not service:
        return
    yield from report_loads(service["loads"])
    print_table("Memory of the process", [("resident", "MiB")] + [
        (moment, f"{kib / 1024:.1f}") for moment, kib in service["resident_kib"].items()])
    print_table("Start", [("until it listens", "ms")] + [
        (what, f"{time:.1f}") for what, time in service["start_ms"].items()])


def read(path):
    return json.loads(path.read_text() or "{}") if path.exists() else {}


def main():
    folder = pathlib.Path(sys.argv[1])
    benchmarks, few, many, service, http_growth = (
        read(folder / f"{name}.json")
        for name in ("benchmarks", f"driver-{FEW}", f"driver-{MANY}", "service", "http-growth"))
    measured = Benchmarks(benchmarks)
    ratios = []
    for report in (report_requests, report_growth, report_sessions, report_failures,
                   report_doubles):
        ratios += report(measured)
    drivers = Benchmarks(few), Benchmarks(many)
    ratios += report_driver(*drivers)
    ratios += report_service(service)
    ratios += report_http_growth(http_growth)
    draw(folder, measured, http_growth)
    print("\nRatios")
    for line in ratios:
        print(line)
    failed = [name for run in (measured, *drivers) for name in run.failed]
    if failed:
        raise SystemExit(f"failed: {', '.join(failed)}")


if __name__ == "__main__":
    main()
