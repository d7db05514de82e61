"""The service over a driver that misbehaves on demand."""

import itertools
import json
import os
import re

import pytest

from hostlib import ROOT, clean_host
from jsonrpc import Client, batch, call

HEADER = (ROOT / "include" / "qitrmcapi.h").read_text(encoding="utf-8")
FUNCTIONS = re.findall(r"nQITRMCAPI100_(\w+)\([^;]*qierr_Status\* status\)",
                       re.sub(r"/\*.*?\*/", "", HEADER, flags=re.DOTALL))

NESTED = {"code": -9, "causes": [{"code": -8, "details": [{"header": "kA"}]}]}
KINDS = {
    "failure": {"status": {"code": -77777}},
    "failure_of_its_own": {"status": {"code": -250811}, "moment": "after"},
    "nested": {"status": {"code": -250988, "causes": [NESTED, NESTED]}},
    "no_json": {"status": {"code": -250811, "json": "{\"translator\":[\"\\u0001"}},
    "warning": {"status": {"code": 77777, "json": "]["}},
    "null": {"output": {"null": True}},
    "null_with_count": {"output": {"null": True, "count": 4294967295}},
    "null_items": {"output": {"null_items": True}},
    "huge_text": {"output": {"text_size": 200000}},
    "many": {"output": {"count": 500}},
    "many_null_items": {"output": {"count": 500, "null_items": True}},
    "none": {"output": {"count": 0}},
}

DEVICE = {"device": "Mod1"}
DEVICES = {"devices": "Mod1"}
TYPED = {"DMM.InputsInUse": [True], "DMM.Readings": [0.5], "DMM.Trims": [1],
         "DMM.Timestamps": [1], "DMM.Labels": ["a"], "DMM.Histogram": [1], "DMM.Totals": [1],
         "Dev.Comment": "x", "Dev.Temperature": 1.5, "Dev.ProductNum": 7,
         "DMM.TriggerCount": 1, "Dev.ProductCategory": 1}


def requests_of(session):
    """Requests that lead into every function of the driver that the service calls."""
    yield "initializeSession", None
    for kind, names in (("devices", "Mod5"), ("physical_channels", "Mod2/ch0"),
                        ("nvmem_areas", "Mod2/user")):
        yield "initializeSession", {kind: names}
        yield "initializeSession", {kind: names, "force_reserve": True}
    inside = [("getSessionPropertyList", {}), ("getDevicePropertyList", DEVICE),
              ("getDevicePropertyList", {"nvmem_area": "Mod1/user"}),
              ("getCommandList", DEVICE), ("getCommandInformation", {**DEVICE, "command": "DMM.Zero"}),
              ("getCommandInformation", {**DEVICE, "command": "DMM.Trigger"}),
              ("executeCommand", {**DEVICES, "command": "DMM.Trigger"}),
              ("getModuleName", {"chassis": "Bench", "slot": 1}),
              ("getModuleName", {"device": "Bench", "slot": 1}),
              ("GetChassisIpOrHostname", {"device": "Bench"}), ("GetChassisIpOrHostname", {}),
              ("renameDevice", {**DEVICE, "new_name": "Mod1"}),
              ("renameChassisAndAllConnectedModules", {"device": "Bench", "new_name": "Bench"}),
              ("getNvmemBytes", {"nvmem_area": "Mod1/user", "address": 0, "size": 4}),
              ("setNvmemBytes", {"nvmem_area": "Mod1/user", "address": 0, "data": [1]}),
              ("commitNvmemAreas", {"nvmem_areas": "Mod1/user"}), ("commitProperties", DEVICES)]
    for method in ("connectToDevices", "disconnectFromDevices", "reserveDevices", "resetDevices",
                   "unreserveDevices"):
        inside.append((method, DEVICES))
    for size in (8, 16, 32, 64):
        inside.append(("readRegister", {**DEVICE, "address": 256, "size": size}))
        inside.append(("writeRegister", {**DEVICE, "address": 256, "size": size, "data": 1}))
    for name, value in TYPED.items():
        inside.append(("getProperty", {**DEVICES, "property": name}))
        inside.append(("setProperty", {**DEVICES, "property": name, "value": value}))
        inside.append(("getPropertyInformation", {**DEVICE, "property": name}))
    inside.append(("getPropertyInformation", {"physical_channel": "Mod1/ch0",
                                              "property": "DMM.Coupling"}))
    for name, value in (("Sys.Devices", ["A"]), ("Session.DefaultDevices", ["Mod1"])):
        inside.append(("getProperty", {"property": name}))
        inside.append(("setProperty", {"property": name, "value": value}))
    inside.append(("getProperty", {"devices": "$DefaultDevices", "property": "Dev.Comment"}))
    inside.append(("abortSession", {}))
    for method, params in inside:
        yield method, {"session_id": session, **params}


class FaultyHost:
    """A host whose faults are replaced while it runs."""

    def __init__(self, host):
        self.host = host
        self.path = host.directory / "faults.json"

    def put(self, description):
        fresh = self.path.with_suffix(".new")
        fresh.write_text(json.dumps(description))
        os.replace(fresh, self.path)


@pytest.fixture(scope="module")
def faulty():
    with clean_host(("--faults", "faults.json")) as running:
        yield FaultyHost(running)


@pytest.fixture
def client(faulty):
    faulty.put({})
    with Client(faulty.host) as connected:
        yield connected
        faulty.put({})


def expect_answer(body, id):
    answer = json.loads(body.decode("utf-8"))
    assert (answer["jsonrpc"], answer["id"]) == ("2.0", id)
    assert ("result" in answer) != ("error" in answer)
    return answer


@pytest.mark.parametrize("function", FUNCTIONS)
def test_every_fault_of_every_function_is_answered(faulty, client, function):
    session = client.open_session()
    for kind, members in KINDS.items():
        if "output" in members and not function.startswith("get"):
            continue
        faulty.put({"faults": [{"function": function, **members}]})
        requests = list(requests_of(session))
        opened = []
        for id, (method, params) in zip(itertools.count(1), requests):
            client.send(call(method, params, str(id)))
            answer = expect_answer(client.receive_whole(), id)
            opened.append(answer.get("result", {}).get("session_id"))
        faulty.put({})
        for id in filter(None, opened):
            client.ask(call("closeSession", {"session_id": id}))
        assert b'"result":{' in client.ask(
            call("getProperty", {"session_id": session, **DEVICES, "property": "Dev.Comment"})), kind
    client.ask(call("closeSession", {"session_id": session}))


def code_of(body):
    error = json.loads(body)["error"]
    return error.get("data", {}).get("qitrmc_code", error["code"])


def read(client, session, device):
    return client.ask(call("getProperty", {"session_id": session, "devices": device,
                                           "property": "Dev.Comment"}))


# The service itself refuses a name that the system does not list.
@pytest.mark.parametrize("event, code", [("pulled", -250828), ("connection_lost", -250941)])
def test_two_clients_see_a_device_leave_and_come_back(faulty, client, event, code):
    with Client(faulty.host) as other:
        sessions = [each.open_session() for each in (client, other)]
        for each, session in zip((client, other), sessions):
            assert b"result" in each.ask(
                call("connectToDevices", {"session_id": session, "devices": "Mod2"}))
        faulty.put({"events": [{"device": "Mod2", "event": event}]})
        listed = call("getProperty", {"session_id": sessions[0], "property": "Sys.Devices"})
        assert (b"Mod2" in client.ask(listed)) == (event == "connection_lost")
        for each, session in zip((client, other), sessions):
            assert code_of(read(each, session, "Mod2")) == code
            assert b"result" in read(each, session, "Mod1")
            connected = each.ask(call("getProperty", {"session_id": session,
                                                      "property": "Session.ConnectedDevices"}))
            assert b"Mod2" not in connected
        faulty.put({})
        for each, session in zip((client, other), sessions):
            assert b"result" in read(each, session, "Mod2")
            each.ask(call("closeSession", {"session_id": session}))


def test_a_batch_stops_at_the_request_that_a_fault_strikes(faulty, client):
    session = client.open_session()
    faulty.put({"faults": [{"resource": "Mod2", "function": "getGeneric*",
                            "status": {"code": -77777}}]})
    requests = [call("getProperty", {"session_id": session, "devices": device,
                                     "property": "Dev.ProductName"})
                for device in ("Mod1", "Mod2", "Mod4")]
    first, *others = json.loads(client.ask_whole(batch(*requests)))
    assert first["result"]["value"] == "Multimeter"
    assert [answer["error"]["data"]["qitrmc_code"] for answer in others] == [-77777, -32001]
    client.ask(call("closeSession", {"session_id": session}))


def test_an_abort_ends_a_delay(faulty, client):
    with Client(faulty.host) as other:
        session = client.open_session()
        faulty.put({"faults": [{"function": "readRegister*", "delay": 3600}]})
        client.send(call("readRegister", {"session_id": session, "device": "Mod1", "address": 0,
                                          "size": 8}))
        while not client.is_answered(0.01):
            other.ask(call("abortSession", {"session_id": session}))
        assert code_of(client.receive_whole()) == -250963
        client.ask(call("closeSession", {"session_id": session}))


def test_faults_of_the_opening_do_not_keep_the_host_from_starting():
    faults = json.dumps({"faults": [{"function": "initialize*", "calls": {"count": 1},
                                     "status": {"code": -77777}}]}).encode()
    with clean_host(("--faults", "faults.json"), {"faults.json": faults}) as host:
        with Client(host) as client:
            assert code_of(client.ask(call("initializeSession"))) == -77777
            assert b"_session1" in client.ask(call("initializeSession"))
            client.ask(call("closeSession", {"session_id": "_session1"}))
