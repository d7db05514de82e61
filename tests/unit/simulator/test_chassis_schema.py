"""Compares the JSON Schema of chassis files with the loader: the loader refuses what the schema
refuses, and accepts what the schema accepts, except for the rules that a schema cannot
express."""

import json
import re
import sys

import jsonschema
import pytest
from hypothesis import HealthCheck, given, settings
from hypothesis import strategies as st

from examples import examples
from load_probe import CHASSIS, REPOSITORY, LoadProbe

sys.path.insert(0, str(REPOSITORY / "tests" / "support"))
from chassis_descriptions import descriptions, edited  # noqa: E402

SCHEMA = json.loads((CHASSIS / "chassis.schema.json").read_text(encoding="utf-8"))
VALIDATOR = jsonschema.Draft7Validator(SCHEMA)

SETTINGS = settings(deadline=None, database=None, derandomize=True,
                    suppress_health_check=list(HealthCheck))

# What the loader reports where a description follows the schema but is still wrong, by rule. The
# patterns match the JSON pointer, a blank, and the message.
BEYOND_A_SCHEMA = {
    "names differ": r'and there is a device "|has a channel or an area of this name already',
    "names have 64 bytes": r"a name has at most 64 bytes",
    "slots hold one module": r"is the slot of ",
    "enumerations exist": r"is not a known enumeration|no item of the enumeration",
    "limits hold": r"must be within the limits|and above max",
    "driver properties keep their meaning":
        r"is not a property whose value can be given|is defined already|"
        r"is no name for a property of its own",
    "values have the type of their property": r"/(values|system_values|session_values|sets|adds|when)/"
                                              r"\S+ (is|holds) ",
    "what moves is there and suits":
        r"is not a stored property of|is not a known resource|does not suit a property|"
        r"counts in a property that can be written|moves an enumeration|follows itself|"
        r"follows a property that moves itself|follows over more than",
    "commands act on what is there": r"is not a stored property|cannot be added to",
    "causes end": r"is nested too deep",
    "registers act on what is there and suits":
        r"does not divide the block|is not a command of the device|is not a part of the device|"
        r"can only be written|cannot be shown|does not have the size of the registers",
    "registers do not overlap": r"which overlap other registers or pass",
    "bytes fit": r"has \d+ digits; .* for this size",
    "a serial number to compare with": r"asks for a serial number",
    "whole numbers are written without a point": r"is -?[0-9.]+(\.0|e\+?[0-9]+); must be a whole",
}


@pytest.fixture(scope="module")
def probe():
    with LoadProbe() as running:
        yield running


def follows_schema(description):
    return VALIDATOR.is_valid(description)


def assert_agreement(probe, description):
    fault = probe.load(description)
    if not follows_schema(description):
        assert fault is not None, "the schema refuses what the loader takes"
    elif fault is not None:
        said = " ".join(fault)
        assert any(re.search(rule, said) for rule in BEYOND_A_SCHEMA.values()), said


def members_described(node, path="schema"):
    """Every place of the schema that defines a member must have a description."""
    if isinstance(node, list):
        for item in node:
            yield from members_described(item, path)
    elif isinstance(node, dict):
        for name, member in node.get("properties", {}).items():
            if isinstance(member, dict) and "then" not in path:
                yield f"{path}/{name}", "description" in member
        for name, child in node.items():
            if name not in ("if", "then", "description"):
                yield from members_described(child, f"{path}/{name}")


def test_the_schema_is_valid_and_describes_every_member():
    jsonschema.Draft7Validator.check_schema(SCHEMA)
    told = dict(members_described({name: value for name, value in SCHEMA.items()}))
    assert len(told) > 40
    rules = ("/allOf/",)
    assert [place for place, described in told.items()
            if not described and not any(rule in place for rule in rules)] == []


@pytest.mark.parametrize("name", ["bench", "small", "full"])
def test_the_shipped_descriptions_follow_the_schema(probe, name):
    text = (CHASSIS / f"{name}.json").read_text(encoding="utf-8")
    VALIDATOR.validate(json.loads(text))
    assert probe.load(text) is None


def device(**members):
    return {"devices": [{"name": "A", "category": 1, **members}]}


def prop(**members):
    return device(properties={"P": members})


def driver_prop(kind, **members):
    return {"driver_properties": {kind: {"P": members}}, "devices": []}


def area(**members):
    return device(nvmem_areas=[{"name": "u", "size": 4, **members}])


def module(**members):
    return device(modules=[{"name": "B", "category": 2, "slot": 1, **members}])


def failing(**members):
    return device(commands={"C": {"fails": members}})


def entry(**members):
    return failing(status={"code": -1, "details": [members]})


def block(**members):
    return device(registers=[{"address": 0, "size": 4, **members}], commands={"C": {}})


SOUND = [
    failing(status={"code": -1}), failing(status={"code": 1, "json": "no JSON"}),
    failing(status={"code": 1, "constant": "c", "details": [], "causes": [{"code": 2}]}),
    failing(status={"code": 1}, every=4294967295, probability=0.5),
    failing(status={"code": 1}, when={"property": "Dev.Comment", "is": "x"}),
    entry(usage="k", value="text"), entry(usage="k", value=5), entry(usage="k", value=["a"]),
    entry(elaboration="k"), entry(header="k"), entry(empty=True),
    {"enums": {"E": {}}, **entry(usage="k", item=-1, enum="E")},
    device(commands={"C": {"on_device": {"sets": {"Dev.Comment": "x"}}}}),
    block(name="Control", description="Starts and stops."), block(description=""),
    block(access="WriteOnly"), block(width=32), block(on_read="clear", on_write="ones_clear"),
    block(runs="C"), block(shows="Dev.ProductNum"), block(shows={"property": "Dev.ProductNum"}),
    {"devices": []}, device(), device(modules=[]), module(), module(slot=64),
    {"$schema": "", "devices": []}, {"first_session_handle": 4294967295, "devices": []},
    {"enums": {"E": {}}, "devices": []}, {"enums": {"E": {"a": -2147483648}}, "devices": []},
    {"enums": {"E": {"a": 1}}, **prop(type="Int32", enum="E", value="a")},
    {"enums": {"E": {"a": 1}}, **prop(type="Int32Array", enum="E", value=["a", 1])},
    prop(type="Int32", value=-2147483648), prop(type="UInt32", value=4294967295),
    prop(type="Int64", value=-2**63), prop(type="UInt64", value=2**64 - 1),
    prop(type="Double", value=1), prop(type="Double", value=2**70), prop(type="Double", value=1e300),
    prop(type="DoubleArray", value=[]), prop(type="String", value=""),
    prop(type="Bool", value=False, access="WriteOnly", needs_commit=True),
    prop(type="UInt64", value=5, min=5, max=5, unit="s", description="d", document="e"),
    driver_prop("device", type="Bool"), driver_prop("device", type="Bool", needs_commit=True),
    driver_prop("system", type="Bool", lasting=True), prop(type="Bool", value=True, lasting=True),
    driver_prop("session", type="Bool", lasting=False),
    driver_prop("system", type="Bool", needs_commit=False), {"driver_properties": {}, "devices": []},
    device(commands={"C": {}}), device(commands={"C": {"seconds": 86400, "resets": True}}),
    device(commands={"C": {"sets": {"Dev.Comment": "x"}, "adds": {"Dev.Temperature": 0.5}}}),
    device(channels={"prefix": "ch", "count": 1024}), device(channels={"prefix": "a b", "count": 1}),
    device(channels={"prefix": "a1b", "count": 1}), area(), area(size=16777216),
    area(name="u10"), area(name="u0"), area(name="0"), area(bytes="", password=""),
    area(bytes="aAfF0099"), device(registers=[{"address": 4294967295, "size": 1}]),
    device(registers=[{"address": 0, "size": 2, "bytes": "00", "access": "ReadOnly"}]),
    device(connect_seconds=0.5, reachable=False), device(values={"Dev.Comment": "ä"}),
    device(live={}), device(live={"Dev.Temperature": {"noise": 0}}), {"seed": 2**64 - 1, "devices": []},
    device(live={"Dev.Temperature": {"drift": {"amplitude": 1, "period": 0.001}, "noise": 1}}),
    device(live={"Dev.Temperature": {"follows": {"property": "Dev.ProductNum", "factor": -1,
                                                 "offset": 2, "time_constant": 0}}}),
    device(live={"Dev.Temperature": {"follows": {"property": "Dev.Temperature", "resource": "no",
                                                 "optional": True}}}),
    {"devices": [{"name": "A", "category": 2, "live": {"P": {"counts": {"per_second": 0}}},
                  "properties": {"P": {"type": "UInt32", "value": 0}}}]},
    {"devices": [{"name": "A", "category": 2, "properties": {"P": {"type": "DoubleArray", "value": []}},
                  "live": {"P": {"noise": 1, "waveform": {"shape": "dc", "samples": "Dev.ProductNum",
                                                          "sample_rate": 1}}}}]},
    device(name="x" * 64), device(name="a b"), device(category=-5), device(name="Ünit-1_%"),
]


@pytest.mark.parametrize("description", SOUND, ids=json.dumps)
def test_both_accept_valid_descriptions(probe, description):
    assert probe.load(description) is None
    assert follows_schema(description)


BROKEN = [
    failing(), failing(status={}), failing(status={"code": 0}), failing(status={"code": "1"}),
    failing(status={"code": 1}, every=0), failing(status={"code": 1}, probability=1.5),
    failing(status={"code": 1}, when={}), failing(status={"code": 1}, when={"property": "P"}),
    failing(status={"code": 1, "json": 5}), failing(status={"code": 1, "json": "", "details": []}),
    failing(status={"code": 1, "causes": [{}]}), failing(status={"code": 1, "constant": 1}),
    failing(status={"code": 1, "causes": [{"code": 1, "json": ""}]}), failing(status={"code": 2**31}),
    failing(status={"code": 1}, colour=1), device(commands={"C": {"on_device": {"resets": True}}}),
    entry(), entry(usage="k"), entry(usage="", value=1), entry(usage="k", value=-1),
    entry(usage="k", value=[1]), entry(usage="k", item=1), entry(usage="k", enum="E"),
    entry(usage="k", item=1, enum="E", value=1), entry(elaboration=""), entry(elaboration=1),
    entry(elaboration="k", header="k"), entry(header="k", empty=True), entry(empty=False),
    entry(empty=1), block(access="Read"), block(width=24), block(width=1), block(width="8"),
    block(on_read="ones_clear"), block(on_write=True), block(runs=5), block(shows=5),
    block(access="ReadOnly", runs="C"), block(access="ReadOnly", on_write="ones_clear"),
    block(access="WriteOnly", on_read="clear"), block(shows="Dev.ProductNum", bytes="00"),
    block(shows="Dev.ProductNum", runs="C"), block(shows={}), block(shows={"property": 1}),
    block(shows={"property": "Dev.ProductNum", "colour": 1}),
    [], 5, None, {}, {"devices": {}}, {"devices": [5]}, {"devices": [{}]}, {"devices": [], "x": 1},
    {"$schema": 1, "devices": []}, {"first_session_handle": 0, "devices": []},
    {"first_session_handle": 2**32, "devices": []}, {"first_session_handle": True, "devices": []},
    {"enums": [], "devices": []}, {"enums": {"E": []}, "devices": []},
    {"enums": {"E": {"a": 2**31}}, "devices": []}, {"enums": {"E": {"a": 0.5}}, "devices": []},
    {"enums": {"": {}}, "devices": []}, {"enums": {"E": {"": 1}}, "devices": []},
    {"enums": {"E": {"a\0": 1}}, "devices": []},
    device(name=""), device(name=" x"), device(name="x "), device(name="x,"), device(name="x/y"),
    device(name="x:y"), device(name="$x"), device(name="x\n"), device(name="x\x7f"),
    device(name="x" * 65), device(name=None), device(name="x\0"), device(category="1"),
    device(category=2**31), device(category=1.5), device(slot=1), device(modules={}),
    {"devices": [{"name": "A", "category": 2, "modules": []}]}, module(slot=0), module(slot=65),
    module(category=1, modules=[]), device(modules=[{"name": "B", "category": 2}]),
    device(colour=1), device(reachable=0), device(connect_seconds=-1), device(connect_seconds=86401),
    device(connect_seconds="1"), device(values=[]), device(values={"Dev.Comment": {}}),
    device(values={"Dev.Comment": None}), device(values={"Dev.Comment": "a\0"}),
    device(properties=[]), device(properties={"P": []}), device(properties={"": {}}),
    prop(), prop(type="Bool"), prop(value=1), prop(type="Float", value=1), prop(type=1, value=1),
    prop(type="bool", value=True), prop(type="Bool", value=0), prop(type="Bool", value="true"),
    prop(type="BoolArray", value=True), prop(type="Bool", value=[]),
    prop(type="BoolArray", value=[1]), prop(type="Double", value="1"), prop(type="Int32", value=2**31),
    prop(type="Int32", value=1.5), prop(type="Int32", value="a"), prop(type="Int32Array", value=["a"]),
    prop(type="UInt32", value=-1), prop(type="UInt32", value=2**32), prop(type="Int64", value=2**63),
    prop(type="UInt64", value=-1), prop(type="UInt64", value=2**64), prop(type="String", value=1),
    prop(type="String", value="\0"), prop(type="StringArray", value=[1]),
    prop(type="Bool", value=True, min=0), prop(type="String", value="", max=1),
    prop(type="Int32", value=1, min=0.5), prop(type="UInt32", value=1, min=-1),
    prop(type="Double", value=1, min="0"), prop(type="UInt32", value=1, enum="E"),
    prop(type="Int32", value=1, enum=1), prop(type="Bool", value=True, access="Read"),
    prop(type="Bool", value=True, needs_commit=1), prop(type="Bool", value=True, unit=1),
    prop(type="Bool", value=True, description="\0"), prop(type="Bool", value=True, document=[]),
    prop(type="Bool", value=True, computed=False), prop(type="Bool", value=True, colour=1),
    driver_prop("devices", type="Bool"), driver_prop("system", type="Bool", needs_commit=True),
    driver_prop("session", type="Bool", needs_commit=True), driver_prop("device"),
    driver_prop("session", type="Bool", lasting=True), prop(type="Bool", value=True, lasting=1),
    driver_prop("device", type="Bool", computed=True), {"driver_properties": [], "devices": []},
    {"system_values": [], "devices": []}, {"session_values": {"Session.Comment": {}}, "devices": []},
    device(commands=[]), device(commands={"C": 1}), device(commands={"": {}}),
    device(commands={"C": {"seconds": -1}}), device(commands={"C": {"seconds": 86401}}),
    device(commands={"C": {"resets": 1}}), device(commands={"C": {"sets": []}}),
    device(commands={"C": {"adds": {"Dev.Temperature": "1"}}}), device(commands={"C": {"x": 1}}),
    device(commands={"C": {"sets": {"Dev.Comment": {}}}}), device(channels=[]), device(channels={}),
    device(channels={"prefix": "ch"}), device(channels={"count": 1}),
    device(channels={"prefix": "ch", "count": 0}), device(channels={"prefix": "ch", "count": 1025}),
    device(channels={"prefix": "ch1", "count": 1}), device(channels={"prefix": "", "count": 1}),
    device(channels={"prefix": "a/b", "count": 1}), device(channels={"prefix": "c", "count": 1, "x": 1}),
    device(nvmem_areas={}), device(nvmem_areas=[{"name": "u"}]), device(nvmem_areas=[{"size": 1}]),
    area(size=0), area(size=16777217), area(name="u01"), area(name="01"), area(name="u/1"),
    area(bytes="0"), area(bytes="0g"), area(bytes=[1]), area(access="WriteOnly"),
    area(serial_number_wanted=1), area(password=1), area(commands={}), area(colour=1),
    {"seed": -1, "devices": []}, {"seed": 2**64, "devices": []}, device(live=[]),
    *[device(live={"Dev.Temperature": motion}) for motion in [
        {}, 5, {"noise": -1}, {"noise": "1"}, {"colour": 1}, {"drift": {}},
        {"drift": {"amplitude": 1}}, {"drift": {"period": 1}},
        {"drift": {"amplitude": -1, "period": 1}}, {"drift": {"amplitude": 1, "period": 0}},
        {"follows": {}}, {"follows": {"property": 5}}, {"follows": "Dev.Temperature"},
        {"follows": {"property": "Dev.ProductNum", "time_constant": -1}},
        {"follows": {"property": "Dev.ProductNum", "optional": 1}},
        {"follows": {"property": "Dev.ProductNum", "factor": "1"}},
        {"follows": {"property": "P", "resource": "no", "optional": True, "while": 5}},
        {"follows": {"property": 5, "resource": "no", "optional": True}}, {"counts": {}},
        {"counts": {"per_second": -1}}, {"counts": {"per_second": 1}, "noise": 1},
        {"waveform": {}}, {"waveform": {"shape": "dc", "samples": 1}},
        {"waveform": {"shape": "Sine", "samples": 1, "sample_rate": 1}},
        {"waveform": {"shape": "dc", "samples": 1048577, "sample_rate": 1}},
        {"waveform": {"shape": "dc", "samples": 1, "sample_rate": 0}},
        {"waveform": {"shape": "dc", "samples": 1, "sample_rate": 1}, "drift": {}}]],
    device(registers={}), device(registers=[{}]), device(registers=[{"address": 0}]),
    device(registers=[{"size": 1}]), device(registers=[{"address": -1, "size": 1}]),
    device(registers=[{"address": 2**32, "size": 1}]), device(registers=[{"address": 0, "size": 0}]),
    device(registers=[{"address": 0, "size": 1, "bytes": "0x"}]),
    block(name=""), block(name=1), block(description=1), block(description="\0"), block(title="x"),
]


@pytest.mark.parametrize("description", BROKEN, ids=json.dumps)
def test_both_refuse_invalid_descriptions(probe, description):
    assert probe.load(description) is not None
    assert not follows_schema(description)


def nested(depth):
    return {"code": 1, **({"causes": [nested(depth - 1)]} if depth else {})}


# A description for each rule that a schema cannot express.
ONLY_LOADED = {
    "names differ": {"devices": [{"name": "A", "category": 2}, {"name": "a", "category": 2}]},
    "names have 64 bytes": device(name="ä" * 33),
    "slots hold one module": device(modules=[{"name": "B", "category": 2, "slot": 1},
                                             {"name": "C", "category": 2, "slot": 1}]),
    "enumerations exist": prop(type="Int32", enum="E", value=1),
    "limits hold": prop(type="Int32", min=2, value=1),
    "driver properties keep their meaning": device(values={"Dev.Name": "B"}),
    "values have the type of their property": device(values={"Dev.Comment": 5}),
    "what moves is there and suits": device(live={"P": {"noise": 1}}),
    "commands act on what is there": device(commands={"C": {"sets": {"P": 1}}}),
    "causes end": device(commands={"C": {"fails": {"status": nested(17)}}}),
    "registers act on what is there and suits": device(registers=[{"address": 0, "size": 1,
                                                                   "runs": "C"}]),
    "registers do not overlap": device(registers=[{"address": 0, "size": 1}] * 2),
    "bytes fit": area(bytes="0011223344"),
    "a serial number to compare with": area(serial_number_wanted=True),
    "whole numbers are written without a point": device(category=1.0),
}


@pytest.mark.parametrize("rule", BEYOND_A_SCHEMA)
def test_some_rules_are_left_to_the_loader(probe, rule):
    description = ONLY_LOADED[rule]
    assert follows_schema(description)
    assert re.search(BEYOND_A_SCHEMA[rule], " ".join(probe.load(description)))


@settings(SETTINGS, max_examples=examples(40))
@given(description=descriptions(moving=True))
def test_any_valid_description_loads(probe, description):
    assert probe.load(description) is None
    VALIDATOR.validate(description)


@settings(SETTINGS, max_examples=examples(150))
@given(description=edited())
def test_both_agree_on_any_edited_description(probe, description):
    assert_agreement(probe, description)


@pytest.mark.parametrize("name", ["bench", "small"])
def test_both_agree_on_edits_of_a_shipped_description(probe, name):
    shipped = json.loads((CHASSIS / f"{name}.json").read_text(encoding="utf-8"))

    @settings(SETTINGS, max_examples=examples(20))
    @given(description=edited(st.just(shipped)))
    def agree(description):
        assert_agreement(probe, description)

    agree()
