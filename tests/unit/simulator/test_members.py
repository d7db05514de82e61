"""Holds the members of chassis files and faults files together. The JSON Schemas are the table of
them: the readers take their lists of known members from there, and what the readers read and the
README lists must be the same."""

import copy
import re
import sys

import pytest

from load_probe import FAULTS, REPOSITORY, LoadProbe

sys.path.insert(0, str(REPOSITORY / "tests" / "support"))
from described_files import known_members, objects, validator  # noqa: E402

README = (REPOSITORY / "simulator" / "README.md").read_text(encoding="utf-8")
FILES = {"chassis": "chassis.schema.json", "faults": "faults.schema.json"}
OBJECTS = {title: (kind, node) for kind, file in FILES.items()
           for title, node in objects(file).items()}


def device(**members):
    return {"devices": [{"name": "A", "category": 1, **members}]}


def live(**motion):
    return device(live={"Dev.Temperature": motion})


def failing(**members):
    return device(commands={"C": {"fails": {"status": {"code": -1}, **members}}})


def entry(**members):
    return failing(status={"code": -1, "details": [members]})


D, C = ("devices", 0), ("devices", 0, "commands", "C")
MOVING = (*D, "live", "Dev.Temperature")
STATUS = (*C, "fails", "status")
ENTRY = (*STATUS, "details", 0)
WAVE = {"devices": [{"name": "A", "category": 2,
                     "properties": {"P": {"type": "DoubleArray", "value": []}},
                     "live": {"P": {"waveform": {"shape": "dc", "samples": 1, "sample_rate": 1}}}}]}

# A sound description with each object, and the path to it.
SAMPLES = {
    "chassis": (device(), ()),
    "driverProperties": ({"driver_properties": {}, **device()}, ("driver_properties",)),
    "device": (device(), D),
    "channels": (device(channels={"prefix": "ch", "count": 1}), (*D, "channels")),
    "nvmemArea": (device(nvmem_areas=[{"name": "u", "size": 4}]), (*D, "nvmem_areas", 0)),
    "registerBlock": (device(registers=[{"address": 0, "size": 4}]), (*D, "registers", 0)),
    "shown": (device(registers=[{"address": 0, "size": 4,
                                 "shows": {"property": "Dev.ProductNum"}}]),
              (*D, "registers", 0, "shows")),
    "motion": (live(noise=0), MOVING),
    "drift": (live(drift={"amplitude": 1, "period": 1}), (*MOVING, "drift")),
    "counts": ({"devices": [{"name": "A", "category": 2, "live": {"P": {"counts": {"per_second": 0}}},
                             "properties": {"P": {"type": "UInt32", "value": 0}}}]},
               (*D, "live", "P", "counts")),
    "follows": (live(follows={"property": "Dev.ProductNum"}), (*MOVING, "follows")),
    "waveform": (WAVE, (*D, "live", "P", "waveform")),
    "command": (device(commands={"C": {}}), C),
    "onDevice": (device(commands={"C": {"on_device": {}}}), (*C, "on_device")),
    "failure": (failing(), (*C, "fails")),
    "when": (failing(when={"property": "Dev.Comment", "is": "x"}), (*C, "fails", "when")),
    "status": (failing(), STATUS),
    "writtenStatus": (failing(status={"code": 1, "json": ""}), STATUS),
    "nestedStatus": (failing(status={"code": 1, "causes": [{"code": 2}]}), (*STATUS, "causes", 0)),
    "entry": (entry(usage="k", value=1), ENTRY),
    "usageItem": ({"enums": {"E": {}}, **entry(usage="k", item=1, enum="E")}, ENTRY),
    "usageValue": (entry(usage="k", value=1), ENTRY),
    "elaboration": (entry(elaboration="k"), ENTRY),
    "header": (entry(header="k"), ENTRY),
    "emptyLine": (entry(empty=True), ENTRY),
    "property": (device(properties={"P": {"type": "Double", "value": 1}}), (*D, "properties", "P")),
    "faults": ({}, ()),
    "fault": ({"faults": [{"delay": 0}]}, ("faults", 0)),
    "calls": ({"faults": [{"delay": 0, "calls": {}}]}, ("faults", 0, "calls")),
    "output": ({"faults": [{"output": {"count": 1}}]}, ("faults", 0, "output")),
    "event": ({"events": [{"device": "Mod1", "event": "pulled"}]}, ("events", 0)),
}


VALIDATORS = {kind: validator(file) for kind, file in FILES.items()}


@pytest.fixture(scope="module")
def probes():
    with LoadProbe() as chassis, LoadProbe(FAULTS) as faults:
        yield {"chassis": chassis, "faults": faults}


def with_member(title, member, value):
    description, path = SAMPLES[title]
    description = copy.deepcopy(description)
    node = description
    for key in path:
        node = node[key]
    node[member] = value
    return description


def test_each_object_has_a_sample():
    assert set(SAMPLES) == set(OBJECTS)


@pytest.mark.parametrize("title", SAMPLES)
def test_the_samples_are_sound(probes, title):
    kind, _ = OBJECTS[title]
    assert probes[kind].load(SAMPLES[title][0]) is None
    VALIDATORS[kind].validate(SAMPLES[title][0])


def test_an_entry_has_the_members_of_its_forms():
    forms = ("usageItem", "usageValue", "elaboration", "header", "emptyLine")
    assert set(OBJECTS["entry"][1]["properties"]) == {
        member for form in forms for member in OBJECTS[form][1]["properties"]}


# No member can be null, so a reader that takes it does not look.
@pytest.mark.parametrize("title, member", [
    (title, member) for title, (_, node) in OBJECTS.items() for member in node["properties"]
    if title != "entry"])
def test_the_reader_reads_each_member(probes, title, member):
    kind, _ = OBJECTS[title]
    description = with_member(title, member, None)
    fault = probes[kind].load(description)
    assert fault is not None, "the reader passes over it"
    assert "is not a known member" not in fault[1]
    assert not VALIDATORS[kind].is_valid(description)


@pytest.mark.parametrize("title", OBJECTS)
def test_an_unknown_member_is_refused(probes, title):
    kind, _ = OBJECTS[title]
    description = with_member(title, "colour", 1)
    assert "is not a known member" in probes[kind].load(description)[1]
    assert not VALIDATORS[kind].is_valid(description)


def reader_sources():
    for path in sorted((REPOSITORY / "simulator").glob("*/*.cpp")):
        text = path.read_text(encoding="utf-8")
        if "expectMembers" in text:
            yield path.name, text


def test_the_readers_look_for_no_other_members():
    names = {name for _, text in reader_sources()
             for name in re.findall(r'[.>](?:has|member|ifPresent)\("([^"]+)"', text)}
    assert len(names) > 60
    assert names - known_members(FILES["chassis"]) - known_members(FILES["faults"]) == set()


def test_the_readers_have_no_lists_of_their_own():
    lists = [(name, argument) for name, text in reader_sources()
             for argument in re.findall(r"\.expectMembers\(\s*([^\s)]+)", text)]
    assert len(lists) >= len(OBJECTS)
    assert [use for use in lists if not use[1].startswith("members::")] == []


# Forms of an entry or a status, which stand in one table.
WITHOUT_TABLE = {"writtenStatus", "nestedStatus", "usageItem", "usageValue", "elaboration",
                 "header", "emptyLine"}


def tables():
    """The rows of each table of the README that lists members: names, each with a star if it must
    be given."""
    for title, table in re.findall(r"<!-- members: (\w+) -->\n\n((?:\|.*\n)+)", README):
        rows = table.splitlines()
        assert rows[:2] == ["| Member | Meaning |", "|---|---|"], title
        yield title, [name + star for row in rows[2:]
                      for name, star in re.findall(r"`([^`]+)`(\*?)", row.split("|")[1])]


def test_the_readme_lists_each_object_once():
    titles = [title for title, _ in tables()]
    assert sorted(titles) == sorted(set(OBJECTS) - WITHOUT_TABLE)


@pytest.mark.parametrize("title", sorted(set(OBJECTS) - WITHOUT_TABLE))
def test_the_readme_lists_the_members(title):
    _, node = OBJECTS[title]
    required = node.get("required", [])
    listed = dict(tables())[title]
    assert len(listed) == len(set(listed))
    # What only the driver's own file has is not for readers.
    assert set(listed) == {name + ("*" if name in required else "")
                           for name, about in node["properties"].items()
                           if about.get("not") != {}}
