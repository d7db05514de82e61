"""The packages for the controller, unpacked beside the libraries of its system, under the emulator."""

import json
import os
import shutil
import subprocess
import sys

import pytest

import machine

sys.path.append(str(machine.ROOT / "tests" / "wire"))
import hostlib  # noqa: E402

CROSS = machine.ROOT / "build" / "cross-armel"
EMULATOR = CROSS / "tools" / "usr" / "bin" / "qemu-arm-static"
LIBRARIES = ("lib/arm-linux-gnueabi", "usr/lib/arm-linux-gnueabi")
PLUGIN = "/usr/lib/qitrmc/plugin/libqitrmcsvc.so"


@pytest.fixture(scope="module")
def controller(tmp_path_factory):
    """The root folder of a controller: the shared libraries of the sysroot, and the packages. A real
    root, since the emulator's own translation of paths leaves some of them out."""
    if os.geteuid() != 0:
        pytest.skip("another root folder needs root")
    root = tmp_path_factory.mktemp("controller")
    for folder in LIBRARIES:
        (root / folder).mkdir(parents=True)
        for path in (CROSS / "sysroot" / folder).glob("*.so*"):
            shutil.copy(path, root / folder, follow_symlinks=False)
    shutil.copy(CROSS / "sysroot/lib/ld-linux.so.3", root / "lib", follow_symlinks=False)
    shutil.copy(EMULATOR, root / "emulator")
    for path in machine.packages("armel").values():
        subprocess.run(["dpkg-deb", "-x", path, root], check=True)
    return root


def emulated(root, program):
    return ["chroot", str(root), "/emulator", program]


@pytest.fixture(scope="module")
def service(controller, tmp_path_factory):
    folder = tmp_path_factory.mktemp("run")
    program = folder / "bin" / "qitrmc-host"
    program.parent.mkdir()
    program.write_text("#!/bin/sh\nexport LD_LIBRARY_PATH=/usr/lib/qitrmc/simulator\nexec "
                       + " ".join(emulated(controller, "/usr/bin/qitrmc-host")) + ' "$@"\n')
    program.chmod(0o755)
    with hostlib.Host(build_dir=folder, plugin=PLUGIN) as host:
        yield host


def call(host, method, **params):
    body = json.dumps({"jsonrpc": "2.0", "id": 1, "method": method, "params": params})
    status, _, answer = host.post(body.encode())
    return status, json.loads(answer)


def test_the_service_opens_a_session(service):
    assert call(service, "initializeSession") == (
        200, {"jsonrpc": "2.0", "id": 1, "result": {"session_id": "_session1"}})


def test_a_failure_comes_in_words_from_the_default_paths(service):
    status, answer = call(service, "closeSession", session_id="_session9")
    assert (status, answer["error"]["code"]) == (200, -32000)
    assert "_session9" in json.dumps(answer) and "not found" not in answer["error"]["message"]


def test_the_tool_finds_the_explanations(controller):
    result = subprocess.run([*emulated(controller, "/usr/bin/qitrmc-explain"), "-32000"],
                            capture_output=True, text=True, timeout=60)
    assert (result.returncode, result.stderr) == (0, "")
    assert result.stdout.startswith("The request failed. ")


def test_without_its_driver_the_service_is_not_loaded(controller):
    result = subprocess.run(
        [*emulated(controller, "/usr/bin/qitrmc-host"), "--plugin", PLUGIN, "--listen", "127.0.0.1:0"],
        capture_output=True, text=True, timeout=60)
    assert result.returncode == 1
    assert "libqitrmcapi.so.1" in result.stderr
