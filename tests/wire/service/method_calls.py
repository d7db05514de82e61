"""Requests that lead each method through all the functions of the driver that it calls."""

import json

VALUES = {"Bool": True, "Double": 1.5, "Int32": 1, "Int64": 1, "String": "x", "UInt32": 1, "UInt64": 1}
VALUES.update({f"{name}Array": [value] for name, value in list(VALUES.items())})


def _definition(type_name, value):
    return {"type": type_name, "access": "ReadWrite", "value": value}


# A chassis with a property of each type, and with those types for the system and for sessions that
# the driver has functions for.
CHASSIS = json.dumps({
    "enums": {"Mode": {"Off": 0, "On": 1}},
    "driver_properties": {
        "system": {"Sys.Flag": _definition("Bool", True), "Sys.Number": _definition("Double", 1),
                   "Sys.Count": {"type": "UInt64", "value": 1}},
        "session": {"Session.Number": _definition("Double", 1)},
    },
    "devices": [{
        "name": "Rack", "category": 1,
        "values": {"Dev.TCPIP.EthernetIP": "192.0.2.1", "Dev.TCPIP.Hostname": "rack"},
        "modules": [{
            "name": "Unit", "category": 2, "slot": 1,
            "properties": {
                **{f"P.{name}": _definition(name, value) for name, value in VALUES.items()},
                "P.Mode": {"type": "Int32", "enum": "Mode", "value": "Off"}},
            "commands": {"Go": {"description": "Goes.", "document": "It goes."}},
            "channels": {"prefix": "ch", "count": 2, "commands": {"Go": {}},
                         "properties": {"C.Number": _definition("Double", 1)}},
            "registers": [{"address": 0, "size": 16}],
            "nvmem_areas": [{"name": "user", "size": 4}]}]}]}).encode()

UNIT, CHANNEL, AREA = {"device": "Unit"}, {"physical_channel": "Unit/ch0"}, {"nvmem_area": "Unit/user"}
UNITS, CHANNELS, AREAS = ({"devices": "Unit"}, {"physical_channels": "Unit/ch0:1"},
                          {"nvmem_areas": "Unit/user"})
TOKEN = {"devices": "$DefaultDevices"}
DEFAULT = {"devices": "$DefaultDevices"}

BOTH_WAYS = [*((f"P.{name}", UNITS, value) for name, value in VALUES.items()),
             ("C.Number", CHANNELS, [1.5, 2.5]), ("Dev.Comment", DEFAULT, ["x", "y"]),
             ("Sys.Flag", {}, False), ("Sys.Number", {}, 2.5), ("Session.Number", {}, 2.5),
             ("Session.DefaultDevices", {}, ["Rack", "Unit"])]
READ_ONLY = [("Sys.Count", {}), ("Sys.Devices", {}), ("NVMEMArea.Size", AREAS)]
WRITTEN_ONLY = [("Session.Comment", {}, "x")]


def _requests():
    yield "initializeSession", {}
    for resource in (UNITS, CHANNELS, AREAS):
        yield "initializeSession", resource
    yield "initializeSession", {**UNITS, "force_reserve": True}
    for method in ("connectToDevices", "disconnectFromDevices", "reserveDevices", "resetDevices",
                   "unreserveDevices"):
        yield method, UNITS
    for resource in (UNITS, CHANNELS):
        yield "commitProperties", resource
    yield "commitNvmemAreas", AREAS
    yield "getSessionPropertyList", {}
    for resource in (UNIT, CHANNEL, AREA):
        yield "getDevicePropertyList", resource
    for name, resource in [*((name, resource) for name, resource, _ in BOTH_WAYS), *READ_ONLY]:
        yield "getProperty", {"property": name, **resource}
    for name, resource, value in BOTH_WAYS + WRITTEN_ONLY:
        yield "setProperty", {"property": name, "value": value, **resource}
    for name, resource in (("P.Mode", UNIT), ("P.Double", UNIT), ("C.Number", CHANNEL),
                           ("NVMEMArea.Size", AREA), ("Sys.Flag", {}),
                           ("Dev.Comment", {"device": "$DefaultDevices"})):
        yield "getPropertyInformation", {"property": name, **resource}
    for resource, resources in ((UNIT, UNITS), (CHANNEL, CHANNELS)):
        yield "getCommandList", resource
        yield "getCommandInformation", {"command": "Go", **resource}
        yield "executeCommand", {"command": "Go", "timeout": 1, **resources}
    for size in (8, 16, 32, 64):
        yield "readRegister", {**UNIT, "address": 0, "size": size}
        yield "writeRegister", {**UNIT, "address": 0, "size": size, "data": 1}
    yield "getNvmemBytes", {**AREA, "address": 0, "size": 2}
    yield "setNvmemBytes", {**AREA, "address": 0, "data": [1]}
    yield "getModuleName", {"device": "Rack", "slot_number": 1}
    yield "GetChassisIpOrHostname", {"device": "Rack"}
    yield "renameDevice", {**UNIT, "new_device_name": "Unit"}
    yield "renameChassisAndAllConnectedModules", {"old_chassis_name": "Rack",
                                                  "new_chassis_name": "Rack"}
    yield "renameDevice", {"device": "Rack-Mod1", "new_device_name": "Unit"}
    yield "abortSession", {}
    yield "closeSession", {}


REQUESTS = list(_requests())
