"""A client that walks through a chassis and compares what it finds with the description of it."""

import itertools
import json
import struct

from jsonrpc import call


class Failed(Exception):
    """Carries the error object of an answer."""


class Walker:
    """A client that turns responses into Python values."""

    def __init__(self, client):
        self.client = client
        self.ids = itertools.count(1)
        self.session = {}

    def do(self, method, **params):
        id = next(self.ids)
        answer = json.loads(self.client.ask(call(method, {**self.session, **params}, str(id))))
        assert (answer["jsonrpc"], answer["id"]) == ("2.0", id)
        if "error" in answer:
            raise Failed(answer["error"])
        return answer["result"]

    def fails(self, method, **params):
        """Returns the code of a call that must fail."""
        try:
            result = self.do(method, **params)
        except Failed as failure:
            error = failure.args[0]
            return error["data"]["qitrmc_code"] if "data" in error else error["code"]
        raise AssertionError(f"{method} with {params} did not fail but gave {result}")

    def open(self, **params):
        self.session = {}
        self.session = self.do("initializeSession", **params)

    def read(self, name, **resource):
        return self.do("getProperty", property=name, **resource)["value"]

    def write(self, name, value, **resource):
        return self.do("setProperty", property=name, value=value, **resource)["data_type"]


class Resource:
    """A device, a channel or an area with its part of the description."""

    ONE = {"device": "devices", "physical_channel": "physical_channels",
           "nvmem_area": "nvmem_areas"}

    def __init__(self, kind, name, about):
        self.kind, self.name, self.about = kind, name, about
        self.properties = about.get("properties", {})
        self.commands = about.get("commands", {})
        self.live = about.get("live", {})
        # The resource in methods that take one resource, and in those that take several.
        self.one = {kind: name}
        self.many = {self.ONE[kind]: name}


def devices_of(description):
    """The devices of a description in the order of Sys.Devices."""
    for device in description["devices"]:
        yield device
        yield from device.get("modules", [])


def channels_of(device):
    about = device.get("channels", {"count": 0})
    return [Resource("physical_channel", f"{device['name']}/{about['prefix']}{number}", about)
            for number in range(about["count"])]


def areas_of(device):
    return [Resource("nvmem_area", f"{device['name']}/{area['name']}", area)
            for area in device.get("nvmem_areas", [])]


class Moves:
    """Equals every value that a changing property may have."""

    def __init__(self, about):
        self.about = about

    def __eq__(self, value):
        values = value if self.about["type"].endswith("Array") else [value]
        low, high = self.about.get("min", -1e300), self.about.get("max", 1e300)
        return all(type(item) in (int, float) and low <= item <= high for item in values)

    def __repr__(self):
        return f"Moves({self.about})"


class Number:
    """Equals every text of one number, because the driver is free in how it writes limits."""

    def __init__(self, value):
        self.value = value

    def __eq__(self, text):
        if not isinstance(text, str):
            return False
        return (float(text) if "e" in text or "." in text else int(text)) == self.value

    def __repr__(self):
        return f"Number({self.value})"


def expected_information(about, enums):
    """The expected result of getPropertyInformation for a property of its own."""
    told = {name: about[name] for name in ("description", "document") if about.get(name)}
    told |= {f"{name}_value": Number(about[name]) for name in ("max", "min") if name in about}
    if about.get("unit"):
        told["unit"] = about["unit"]
    told |= {"data_type": about["type"], "access": about.get("access", "ReadOnly"),
             "driver_defined": False, "pending_changes": False}
    if "enum" in about:
        told["enum"] = {"name": about["enum"], "values": enums[about["enum"]]}
    return told


def expected_value(about, enums, value=None):
    """A value of a property as it is read."""
    value = about["value"] if value is None else value
    if isinstance(value, list):
        return [expected_value(about, enums, item) for item in value]
    return enums[about["enum"]].get(value, value) if "enum" in about else value


def explore_resource(walker, resource, enums, moving=None):
    """Reads all that a resource has, and compares it with its description. moving: for
    properties of the device that change, the values they are compared with, by name."""
    one, many = resource.one, resource.many
    names = walker.do("getDevicePropertyList", **one)["dynamic_properties"]
    assert names == list(resource.properties)
    for name, about in resource.properties.items():
        told = walker.do("getPropertyInformation", property=name, **one)
        assert list(told.items()) == list(expected_information(about, enums).items())
        if about.get("access") != "WriteOnly":
            still = Moves(about) if name in resource.live else expected_value(about, enums)
            assert (moving or {}).get(name, still) == walker.read(name, **many)
    assert walker.do("getCommandList", **one)["commands"] == list(resource.commands)
    for name, about in resource.commands.items():
        assert walker.do("getCommandInformation", command=name, **one) == {
            "description": about.get("description", ""), "document": about.get("document", "")}


def content_of(about):
    return bytes.fromhex(about.get("bytes", "")).ljust(about["size"], b"\0")


def explore_areas(walker, device):
    areas = areas_of(device)
    assert walker.read("Dev.NVMEM.Areas", devices=device["name"]) == [area.name for area in areas]
    for area in areas:
        assert walker.read("NVMEMArea.Size", **area.many) == area.about["size"]
        assert walker.do("getNvmemBytes", address=0, size=area.about["size"], **area.one) == {
            "data": list(content_of(area.about)), "next_address": 1}


# How a value of each type is stored in registers of eight and of four bytes.
PACKED = {("Double", 8): "<d", ("UInt64", 8): "<Q", ("Int32", 4): "<i"}


def register_content(block, device):
    """The bytes of a register block after power-on."""
    if "shows" not in block:
        return content_of(block)
    shown = block["shows"]
    owner = device if isinstance(shown, str) else device["channels"]
    about = owner["properties"][shown if isinstance(shown, str) else shown["property"]]
    return struct.pack(PACKED[about["type"], block["size"]], about["value"])


def widest_access(block):
    """The width in bytes of the widest access at the beginning of a block."""
    fits = [width for width in (8, 4, 2, 1)
            if block["address"] % width == 0 and block["size"] % width == 0]
    return block["width"] // 8 if "width" in block else fits[0]


def explore_registers(walker, device):
    for block in device.get("registers", []):
        content, width = register_content(block, device), widest_access(block)
        for offset in range(0, block["size"], width):
            place = {"device": device["name"], "address": block["address"] + offset,
                     "size": 8 * width}
            if block.get("access") == "WriteOnly":
                assert walker.fails("readRegister", **place) == -250935
            else:
                assert walker.do("readRegister", **place) == {
                    "next_address": place["address"] + 1,
                    "data": int.from_bytes(content[offset:offset + width], "little")}


def explore_device(walker, device, enums, moving=None):
    """All of a device in the state after power-on. moving: see explore_resource()."""
    name = device["name"]
    for prop, value in device.get("values", {}).items():
        still = Moves({"type": "Double"}) if prop in device.get("live", {}) else value
        assert (moving or {}).get(prop, still) == walker.read(prop, devices=name)
    assert walker.read("Dev.ProductCategory", devices=name) == device["category"]
    explore_resource(walker, Resource("device", name, device), enums, moving)
    channels = channels_of(device)
    assert walker.read("Dev.PhysChans", devices=name) == [channel.name for channel in channels]
    for channel in channels:
        explore_resource(walker, channel, enums, moving)
    explore_areas(walker, device)
    explore_registers(walker, device)
