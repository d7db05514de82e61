"""The exact texts of every failure that a request can cause."""

import json

import pytest

from error_texts import (INTERNAL, METHOD, NOT_CHASSIS, PARAMS, PARSE, REQUEST, RESERVED, RESOURCE,
                         SESSION, SEVERAL, SKIPPED, TOO_MANY, TOO_WIDE, UTF8, VALUE_TYPE, standing,
                         text, wrapped)
from jsonrpc import Client, call


@pytest.fixture
def session(client):
    with client.session() as session_id:
        yield session_id


# ---- JSON-RPC ------------------------------------------------------------------------------------

@pytest.mark.parametrize("body, details, offset", [
    (b"", "The document is empty.", 0),
    (b"{} {}", "The document root must not be followed by other values.", 3),
    (b"{x}", "Missing a name for object member.", 1),
    (b'{"a" 1}', "Missing a colon after a name of object member.", 5),
    (b'{"a":1 "b"}', "Missing a comma or '}' after an object member.", 7),
    (b"[1 2]", "Missing a comma or ']' after an array element.", 3),
    (b'["\\ud83d"]', "The surrogate pair in string is invalid.", 2),
    (b'["a', "Missing a closing quotation mark in string.", 3),
    (b"[1e999]", "Number too big to be stored in double.", 1),
    pytest.param(b"[" * 2000, "Terminate parsing due to Handler error.", 1001, id="too deep"),
])
def test_a_body_that_is_not_json(client, body, details, offset):
    assert client.ask_whole(body) == standing(
        -32700, text(PARSE, f"Details: {details}", f"Offset: {offset}"), id="null")


@pytest.mark.parametrize("body", [b"[]", b"1", b'"x"', b"null"])
def test_a_root_that_is_not_a_request(client, body):
    assert client.ask_whole(body) == standing(-32600, text(REQUEST), id="null")


@pytest.mark.parametrize("body, member, id", [
    (b"{}", "id", "null"),
    (b'{"id":1.5}', "id", "1.5"),
    (b'{"id":1}', "jsonrpc", "1"),
    (b'{"id":1,"jsonrpc":"2.0","method":[]}', "method", "1"),
    (b'{"id":1,"jsonrpc":"2.0","method":"closeSession","params":[]}', "params", "1"),
])
def test_a_faulty_envelope(client, body, member, id):
    assert client.ask_whole(body) == standing(
        -32600, text(REQUEST, f"Invalid Member: {member}"), id=id)


@pytest.mark.parametrize("method", ["", "closesession", "größe", "a \"b\" \\ c", "Devices: x"])
def test_an_unknown_method(client, method):
    assert client.ask_whole(call(method)) == standing(-32601, text(METHOD, f"Method: {method}"))


def test_an_unknown_method_of_several_lines_stays_on_one(client):
    assert client.ask_whole(call("a\nb")) == standing(-32601, text(METHOD, "Method: a b"))


def test_an_unknown_method_that_is_not_utf8_is_quoted_with_replacement_characters(client):
    assert client.ask_whole(b'{"jsonrpc":"2.0","id":1,"method":"a\xffb\xc3"}') == standing(
        -32601, text(METHOD, "Method: a\N{REPLACEMENT CHARACTER}b\N{REPLACEMENT CHARACTER}"))


def test_a_skipped_element_of_a_batch(client):
    assert client.ask_whole(b"[" + call("x") + b"," + call("closeSession", id="2") + b"]") == (
        b"[" + standing(-32601, text(METHOD, "Method: x")) + b"," +
        wrapped(-32001, text(SKIPPED), id="2") + b"]")


# ---- The sentences of parameter errors ------------------------------------------------------------

def at(pointer, sentence):
    return standing(-32602, text(PARAMS, f"Parameter: {pointer}", f"Details: {sentence}"))


ONE_OF = "You must specify none or only one of the following parameters: "


@pytest.mark.parametrize("method, params, pointer, sentence", [
    ("closeSession", {"session_id": "_session1", "extra": 1}, "#/params/extra",
     "This parameter you specified is unsupported."),
    ("closeSession", {"session_id": 5}, "#/params/session_id",
     "Wrong parameter data type. The data type must be string."),
    ("readRegister", {"session_id": "_session1", "address": 1.5, "size": 8}, "#/params/address",
     "Wrong parameter data type. The data type must be integer."),
    ("closeSession", {}, "#/params", "The following parameter(s) is required: session_id."),
    ("readRegister", {"session_id": "_session1", "address": 0}, "#/params",
     "The following parameter(s) is required: session_id, address, size."),
    ("closeSession", {"session_id": "session1"}, "#/params/session_id",
     "Wrong session ID format. The format of a session ID must be _session<number>. For example, a "
     "session ID can be _session1."),
    ("readRegister", {"session_id": "_session1", "address": 0, "size": 7}, "#/params/size",
     "Wrong enum item. The enum item must be one of the following items: 8, 16, 32, 64"),
    ("initializeSession", {"access": 2}, "#/params/access",
     "Wrong enum item. The enum item must be one of the following items: 1, 3, ReadOnly, ReadWrite"),
    ("executeCommand", {"session_id": "_session1", "command": "x", "timeout": -1},
     "#/params/timeout", "The number must be greater than or equal to 0"),
    ("readRegister", {"session_id": "_session1", "address": 4294967296, "size": 8},
     "#/params/address", "The number must be less than or equal to 4294967295"),
    ("setNvmemBytes", {"session_id": "_session1", "address": 0, "data": []}, "#/params/data",
     "The parameter must not be empty array."),
    ("initializeSession", {"devices": 5}, "#/params/devices",
     "Wrong data type for parameter devices. The data type must be string or array of string."),
    ("initializeSession", {"physical_channels": [1]}, "#/params/physical_channels",
     "Wrong data type for parameter physical_channels. The data type must be string or array of "
     "string."),
    ("initializeSession", {"nvmem_areas": {}}, "#/params/nvmem_areas",
     "Wrong data type for parameter nvmem_areas. The data type must be string or array of string."),
    ("setProperty", {"session_id": "_session1", "property": "p", "value": [1, True]},
     "#/params/value",
     "Wrong data type for parameter property. The data type must be one of the following data "
     "types: boolean, string, number, array of boolean, array of string, or array of number."),
    ("getCommandList", {"session_id": "_session1", "device": "a", "physical_channel": "b"},
     "#/params", ONE_OF + "device, physical_channel."),
    ("commitProperties", {"session_id": "_session1", "devices": "a", "physical_channels": "b"},
     "#/params", ONE_OF + "devices, physical_channels."),
    ("commitNvmemAreas", {"session_id": "_session1", "devices": "a", "nvmem_areas": "b"},
     "#/params", ONE_OF + "devices, nvmem_areas."),
    ("getPropertyInformation",
     {"session_id": "_session1", "property": "p", "device": "a", "nvmem_area": "b"},
     "#/params", ONE_OF + "device, physical_channel, nvmem_area."),
    ("getProperty", {"session_id": "_session1", "property": "p", "devices": "a", "nvmem_areas": "b"},
     "#/params", ONE_OF + "devices, physical_channels, nvmem_areas."),
    ("closeSession", {"session_id": "_session1", "a/b é": 1}, "#/params/a~1b%20%C3%A9",
     "This parameter you specified is unsupported."),
])
def test_a_parameter_that_breaks_the_schema(client, method, params, pointer, sentence):
    assert client.ask_whole(call(method, params)) == at(pointer, sentence)


@pytest.mark.parametrize("method, params, sentence", [
    ("getDevicePropertyList", {}, "You must specify at least one of the following parameters: "
     "device, physical_channel, nvmem_area."),
    ("getCommandList", {}, "You must specify at least one of the following parameters: device, "
     "physical_channel."),
    ("getProperty", {"property": "x"}, "You must specify at least one of the following parameters: "
     "devices, physical_channels, nvmem_areas."),
    ("getModuleName", {"slot_number": 1}, "You must specify none or only one device."),
])
def test_a_request_that_lacks_a_resource(client, session, method, params, sentence):
    assert client.ask_whole(call(method, {"session_id": session, **params})) == standing(
        -32602, text(PARAMS, f"Details: {sentence}"))


# ---- The service and the driver -------------------------------------------------------------------

def test_an_unknown_session(client):
    assert client.ask_whole(call("closeSession", {"session_id": "_session999999"})) == wrapped(
        -250833, text(SESSION, "Session ID: _session999999"))


@pytest.mark.parametrize("member, name", [
    ("devices", "Mod3"), ("devices", "Mod1:3"), ("physical_channels", "Mod1/ch9"),
    ("nvmem_areas", "Mod1/none"), ("physical_channels", "Mod1/ch4:1")])
def test_an_unknown_resource(client, session, member, name):
    params = {"session_id": session, "property": "x", member: name}
    assert client.ask_whole(call("getProperty", params)) == wrapped(
        -250828, text(RESOURCE, f"Requested Value: {name}"))


def test_a_malformed_name_that_is_not_utf8(client):
    body = (b'{"jsonrpc":"2.0","id":1,"method":"initializeSession","params":'
            b'{"physical_channels":"M\xff/ch4:1"}}')
    assert client.ask_whole(body) == wrapped(-250832, text(UTF8))


def test_an_array_property_on_several_resources(client, session):
    params = {"session_id": session, "property": "Dev.PhysChans", "devices": ["Mod1", "Mod2"]}
    assert client.ask_whole(call("getProperty", params)) == wrapped(
        -250829, text(SEVERAL, "Devices: Mod1,Mod2"))


def test_a_device_that_is_not_a_chassis(client, session):
    params = {"session_id": session, "slot_number": 1, "device": "Mod1"}
    assert client.ask_whole(call("getModuleName", params)) == wrapped(-250812, text(NOT_CHASSIS))


def test_data_wider_than_the_register(client, session):
    params = {"session_id": session, "device": "Mod1", "address": 0, "size": 8, "data": 256}
    assert client.ask_whole(call("writeRegister", params)) == wrapped(-250860, text(TOO_WIDE))


def test_an_access_with_a_fraction_is_an_internal_error(client):
    assert client.ask_whole(call("initializeSession", '{"devices":"Mod1","access":1.0}')) == wrapped(
        -250800, text(INTERNAL))


def test_a_reserved_device_is_reported_with_the_sessions_that_hold_it(client):
    group = '"reservation_group":"g"'
    with client.session(f'{{"devices":"Mod1",{group}}}') as first:
        with client.session(f'{{"devices":"Mod1",{group}}}') as second:
            holders = ", ".join(sorted((first, second)))
            assert client.ask_whole(call("initializeSession", {"devices": "Mod1"})) == wrapped(
                -250811, text(RESERVED, "Device: Mod1", f"Reserved by Sessions: {holders}"))


def test_a_value_of_another_type(client, session):
    properties = json.loads(client.ask_whole(
        call("getDevicePropertyList", {"session_id": session, "device": "Mod1"})))["result"]
    assert properties["dynamic_properties"]
    params = {"session_id": session, "device": "Mod1", "property": "Dev.ProductCategory"}
    assert json.loads(client.ask_whole(call("getPropertyInformation", params)))["result"][
        "data_type"] == "Int32"
    params = {"session_id": session, "devices": "Mod1", "property": "Dev.ProductCategory",
              "value": 1.0}
    assert client.ask_whole(call("setProperty", params)) == wrapped(
        -250819, text(VALUE_TYPE, "Requested Data Type: Int32"))


def test_more_sessions_than_there_is_room_for(own_host):
    with Client(own_host) as client:
        shared = '{"devices":"Mod1","reservation_group":"g"}'
        for _ in range(100):
            assert b'"result"' in client.ask_whole(call("initializeSession", shared))
        assert client.ask_whole(call("initializeSession", shared)) == wrapped(-250901, text(TOO_MANY))
