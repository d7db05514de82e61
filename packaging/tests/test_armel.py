"""The packages for the controller, unpacked beside the libraries of its system, under the emulator."""

import json
import os
import subprocess

import pytest

from controller import PLUGIN, emulated, make, serve


@pytest.fixture(scope="module")
def root(tmp_path_factory):
    if os.geteuid() != 0:
        pytest.skip("another root folder needs root")
    folder = tmp_path_factory.mktemp("controller")
    make(folder)
    return folder


@pytest.fixture(scope="module")
def service(root, tmp_path_factory):
    with serve(emulated(root, "/usr/bin/qitrmc-host"), tmp_path_factory.mktemp("run")) as host:
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


def test_the_tool_finds_the_explanations(root):
    result = subprocess.run([*emulated(root, "/usr/bin/qitrmc-explain"), "-32000"],
                            capture_output=True, text=True, timeout=60)
    assert (result.returncode, result.stderr) == (0, "")
    assert result.stdout.startswith("The request failed. ")


def test_without_its_driver_the_service_is_not_loaded(root):
    result = subprocess.run(
        [*emulated(root, "/usr/bin/qitrmc-host"), "--plugin", PLUGIN, "--listen", "127.0.0.1:0"],
        capture_output=True, text=True, timeout=60)
    assert result.returncode == 1
    assert "libqitrmcapi.so.1" in result.stderr
