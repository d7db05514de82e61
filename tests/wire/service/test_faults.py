"""The service over a driver that fails on demand."""

import json
import os
import re

import pytest

import methods
from hostlib import ROOT, clean_host
from jsonrpc import Client, batch, call
from methods import request

HEADER = re.sub(r"/\*.*?\*/", "", (ROOT / "include" / "qitrmcapi.h").read_text(encoding="utf-8"),
                flags=re.DOTALL)
PARAMETERS = dict(re.findall(r"nQITRMCAPI100_(\w+)\(([^;]*)qierr_Status\* status\)", HEADER))

FUNCTIONS = list(PARAMETERS)
# Functions that no method calls, with the reason.
UNREACHED = {
    "getSystemPropertyUInt64": "the one such property, Sys.ConfigChangeCount, is hidden from clients",
}

# A close that fails after the driver has closed the session leaves the service with an invalid
# session, which it still queries for its reservations.
SESSION_ENDED = -250955

NESTED = {"code": -9, "causes": [{"code": -8, "details": [{"header": "kA"}]}]}


class Fault:
    """members: of the faults file. trace: a pattern of the trace line of a call that it
    affected. parameters: a pattern of the parameters of the functions that it can affect."""

    def __init__(self, members, trace, parameters=""):
        self.members = members
        self.trace = trace
        self.parameters = parameters


TEXT, TEXTS, ARRAY = r"char\*\* ", r"char\*\*\* ", r"\*\* array"
KINDS = {
    "failure": Fault({"status": {"code": -77777}}, r"-> -77777 "),
    "failure_of_its_own": Fault({"status": {"code": -250811}, "moment": "after"}, r"-> -250811 "),
    "nested": Fault({"status": {"code": -250988, "causes": [NESTED, NESTED]}}, r"-> -250988 "),
    "no_json": Fault({"status": {"code": -250811, "json": "{\"translator\":[\"\\u0001"}},
                     r'-> -250811 \{"translator":\["\\u0001 '),
    "warning": Fault({"status": {"code": 77777, "json": "]["}}, r"-> 77777 \]\["),
    "null": Fault({"output": {"null": True}}, r"-> \d+ \w+=null", rf"{TEXT}|{ARRAY}"),
    "null_with_count": Fault({"output": {"null": True, "count": 4294967295}}, r"-> \d+ array=null",
                             ARRAY),
    "null_items": Fault({"output": {"null_items": True}}, r"-> \d+ array=\[null", TEXTS),
    "huge_text": Fault({"output": {"text_size": 200000}}, r"-> \d+ .*\(200000 bytes\)",
                       rf"{TEXT}|{TEXTS}"),
    "many": Fault({"output": {"count": 500}}, r"-> \d+ array=\[.*,\.\.\.\(500\)\]", ARRAY),
    "many_null_items": Fault({"output": {"count": 500, "null_items": True}},
                             r"-> \d+ array=\[null,.*,\.\.\.\(500\)\]", TEXTS),
    "none": Fault({"output": {"count": 0}}, r"-> \d+ array=(null|\[\]) ", ARRAY),
}
CASES = [(function, kind) for function, parameters in PARAMETERS.items()
         if function not in UNREACHED
         for kind, fault in KINDS.items() if re.search(fault.parameters, parameters)]

# The built-in chassis, in which Mod1 has a property of each type that can be written.
VALUES = {"Bool": True, "Double": 0.5, "Int32": -1, "Int64": -1, "String": "a", "UInt32": 1,
          "UInt64": 1}
TYPED = {f"Any.{name}": {"type": name, "value": value, "access": "ReadWrite"}
         for one, item in VALUES.items() for name, value in ((one, item), (f"{one}Array", [item]))}
CHASSIS = json.loads((ROOT / "simulator" / "chassis" / "bench.json").read_text(encoding="utf-8"))
CHASSIS["devices"][0]["modules"][0]["properties"] |= TYPED
# The properties of the system and of the session that have functions of their own.
SCOPED = {"Sys.Devices": ["A"], "Sys.DiscoveryEnabled": True, "Sys.DiscoveryInterval": 10.0,
          "Session.Timeout": 5.0, "Session.DefaultDevices": ["Mod1"]}


def requests():
    """Requests that lead to every function of the driver that the service calls."""
    for method in methods.NAMES:
        yield request(method)
    yield request("initializeSession", without=["devices"])
    yield request("initializeSession", opened_on={"devices": "Mod1"}, devices="Mod1",
                  force_reserve=True)
    yield request("initializeSession", physical_channels="Mod2/ch0")
    yield request("initializeSession", nvmem_areas="Mod2/user")
    for size in (8, 16, 32, 64):
        yield request("readRegister", address=256, size=size)
        yield request("writeRegister", address=256, size=size, data=1)
    for name, about in TYPED.items():
        yield request("getProperty", property=name, devices="Mod1")
        yield request("setProperty", property=name, devices="Mod1", value=about["value"])
        yield request("getPropertyInformation", property=name, device="Mod1")
    yield request("getPropertyInformation", property="DMM.Range", device="Mod1")
    for name, value in SCOPED.items():
        yield request("getProperty", property=name, without=["devices"])
        yield request("setProperty", property=name, without=["physical_channels"], value=value)
    yield request("getDevicePropertyList", nvmem_area="Mod1/user")
    yield request("commitNvmemAreas", devices="Mod1")
    yield request("getModuleName", opened_on={"devices": "Bench"}, without=["device"])


class FaultyHost:
    """A host whose faults are replaced while it runs, and whose driver calls are traced."""

    def __init__(self, host):
        self.host = host
        self.path = host.directory / "faults.json"
        self.trace = open(host.directory / "trace", encoding="utf-8", errors="replace")

    def put(self, description):
        fresh = self.path.with_suffix(".new")
        fresh.write_text(json.dumps(description))
        os.replace(fresh, self.path)

    def calls(self):
        """The lines of the trace since the previous call of this function, from the name of the
        driver function on."""
        return [line.split(" ", 2)[2] for line in self.trace.read().splitlines()]


@pytest.fixture(scope="module")
def faulty():
    with clean_host(("--faults", "faults.json", "--trace", "trace", "--chassis", "chassis.json"),
                    {"chassis.json": json.dumps(CHASSIS).encode()}) as running:
        host = FaultyHost(running)
        yield host
        host.trace.close()


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


def ask(client, method, params):
    return expect_answer(client.ask_whole(call(method, params)), 1)


def expect_result(client, method, params):
    answer = ask(client, method, params)
    assert "result" in answer, (method, params, answer)
    return answer["result"]


def devices(client, session):
    return expect_result(client, "getProperty",
                         {"session_id": session, "property": "Sys.Devices"})["value"]


def restore_names(client, names):
    """Gives the devices these names again, in their order."""
    with client.session() as session:
        for new, old in zip(names, devices(client, session)):
            if new != old:
                expect_result(client, "renameDevice",
                              {"session_id": session, "device": old, "new_device_name": new})


NAMES = ["Bench", "Mod1", "Mod2", "Mod4", "Mod5"]


def calls_behind(faulty, client, wanted, fault):
    """The driver calls made for a request that meets a fault. The calls that prepare the request
    meet none, and afterwards the state is restored."""
    session = wanted.prepare(lambda *step: expect_result(client, *step))
    faulty.put(fault)
    faulty.calls()
    answer = ask(client, wanted.method, wanted.params_in(session))
    calls = faulty.calls()
    faulty.put({})
    for opened in filter(None, (session, answer.get("result", {}).get("session_id"))):
        ask(client, "closeSession", {"session_id": opened})
    if wanted.method.startswith("rename"):
        restore_names(client, NAMES)
    return calls


@pytest.fixture(scope="module")
def leading_to(faulty):
    """For each function of the driver, the requests that lead to a call of it."""
    requests_of = {}
    with Client(faulty.host) as client:
        for wanted in requests():
            calls = calls_behind(faulty, client, wanted, {})
            for function in {line.split("(")[0] for line in calls}:
                requests_of.setdefault(function, []).append(wanted)
    return requests_of


def test_the_requests_lead_to_every_function_but_those_that_no_method_calls(leading_to):
    assert [name for name in FUNCTIONS if name not in leading_to] == list(UNREACHED)


@pytest.mark.parametrize("function, kind", CASES)
def test_every_fault_of_every_function_applies_and_is_answered(faulty, client, leading_to, function,
                                                               kind):
    fault = KINDS[kind]
    calls = [line for wanted in leading_to[function]
             for line in calls_behind(faulty, client, wanted,
                                      {"faults": [{"function": function, **fault.members}]})
             if line.startswith(f"{function}(") and f" -> {SESSION_ENDED} " not in line]
    affected = [line for line in calls if re.search(fault.trace, line)]
    assert affected
    # Arrays without elements have no texts that could be replaced.
    assert affected == calls or kind in ("null_items", "huge_text", "many_null_items")
    with client.session() as session:
        assert devices(client, session) == NAMES


def code_of(body):
    error = json.loads(body)["error"]
    return error.get("data", {}).get("qitrmc_code", error["code"])


def read(client, session, device):
    return client.ask(call("getProperty", {"session_id": session, "devices": device,
                                           "property": "Dev.Comment"}))


# The service itself refuses a name that the system does not list.
@pytest.mark.parametrize("event, code", [("pulled", -250828), ("connection_lost", -250941)])
def test_two_clients_see_a_device_removed_and_inserted_again(faulty, client, event, code):
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


def test_a_batch_stops_at_the_request_that_a_fault_affects(faulty, client):
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


def test_faults_in_opening_sessions_do_not_prevent_the_host_from_starting():
    faults = json.dumps({"faults": [{"function": "initialize*", "calls": {"count": 1},
                                     "status": {"code": -77777}}]}).encode()
    with clean_host(("--faults", "faults.json"), {"faults.json": faults}) as host:
        with Client(host) as client:
            assert code_of(client.ask(call("initializeSession"))) == -77777
            assert b"_session1" in client.ask(call("initializeSession"))
            client.ask(call("closeSession", {"session_id": "_session1"}))
