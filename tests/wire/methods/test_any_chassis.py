"""Walks through generated chassis: any valid description loads, and all methods serve it.

Each walk is a model of its chassis: every response is predicted from the description and from what
the walk did before.
"""

import json
import pathlib
import sys

from hypothesis import HealthCheck, Phase, given, settings

from examples import examples
from hostlib import clean_host
from jsonrpc import Client
from walker import (Resource, Walker, areas_of, channels_of, content_of, devices_of, expected_value,
                    explore_device)

sys.path.insert(0, str(pathlib.Path(__file__).resolve().parents[2] / "support"))
from chassis_descriptions import BOUNDS, descriptions  # noqa: E402

# Failures are reported as found, without shrinking: each attempt to shrink one would start a host.
SETTINGS = settings(max_examples=examples(40), phases=[Phase.generate], deadline=None, database=None,
                    derandomize=True, suppress_health_check=list(HealthCheck))


def another_value(about, enums):
    """A value that a property may have, if possible another one than in the description."""
    kind = about["type"].removesuffix("Array")
    if "enum" in about:
        scalar = max(enums[about["enum"]].values())
    elif kind in ("Bool", "String"):
        scalar = {"Bool": True, "String": "neu\n\"§\" 𝄞"}[kind]
    else:
        scalar = about.get("max", about.get("min", 0.1 if kind == "Double" else BOUNDS[kind][1]))
    return [scalar] * 3 if about["type"].endswith("Array") else scalar


def access_to(about):
    return about.get("access", "ReadOnly")


def assert_value(walker, resource, name, value, enums):
    about = resource.properties[name]
    if access_to(about) == "WriteOnly":
        assert walker.fails("getProperty", property=name, **resource.many) == -250969
    else:
        assert walker.read(name, **resource.many) == expected_value(about, enums, value)


def write_properties(walker, resource, enums):
    """Writes every writable property and reads it back."""
    for name, about in resource.properties.items():
        value = another_value(about, enums)
        if access_to(about) == "ReadOnly":
            assert walker.fails("setProperty", property=name, value=value,
                                **resource.many) == -250968
            continue
        assert walker.write(name, value, **resource.many) == about["type"]
        held = about.get("needs_commit", False)
        told = walker.do("getPropertyInformation", property=name, **resource.one)
        assert told["pending_changes"] == held
        assert_value(walker, resource, name, None if held else value, enums)
    walker.do("commitProperties", **resource.many)
    for name, about in resource.properties.items():
        value = None if access_to(about) == "ReadOnly" else another_value(about, enums)
        assert_value(walker, resource, name, value, enums)


def run_commands(walker, resource, enums):
    for name, about in resource.commands.items():
        assert walker.do("executeCommand", command=name, **resource.many) == {}
        for target, value in about.get("sets", {}).items():
            if target not in about.get("adds", {}):
                assert_value(walker, resource, target, value, enums)
    assert walker.fails("executeCommand", command="No such", **resource.many) == -250975


def use_areas(walker, device):
    """Writes to the areas and commits them. Returns their contents afterwards, by name."""
    lasting = {}
    for area in areas_of(device):
        about, content = area.about, bytearray(content_of(area.about))
        keys = {"serial_number": device["values"]["Dev.SerialNum"],
                "password": about.get("password", "")}
        write = {"address": about["size"] - 1, "data": [content[-1] ^ 0xFF]}
        if about.get("access") == "ReadOnly":
            assert walker.fails("setNvmemBytes", **write, **keys, **area.one) == -250982
        else:
            if about.get("password"):
                assert walker.fails("setNvmemBytes", **write, **area.one,
                                    **{**keys, "password": "x" + keys["password"]}) == -250984
            walker.do("setNvmemBytes", **write, **keys, **area.one)
            content[-1] ^= 0xFF
        assert walker.fails("getNvmemBytes", address=1, size=about["size"], **area.one) == -250981
        walker.do("commitNvmemAreas", **area.many)
        lasting[area.name] = list(content)
    return lasting


def use_registers(walker, device):
    for block in device["registers"]:
        place = {"device": device["name"], "address": block["address"], "size": 8}
        value = content_of(block)[0] ^ 0xFF
        if block.get("access") == "ReadOnly":
            assert walker.fails("writeRegister", data=value, **place) == -250980
        else:
            walker.do("writeRegister", data=value, **place)
            assert walker.do("readRegister", **place)["data"] == value
        behind = block["address"] + block["size"]
        if behind not in [other["address"] for other in device["registers"]]:
            code = walker.fails("readRegister", **{**place, "address": behind})
            assert code == -250978


def use_device(walker, device, enums):
    name = device["name"]
    walker.open(devices=name)
    if device.get("reachable", True):
        walker.do("connectToDevices")
        assert walker.read("Session.ConnectedDevices") == [name]
        walker.do("disconnectFromDevices")
    else:
        assert walker.fails("connectToDevices") == -250988
    for resource in [Resource("device", name, device), *channels_of(device)]:
        write_properties(walker, resource, enums)
        run_commands(walker, resource, enums)
    use_registers(walker, device)
    lasting = use_areas(walker, device)
    walker.do("resetDevices")
    for area in areas_of(device):
        size = area.about["size"]
        assert walker.do("getNvmemBytes", address=0, size=size,
                         **area.one)["data"] == lasting[area.name]
        area.about["bytes"] = bytes(lasting[area.name]).hex()
    explore_device(walker, device, enums)
    walker.do("unreserveDevices")
    walker.do("reserveDevices", access="ReadOnly")
    assert walker.fails("resetDevices") == -250972
    walker.do("closeSession")


def use_chassis(walker, chassis):
    """Exercises the methods of a chassis. Gives it and its modules new names."""
    walker.open(devices=chassis["name"])
    by_slot = {module["slot"]: module["name"] for module in chassis["modules"]}
    for slot in range(1, 65):
        assert walker.do("getModuleName", slot_number=slot) == (
            {"module": by_slot[slot], "present": True} if slot in by_slot else {"present": False})
    assert walker.fails("GetChassisIpOrHostname") == -250964
    new_names = [f"Neu-Mod{module['slot']}" for module in chassis["modules"]]
    assert walker.do("renameChassisAndAllConnectedModules", old_chassis_name=chassis["name"],
                     new_chassis_name="Neu") == {"new_module_names": new_names,
                                                 "new_chassis_name": "Neu"}
    chassis["name"] = "Neu"
    for module, name in zip(chassis["modules"], new_names):
        module["name"] = name
    walker.do("closeSession")


def rename(walker, device):
    walker.open()
    new = f"{device['name']} neu"
    walker.do("renameDevice", device=device["name"], new_device_name=new)
    assert walker.fails("getProperty", property="Dev.Name", devices=device["name"]) == -250828
    device["name"] = new
    assert walker.read("Dev.Name", devices=new) == new
    walker.do("abortSession")
    walker.do("closeSession")


def walk(walker, description):
    enums = description["enums"]
    walker.open()
    assert "Session.Timeout" in walker.do("getSessionPropertyList")["properties"]
    for device in devices_of(description):
        explore_device(walker, device, enums)
    walker.do("closeSession")
    for device in devices_of(description):
        use_device(walker, device, enums)
    use_chassis(walker, description["devices"][0])
    for device in devices_of(description):
        rename(walker, device)
    walker.open()
    for device in devices_of(description):
        explore_device(walker, device, enums)
    walker.do("closeSession")


@SETTINGS
@given(description=descriptions())
def test_any_chassis_is_served(description):
    text = json.dumps(description, ensure_ascii=False).encode()
    with clean_host(("--chassis", "any.json"), {"any.json": text}) as host, Client(host) as client:
        walk(Walker(client), description)
