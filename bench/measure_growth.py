#!/usr/bin/python3
"""Measures over HTTP how requests grow: measure_growth.py BUILD_DIR RESULTS.json

The processor time of the server, user and system, for one request of each size: medians of rounds in
which the sizes take turns. The service has the simulated chassis.
"""

import contextlib
import json
import pathlib
import statistics
import sys
import tempfile

from http_servers import Server, call, get_property, host_command, open_session, post
from measure_slow import chassis_with_large_area

ROUNDS = 5
SECONDS = 0.1  # of processor time for a size in a round, about
SIZES = (1, 4, 16, 64)


def array_of(text, count):
    return f"[{','.join([text] * count)}]"


def cases(session):
    """By name: how many at the smallest size, and the function that makes a request of a count."""
    return {
        "names in devices": (256, lambda count: call(
            "getProperty", session_id=session, devices=["Mod1"] * count,
            property="Dev.Temperature")),
        "elements of a batch": (16, lambda count: array_of(get_property(session), count)),
        "numbers in a value": (256, lambda count: call(
            "setProperty", session_id=session, devices=["Mod1"], property="Dev.Comment",
            value=[36.625] * count)),
        "bytes of NVMEM read": (16384, lambda count: call(
            "getNvmemBytes", session_id=session, nvmem_area="Mod1/user", address=0, size=count)),
        "bytes of NVMEM written": (16384, lambda count: call(
            "setNvmemBytes", session_id=session, nvmem_area="Mod1/user", address=0,
            data=[200] * count)),
        "characters of an unknown name": (16384, lambda count: get_property(session, "x" * count)),
        "failing elements of a batch": (
            16, lambda count: array_of(get_property(session, "NoSuchDevice"), count)),
    }


def processor_time(server, connection, body, count):
    """Seconds of the server for `count` requests."""
    before = server.processor_time()
    for _ in range(count):
        post(connection, body)
    return server.processor_time() - before


def enough(server, connection, body):
    """How many requests take about SECONDS."""
    count = 1
    while (time := processor_time(server, connection, body, count)) < SECONDS / 4:
        count *= 2
    return max(1, round(count * SECONDS / time))


def measure(server):
    with contextlib.closing(server.connection()) as connection:
        measured = {}
        for name, (first, make) in cases(open_session(connection)).items():
            bodies = {first * size: make(first * size) for size in SIZES}
            counts = {size: enough(server, connection, body) for size, body in bodies.items()}
            rounds = [{size: processor_time(server, connection, body, counts[size]) / counts[size]
                       for size, body in bodies.items()} for _ in range(ROUNDS)]
            measured[name] = [(size, statistics.median(one[size] for one in rounds) * 1e6)
                              for size in bodies]
        return measured


def main():
    build, results = map(pathlib.Path, sys.argv[1:3])
    with tempfile.NamedTemporaryFile("w", suffix=".json") as file:
        json.dump(chassis_with_large_area(), file)
        file.flush()
        with Server(*host_command(build), "--chassis", file.name) as server:
            results.write_text(json.dumps(measure(server), indent=1))


if __name__ == "__main__":
    main()
