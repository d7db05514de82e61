"""Walks through the shipped chassis as clients would: one client that discovers everything, and one
that works with the modules of the chassis Bench.

What the first one finds is compared with the description that the simulator reads.
"""

import json
import pathlib

import pytest

from hostlib import clean_host
from jsonrpc import Client, batch, call
from walker import Failed, Walker, channels_of, devices_of, explore_device

CHASSIS = pathlib.Path(__file__).resolve().parents[3] / "simulator" / "chassis"


@pytest.fixture
def walker(own_bench):
    return Walker(own_bench)


class Near:
    """Equals every number within this distance."""

    def __init__(self, value, distance):
        self.value = value
        self.distance = distance

    def __eq__(self, number):
        return abs(number - self.value) <= self.distance


class Counted:
    """Equals every integer that a counter may have."""

    def __eq__(self, number):
        return isinstance(number, int) and number >= 0


class Wave:
    """Equals every record of this many samples that lie within this distance of 0."""

    def __init__(self, samples, distance):
        self.samples = samples
        self.distance = distance

    def __eq__(self, values):
        return len(values) == self.samples and all(abs(v) <= self.distance for v in values)


# What changes on the chassis Bench while all settings are as after power-on. Noise stays within six
# standard deviations.
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


def described(name):
    return json.loads((CHASSIS / f"{name}.json").read_text(encoding="utf-8"))


@pytest.fixture(scope="module", params=["bench", "small", "full"])
def shipped(request):
    """A walker through a shipped chassis, and the description of the chassis."""
    path = CHASSIS / f"{request.param}.json"
    with clean_host(("--chassis", path)) as host, Client(host) as client:
        yield Walker(client), described(request.param)


def test_the_full_chassis_has_nearly_all_slots_and_a_hundred_channels():
    chassis, = described("full")["devices"]
    slots = [module["slot"] for module in chassis["modules"]]
    assert chassis["properties"]["Chassis.SlotCount"]["value"] == 18
    assert len(set(slots)) >= 17 and set(slots) <= set(range(1, 19))
    assert sum(len(channels_of(device)) for device in devices_of(described("full"))) >= 100


def test_the_small_chassis_has_two_slots_and_one_module():
    chassis, = described("small")["devices"]
    assert chassis["properties"]["Chassis.SlotCount"]["value"] == 2
    assert [module["slot"] for module in chassis["modules"]] == [1]


def test_a_client_without_prior_knowledge_finds_everything(shipped):
    walker, description = shipped
    walker.open()
    assert walker.read("Sys.Devices") == [device["name"] for device in devices_of(description)]
    for device in devices_of(description):
        moving = {prop: value for (name, prop), value in MOVING.items() if name == device["name"]}
        explore_device(walker, device, description.get("enums", {}), moving)
    walker.do("closeSession")


def test_every_name_opens_a_session(shipped):
    walker, description = shipped
    for device in devices_of(description):
        walker.open(devices=device["name"])
        walker.do("closeSession")
        channels = [channel.name for channel in channels_of(device)]
        for name in channels:
            walker.open(physical_channels=name)
            assert walker.read("Session.DefaultPhysChans") == [name]
            walker.do("closeSession")


def test_the_slots_of_the_chassis_are_found_one_by_one(shipped):
    walker, description = shipped
    chassis, = description["devices"]
    walker.open(devices=chassis["name"])
    found = {}
    for slot in range(1, walker.read("Chassis.SlotCount") + 1):
        module = walker.do("getModuleName", slot_number=slot)
        if module["present"]:
            found[slot] = module["module"]
    assert found == {module["slot"]: module["name"] for module in chassis["modules"]}
    assert walker.read("Dev.Modules") == list(found.values())
    assert walker.do("GetChassisIpOrHostname") == {
        "chassis_ip": chassis["values"]["Dev.TCPIP.EthernetIP"],
        "chassis_hostname": chassis["values"]["Dev.TCPIP.Hostname"]}
    walker.do("closeSession")


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
