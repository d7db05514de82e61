"""The error texts about sessions, and about the params that many methods share."""

import pytest

from answers import failure, session_on, wrong_parameter
from jsonrpc import call

LIMIT = 100
NAMES = "Wrong data type for parameter {}. The data type must be string or array of string."
SESSION_ID = ("Wrong session ID format. The format of a session ID must be _session<number>. For "
              "example, a session ID can be _session1.")
ONE_OF = ("You must specify none or only one of the following parameters: devices, "
          "physical_channels, nvmem_areas.")


@pytest.mark.parametrize("method", ["closeSession", "abortSession", "getSessionPropertyList",
                                    "connectToDevices", "GetChassisIpOrHostname"])
@pytest.mark.parametrize("session_id", ["_session0", "_session12345678901234567890"])
def test_an_unknown_session_is_named(client, method, session_id):
    assert client.ask_whole(call(method, {"session_id": session_id})) == failure(
        -250833, f"Session ID: {session_id}")


def test_a_closed_session_is_unknown(client):
    session_id = client.open_session()
    client.close_session(session_id)
    assert client.ask_whole(call("abortSession", {"session_id": session_id})) == failure(
        -250833, f"Session ID: {session_id}")


def test_an_unknown_session_takes_precedence_over_other_errors(client):
    params = '{"session_id":"_session0","property":"No.Such","devices":"Mod3"}'
    assert client.ask_whole(call("getProperty", params)) == failure(
        -250833, "Session ID: _session0")


@pytest.mark.parametrize("params, pointer, details", [
    ('{"session_id":"session1"}', "/session_id", SESSION_ID),
    ('{"session_id":"_session"}', "/session_id", SESSION_ID),
    ('{"session_id":5}', "/session_id",
     "Wrong parameter data type. The data type must be string."),
    ("{}", "", "The following parameter(s) is required: session_id."),
    ('{"session_id":"_session1","foo":1}', "/foo", "This parameter you specified is unsupported."),
    ('{"session_id":"_session1","a/b ~":1}', "/a~1b%20~0",
     "This parameter you specified is unsupported."),
])
def test_the_first_fault_of_params_is_reported(client, params, pointer, details):
    assert client.ask_whole(call("closeSession", params)) == wrong_parameter(
        f"#/params{pointer}", details)


@pytest.mark.parametrize("params, pointer, details", [
    ('{"devices":5}', "/devices", NAMES.format("devices")),
    ('{"devices":["Mod1",5]}', "/devices", NAMES.format("devices")),
    ('{"physical_channels":{}}', "/physical_channels", NAMES.format("physical_channels")),
    ('{"nvmem_areas":[null]}', "/nvmem_areas", NAMES.format("nvmem_areas")),
    ('{"access":2}', "/access",
     "Wrong enum item. The enum item must be one of the following items: 1, 3, ReadOnly, "
     "ReadWrite"),
    ('{"reservation_group":1}', "/reservation_group",
     "Wrong parameter data type. The data type must be string."),
    ('{"reservation_timeout":"1"}', "/reservation_timeout",
     "Wrong parameter data type. The data type must be number."),
    ('{"force_reserve":1}', "/force_reserve",
     "Wrong parameter data type. The data type must be boolean."),
    ('{"devices":"a","nvmem_areas":"b"}', "", ONE_OF),
])
def test_invalid_params_of_an_opening_are_reported(client, params, pointer, details):
    assert client.ask_whole(call("initializeSession", params)) == wrong_parameter(
        f"#/params{pointer}", details)


@pytest.mark.parametrize("params", ["[]", "null", '"session_id"', "1"])
def test_params_that_are_not_an_object_are_an_invalid_member(client, params):
    assert client.ask_whole(call("closeSession", params)) == failure(
        -32600, "Invalid Member: params")


@pytest.mark.parametrize("params, answer", [
    ('{"devices":"Mod3"}', failure(-250956, "Requested Value: Mod3")),
    ('{"devices":["Mod1","Mod3"]}', failure(-250956, "Requested Value: Mod3")),
    ('{"physical_channels":"Mod1/ch3:4"}', failure(-250957, "Requested Value: Mod1/ch4")),
    ('{"physical_channels":"Mod1/ch4:1"}', failure(-250828, "Requested Value: Mod1/ch4:1")),
    ('{"nvmem_areas":"Mod1/secret"}', failure(-250958, "Requested Value: Mod1/secret")),
    ('{"devices":[]}', failure(-250959)),
    ('{"devices":"Mod1","reservation_timeout":-0.5}', failure(-250962, "Timeout: -0.5")),
])
def test_invalid_resources_of_an_opening_are_reported(client, params, answer):
    assert client.ask_whole(call("initializeSession", params)) == answer


def test_the_session_that_holds_a_device_is_named(client):
    with session_on(client, '{"devices":"Mod1"}') as holder:
        for params in ('{"devices":["Mod2","Mod1"]}', '{"nvmem_areas":"Mod1/user"}'):
            assert client.ask_whole(call("initializeSession", params)) == failure(
                -250811, "Device: Mod1", f"Reserved by Sessions: {holder.id}")


def test_a_session_that_holds_a_device_for_reading_is_not_named(client):
    with session_on(client, '{"devices":"Mod1","access":1}'):
        assert client.ask_whole(call("initializeSession", '{"devices":"Mod1"}')) == failure(
            -250811, "Device: Mod1")


def test_the_limit_of_sessions_is_reported(own_bench):
    for _ in range(LIMIT):
        own_bench.open_session()
    assert own_bench.ask_whole(call("initializeSession", '{"devices":"Mod1"}')) == failure(-250901)
