"""Holds the JSON Schema of faults files and their reader together."""

import json
import re
import sys

import jsonschema
import pytest

from load_probe import FAULTS, REPOSITORY, LoadProbe

sys.path.insert(0, str(REPOSITORY / "tests" / "support"))
from described_files import schema, validator  # noqa: E402

VALIDATOR = validator("faults.schema.json")


@pytest.fixture(scope="module")
def probe():
    with LoadProbe(FAULTS) as running:
        yield running


def fault(**members):
    return {"faults": [members]}


def delay(**members):
    return fault(delay=0, **members)


def output(**members):
    return fault(output=members)


def event(**members):
    return {"events": [{"device": "Mod1", "event": "pulled", **members}]}


def test_the_schema_is_one():
    jsonschema.Draft7Validator.check_schema(schema("faults.schema.json"))


SOUND = [
    {}, {"$schema": "", "seed": 4294967295, "faults": [], "events": []}, delay(),
    delay(function="*"), delay(function="abortSession"), delay(function="getGeneric*"),
    delay(method="getProperty"), delay(method="GetChassisIpOrHostname"), delay(resource="Mod1/ch0"),
    delay(calls={"first": 1, "count": 4294967295, "every": 2}), delay(probability=0),
    delay(after=0.5, lasts=86400), fault(delay=86400), fault(status={"code": -1}, moment="before"),
    fault(status={"code": -1, "json": "x"}, moment="after"), fault(status={"code": 1}),
    fault(status={"code": 1}, output={"count": 1}), output(null=True), output(null_items=True),
    output(null=True, count=4294967295), output(text_size=1073741824), output(count=16777216),
    output(null=False, text_size=0), event(), event(event="connection_lost", after=0, lasts=1),
]


@pytest.mark.parametrize("description", SOUND, ids=json.dumps)
def test_both_take_what_is_sound(probe, description):
    assert probe.load(description) is None
    VALIDATOR.validate(description)


BROKEN = [
    [], 5, {"colour": 1}, {"$schema": 5}, {"seed": -1}, {"seed": 4294967296}, {"seed": 1.5},
    {"faults": {}}, {"faults": [5]}, {"events": [{}]}, fault(), fault(function="abortSession"),
    delay(colour=1), delay(function=5), delay(method=5), delay(resource=5),
    delay(function="getNvmemBytes", method="getNvmemBytes"), delay(calls=[]),
    delay(calls={"first": 0}), delay(calls={"count": 4294967296}), delay(calls={"every": "2"}),
    delay(calls={"last": 1}), delay(probability=1.5), delay(probability="1"), delay(after=-1),
    delay(after="1"), delay(lasts=86401), delay(lasts=True), fault(delay=-1), fault(delay="1"),
    fault(status={}), fault(status={"code": 0}), fault(status={"code": -1, "causes": [{}]}),
    fault(status={"code": -1}, moment="later"), delay(moment="after"),
    fault(status={"code": 1}, moment="after"), fault(status={"code": -1}, output={"count": 1}),
    output(), output(colour=1), output(null=False), output(null=True, null_items=True),
    output(null=True, text_size=1), output(null_items=True, text_size=1), output(null=1),
    output(text_size=1073741825), output(count=16777217), output(count=-1),
    output(null=True, count=4294967296), event(device=5), event(event="burnt"), event(after=-1),
    event(lasts="1"), event(colour=1), {"events": [{"device": "Mod1"}]},
    {"events": [{"event": "pulled"}]},
]


@pytest.mark.parametrize("description", BROKEN, ids=json.dumps)
def test_both_refuse_what_is_broken(probe, description):
    assert probe.load(description) is not None
    assert not VALIDATOR.is_valid(description)


# What only the reader can tell.
BEYOND_A_SCHEMA = [
    (delay(function="abortSesion"), 'perhaps "abortSession" is meant'),
    (delay(function="nQITRMCAPI100_closeSession"), 'perhaps "closeSession" is meant'),
    (delay(method="getproperty"), 'perhaps "getProperty" is meant'),
    (delay(method="abort*"), "is not a method of the service"),
    (delay(resource="Mod3"), "is not a resource of the chassis"),
    (event(device="Mod3"), "is not a device of the chassis"),
    (event(device="Bench"), "befalls a device that is no module"),
    (output(count=2, text_size=536870913), "is too large"),
    (fault(status={"code": 1, "details": [{"usage": "k", "item": 1, "enum": "No"}]}),
     "is not a known enumeration"),
    ({"seed": 1.0}, "whole number"),
]


@pytest.mark.parametrize("description, words", BEYOND_A_SCHEMA,
                         ids=[row[1] for row in BEYOND_A_SCHEMA])
def test_some_rules_are_left_to_the_reader(probe, description, words):
    assert re.search(re.escape(words), probe.load(description)[1])
    VALIDATOR.validate(description)
