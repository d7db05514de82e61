"""Compares the schema files with the model of the parameters."""

import json
import re
import sys
from pathlib import Path

import pytest

sys.path.insert(0, str(Path(__file__).parent))
from parameter_model import (  # noqa: E402
    DEFINITIONS,
    INLINE,
    METHODS,
    Bytes,
    Choice,
    Flag,
    Number,
    OneOrMore,
    PropertyValue,
    Text,
)

SOURCE = Path(__file__).resolve().parents[3] / "src"
SCHEMAS = SOURCE / "embedded" / "schemas"
DRAFT_4 = "http://json-schema.org/draft-04/schema#"


def load(name: str):
    return json.loads((SCHEMAS / name).read_text(encoding="ascii"))


def reference(name: str) -> dict:
    return {"$ref": f"#/definitions/{name}"}


def array_of(items: dict) -> dict:
    return {"type": "array", "items": items}


def expected_definition(shape) -> dict:
    title = {"title": shape.title} if getattr(shape, "title", None) else {}
    match shape:
        case Text(session_id=True):
            return {
                "type": "string",
                "pattern": "^_session[0-9]+$",
                "patternErrorDescription": "InvalidSessionIdFormat",
            }
        case Text():
            return {**title, "type": "string"}
        case Number():
            limits = {"minimum": shape.minimum, "maximum": shape.maximum}
            stated = {name: limit for name, limit in limits.items() if limit is not None}
            return {"type": "integer" if shape.integer else "number", **stated}
        case Choice():
            return {"enum": list(shape.items)}
        case Flag():
            return {"type": "boolean"}
        case OneOrMore():
            single = reference(shape.single)
            return {
                **title,
                "oneOf": [single, array_of(single)],
                "oneOfErrorDescription": shape.description,
            }
        case PropertyValue():
            scalars = [{"type": name} for name in ("boolean", "number", "string")]
            return {
                "oneOf": scalars + [array_of(scalar) for scalar in scalars],
                "oneOfErrorDescription": "WrongPropertyType",
            }
        case Bytes():
            return {
                **array_of({"type": "integer", "minimum": 0, "maximum": 255}),
                "minItems": 1,
                "minItemsErrorDescription": "EmptyArray",
            }


def expected_params(method) -> dict:
    params = {
        "type": "object",
        "properties": {
            member: reference(definition) if definition else expected_definition(INLINE[member])
            for member, definition in method.members.items()
        },
        "additionalProperties": False,
    }
    if method.required:
        params["required"] = method.required
    if method.rule:
        none_of_them = {"properties": {member: {"not": {}} for member in method.rule.members}}
        params["oneOf"] = [{"required": [member]} for member in method.rule.members]
        params["oneOf"].append(none_of_them)
        params["oneOfErrorDescription"] = method.rule.description
    return params


def expected_schema(method) -> dict:
    schema = {
        "$schema": DRAFT_4,
        "properties": {
            "method": {"type": "string", "pattern": f"^{method.name}$"},
            "params": expected_params(method),
        },
    }
    if method.name != "initializeSession":
        schema["required"] = ["params"]
    return schema


def in_order(value):
    """The value with its objects as lists of pairs, so that a comparison sees their order."""
    if isinstance(value, dict):
        return [(name, in_order(member)) for name, member in value.items()]
    if isinstance(value, list):
        return [in_order(element) for element in value]
    return value


def schemas_within(value):
    if isinstance(value, dict):
        yield value
        for member in value.values():
            yield from schemas_within(member)
    elif isinstance(value, list):
        for element in value:
            yield from schemas_within(element)


ALL_FILES = ["definitions.json"] + [method.file for method in METHODS]


def test_there_is_one_schema_for_each_method_and_no_other_file():
    assert sorted(path.name for path in SCHEMAS.iterdir()) == sorted(ALL_FILES)


@pytest.mark.parametrize("method", METHODS, ids=lambda method: method.name)
def test_schema_of_method_equals_the_model_in_content_and_order(method):
    assert in_order(load(method.file)) == in_order(expected_schema(method))


def test_definitions_equal_the_model_in_content_and_order():
    expected = {name: expected_definition(shape) for name, shape in DEFINITIONS.items()}
    definitions = load("definitions.json")
    assert list(definitions) == ["$schema", "definitions"]
    assert definitions["$schema"] == DRAFT_4
    assert in_order(definitions["definitions"]) == in_order(expected)


# A reference to nothing, or a pattern that cannot be parsed, would silently accept any value.


@pytest.mark.parametrize("name", ALL_FILES)
def test_every_reference_resolves(name):
    known = {f"#/definitions/{entry}" for entry in load("definitions.json")["definitions"]}
    found = [schema["$ref"] for schema in schemas_within(load(name)) if "$ref" in schema]
    assert found
    assert set(found) <= known


@pytest.mark.parametrize("name", ALL_FILES)
def test_every_pattern_consists_of_anchors_and_one_repeated_class(name):
    patterns = [
        schema["pattern"] for schema in schemas_within(load(name)) if "pattern" in schema
    ]
    assert patterns
    for pattern in patterns:
        assert re.fullmatch(r"\^\w+(\[0-9\]\+)?\$", pattern)


@pytest.mark.parametrize("name", ALL_FILES)
def test_every_description_that_is_named_exists(name):
    table = (SOURCE / "qitrmcwebsvcerr" / "descriptions.tsv").read_text(encoding="ascii")
    known = {line.split("\t")[0] for line in table.splitlines()}
    for schema in schemas_within(load(name)):
        for keyword, value in schema.items():
            if keyword.endswith("ErrorDescription"):
                assert value in known
                assert keyword.removesuffix("ErrorDescription") in schema
