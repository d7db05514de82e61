"""A chassis with everything that the simulator's built-in one lacks.

Unit1, Unit2  properties of every type without limits, on the device and on the channels ch0 to ch3;
              registers at both ends of the addresses and registers with side effects; NVMEM areas
              of 1 byte, of 1 MiB and with every protection. Unit2 has no serial number.
Crate         a chassis whose modules are out of order: Four in slot 4, then One in slot 1, which
              is a chassis itself, then Last in slot 64
Empty         a chassis without modules, whose name and address are not ASCII
Bare          a chassis that does not know its host name
Dead, Lost    do not answer
Slow          takes longer to connect than the driver waits
"""

SCALARS = {"Bool": False, "Double": 0, "Int32": 0, "Int64": 0, "String": "", "UInt32": 0,
           "UInt64": 0}
TYPES = {**SCALARS, **{f"{name}Array": [] for name in SCALARS}}

MEBIBYTE = 1 << 20


def of_every_type(prefix):
    return {f"{prefix}.{name}": {"type": name, "access": "ReadWrite", "value": value}
            for name, value in TYPES.items()}


INFORMATION = {
    "Info.Full": {"type": "Int64", "access": "ReadWrite", "description": "All \"five\".",
                  "document": "Mehr dazu: §3", "unit": "µV", "min": -9223372036854775808,
                  "max": 9223372036854775807, "value": 0},
    "Info.Plain": {"type": "Double", "value": 0},
    "Info.Secret": {"type": "String", "access": "WriteOnly", "value": ""},
    "Info.Mode": {"type": "Int32", "access": "ReadWrite", "enum": "Mode", "value": "Zulu"},
    "Info.Nothing": {"type": "Int32Array", "enum": "Nothing", "value": []},
    "Info.Limited": {"type": "Double", "access": "ReadWrite", "min": 0.1, "max": 1e300,
                     "value": 1},
    "Info.Held": {"type": "Int32", "access": "ReadWrite", "needs_commit": True, "value": 1},
}

UNIT = {
    "category": 2,
    "properties": {**of_every_type("Any"), **INFORMATION},
    "commands": {
        "Unit.Bare": {},
        "Unit.Set": {"description": "Sets \"Any\".", "document": "Näheres folgt.",
                     "sets": {"Any.Int32": 7}},
        "Unit.Slow": {"seconds": 3600},
        "Unit.Short": {"seconds": 0.01, "sets": {"Any.Int32": 8}},
    },
    "channels": {
        "prefix": "ch", "count": 4,
        "properties": {**of_every_type("Any"), "Info.Held": INFORMATION["Info.Held"]},
        "commands": {"Chan.Set": {"sets": {"Any.UInt64": 18446744073709551615}}},
    },
    "registers": [
        {"address": 0, "size": 16},
        {"address": 1024, "size": 8, "access": "ReadOnly", "bytes": "0123456789abcdef"},
        {"address": 3072, "size": 8, "access": "WriteOnly"},
        {"address": 3080, "size": 4, "width": 32, "runs": "Unit.Bare"},
        {"address": 3084, "size": 4, "shows": "Info.Mode"},
        {"address": 3088, "size": 8, "shows": "Info.Limited"},
        {"address": 3096, "size": 8, "shows": "Info.Plain"},
        {"address": 4294967288, "size": 8},
    ],
    "nvmem_areas": [
        {"name": "byte", "size": 1, "bytes": "7f"},
        {"name": "big", "size": MEBIBYTE},
        {"name": "closed", "size": 4, "access": "ReadOnly", "bytes": "00ff"},
        {"name": "password", "size": 4, "password": "öffnen"},
    ],
}
NUMBERED = {"Dev.SerialNum": "S/N \"1\"", "Dev.Comment": "the first"}


def unit(name, values=None, areas=()):
    return {**UNIT, "name": name, "values": values or {},
            "nvmem_areas": [*UNIT["nvmem_areas"], *areas]}


def module(name, slot, category=5):
    return {"name": name, "slot": slot, "category": category}


RACK = {
    "enums": {"Mode": {"Zulu": 3, "Alpha": -2147483648, "ä \"b\"": 2147483647}, "Nothing": {}},
    "driver_properties": {"system": of_every_type("Sys.Any"),
                          "session": of_every_type("Session.Any")},
    "devices": [
        unit("Unit1", NUMBERED, [
            {"name": "serial", "size": 4, "serial_number_wanted": True},
            {"name": "both", "size": 4, "serial_number_wanted": True, "password": "öffnen"}]),
        unit("Unit2"),
        {"name": "Crate", "category": 1,
         "modules": [module("Four", 4), module("One", 1, category=1), module("Last", 64)]},
        {"name": "Empty", "category": 1, "values": {"Dev.TCPIP.EthernetIP": "2001:db8::1",
                                                    "Dev.TCPIP.Hostname": "gehäuse.example"}},
        {"name": "Bare", "category": 1, "values": {"Dev.TCPIP.EthernetIP": ""}},
        {"name": "Dead", "category": 2, "reachable": False},
        {"name": "Lost", "category": 2, "reachable": False},
        {"name": "Slow", "category": 2, "connect_seconds": 3600},
    ],
}
