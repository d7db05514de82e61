#!/usr/bin/python3
"""Measures the whole service over HTTP: measure_service.py BUILD_DIR RESULTS.json

Requests per second with wrk, compared with a server of the same HTTP library that responds with a
fixed text; the memory of the process; the time to start. All in one run, alternating, on loopback.
"""

import contextlib
import http.client
import json
import os
import pathlib
import re
import statistics
import subprocess
import sys
import time
import urllib.parse

HERE = pathlib.Path(__file__).resolve().parent
ROUNDS = 3
SECONDS = 3
CONNECTIONS = 16
STARTS = 11
MIXED_REQUESTS = 10000


class Server:
    """A process that listens on a free port and prints its address."""

    def __init__(self, *command):
        begin = time.perf_counter()
        self.process = subprocess.Popen([str(word) for word in command], stdin=subprocess.PIPE,
                                        stdout=subprocess.PIPE, text=True)
        line = self.process.stdout.readline()
        self.start_ms = (time.perf_counter() - begin) * 1000
        if not line.startswith("Listening on "):
            self.process.kill()
            raise SystemExit(f"{command[0]} did not start: {line!r}")
        self.url = line.split()[-1]

    def __enter__(self):
        return self

    def __exit__(self, *_):
        self.process.terminate()
        self.process.wait()
        self.process.stdin.close()
        self.process.stdout.close()

    def connection(self):
        return http.client.HTTPConnection(urllib.parse.urlsplit(self.url).netloc)

    def resident_kib(self):
        status = pathlib.Path(f"/proc/{self.process.pid}/status").read_text()
        return int(re.search(r"VmRSS:\s+(\d+) kB", status)[1])


def call(method, **params):
    return json.dumps({"jsonrpc": "2.0", "id": 1, "method": method, "params": params},
                      separators=(",", ":"))


def post(connection, body):
    connection.request("POST", "/qitrmc/Call", body)
    return connection.getresponse().read().decode()


def open_session(connection):
    return json.loads(post(connection, call("initializeSession")))["result"]["session_id"]


def get_property(session, device="Mod1"):
    return call("getProperty", session_id=session, devices=[device], property="Dev.Temperature")


def requests_per_second(server, script, body=""):
    """One run of wrk. A response other than HTTP 200 ends the measurement."""
    report = subprocess.run(
        ["wrk", "-t2", f"-c{CONNECTIONS}", f"-d{SECONDS}s", "-s", HERE / script, server.url],
        env={**os.environ, "BODY": body}, check=True, capture_output=True, text=True).stdout
    if "Non-2xx" in report or "Socket errors" in report:
        raise SystemExit(report)
    return float(re.search(r"Requests/sec:\s+([\d.]+)", report)[1])


def measure_throughput(host, bare_server):
    with contextlib.closing(host.connection()) as connection:
        session = open_session(connection)
        good, bad = get_property(session), get_property(session, "NoSuchDevice")
        answer = post(connection, good)
        if "result" not in answer or "error" not in post(connection, bad):
            raise SystemExit(f"not the expected outcome: {answer}")
    with Server(bare_server, answer) as bare:
        kinds = {
            "fixed text, no service": (bare, "post.lua", good),
            "getProperty": (host, "post.lua", good),
            "initializeSession, closeSession": (host, "sessions.lua"),
            "an error": (host, "post.lua", bad),
        }
        rounds = [{kind: requests_per_second(*arguments) for kind, arguments in kinds.items()}
                  for _ in range(ROUNDS)]
    return {kind: statistics.median(one[kind] for one in rounds) for kind in kinds}


def send_mixed_requests(connection, session):
    bodies = [get_property(session), get_property(session, "NoSuchDevice"), "{", "[]",
              call("getSessionPropertyList", session_id=session),
              f"[{','.join([get_property(session)] * 10)}]", call("noSuchMethod"),
              call("getNvmemBytes", session_id=session, nvmem_area="Mod1/user", address=0, size=64)]
    for number in range(MIXED_REQUESTS // 10):
        for body in bodies:
            post(connection, body)
        opened = open_session(connection)
        post(connection, call("closeSession", session_id=opened))


def measure_memory(host_program):
    with Server(*host_program) as host, contextlib.closing(host.connection()) as connection:
        memory = {"after the start": host.resident_kib()}
        session = open_session(connection)
        for count in (MIXED_REQUESTS, 2 * MIXED_REQUESTS):
            send_mixed_requests(connection, session)
            memory[f"after {count} mixed requests"] = host.resident_kib()
    return memory


def start_time(*command):
    times = []
    for _ in range(STARTS):
        with Server(*command) as server:
            times.append(server.start_ms)
    return statistics.median(times)


def main():
    build, results = pathlib.Path(sys.argv[1]), pathlib.Path(sys.argv[2])
    host_program = (build / "bin" / "qitrmc-host", "--listen", "127.0.0.1:0")
    bare_server = build / "bin" / "qitrmc-bench-bare-server"
    with Server(*host_program) as host:
        throughput = measure_throughput(host, bare_server)
    measured = {
        "requests_per_second": throughput,
        "resident_kib": measure_memory(host_program),
        "start_ms": {"the service": start_time(*host_program),
                     "fixed text, no service": start_time(bare_server, "{}")},
    }
    results.write_text(json.dumps(measured, indent=1))


if __name__ == "__main__":
    main()
