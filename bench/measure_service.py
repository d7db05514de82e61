#!/usr/bin/python3
"""Measures the whole service over HTTP: measure_service.py BUILD_DIR RESULTS.json

Requests per second, latency, processor time and context switches under wrk, beside servers of the
same HTTP library that respond with a fixed text and beside servers made with other libraries; the
memory of the process; the time to start. All in one run, in turns, on loopback.
"""

import contextlib
import json
import os
import pathlib
import re
import statistics
import subprocess
import sys

from http_servers import (HERE, Server, bare_command, call, get_property, host_command,
                          open_session, peer_commands, post)

ROUNDS = 5
SECONDS = 1
CONNECTIONS = (1, 16, 64, 256)
STARTS = 11
MIXED_REQUESTS = 10000
MICROSECONDS = {"us": 1, "ms": 1e3, "s": 1e6}


def microseconds(text):
    number, unit = re.fullmatch(r"([\d.]+)(us|ms|s)", text).groups()
    return float(number) * MICROSECONDS[unit]


def load(name, server, script, body, connections):
    """One run of wrk. A response other than HTTP 200 ends the measurement, with the name of the server."""
    before = server.used()
    report = subprocess.run(
        ["wrk", "-t1", f"-c{connections}", f"-d{SECONDS}s", "--latency", "-s", HERE / script,
         server.url],
        env={**os.environ, "BODY": body}, check=True, capture_output=True, text=True).stdout
    after = server.used()
    if "Non-2xx" in report or "Socket errors" in report:
        raise SystemExit(f"{name}, {connections} connections:\n{report}")
    count = int(re.search(r"(\d+) requests in", report)[1])
    user, system, switches = (late - early for late, early in zip(after, before))
    percentile = dict(re.findall(r"(50|99)%\s+([\d.]+[mu]?s)", report))
    return {"requests_per_second": float(re.search(r"Requests/sec:\s+([\d.]+)", report)[1]),
            "median_us": microseconds(percentile["50"]), "p99_us": microseconds(percentile["99"]),
            "user_us": user / count * 1e6, "system_us": system / count * 1e6,
            "switches": switches / count}


def summary(runs):
    """Each measure of the runs as its median, least and greatest value."""
    return {name: [function(run[name] for run in runs) for function in (statistics.median, min, max)]
            for name in runs[0]}


def measure_kinds(kinds):
    """Loads of each kind in turns: {connections: {kind: summary}}."""
    measured = {}
    for connections in CONNECTIONS:
        runs = {kind: [] for kind in kinds}
        for _ in range(ROUNDS):
            for kind, (server, script, body) in kinds.items():
                runs[kind].append(load(kind, server, script, body, connections))
        measured[connections] = {kind: summary(some) for kind, some in runs.items()}
    return measured


def measure_load(host, build):
    with contextlib.closing(host.connection()) as connection:
        session = open_session(connection)
        good, bad = get_property(session), get_property(session, "NoSuchDevice")
        answer = post(connection, good)
        if "result" not in answer or "error" not in post(connection, bad):
            raise SystemExit(f"not the expected outcome: {answer}")
    value = json.loads(answer)["result"]["value"]
    with contextlib.ExitStack() as stack:
        bare = {f"fixed text, {name}": stack.enter_context(
            Server(*bare_command(build, answer, kind)))
            for name, kind in (("event loop", "loop"), ("thread a connection", "threads"))}
        peers = {name: stack.enter_context(Server(*command))
                 for name, command in peer_commands(build, value).items()}
        for name, peer in peers.items():
            with contextlib.closing(peer.connection()) as connection:
                if json.loads(post(connection, good)).get("result") != {"value": value}:
                    raise SystemExit(f"{name} does not answer the request")
        kinds = {name: (server, "post.lua", good) for name, server in {**bare, **peers}.items()}
        kinds["getProperty"] = (host, "post.lua", good)
        kinds["initializeSession, closeSession"] = (host, "sessions.lua", "")
        kinds["an error"] = (host, "post.lua", bad)
        return measure_kinds(kinds)


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
    with Server(*host_command(build)) as host:
        loads = measure_load(host, build)
    measured = {
        "loads": loads,
        "resident_kib": measure_memory(host_command(build)),
        "start_ms": {"the service": start_time(*host_command(build)),
                     "fixed text": start_time(*bare_command(build, "{}", "loop"))},
    }
    results.write_text(json.dumps(measured, indent=1))


if __name__ == "__main__":
    main()
