"""Claims of docs/guide.md that no exchange shows: limits, restarts, and the registers of Bench."""

import json
import pathlib
import re

import pytest

from hostlib import clean_host
from jsonrpc import Client, batch, call, error_response, result_response

ROOT = pathlib.Path(__file__).resolve().parents[3]
GUIDE = (ROOT / "docs" / "guide.md").read_text(encoding="utf-8")
BENCH = json.loads((ROOT / "simulator" / "chassis" / "bench.json").read_text(encoding="utf-8"))


def nested(levels):
    """A request whose body has so many levels of nesting; its params are of a wrong type."""
    inner = levels - 1
    return call("getProperty", "[" * inner + "]" * inner)


def renaming(name):
    def request(session):
        return call("renameDevice", {"session_id": session, "device": "Mod4", "new_device_name": name})
    return request


# A request beyond a limit, the response to it, and a request within the limit.
BODIES = [
    (nested(1001), error_response("null", -32700), nested(1000)),
    (call("x", '{"a":1e309}'), error_response("null", -32700), call("x", '{"a":1e308}')),
    (call("x", id="2147483648"), error_response("2147483648", -32600), call("x", id="2147483647")),
    (batch(*[b"{}"] * 100001), error_response("null", -32600), batch(b"{}")),
    (batch(), error_response("null", -32600), batch(b"{}")),
]


@pytest.mark.parametrize("beyond, refusal, within", BODIES, ids=(
    "nesting", "number", "id", "longest batch", "shortest batch"))
def test_a_body_beyond_a_limit_is_refused(client, beyond, refusal, within):
    assert client.ask(beyond) == refusal
    assert client.ask(within) != refusal


def test_a_range_of_1024_names_is_read_and_one_of_1025_refused(client):
    def reading(last):
        return call("getProperty", {"session_id": session, "property": "PSU.Voltage",
                                    "physical_channels": f"Mod2/ch0:{last}"})
    with client.session() as session:
        texts = [json.loads(client.ask_whole(reading(last)))["error"]["data"]["qitrmc_message"]
                 for last in (1023, 1024)]
    # 1024 names are read as a range, and its first unknown channel is reported.
    assert [text.rpartition("Requested Value: ")[2] for text in texts] == ["Mod2/ch2", "Mod2/ch0:1024"]


@pytest.mark.parametrize("name", ["", "x" * 65, "a,b", "a/b", "a:b", "$a", " a", "a ", "a\nb"])
def test_a_new_name_beyond_the_limits_is_refused(client, name):
    with client.session() as session:
        assert client.ask(renaming(name)(session)) == error_response("1", -250985)


def test_a_new_name_of_64_bytes_is_taken(own_bench):
    with own_bench.session() as session:
        assert own_bench.ask(renaming("x" * 64)(session)) == result_response()


def test_at_100_sessions_one_without_resources_can_still_reserve(own_bench):
    reader = '{"devices":"Mod1","access":1}'
    sessions = [own_bench.open_session(reader) for _ in range(100)]
    forced = call("initializeSession", {"devices": "Mod2", "force_reserve": True})
    assert own_bench.ask(forced) == error_response("1", -250901)
    with own_bench.session() as session:
        assert own_bench.ask(call("reserveDevices", {"session_id": session, "devices": "Mod2"})) \
            == result_response()
    for session in sessions:
        own_bench.close_session(session)


def test_a_restart_closes_all_sessions():
    with clean_host() as host, Client(host) as client:
        session = client.open_session('{"devices":"Mod1"}')
    with clean_host() as host, Client(host) as client:
        assert client.ask(call("closeSession", {"session_id": session})) == error_response("1", -250833)
        client.close_session(client.open_session('{"devices":"Mod1"}'))


def test_an_unexplained_code_is_reported_with_code_and_id_only_if_it_has_details():
    details = {"usage": "kUsageTypeDevice", "value": "Mod1"}
    faults = {"faults": [
        {"function": "abortSession", "status": {"code": -77777, "json": ""}},
        {"function": "getGenericPropertyString", "status": {"code": -77777, "details": [details]}}]}
    with clean_host(("--faults", "faults.json"),
                    {"faults.json": json.dumps(faults).encode()}) as host, Client(host) as client, \
            client.session() as session:
        failing = call("abortSession", {"session_id": session}, id="7")
        lost = error_response("null", -52006)
        assert client.ask(failing) == lost
        assert client.ask(batch(call("getProperty", {"session_id": session, "property": "Sys.Devices"},
                                     id="6"), failing)) == lost
        read = call("getProperty", {"session_id": session, "property": "Dev.Comment",
                                    "devices": "Mod1"}, id="8")
        answer = json.loads(client.ask_whole(read))
        assert (answer["id"], answer["error"]["data"]) == (8, {
            "qitrmc_code": -77777, "qitrmc_message": "Error description not found  Device: Mod1"})


# The registers of Bench


def rows_of_the_guide():
    """(device, address, bytes, access, width) of each row of the table, a row for each device."""
    rows = re.findall(r"^\| ([\w, ]+) \| (\d+) \| (\d+) \| (\w+) \| (\w+) \|", GUIDE, re.MULTILINE)
    return {(device, int(address), int(size), access, width)
            for devices, address, size, access, width in rows for device in devices.split(", ")}


def test_the_registers_of_bench_are_those_of_its_description():
    modules = BENCH["devices"][0]["modules"]
    described = {(module["name"], block["address"], block["size"],
                  block.get("access", "ReadWrite"), str(block.get("width", "any")))
                 for module in modules for block in module["registers"]}
    assert len(described) == 14
    assert rows_of_the_guide() == described
