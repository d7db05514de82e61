#!/usr/bin/python3
"""Measures what getProperty of one client sees while others are slow: measure_slow.py BUILD_DIR

The others are one client that waits in a reservation, one that sends batches of 1000 failing
requests and one that reads 1 MiB of NVMEM, again and again: each by itself, and all together.
"""

import contextlib
import json
import pathlib
import statistics
import sys
import tempfile
import threading
import time

from http_servers import HERE, Server, call, get_property, host_command, open_session, post

SECONDS = 4
RESERVATION_SECONDS = 1.0
MEBIBYTE = 1024 * 1024
CHASSIS = HERE.parent / "simulator" / "chassis" / "bench.json"


def chassis_with_large_area():
    """The chassis of the benchmark with 1 MiB of NVMEM at Mod1/user."""
    chassis = json.loads(CHASSIS.read_text())

    def enlarge(part):
        for module in part:
            if module["name"] == "Mod1":
                module["nvmem_areas"] = [{"name": "user", "size": MEBIBYTE}]
            enlarge(module.get("modules", []))

    enlarge(chassis["devices"])
    return chassis


class Repeater(threading.Thread):
    """A client that sends one request again and again until the block ends."""

    def __init__(self, server, body, expected):
        super().__init__()
        self.connection = server.connection()
        self.body = body
        self.expected = expected
        self.count = 0
        self.ending = False

    def run(self):
        while not self.ending:
            if self.expected not in post(self.connection, self.body):
                raise SystemExit(f"not the expected outcome: {self.body[:200]}")
            self.count += 1

    def __enter__(self):
        self.start()
        return self

    def __exit__(self, *_):
        self.ending = True
        self.join()
        self.connection.close()


def observed(server, body):
    """Milliseconds that each of many requests in turn took."""
    times = []
    with contextlib.closing(server.connection()) as connection:
        end = time.perf_counter() + SECONDS
        while (begin := time.perf_counter()) < end:
            if '"result"' not in post(connection, body):
                raise SystemExit("getProperty fails")
            times.append((time.perf_counter() - begin) * 1000)
    return sorted(times)


def slow_requests(server):
    """The requests of the slow clients and a text of the response to each, by name."""
    with contextlib.closing(server.connection()) as connection:
        session = open_session(connection)
        post(connection, call("initializeSession", devices=["Mod2"], access=3))
    failing = f"[{','.join([get_property(session, 'NoSuchDevice')] * 1000)}]"
    return {
        "a reservation that waits": (
            call("initializeSession", devices=["Mod2"], access=3,
                 reservation_timeout=RESERVATION_SECONDS), '"error"'),
        "batches of 1000 failing requests": (failing, '"error"'),
        "reading 1 MiB of NVMEM": (
            call("getNvmemBytes", session_id=session, nvmem_area="Mod1/user", address=0,
                 size=MEBIBYTE), '"result"'),
    }


def print_row(name, times, slow):
    share = [statistics.median(times), times[int(len(times) * 0.99)], times[-1]]
    counts = ", ".join(str(one.count) for one in slow)
    print(f"  {name:34}" + "".join(f"{value:10.2f}" for value in share)
          + f"{len(times):8}   {counts}")


def main():
    with tempfile.NamedTemporaryFile("w", suffix=".json") as file:
        json.dump(chassis_with_large_area(), file)
        file.flush()
        with Server(*host_command(pathlib.Path(sys.argv[1])), "--chassis", file.name) as server:
            slow = slow_requests(server)
            with contextlib.closing(server.connection()) as connection:
                body = get_property(open_session(connection))
            print("\ngetProperty while others are slow, in ms")
            print(f"  {'what the others do':34}{'median':>10}{'99 %':>10}{'maximum':>10}"
                  f"{'count':>8}   count of the others")
            print_row("nothing", observed(server, body), [])
            for name, request in slow.items():
                with Repeater(server, *request) as other:
                    print_row(name, observed(server, body), [other])
            with contextlib.ExitStack() as stack:
                others = [stack.enter_context(Repeater(server, *one)) for one in slow.values()]
                print_row("all of it", observed(server, body), others)


if __name__ == "__main__":
    main()
