"""What the simulated chassis keeps from one run of the host to the next."""

import signal
import subprocess

import pytest

from hostlib import BUILD_DIR, Host, clean_host
from jsonrpc import Client, call, error_response, result_response

NOTHING = result_response()

ONE_CHASSIS = """{"devices": [
    {"name": "A", "category": 1,
     "properties": {"P": {"type": "Int32", "access": "ReadWrite", "lasting": true,
                          "needs_commit": true, "value": 0}},
     "commands": {"Note": {"sets": {"Dev.Comment": "noted"}}},
     "nvmem_areas": [{"name": "user", "size": 4}]}]}"""

# Each method that changes persistent state, with its parameters.
LASTING_CHANGES = {
    "renameDevice": {"device": "A", "new_device_name": "B"},
    "setProperty": {"property": "Dev.Comment", "value": "x", "devices": "A"},
    "commitProperties": {"devices": "A"},
    "executeCommand": {"command": "Note", "devices": "A", "timeout": 1},
    "commitNvmemAreas": {"nvmem_areas": "A/user"},
    "renameChassisAndAllConnectedModules": {"old_chassis_name": "A", "new_chassis_name": "B"},
}


@pytest.fixture
def folder(tmp_path):
    return tmp_path / "state"


class Bench:
    """A session on a host with a state folder."""

    def __init__(self, client, session_id):
        self.client = client
        self.session_id = session_id

    def ask(self, method, params):
        return self.client.ask(call(method, {"session_id": self.session_id, **params}))

    def read(self, area, size):
        return self.ask("getNvmemBytes", {"nvmem_area": area, "address": 0, "size": size})

    def write(self, area, values):
        answer = self.ask("setNvmemBytes", {"nvmem_area": area, "address": 0, "data": values})
        assert answer == result_response('{"next_address":1}')

    def devices(self):
        return self.ask("getProperty", {"property": "Sys.Devices"})


def run(folder, use, options=()):
    """Runs a host on the folder, calls use(Bench), and ends the host as a service manager does."""
    with clean_host(options=("--state", folder, *options)) as host, Client(host) as client:
        with client.session() as session_id:
            use(Bench(client, session_id))


def expect(answer, wanted):
    assert answer == wanted


def data(*values):
    listed = ",".join(map(str, values))
    return result_response(f'{{"data":[{listed}],"next_address":1}}')


def test_committed_bytes_survive_a_restart(folder):
    def commit(bench):
        bench.write("Mod1/user", [1, 2, 255])
        assert bench.ask("commitNvmemAreas", {"nvmem_areas": ["Mod1/user"]}) == NOTHING

    run(folder, commit)
    run(folder, lambda bench: expect(bench.read("Mod1/user", 4), data(1, 2, 255, 0)))


def test_uncommitted_bytes_are_lost_at_a_restart(folder):
    def write(bench):
        bench.write("Mod1/user", [7])
        expect(bench.read("Mod1/user", 1), data(7))

    run(folder, write)
    run(folder, lambda bench: expect(bench.read("Mod1/user", 1), data(0)))


def test_new_names_survive_a_restart(folder):
    names = result_response('{"data_type":"StringArray","value":'
                            '["Lab","Lab-Mod1","Lab-Mod2","Lab-Mod4","Lab-Mod5"]}')

    def rename(bench):
        bench.ask("renameChassisAndAllConnectedModules",
                  {"old_chassis_name": "Bench", "new_chassis_name": "Lab"})
        expect(bench.devices(), names)

    run(folder, rename)
    run(folder, lambda bench: expect(bench.devices(), names))


def test_a_commit_that_cannot_be_written_fails_and_stays_pending(folder):
    def commit(bench):
        bench.write("Mod1/user", [9])
        (folder / "unfinished").mkdir()
        commit = ("commitNvmemAreas", {"nvmem_areas": ["Mod1/user"]})
        expect(bench.ask(*commit), error_response("1", -250931))
        (folder / "unfinished").rmdir()
        expect(bench.ask(*commit), NOTHING)

    run(folder, commit)
    run(folder, lambda bench: expect(bench.read("Mod1/user", 1), data(9)))


def test_each_change_of_persistent_state_fails_when_it_cannot_be_written(folder, tmp_path):
    (tmp_path / "chassis.json").write_text(ONE_CHASSIS)

    def change(bench):
        bench.write("A/user", [9])
        number = {"property": "P", "value": 1, "devices": "A"}
        expect(bench.ask("setProperty", number), result_response('{"data_type":"Int32"}'))
        (folder / "unfinished").mkdir()
        for method, params in LASTING_CHANGES.items():
            assert bench.ask(method, params) == error_response("1", -250931), method

    run(folder, change, ("--chassis", tmp_path / "chassis.json"))


def test_a_killed_host_leaves_the_folder_usable(folder):
    with Host(options=("--state", folder)) as host:
        result = subprocess.run(
            [BUILD_DIR / "bin" / "qitrmc-host", "--listen", "127.0.0.1:0", "--state", folder],
            capture_output=True, text=True, timeout=60)
        assert (result.returncode, result.stdout) == (1, "")
        assert result.stderr.splitlines()[0] == (
            f"qitrmcapi: {folder}: is in use by process {host.process.pid}; end that process, or "
            "name another folder in QITRMC_SIM_STATE")
        host.process.send_signal(signal.SIGKILL)
        host.process.wait()
    run(folder, lambda bench: expect(bench.read("Mod1/user", 1), data(0)))
