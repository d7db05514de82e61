"""The codes that docs/simulator.md lists for devices that were removed or do not answer."""

import json
import os

import pytest

from hostlib import clean_host
from jsonrpc import Client, call, result_response

FAULTS = "faults.json"
UNKNOWN, PULLED, LOST, UNREACHABLE = -250828, -250940, -250941, -250988
BUSY, OUT_OF_TIME = -250977, -250976

READ = {"property": "Dev.Comment"}
CHANNEL = {"property": "DMM.Voltage", "physical_channels": "Mod1/ch0"}
AREA = {"property": "NVMEMArea.Size", "nvmem_areas": "Mod1/user"}
REGISTER = {"address": 0, "size": 8}
DEVICE = {"devices": "Mod1"}

# Method, parameters, and the codes with which it fails: while the module is pulled, and while its
# connection is lost. The default device of the session is Mod1.
NAMED = [
    ("getProperty", {**READ, **DEVICE}, UNKNOWN, LOST),
    ("readRegister", {**REGISTER, "device": "Mod1"}, UNKNOWN, LOST),
    ("reserveDevices", DEVICE, UNKNOWN, LOST),
    ("getCommandList", {"device": "Mod1"}, UNKNOWN, LOST),
    ("connectToDevices", DEVICE, UNKNOWN, UNREACHABLE),
]
PARTS = [
    ("getProperty", CHANNEL, UNKNOWN, UNKNOWN),
    ("getProperty", AREA, UNKNOWN, UNKNOWN),
    ("executeCommand", {"command": "DMM.Zero", "physical_channels": "Mod1/ch0"}, UNKNOWN, UNKNOWN),
    ("getNvmemBytes", {**REGISTER, "nvmem_area": "Mod1/user"}, UNKNOWN, UNKNOWN),
]
DEFAULT = [
    ("getProperty", READ, PULLED, LOST),
    ("readRegister", REGISTER, PULLED, LOST),
    ("connectToDevices", {}, PULLED, UNREACHABLE),
    ("executeCommand", {"command": "DMM.Trigger"}, PULLED, LOST),
]
DRIVER_ONLY = [
    ("initializeSession", DEVICE, PULLED, LOST),
    ("initializeSession", {"physical_channels": "Mod1/ch0"}, PULLED, LOST),
    ("initializeSession", {"nvmem_areas": "Mod1/user"}, PULLED, LOST),
    ("renameDevice", {"device": "Mod1", "new_device_name": "Meter"}, PULLED, LOST),
]
REQUESTS = NAMED + PARTS + DEFAULT + DRIVER_ONLY
EVENTS = [("pulled", 0), ("connection_lost", 1)]


@pytest.fixture(scope="module")
def faulty_host():
    with clean_host(("--faults", FAULTS)) as running:
        yield running


def strike(host, *events):
    """Makes the events take effect from the next driver call on."""
    new = host.directory / "faults.new"
    new.write_text(json.dumps({"events": events}), encoding="utf-8")
    os.rename(new, host.directory / FAULTS)


@pytest.fixture
def client(faulty_host):
    with Client(faulty_host) as connected:
        yield connected


@pytest.fixture
def session(faulty_host, client):
    session_id = client.open_session(DEVICE)
    yield session_id
    strike(faulty_host)
    client.close_session(session_id)


def code_of(answer):
    return json.loads(answer)["error"]["data"]["qitrmc_code"]


def with_session(session, method, params):
    return call(method, params if method == "initializeSession" else {"session_id": session, **params})


@pytest.mark.parametrize("event, column", EVENTS)
@pytest.mark.parametrize("method, params, pulled, lost", REQUESTS)
def test_each_method_has_its_codes_for_a_missing_device(faulty_host, client, session, event, column,
                                                        method, params, pulled, lost):
    strike(faulty_host, {"device": "Mod1", "event": event})
    answer = client.ask_whole(with_session(session, method, params))
    assert code_of(answer) == (pulled, lost)[column]


def wait_until_busy(client, request):
    while True:
        code = code_of(client.ask_whole(request))
        if code == BUSY:
            return
        assert code == OUT_OF_TIME


@pytest.mark.parametrize("event, code", [("pulled", PULLED), ("connection_lost", LOST)])
def test_a_running_command_ends_with_the_code_of_the_driver(faulty_host, client, session, event,
                                                            code):
    command = {"session_id": session, "command": "DMM.Calibrate"}
    with Client(faulty_host) as running:
        running.send(call("executeCommand", {**command, "timeout": 60}))
        wait_until_busy(client, call("executeCommand", {**command, "timeout": 0}))
        strike(faulty_host, {"device": "Mod1", "event": event})
        with client.session():  # a call of the driver, which reads the new file
            pass
        assert code_of(running.receive_whole()) == code


def test_a_lost_device_stays_listed_and_a_pulled_one_does_not(faulty_host, client, session):
    listed = call("getProperty", {"session_id": session, "property": "Sys.Devices"})
    all_devices = '{"data_type":"StringArray","value":["Bench","Mod1","Mod2","Mod4","Mod5"]}'
    strike(faulty_host, {"device": "Mod1", "event": "connection_lost"})
    assert client.ask(listed) == result_response(all_devices)
    strike(faulty_host, {"device": "Mod1", "event": "pulled"})
    assert client.ask(listed) == result_response(all_devices.replace('"Mod1",', ""))
