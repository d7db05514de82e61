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


# Lays the explanation files over themselves, so that their numbers on the file system have 64 bits.
# Prints one of them, and runs the tool.
LARGE_NUMBERS = """
mount -t tmpfs tmpfs /mnt && mkdir /mnt/new /mnt/work
mount -t overlay overlay -o xino=on,lowerdir="$0/usr/local/qinstal",upperdir=/mnt/new,workdir=/mnt/work \
  "$0/usr/local/qinstal"
stat -c %i "$0/usr/local/qinstal/share/errors/English/qitrmc.txt"
exec "$@"
"""


def test_explanation_files_are_found_whose_numbers_on_the_file_system_have_64_bits(root):
    result = subprocess.run(
        ["unshare", "--mount", "sh", "-ec", LARGE_NUMBERS, root, *emulated(root, "/usr/bin/qitrmc-explain"),
         "-32000"], capture_output=True, text=True, timeout=60)
    assert (result.returncode, result.stderr) == (0, "")
    number, text = result.stdout.split("\n", 1)
    assert int(number) >= 1 << 32
    assert text.startswith("The request failed. ")


def test_without_its_driver_the_service_is_not_loaded(root):
    result = subprocess.run(
        [*emulated(root, "/usr/bin/qitrmc-host"), "--plugin", PLUGIN, "--listen", "127.0.0.1:0"],
        capture_output=True, text=True, timeout=60)
    assert result.returncode == 1
    assert "libqitrmcapi.so.1" in result.stderr
