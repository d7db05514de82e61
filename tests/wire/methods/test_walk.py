"""Walks through the chassis Bench as clients would take them: one that knows nothing and asks, and
one that works with its modules.

What the first one finds is compared with the description that the simulator is built from.
"""

import itertools
import json
import pathlib
import struct

import pytest

from jsonrpc import Client, batch, call

BENCH = json.loads((pathlib.Path(__file__).resolve().parents[3]
                    / "simulator" / "chassis" / "bench.json"
                    ).read_text(encoding="utf-8"))


class Failed(Exception):
    """Carries the error object of an answer."""


class Walker:
    """A client that makes Python values of the answers."""

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

    def open(self, **params):
        self.session = {}
        self.session = self.do("initializeSession", **params)

    def read(self, name, **resource):
        return self.do("getProperty", property=name, **resource)["value"]

    def write(self, name, value, **resource):
        return self.do("setProperty", property=name, value=value, **resource)["data_type"]


@pytest.fixture
def walker(own_bench):
    return Walker(own_bench)


def described_devices():
    for chassis in BENCH["devices"]:
        yield chassis
        yield from chassis["modules"]


class Number:
    """Equals every text of one number: how the driver writes limits is its own affair."""

    def __init__(self, value):
        self.value = value

    def __eq__(self, text):
        return isinstance(text, str) and float(text) == self.value


def expected_information(description):
    """What getPropertyInformation has to tell of a property of its own."""
    told = {name: description[name] for name in ("description", "document") if name in description}
    told |= {f"{name}_value": Number(description[name]) for name in ("max", "min") if name in description}
    if "unit" in description:
        told["unit"] = description["unit"]
    told |= {"data_type": description["type"], "access": description.get("access", "ReadOnly"),
             "driver_defined": False, "pending_changes": False}
    if "enum" in description:
        told["enum"] = {"name": description["enum"], "values": BENCH["enums"][description["enum"]]}
    return told


def expected_value(description):
    value = description["value"]
    return BENCH["enums"][description["enum"]][value] if "enum" in description else value


class Near:
    """Equals every number that is as far away as this, or less."""

    def __init__(self, value, distance):
        self.value = value
        self.distance = distance

    def __eq__(self, number):
        return abs(number - self.value) <= self.distance


class Counted:
    """Equals every whole number that a counter may show."""

    def __eq__(self, number):
        return isinstance(number, int) and number >= 0


class Wave:
    """Equals every record of so many samples that lie this far from 0, or less."""

    def __init__(self, samples, distance):
        self.samples = samples
        self.distance = distance

    def __eq__(self, values):
        return len(values) == self.samples and all(abs(v) <= self.distance for v in values)


# What moves while all settings are as after power-on. Noise goes six deviations away at most.
MOVING = {
    ("Bench", "Dev.Temperature"): Near(31.5, 0.5 + 0.12),
    ("Mod1", "Dev.Temperature"): Near(36.25, 0.75 + 0.12),
    ("Mod2", "Dev.Temperature"): Near(41, 1.5 + 0.12),
    ("Mod4", "Dev.Temperature"): Near(44.5, 1 + 0.12),
    ("Mod5", "Dev.Temperature"): Near(29.75, 0.5 + 0.12),
    ("Bench", "Chassis.MeasuredFanSpeed"): Near(1800, 36),
    ("Mod1", "DMM.Voltage"): Near(0, 6 * (0.0005 + 0.00005)),
    ("Mod1", "DMM.SampleClock"): Counted(),
    ("Mod2", "PSU.MeasuredVoltage"): Near(0, 6 * 0.0005),
    ("Mod2", "PSU.MeasuredCurrent"): Near(0, 6 * 0.000002),
    ("Mod4", "DIG.Waveform"): Wave(1024, 1 + 6 * 0.002),
}


def explore_resource(walker, device, one, many, description):
    """Asks for all that a resource has, and compares it with its description."""
    properties = description.get("properties", {})
    assert walker.do("getDevicePropertyList", **one)["dynamic_properties"] == list(properties)
    for name, about in properties.items():
        told = walker.do("getPropertyInformation", property=name, **one)
        assert list(told.items()) == list(expected_information(about).items())
        if about.get("access") != "WriteOnly":
            value = MOVING.get((device, name), expected_value(about))
            assert walker.read(name, **many) == value
    commands = description.get("commands", {})
    assert walker.do("getCommandList", **one)["commands"] == list(commands)
    for name, about in commands.items():
        assert walker.do("getCommandInformation", command=name, **one) == {
            "description": about.get("description", ""), "document": about.get("document", "")}


def explore_areas(walker, device):
    names = [f"{device['name']}/{area['name']}" for area in device.get("nvmem_areas", [])]
    assert walker.read("Dev.NVMEM.Areas", devices=device["name"]) == names
    for name, area in zip(names, device.get("nvmem_areas", [])):
        content = bytes.fromhex(area.get("bytes", "")).ljust(area["size"], b"\0")
        assert walker.read("NVMEMArea.Size", nvmem_areas=name) == area["size"]
        assert walker.do("getNvmemBytes", nvmem_area=name, address=0, size=area["size"]) == {
            "data": list(content), "next_address": 1}


# How a value of each type stands in registers of eight and of four bytes.
PACKED = {("Double", 8): "<d", ("UInt64", 8): "<Q", ("Int32", 4): "<i"}


def content_of(block, device):
    """The bytes of a register block after power-on."""
    if "shows" not in block:
        return bytes.fromhex(block.get("bytes", "")).ljust(block["size"], b"\0")
    shown = block["shows"]
    owner = device if isinstance(shown, str) else device["channels"]
    about = owner["properties"][shown if isinstance(shown, str) else shown["property"]]
    return struct.pack(PACKED[about["type"], block["size"]], about["value"])


def explore_registers(walker, device):
    for block in device.get("registers", []):
        content = content_of(block, device)
        width = min(8, block["size"])
        for offset in range(0, block["size"], width):
            address = block["address"] + offset

            def read():
                return walker.do("readRegister", device=device["name"], address=address,
                                 size=8 * width)

            if block.get("access") == "WriteOnly":
                with pytest.raises(Failed) as refused:
                    read()
                assert refused.value.args[0]["data"]["qitrmc_code"] == -250935
            else:
                assert read() == {
                    "next_address": address + 1,
                    "data": int.from_bytes(content[offset:offset + width], "little")}


@pytest.mark.parametrize("device", described_devices(), ids=lambda device: device["name"])
def test_a_client_that_knows_nothing_finds_everything(walker, device):
    walker.open()
    name = device["name"]
    assert name in walker.read("Sys.Devices")
    for prop, value in device["values"].items():
        assert walker.read(prop, devices=name) == MOVING.get((name, prop), value)
    assert walker.read("Dev.ProductCategory", devices=name) == device["category"]
    explore_resource(walker, name, {"device": name}, {"devices": name}, device)
    channels = device.get("channels", {"count": 0})
    named = [f"{name}/{channels['prefix']}{number}" for number in range(channels["count"])]
    assert walker.read("Dev.PhysChans", devices=name) == named
    for channel in named:
        explore_resource(walker, name, {"physical_channel": channel},
                         {"physical_channels": channel}, channels)
    explore_areas(walker, device)
    explore_registers(walker, device)


def test_the_slots_of_the_chassis_are_found_one_by_one(walker):
    walker.open(devices="Bench")
    found = {}
    for slot in range(1, walker.read("Chassis.SlotCount") + 1):
        module = walker.do("getModuleName", slot_number=slot)
        if module["present"]:
            found[slot] = module["module"]
    assert found == {module["slot"]: module["name"] for module in BENCH["devices"][0]["modules"]}
    assert walker.read("Dev.Modules") == list(found.values())


def test_a_client_works_with_its_modules(walker, own_host):
    walker.open(devices=["Mod1", "Mod2"])
    walker.do("connectToDevices")
    assert walker.read("Session.ConnectedDevices") == ["Mod1", "Mod2"]

    assert walker.write("DMM.Function", 2, devices="Mod1") == "Int32"
    assert walker.write("DMM.ApertureTime", 0.5, devices="Mod1") == "Double"
    assert walker.write("PSU.Voltage", [12, 5], physical_channels="Mod2/ch0:1") == "DoubleArray"
    assert walker.write("PSU.CurrentLimit", [1, 2.5], physical_channels="Mod2/ch0:1")
    assert walker.read("PSU.CurrentLimit", physical_channels="Mod2/ch0:1") == [0.1, 0.1]
    walker.do("commitProperties")
    assert walker.read("PSU.CurrentLimit", physical_channels="Mod2/ch0:1") == [1.0, 2.5]
    assert walker.read("DMM.ApertureTime", devices="Mod1") == 0.5

    walker.do("executeCommand", command="PSU.On", physical_channels="Mod2/ch0:1")
    assert walker.read("PSU.OutputEnabled", physical_channels="Mod2/ch0:1") == [True, True]
    for _ in range(3):
        walker.do("executeCommand", command="DMM.Trigger", devices="Mod1")
    assert walker.read("DMM.TriggerCount", devices="Mod1") == 3
    walker.do("executeCommand", command="DMM.SelfTest", devices="Mod1", timeout=30)
    assert walker.read("Dev.Comment", devices="Mod1") == "self test passed"

    with Client(own_host) as connection:
        other = Walker(connection)
        other.open()
        with pytest.raises(Failed) as refused:
            other.do("executeCommand", command="PSU.Off", physical_channels="Mod2/ch0")
        assert refused.value.args[0]["data"]["qitrmc_code"] == -250811
        assert other.read("PSU.OutputEnabled", physical_channels="Mod2/ch0:1") == [True, True]

        walker.do("unreserveDevices", devices="Mod2")
        other.do("executeCommand", command="PSU.Off", physical_channels="Mod2/ch0")
        assert walker.read("PSU.OutputEnabled", physical_channels="Mod2/ch0:1") == [False, True]

    walker.do("resetDevices", devices="Mod1")
    assert walker.read("DMM.TriggerCount", devices="Mod1") == 0
    assert walker.read("DMM.ApertureTime", devices="Mod1") == 0.02
    walker.do("disconnectFromDevices")
    walker.do("closeSession")
    with pytest.raises(Failed) as refused:
        walker.read("Session.ConnectedDevices")
    assert refused.value.args[0]["data"]["qitrmc_code"] == -250833


def test_a_batch_sets_a_measurement_up_and_stops_where_it_fails(walker):
    walker.open(devices="Mod1")

    def step(id, method, **params):
        return call(method, {**walker.session, **params}, str(id))

    answer = json.loads(walker.client.ask(batch(
        step(1, "setProperty", property="DMM.Range", value=100),
        step(2, "setProperty", property="DMM.SampleCount", value=1000),
        step(3, "executeCommand", command="DMM.Trigger"),
        step(4, "setProperty", property="DMM.Range", value=1001),
        step(5, "executeCommand", command="DMM.Trigger"),
        step(6, "closeSession"))))
    assert [one["id"] for one in answer] == [1, 2, 3, 4, 5, 6]
    assert ["result" in one for one in answer] == [True, True, True, False, False, False]
    assert [one["error"]["data"]["qitrmc_code"] for one in answer[3:]] == [-250971, -32001, -32001]
    assert walker.read("DMM.Range") == 100
    assert walker.read("DMM.SampleCount") == 1000
    assert walker.read("DMM.TriggerCount") == 1
