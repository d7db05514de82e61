"""The params of every method: what is accepted and what is refused.

The table below lists what the methods take. Valid params pass the check and then fail, because
their session does not exist; invalid params fail with -32602.
"""

import itertools

import pytest

from jsonrpc import call, error_response
from methods import NAMES

INVALID_REQUEST = error_response("1", -32600)
INVALID_PARAMS = error_response("1", -32602)
UNKNOWN_METHOD = error_response("1", -32601)
UNKNOWN_SESSION = error_response("1", -250833)

NOT_TEXT = ["1", "1.5", "null", "true", "false", "[]", '["x"]', "{}"]
NOT_NUMBER = ['""', '"1"', "null", "true", "false", "[]", "[1]", "{}"]
NOT_INTEGER = NOT_NUMBER + ["1.5", "1.0", "1e2", "18446744073709551616", "-9223372036854775809"]

# Kind of value: JSON texts that are accepted, JSON texts that are refused.
KINDS = {
    "session": (['"_session999999"', '"_session0999999"', '"_session18446744071562069999"',
                 '"_session99999999999999999999999999"', '"_session999999\\u0000x"'],
                ['""', '"_session"', '"session1"', '"_session1x"', '"_Session1"', '" _session1"',
                 '"_session1 "', '"_session-1"', '"_session1\\n"', '"_session\\u0000"', '"_sessionⅣ"']
                + NOT_TEXT),
    "text": (['""', '"x"', '"é"', '"a\\u0000b"', '"' + "x" * 5000 + '"'], NOT_TEXT),
    "names": (['""', '"Mod1"', "[]", '["Mod1"]', '["Mod1","Mod2"]', '["","é"]'],
              ["1", "1.5", "null", "true", "{}", "[1]", '["Mod1",1]', '[1,"Mod1"]', "[null]",
               '[["Mod1"]]', '[{}]', '{"0":"Mod1"}']),
    "number": (["0", "-1", "1.5", "-0.5", "1e10", "18446744073709551615", "-9223372036854775808"],
               NOT_NUMBER),
    "timeout": (["0", "0.0", "-0.0", "1", "1.5", "1e300", "18446744073709551615"],
                NOT_NUMBER + ["-1", "-0.5", "-1e-300", "-2147483649", "-9223372036854775808"]),
    "uint32": (["0", "1", "4294967295"],
               NOT_INTEGER + ["-1", "4294967296", "9223372036854775808", "18446744073709551615"]),
    "size": (["8", "16", "32", "64", "8.0", "8e0"],
             ["0", "7", "9", "-8", "128", "8.5", "4294967304", '"8"', "null", "true", "[]", "[8]",
              "{}"]),
    "data": (["0", "1", "4294967296", "18446744073709551615"], NOT_INTEGER + ["-1", "-2147483649"]),
    "bytes": (["[0]", "[255]", "[0,1,254,255]", "[" + "7," * 5000 + "7]"],
              ["[]", "[256]", "[-1]", "[0,256]", "[1.5]", "[1.0]", '["0"]', "[null]", "[true]",
               "[[0]]", "[{}]", "0", '"0"', "null", "true", "{}"]),
    "slot": (["1", "2", "4294967295"], NOT_INTEGER + ["0", "-1", "4294967296"]),
    "access": (["1", "3", '"ReadOnly"', '"ReadWrite"', "1.0", "3.0"],
               ["0", "2", "-1", "4", "1.5", "4294967297", '""', '"readonly"', '"READWRITE"',
                '"ReadOnly "', '"1"', "null", "true", "[]", "[1]", "{}"]),
    "bool": (["true", "false"], ["0", "1", '""', '"true"', "null", "[]", "[true]", "{}"]),
    "value": (["true", "false", "0", "-1", "1.5", "1e300", "18446744073709551615", '""', '"x"',
               "[true]", "[true,false]", "[1]", "[1,2.5,-3]", '["x"]', '["x",""]'],
              ["null", "[]", "{}", '{"a":1}', "[1,true]", "[true,1]", '["x",1]', '[1,"x"]',
               "[null]", "[[1]]", "[[]]", "[{}]", '[true,"x"]']),
}

# Groups of members of which a request names at most one.
DEVICE_OR_CHANNEL = ("device", "physical_channel")
DEVICES_OR_CHANNELS = ("devices", "physical_channels")
ANY_PLURAL = ("devices", "physical_channels", "nvmem_areas")
ANY_SINGULAR = ("device", "physical_channel", "nvmem_area")
AREAS_OR_DEVICES = ("nvmem_areas", "devices")

NAME_KINDS = {"devices": "names", "physical_channels": "names", "nvmem_areas": "names",
              "device": "text", "physical_channel": "text", "nvmem_area": "text"}


class Method:
    """required, optional: member -> kind, in order; one_of: names, which are optional members."""

    def __init__(self, required=None, optional=None, one_of=()):
        self.required = {"session_id": "session", **(required or {})}
        self.one_of = one_of
        self.optional = {**{name: NAME_KINDS[name] for name in one_of}, **(optional or {})}

    @property
    def members(self):
        return {**self.required, **self.optional}


DEVICES = {"devices": "names"}
DEVICE = {"device": "text"}
RESERVATION = {"access": "access", "reservation_group": "text", "reservation_timeout": "number"}
REGISTER = {"address": "uint32", "size": "size"}

METHODS = {
    "initializeSession": Method(one_of=ANY_PLURAL,
                                optional={**RESERVATION, "force_reserve": "bool"}),
    "closeSession": Method(),
    "abortSession": Method(),
    "connectToDevices": Method(optional=DEVICES),
    "disconnectFromDevices": Method(optional=DEVICES),
    "reserveDevices": Method(optional={**DEVICES, **RESERVATION}),
    "unreserveDevices": Method(optional=DEVICES),
    "resetDevices": Method(optional=DEVICES),
    "renameDevice": Method({"device": "text", "new_device_name": "text"}),
    "getSessionPropertyList": Method(),
    "getDevicePropertyList": Method(one_of=ANY_SINGULAR),
    "getProperty": Method({"property": "text"}, one_of=ANY_PLURAL),
    "setProperty": Method({"property": "text", "value": "value"}, one_of=DEVICES_OR_CHANNELS),
    "commitProperties": Method(one_of=DEVICES_OR_CHANNELS),
    "getPropertyInformation": Method({"property": "text"}, one_of=ANY_SINGULAR),
    "getCommandList": Method(one_of=DEVICE_OR_CHANNEL),
    "executeCommand": Method({"command": "text"}, {"timeout": "timeout"}, DEVICES_OR_CHANNELS),
    "getCommandInformation": Method({"command": "text"}, one_of=DEVICE_OR_CHANNEL),
    "readRegister": Method(REGISTER, DEVICE),
    "writeRegister": Method({**REGISTER, "data": "data"}, DEVICE),
    "getNvmemBytes": Method({"address": "uint32", "size": "uint32"}, {"nvmem_area": "text"}),
    "setNvmemBytes": Method({"address": "uint32", "data": "bytes"},
                            {"nvmem_area": "text", "serial_number": "text", "password": "text"}),
    "commitNvmemAreas": Method(one_of=AREAS_OR_DEVICES),
    "getModuleName": Method({"slot_number": "slot"}, DEVICE),
    "renameChassisAndAllConnectedModules": Method({"old_chassis_name": "text",
                                                   "new_chassis_name": "text"}),
    "GetChassisIpOrHostname": Method(optional=DEVICE),
}
# The one method that needs no session.
METHODS["initializeSession"].required = {}

EVERY_MEMBER = sorted({name for method in METHODS.values() for name in method.members})


def good(kind):
    return KINDS[kind][0][0]


def params_of(members):
    return "{" + ",".join(f'"{name}":{text}' for name, text in members.items()) + "}"


def least(method):
    """The smallest set of valid params, as member -> text."""
    return {name: good(kind) for name, kind in METHODS[method].required.items()}


def right_params():
    for name, method in METHODS.items():
        yield name, least(name)
        for member, kind in method.members.items():
            for text in KINDS[kind][0]:
                yield name, {**least(name), member: text}
        for chosen in method.one_of or [None]:
            others = {member: good(kind) for member, kind in method.members.items()
                      if member == chosen or member not in method.one_of}
            yield name, others
            yield name, dict(reversed(others.items()))


def wrong_params():
    for name, method in METHODS.items():
        for member, kind in method.members.items():
            for text in KINDS[kind][1]:
                yield name, {**least(name), member: text}
        for absent in method.required:
            yield name, {member: text for member, text in least(name).items() if member != absent}
        if method.required:
            yield name, {}
        for unknown in ["x", "", "Session_id", "session_id ", "session_id\\u0000", "id", "method"]:
            yield name, {**least(name), unknown: good("session")}
        for foreign in EVERY_MEMBER:
            if foreign not in method.members:
                yield name, {**least(name), foreign: good("text")}
        for count in range(2, len(method.one_of) + 1):
            for together in itertools.permutations(method.one_of, count):
                yield name, {**least(name), **{one: good(NAME_KINDS[one]) for one in together}}


def cases(generated):
    return [pytest.param(method, params_of(members), id=f"{method} {ascii(params_of(members))[:120]}")
            for method, members in generated]


@pytest.fixture
def ask(client):
    def ask_and_compare(method, params, is_right):
        answer = client.ask(call(method, params))
        client.close_if_opened(answer)
        assert is_right(answer), answer
    return ask_and_compare


def opens(answer):
    return answer.startswith(b'{"jsonrpc":"2.0","id":1,"result":{"session_id":"_session')


def is_past_the_schema(method, params):
    """How valid params are answered. A session without resources opens with any other params, but
    named resources need not exist, and the driver accepts access only as an integer."""
    if method != "initializeSession":
        return lambda answer: answer == UNKNOWN_SESSION
    if params.endswith(('"access":1.0}', '"access":3.0}')):
        return lambda answer: answer == error_response("1", -250800)
    if any(f'"{name}"' in params for name in ANY_PLURAL):
        return lambda answer: opens(answer) or answer.startswith(
            b'{"jsonrpc":"2.0","id":1,"error":{"code":-32000,"message":"","data":{"qitrmc_code":-')
    return opens


@pytest.mark.parametrize("method, params", cases(right_params()))
def test_valid_params_are_accepted(ask, method, params):
    ask(method, params, is_past_the_schema(method, params))


@pytest.mark.parametrize("method, params", cases(wrong_params()))
def test_invalid_params_are_refused(ask, method, params):
    ask(method, params, lambda answer: answer == INVALID_PARAMS)


@pytest.mark.parametrize("params", ["[]", "[{}]", "0", "1.5", '""', '"x"', "null", "true", "false"])
@pytest.mark.parametrize("method", METHODS)
def test_params_that_are_not_an_object_make_an_invalid_request(ask, method, params):
    ask(method, params, lambda answer: answer == INVALID_REQUEST)


@pytest.mark.parametrize("method", METHODS)
def test_absent_params_are_empty_params(ask, method):
    needs_nothing = not METHODS[method].required
    ask(method, None, opens if needs_nothing else lambda answer: answer == INVALID_PARAMS)


@pytest.mark.parametrize("method", METHODS)
def test_the_case_of_a_method_matters(client, method):
    params = params_of(least(method))
    for changed in (method.swapcase(), method[0].swapcase() + method[1:]):
        assert client.ask(call(changed, params)) == UNKNOWN_METHOD


def test_the_methods_are_those_of_the_service():
    assert list(METHODS) == NAMES
