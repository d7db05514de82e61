"""What the JSON Schemas of chassis files and faults files say about the members of objects."""

import json
import pathlib
import sys

import jsonschema

SIMULATOR = pathlib.Path(__file__).resolve().parents[2] / "simulator"
sys.path.insert(0, str(SIMULATOR / "description"))
from list_members import closed_objects  # noqa: E402


def schema(name):
    return json.loads((SIMULATOR / "chassis" / name).read_text(encoding="utf-8"))


def objects(name):
    """The objects of a schema whose members are all known, by title."""
    return dict(closed_objects(schema(name)))


def known_members(name):
    return {member for node in objects(name).values() for member in node["properties"]}


def validator(name):
    """A schema that finds the others beside it."""
    base = "file:///"
    resolver = jsonschema.RefResolver(base + name, schema(name), {
        base + path.name: schema(path.name) for path in (SIMULATOR / "chassis").glob("*.schema.json")})
    return jsonschema.Draft7Validator(schema(name), resolver=resolver)
