"""Servers for the measurements over HTTP, and what is sent to them."""

import contextlib
import ctypes
import http.client
import json
import os
import pathlib
import re
import shutil
import socket
import subprocess
import time
import urllib.parse

HERE = pathlib.Path(__file__).resolve().parent
SCHEMAS = HERE.parent / "src" / "embedded" / "schemas"
TICKS = os.sysconf("SC_CLK_TCK")


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

    def processor_time(self):
        """Seconds of user and system time so far, which used() has only in ticks."""
        clock = ctypes.c_int()
        if ctypes.CDLL(None).clock_getcpuclockid(self.process.pid, ctypes.byref(clock)) != 0:
            raise SystemExit(f"process {self.process.pid} has ended")
        return time.clock_gettime(clock.value)

    def used(self):
        """Seconds of user time, seconds of system time and context switches so far."""
        folder = pathlib.Path(f"/proc/{self.process.pid}")
        fields = (folder / "stat").read_text().rpartition(")")[2].split()
        switches = 0
        for task in (folder / "task").iterdir():
            with contextlib.suppress(OSError):  # a thread may end meanwhile
                switches += sum(map(int, re.findall(r"ctxt_switches:\s+(\d+)",
                                                    (task / "status").read_text())))
        return int(fields[11]) / TICKS, int(fields[12]) / TICKS, switches


def call(method, **params):
    return json.dumps({"jsonrpc": "2.0", "id": 1, "method": method, "params": params},
                      separators=(",", ":"))


def post(connection, body):
    connection.request("POST", "/qitrmc/Call", body, {"Content-Type": "application/json"})
    return connection.getresponse().read().decode()


def open_session(connection):
    return json.loads(post(connection, call("initializeSession")))["result"]["session_id"]


def get_property(session, device="Mod1"):
    return call("getProperty", session_id=session, devices=[device], property="Dev.Temperature")


def host_command(build):
    return build / "bin" / "qitrmc-host", "--listen", "127.0.0.1:0"


def bare_command(build, text, kind):
    return build / "bin" / "qitrmc-bench-bare-server", text, kind


def free_port():
    with socket.create_server(("127.0.0.1", 0)) as probe:
        return probe.getsockname()[1]


def peer_commands(build, value):
    """The servers made with other libraries, by name, as far as they are installed."""
    peers = {}
    program = build / "bin" / "qitrmc-bench-rpc-server"
    if program.exists():
        peers["libjson-rpc-cpp"] = (program, free_port(), value)
    node = shutil.which("node") or shutil.which("nodejs")
    if node and (HERE / "peers" / "node_modules" / "jayson").exists():
        peers["Node"] = (node, HERE / "peers" / "nodeServer.mjs",
                         SCHEMAS / "procedure_get_property.json", SCHEMAS / "definitions.json",
                         value)
    return peers
