"""A process of qitrmc-host with a chassis of one's own."""

from __future__ import annotations

import json
import os
import pathlib
import re
import shutil
import subprocess
import tempfile
from typing import Any, Dict, List, Mapping, Optional, Type, Union

from .. import chassis as connected
from ..errors import Error, StatusError
from .functions import FUNCTIONS

PROGRAM_VARIABLE = "QITRMC_HOST"
PROGRAM = "qitrmc-host"
LISTENING = re.compile(r"Listening on (\S+)")
PATIENCE_SECONDS = 60.0

Description = Union[str, "os.PathLike[str]", Mapping[str, Any], None]


class SimulatedChassis:
    """A simulated chassis on a free loopback port, until the end of its `with` block.

    description: the path of a chassis file, its content, or None for the chassis Bench. faults: what
    goes wrong from the start, as in a faults file. time_scale: simulated seconds in a real one, or
    "calls": then nothing takes time and runs repeat exactly. seed: where random numbers come from.
    listen: the address and port; port 0 is a free one. program: the path of qitrmc-host; the
    environment variable QITRMC_HOST or the search path if not given.

    Attribute: url (of the service).
    """

    def __init__(self, description: Description = None, *, faults: Optional[Mapping[str, Any]] = None,
                 time_scale: Union[str, float] = "calls", seed: Optional[int] = None,
                 listen: str = "127.0.0.1:0", program: Optional[str] = None) -> None:
        self._faults: Dict[str, List[Any]] = {"faults": list((faults or {}).get("faults", [])),
                                              "events": list((faults or {}).get("events", []))}
        self._folder = pathlib.Path(tempfile.mkdtemp(prefix="qitrmc-"))
        try:
            self._write_faults()
            host = os.path.abspath(program or host_program())
            command = [host, *_plugin_option(host), "--listen", listen, "--time-scale", str(time_scale),
                       "--faults", str(self._folder / "faults.json"),
                       "--trace", str(self._folder / "trace"), *self._chassis_option(description)]
            if seed is not None:
                command += ["--seed", str(seed)]
            self._start(command, _driver_environment(host))
        except BaseException:
            shutil.rmtree(self._folder, ignore_errors=True)
            raise

    def __enter__(self) -> SimulatedChassis:
        return self

    def __exit__(self, *_: Any) -> None:
        self.stop()

    def connect(self, **options: Any) -> connected.Chassis:
        """A connection to the chassis, as `qitrmc.connect` gives it."""
        return connected.connect(self.url, **options)

    def fail(self, method: str, status: Union[int, Type[StatusError]], *, resource: Optional[str] = None,
             first: int = 1, count: Optional[int] = None, every: int = 1) -> None:
        """Let a method fail with a status, a code or class, from the next call on.

        resource: only calls about this device, with all that belongs to it, channel or area. first,
        count, every: from which of the calls on, how many of them (all), and each how many-th. The
        functions of the driver fail that the method depends on; few of them serve other methods too.
        """
        if method not in FUNCTIONS:
            raise ValueError(f"There is no method {method}; there are {', '.join(FUNCTIONS)}.")
        code = status if isinstance(status, int) else status.code
        calls = {"first": first, "every": every, **({"count": count} if count is not None else {})}
        for function in FUNCTIONS[method]:
            self._faults["faults"].append({
                "function": function, "status": {"code": code}, "calls": calls,
                **({"resource": resource} if resource else {})})
        self._write_faults()

    def pull(self, device: str) -> None:
        """Pull a module out of its slot."""
        self._event(device, "pulled")

    def disconnect(self, device: str) -> None:
        """Let the connection to a device break; it stays in the lists."""
        self._event(device, "connection_lost")

    def restore(self) -> None:
        """End all faults, and put back what was pulled."""
        self._faults = {"faults": [], "events": []}
        self._write_faults()

    @property
    def trace(self) -> List[str]:
        """The calls of the driver that have ended, a line each with time, thread, function and result."""
        path = self._folder / "trace"
        return path.read_text(encoding="utf-8", errors="replace").splitlines() if path.exists() else []

    def stop(self) -> None:
        """End the chassis. May be called again."""
        self._process.terminate()
        try:
            self._process.wait(PATIENCE_SECONDS)
        except subprocess.TimeoutExpired:
            self._process.kill()
            self._process.wait()
        if self._process.stdout:
            self._process.stdout.close()
        shutil.rmtree(self._folder, ignore_errors=True)

    def wait(self) -> None:
        """Wait until the chassis ends by itself or by a signal."""
        self._process.wait()

    def _event(self, device: str, event: str) -> None:
        self._faults["events"].append({"device": device, "event": event})
        self._write_faults()

    def _write_faults(self) -> None:
        new = self._folder / "faults.new"
        new.write_text(json.dumps(self._faults), encoding="utf-8")
        new.replace(self._folder / "faults.json")

    def _chassis_option(self, description: Description) -> List[str]:
        if description is None:
            return []
        if isinstance(description, Mapping):
            path = self._folder / "chassis.json"
            path.write_text(json.dumps(description), encoding="utf-8")
            return ["--chassis", str(path)]
        return ["--chassis", str(pathlib.Path(description).resolve())]

    def _start(self, command: List[str], environment: Dict[str, str]) -> None:
        with open(self._folder / "stderr", "wb") as stderr:
            self._process = subprocess.Popen(command, stdout=subprocess.PIPE, stderr=stderr, text=True,
                                             cwd=self._folder, env={**os.environ, **environment})
        assert self._process.stdout is not None
        line = self._process.stdout.readline()
        listening = LISTENING.match(line)
        if not listening:
            self._process.kill()
            self._process.wait()
            self._process.stdout.close()
            said = (self._folder / "stderr").read_text(encoding="utf-8", errors="replace").strip()
            raise Error(f"The simulated chassis did not start: {said or line.strip()}")
        self.url = listening[1]


def _installed(host: str, path: str) -> Optional[pathlib.Path]:
    """What an installation has at a path below lib/qitrmc; None beside a build."""
    place = pathlib.Path(host).resolve().parent.parent / "lib" / "qitrmc" / path
    return place if place.exists() else None


def _plugin_option(host: str) -> List[str]:
    plugin = _installed(host, "plugin/libqitrmcsvc.so")
    return ["--plugin", str(plugin)] if plugin else []


def _driver_environment(host: str) -> Dict[str, str]:
    # An installation keeps the simulated driver where only those who name its folder find it.
    folder = _installed(host, "simulator")
    if folder is None:
        return {}
    others = os.environ.get("LD_LIBRARY_PATH")
    return {"LD_LIBRARY_PATH": f"{folder}:{others}" if others else str(folder)}


def host_program() -> str:
    """The path of qitrmc-host. Raises Error."""
    program = os.environ.get(PROGRAM_VARIABLE) or shutil.which(PROGRAM)
    if not program:
        raise Error(f"{PROGRAM} was not found: put it on the search path, or name it in the environment "
                    f"variable {PROGRAM_VARIABLE}.")
    return program


def chassis(description: Description = None, **options: Any) -> SimulatedChassis:
    """Start a simulated chassis; see `SimulatedChassis` for the options."""
    return SimulatedChassis(description, **options)
