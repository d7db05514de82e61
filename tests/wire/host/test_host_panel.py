"""The panel of the simulated chassis: /simulator/."""

import json
import socket

import pytest

from hostlib import Host, clean_host
from jsonrpc import call

FAULTS = "/simulator/faults"
PULLED = b'{"events": [{"device": "Mod2", "event": "pulled"}]}'
DELAYS = b'{"faults": [{"function": "reset*", "delay": 0.001}]}'


@pytest.fixture(scope="module")
def host():
    with clean_host() as running:
        yield running


@pytest.fixture(autouse=True)
def no_faults_left(host):
    yield
    host.request("POST", FAULTS, b"{}")


def read(host, path):
    status, headers, body = host.request("GET", path)
    assert (status, headers["Content-Type"]) == (200, "application/json; charset=utf-8")
    assert headers["Cache-Control"] == "no-store"
    return json.loads(body)


def states(host):
    return {device["name"]: device["state"] for device in read(host, "/simulator/devices")}


def devices_of_service(host):
    session = json.loads(host.post(call("initializeSession"))[2])["result"]["session_id"]
    answer = host.post(call("getProperty", {"session_id": session, "property": "Sys.Devices"}))[2]
    host.post(call("closeSession", {"session_id": session}))
    return json.loads(answer)["result"]["value"]


def test_devices_are_listed_with_slots_and_registers(host):
    devices = {device["name"]: device for device in read(host, "/simulator/devices")}
    assert sorted(devices) == ["Bench", "Mod1", "Mod2", "Mod4", "Mod5"]
    assert (devices["Mod4"]["slot"], devices["Mod4"]["chassis"]) == (4, "Bench")
    assert "slot" not in devices["Bench"]
    assert devices["Mod4"]["registers"][1] == {"address": 256, "size": 256, "name": "Scratch"}


def test_a_module_is_pulled_and_put_back(host):
    assert states(host)["Mod2"] == "present"
    assert host.request("POST", FAULTS, PULLED)[::2] == (204, b"")
    assert states(host)["Mod2"] == "pulled"
    assert "Mod2" not in devices_of_service(host)
    assert host.request("POST", FAULTS, b"{}")[0] == 204
    assert states(host)["Mod2"] == "present"
    assert "Mod2" in devices_of_service(host)


def test_faults_in_force_are_read_back(host):
    assert read(host, FAULTS) == {}
    host.request("POST", FAULTS, DELAYS)
    assert read(host, FAULTS) == json.loads(DELAYS)


@pytest.mark.parametrize("body, words", [
    (b"", b"is not JSON"),
    (b"{", b"is not JSON"),
    (b"[]", b"must be an object"),
    (b'{"events": [{"device": "Mod9", "event": "pulled"}]}', b"/events/0/device"),
    (b'{"fautls": []}', b"fautls"),
])
def test_broken_faults_are_refused_with_the_reason_and_change_nothing(host, body, words):
    host.request("POST", FAULTS, DELAYS)
    status, _, reason = host.request("POST", FAULTS, body)
    assert status == 400
    assert words in reason
    assert read(host, FAULTS) == json.loads(DELAYS)


def test_faults_of_a_file_are_shown(tmp_path):
    file = tmp_path / "faults.json"
    file.write_bytes(PULLED)
    with clean_host(options=("--faults", file)) as host:
        assert read(host, FAULTS) == json.loads(PULLED)
        assert states(host)["Mod2"] == "pulled"


def test_the_trace_is_followed(host):
    start = read(host, "/simulator/trace/0")["next"]
    devices_of_service(host)
    piece = read(host, f"/simulator/trace/{start}")
    assert any('getSystemPropertyStringArray(session=' in line for line in piece["lines"])
    assert piece["next"] == start + len(piece["lines"])
    assert read(host, f"/simulator/trace/{piece['next']}")["lines"] == []


@pytest.mark.parametrize("path", ["/simulator", "/simulator/", "/simulator/trace", "/simulator/trace/",
                                  "/simulator/trace/x", "/simulator/trace/-1", "/simulator/trace/1x",
                                  "/simulator/trace/99999999999999999999", "/simulator/faults/"])
def test_there_are_no_other_paths(host, path):
    assert host.request("GET", path)[0] == 404


@pytest.mark.parametrize("method, path, allowed", [
    ("PUT", FAULTS, "GET, HEAD, POST"), ("DELETE", FAULTS, "GET, HEAD, POST"),
    ("POST", "/simulator/devices", "GET, HEAD"), ("POST", "/simulator/trace/0", "GET, HEAD")])
def test_other_methods_are_refused(host, method, path, allowed):
    status, headers, _ = host.request(method, path, b"{}")
    assert (status, headers["Allow"]) == (405, allowed)


@pytest.mark.parametrize("headers", [{"Origin": "http://elsewhere.example"}, {"Origin": "null"},
                                     {"Host": "elsewhere.example"}])
def test_pages_of_other_sites_are_refused(host, headers):
    assert host.request("POST", FAULTS, PULLED, headers)[0] == 403
    assert host.request("GET", "/simulator/devices", headers=headers)[0] == 403
    assert states(host)["Mod2"] == "present"


def own_address():
    """An address of this machine besides the loopback ones; no packet is sent."""
    with socket.socket(socket.AF_INET, socket.SOCK_DGRAM) as probe:
        try:
            probe.connect(("192.0.2.1", 9))
            address = probe.getsockname()[0]
        except OSError:
            address = "127.0.0.1"
    if address.startswith("127."):
        pytest.skip("this machine has no other address")
    return address


def test_clients_at_other_addresses_are_refused():
    address = own_address()
    with Host(options=("--listen", f"{address}:0")) as host:
        for path in (FAULTS, "/simulator/devices", "/simulator/trace/0"):
            assert host.request("GET", path)[::2] == (
                403, b"The simulated chassis is changed from its own machine alone.\n")
        assert host.request("POST", FAULTS, PULLED)[0] == 403
        assert "Mod2" in devices_of_service(host)


def test_it_can_be_switched_off():
    with clean_host(options=("--no-panel",)) as host:
        assert host.request("GET", FAULTS)[0] == 404


def test_it_is_not_there_with_another_driver(start_host):
    assert start_host().request("GET", FAULTS)[0] == 404
