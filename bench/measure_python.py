#!/usr/bin/python3
"""Measures what the Python package adds to bare httpx: measure_python.py BUILD_DIR

Both send the same requests on one connection to the simulated chassis, in alternating rounds. The bare
one makes and reads the JSON, and sends small packets at once as the package does. Ends with status 1
when a request of the package takes more than MOST times that of bare httpx.
"""

import itertools
import json
import os
import pathlib
import socket
import statistics
import sys
import time

import httpx

ROOT = pathlib.Path(__file__).resolve().parents[1]
sys.path.insert(0, str(ROOT / "clients" / "python" / "src"))

import qitrmc  # from the sources
from qitrmc.testing import chassis as simulated

ROUNDS = 11
REQUESTS = 200
MOST = 1.3


class Bare:
    """httpx alone."""

    def __init__(self, url):
        self.url = httpx.URL(url)
        self.client = httpx.Client(headers={"Content-Type": "application/json"})
        self.ids = itertools.count(1)
        self.session = self.call("initializeSession", {})["session_id"]

    def call(self, method, params):
        request = {"jsonrpc": "2.0", "id": next(self.ids), "method": method, "params": params}
        response = self.client.post(self.url, content=json.dumps(request).encode())
        connection = response.extensions["network_stream"].get_extra_info("socket")
        connection.setsockopt(socket.IPPROTO_TCP, socket.TCP_NODELAY, 1)
        return json.loads(response.content)["result"]

    def get(self):
        return self.call("getProperty", {"session_id": self.session, "property": "DMM.Voltage",
                                         "physical_channels": "Mod1/ch0"})["value"]

    def set(self):
        self.call("setProperty", {"session_id": self.session, "property": "PSU.Voltage", "value": 5.0,
                                  "physical_channels": "Mod2/ch0"})

    def close(self):
        self.call("closeSession", {"session_id": self.session})
        self.client.close()


def seconds_of(work, clock):
    begin = clock()
    for _ in range(REQUESTS):
        work()
    return (clock() - begin) / REQUESTS


def measured(pairs, clock):
    """{name: (seconds of the package, seconds of bare httpx)}, medians of alternating rounds."""
    times = {name: ([], []) for name in pairs}
    for turn in range(ROUNDS):
        for name, works in pairs.items():
            for side in ((0, 1) if turn % 2 else (1, 0)):
                times[name][side].append(seconds_of(works[side], clock))
    return {name: tuple(map(statistics.median, sides)) for name, sides in times.items()}


def report(times):
    ratios = {name: package / bare for name, (package, bare) in times.items()}
    print("Request of the Python package, beside bare httpx (processor time of the client)")
    for name, (package, bare) in times.items():
        print(f"  {name:8}{package * 1e6:8.0f} us{bare * 1e6:8.0f} us   ratio {ratios[name]:.2f}")
    worst = max(ratios.values())
    print(f"python package to bare httpx: {worst:.2f} (at most {MOST})")
    return worst <= MOST


def main():
    os.environ["QITRMC_HOST"] = str(pathlib.Path(sys.argv[1]) / "bin" / "qitrmc-host")
    with simulated() as bench, qitrmc.connect(bench.url) as chassis, chassis.session() as session:
        bare = Bare(bench.url)
        pairs = {"read": (lambda: session["Mod1/ch0"]["DMM.Voltage"], bare.get),
                 "write": (lambda: session["Mod2/ch0"].set("PSU.Voltage", 5.0), bare.set)}
        for works in pairs.values():
            for work in works:
                seconds_of(work, time.process_time)
        times = measured(pairs, time.process_time)
        bare.close()
    return 0 if report(times) else 1


if __name__ == "__main__":
    sys.exit(main())
