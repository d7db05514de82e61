"""The reference lists the error codes of each method: each of them is provoked here.

The texts of the failures are tested with their methods; here only the list is tested.
"""

import contextlib
import json
import pathlib

import pytest

from answers import session_on
from jsonrpc import ENCODING, call

PAGE_TABLE = pathlib.Path(__file__).resolve().parents[3] / "docs" / "methods.json"


def bad_names(member):
    """An unknown name, and a malformed range that is not valid UTF-8 either."""
    return [(-250828, f'"{member}":"Unit9"'), (-250832, f'"{member}":"Unit1/ch2:1\udcff"')]


def no_resource(*more):
    return (-250959, ",".join(more))


UNIT1 = '"devices":"Unit1"'
ONE_UNIT = '"device":"Unit1"'
BOTH_UNITS = '"device":"Unit1,Unit2"'
BYTE = '"nvmem_area":"Unit1/byte"'
TWO_AREAS = '"nvmem_area":"Unit1/byte,Unit1/big"'
NO_DEVICE = '"device":"$ConnectedDevices"'
REGISTER = '"address":0,"size":16'
BYTES = '"address":0,"data":[1]'

READING = {"opening": '{"devices":"Unit1","access":1}'}
TAKEN = {"held": '{"devices":"Unit1"}'}


def with_more(cases, more):
    return [(code, f"{params},{more}") for code, params in cases]


PROPERTY = '"property":"Any.Int32"'
COMMAND = '"command":"Unit.Bare"'

# Method: code, params after session_id, and, where needed, how the session is opened (opening) and
# what another session holds (held).
FAILURES = {
    "initializeSession": [
        (-250811, UNIT1, TAKEN), (-250828, '"physical_channels":"a/b2:1"'),
        (-250832, '"physical_channels":"a/b2:1\udcff"'), (-250956, '"devices":"Unit9"'),
        (-250957, '"physical_channels":"Unit1/ch9"'), (-250958, '"nvmem_areas":"Unit1/ch0"'),
        (-250959, '"devices":[]'), (-250962, f'{UNIT1},"reservation_timeout":-1')],
    "closeSession": [],
    "abortSession": [],
    "connectToDevices": [*bad_names("devices"), no_resource(), (-250988, '"devices":"Dead"')],
    "disconnectFromDevices": [*bad_names("devices"), no_resource()],
    "reserveDevices": [*bad_names("devices"), no_resource(), (-250811, UNIT1, TAKEN),
                       (-250962, f'{UNIT1},"reservation_timeout":-1')],
    "unreserveDevices": [*bad_names("devices"), no_resource()],
    "resetDevices": [*bad_names("devices"), no_resource(), (-250811, UNIT1, TAKEN),
                     (-250972, UNIT1, READING)],
    "renameDevice": [(code, f'"device":"{old}","new_device_name":"{new}"', *more)
                     for code, old, new, *more in [
                         (-250811, "Unit1", "x", TAKEN), (-250956, "Unit9", "x"),
                         (-250959, "", "x"), (-250966, "Unit1,Unit2", "x"),
                         (-250972, "Unit1", "x", READING), (-250985, "Unit1", ""),
                         (-250986, "Unit1", "Unit2")]],
    "getSessionPropertyList": [],
    "getDevicePropertyList": bad_names("device"),
    "getProperty": [*with_more([*bad_names("nvmem_areas"), (-250959, '"devices":[]')], PROPERTY),
                    (-250829, '"property":"Any.Int32Array","devices":"Unit1,Unit2"'),
                    (-250964, f'"property":"No.Such",{UNIT1}'),
                    (-250969, f'"property":"Info.Secret",{UNIT1}')],
    "setProperty": [
        *with_more([*bad_names("physical_channels"), (-250959, '"devices":[]')],
                   f'{PROPERTY},"value":1'),
        (-250811, f'{PROPERTY},{UNIT1},"value":1', TAKEN),
        (-250819, f'{PROPERTY},{UNIT1},"value":true'),
        (-250829, '"property":"Any.Int32Array","devices":"Unit1,Unit2","value":[1]'),
        (-250964, f'"property":"No.Such",{UNIT1},"value":1'),
        (-250967, f'{PROPERTY},"devices":"Unit1,Unit2","value":[1,2,3]'),
        (-250968, f'"property":"Info.Plain",{UNIT1},"value":1'),
        (-250970, f'"property":"Info.Mode",{UNIT1},"value":1'),
        (-250971, f'"property":"Info.Limited",{UNIT1},"value":0'),
        (-250972, f'{PROPERTY},{UNIT1},"value":1', READING)],
    "commitProperties": [*bad_names("physical_channels"), no_resource(), (-250811, UNIT1, TAKEN),
                         (-250972, UNIT1, READING)],
    "getPropertyInformation": [
        *with_more([*bad_names("physical_channel"), (-250959, NO_DEVICE)], PROPERTY),
        (-250829, '"property":"Any.Int32Array","device":"Unit1,Unit2"'),
        (-250964, f'"property":"No.Such",{ONE_UNIT}')],
    "getCommandList": [*bad_names("physical_channel"), (-250959, NO_DEVICE),
                       (-250966, BOTH_UNITS)],
    "executeCommand": [*with_more(bad_names("devices"), COMMAND), no_resource(COMMAND),
                       (-250811, f"{COMMAND},{UNIT1}", TAKEN),
                       (-250972, f"{COMMAND},{UNIT1}", READING),
                       (-250975, f'"command":"No.Such",{UNIT1}'),
                       (-250976, f'"command":"Unit.Slow","timeout":0,{UNIT1}')],
    "getCommandInformation": [*with_more(bad_names("device"), COMMAND), no_resource(COMMAND),
                              (-250975, f'"command":"No.Such",{ONE_UNIT}')],
    "readRegister": [*with_more([*bad_names("device"), (-250966, BOTH_UNITS)], REGISTER),
                     no_resource(REGISTER), (-250935, f'{ONE_UNIT},"address":3072,"size":8'),
                     (-250978, f'{ONE_UNIT},"address":16,"size":8'),
                     (-250979, f'{ONE_UNIT},"address":1,"size":16')],
    "writeRegister": [*with_more([*bad_names("device"), (-250966, BOTH_UNITS)],
                                 f'{REGISTER},"data":1'), no_resource(REGISTER, '"data":1'),
                      (-250811, f'{ONE_UNIT},{REGISTER},"data":1', TAKEN),
                      (-250860, f'{ONE_UNIT},{REGISTER},"data":65536'),
                      (-250968, f'{ONE_UNIT},"address":3096,"size":64,"data":0'),
                      (-250970, f'{ONE_UNIT},"address":3084,"size":32,"data":4'),
                      (-250971, f'{ONE_UNIT},"address":3088,"size":64,"data":0'),
                      (-250972, f'{ONE_UNIT},{REGISTER},"data":1', READING),
                      (-250978, f'{ONE_UNIT},"address":16,"size":8,"data":1'),
                      (-250979, f'{ONE_UNIT},"address":1,"size":16,"data":1'),
                      (-250980, f'{ONE_UNIT},"address":1024,"size":16,"data":1')],
    "getNvmemBytes": [*with_more([*bad_names("nvmem_area"), (-250966, TWO_AREAS)],
                                 '"address":0,"size":1'), no_resource('"address":0,"size":1'),
                      (-250958, '"address":0,"size":1', {"opening": '{"devices":"Unit1"}'}),
                      (-250981, f'{BYTE},"address":1,"size":1')],
    "setNvmemBytes": [*with_more([*bad_names("nvmem_area"), (-250966, TWO_AREAS)], BYTES),
                      no_resource(BYTES), (-250811, f"{BYTE},{BYTES}", TAKEN),
                      (-250958, BYTES, {"opening": '{"devices":"Unit1"}'}),
                      (-250972, f"{BYTE},{BYTES}", READING),
                      (-250981, f'{BYTE},"address":1,"data":[1]'),
                      (-250982, f'"nvmem_area":"Unit1/closed",{BYTES}'),
                      (-250983, f'"nvmem_area":"Unit1/serial",{BYTES}'),
                      (-250984, f'"nvmem_area":"Unit1/password",{BYTES}')],
    "commitNvmemAreas": [*bad_names("nvmem_areas"), no_resource(), (-250811, UNIT1, TAKEN),
                         (-250958, "", {"opening": '{"physical_channels":"Unit1/ch0"}'}),
                         (-250972, UNIT1, READING)],
    "getModuleName": [
        *with_more([*bad_names("device"), (-250812, ONE_UNIT), (-250959, NO_DEVICE),
                    (-250964, '"device":"One"')], '"slot_number":1'),
        (-250966, '"slot_number":1', {"opening": '{"devices":"Unit1,Unit2"}'})],
    "renameChassisAndAllConnectedModules": [
        (code, f'"old_chassis_name":"{old}","new_chassis_name":"{new}"', *more)
        for code, old, new, *more in [
            (-250811, "Crate", "x", {"held": '{"devices":"Four"}'}), (-250812, "Unit1", "x"),
            (-250828, "Unit9", "x"), (-250832, "Unit1/ch2:1\udcff", "x"),
            (-250959, "$ConnectedDevices", "x"), (-250964, "One", "x"),
            (-250966, "$DefaultDevices", "x", {"opening": '{"devices":"Unit1,Unit2"}'}),
            (-250972, "Crate", "x", {"opening": '{"devices":"Four","access":1}'}),
            (-250985, "Crate", "$"), (-250986, "Empty", "Unit1")]],
    "GetChassisIpOrHostname": [
        *bad_names("device"), (-250812, ONE_UNIT), (-250959, NO_DEVICE),
        (-250964, '"device":"Bare"'),
        (-250966, "", {"opening": '{"devices":"Unit1,Unit2"}'})],
}

# Codes with a test of their own because they need two connections, a hundred sessions or a state
# folder; and -250987, which would take ten seconds and is tested with the driver alone.
PROVOKED_ELSEWHERE = {"initializeSession": {-250901, -250931}, "connectToDevices": {-250963, -250987},
                      "executeCommand": {-250931, -250963, -250977}, "renameDevice": {-250931},
                      "setProperty": {-250931}, "commitProperties": {-250931},
                      "commitNvmemAreas": {-250931},
                      "renameChassisAndAllConnectedModules": {-250931},
                      "writeRegister": {-250931, -250977}}


@pytest.mark.parametrize("method, code, params, setting", [
    pytest.param(method, code, params, *setting or [{}], id=f"{method} {code}")
    for method, rows in FAILURES.items() for code, params, *setting in rows])
def test_a_method_fails_with_each_code_of_its_list(rack, method, code, params, setting):
    held = session_on(rack, setting["held"]) if "held" in setting else contextlib.nullcontext()
    with held, session_on(rack, setting.get("opening")) as session:
        if method == "initializeSession":
            answer = rack.ask_whole(call(method, "{" + params + "}"))
        else:
            answer = session.ask(method, params)
    assert json.loads(answer.decode(*ENCODING))["error"]["data"]["qitrmc_code"] == code


def test_the_reference_lists_the_codes_that_are_provoked():
    listed = json.loads(PAGE_TABLE.read_text(encoding="utf-8"))["methods"]
    provoked = {method: {code for code, *_ in rows} | PROVOKED_ELSEWHERE.get(method, set())
                for method, rows in FAILURES.items()}
    assert {method: set(entry["errors"]) for method, entry in listed.items()} == provoked
    assert all(len(set(entry["errors"])) == len(entry["errors"]) for entry in listed.values())
