#!/usr/bin/python3
"""Write the description of the service that machines read, an OpenRPC 1.3 document.

usage: make_openrpc.py [--document FILE]

It is made of what make_methods.py makes its page of: the list of methods, the embedded schemas, the
status tables, methods.json and the recorded exchanges. The same sources always give the same
document. A fault of the sources is reported on standard error.
"""

import argparse
import json
import re
import sys
from pathlib import Path

import make_methods
from make_methods import Fault, exclusive_members, read_json, read_methods
from status_tables import read_statuses

DOCUMENT = Path(__file__).resolve().parent / "openrpc.json"
PROJECT = make_methods.ROOT / "CMakeLists.txt"
PROJECT_VERSION = re.compile(r"^project\(qitrmc VERSION ([0-9.]+)", re.MULTILINE)
# Members of the embedded schemas that choose an error text; other validators do not know them.
ERROR_TEXT_MEMBER = re.compile(r"ErrorDescription$")
# The code that stands in error.code where the precise one stands in error.data.
SERVER_ERROR = -32000
# These concern methods with a session_id alone.
SESSION_ERRORS = ("unknownSession", "qitrmcsim_unknownSession")
# These concern methods that use a device alone.
DEVICE_ERRORS = ("qitrmcsim_deviceRemoved", "qitrmcsim_connectionLost")
DEVICE_PARAMETERS = {"devices", "physical_channels", "nvmem_areas", "device", "physical_channel",
                     "nvmem_area", "old_chassis_name"}
MOST_REQUESTS_IN_BATCH = 100000

RULES = f"""\
JSON-RPC 2.0 over HTTP: a client posts one JSON text in UTF-8 to /qitrmc/Call and reads one back, with \
HTTP status 200 for successes and failures alike.

- There are no notifications: every request has an `id`, a string or a 32-bit integer.
- `params` is an object; parameters that are not listed are refused.
- A batch has 1 to {MOST_REQUESTS_IN_BATCH} requests. They are run in order, and a batch stops at its \
first failure: what follows is not run and answered with the error `skipped`.
- Integers have up to 64 bits and are written without decimal point and exponent.
- Errors of JSON-RPC itself stand in `error.code`. For every other one `error.code` is -32000, and \
`error.data` holds `qitrmc_code` and `qitrmc_message`. A message may be followed by details.
- `x-at-most-one-of` lists parameters of a method of which a request may name one."""


# Schemas


def published(schema):
    """A schema as other validators know it, with its references into this document."""
    if isinstance(schema, list):
        return [published(item) for item in schema]
    if not isinstance(schema, dict):
        return schema
    return {name: value.replace("#/definitions/", "#/components/schemas/") if name == "$ref"
            else published(value)
            for name, value in schema.items() if not ERROR_TEXT_MEMBER.search(name)}


def component_schemas(table):
    definitions = read_json(make_methods.SCHEMAS / "definitions.json")["definitions"]
    return published({**definitions, **table["definitions"]})


KINDS = {"string": {"type": "string"},
         "boolean": {"type": "boolean"},
         "array of strings": {"type": "array", "items": {"type": "string"}}}


def member_schema(method, name, kind, table):
    """The schema of one member of a result."""
    schemas = table["result_schemas"]
    for key in (f"{method}.{name}", name):
        if key in schemas:
            return published(schemas[key])
    return KINDS[kind]


def described(schema, meaning):
    # Whatever stands beside a reference does not count.
    return {**({"allOf": [schema]} if "$ref" in schema else schema), "description": meaning}


def result_schema(method, entry, table):
    optional = entry.get("optional", [])
    unknown = set(optional) - {name for name, *_ in entry["result"]}
    if unknown:
        raise Fault(f"{make_methods.TABLE}: {method} has no result member {', '.join(unknown)}")
    members = {name: described(member_schema(method, name, kind, table), meaning)
               for name, kind, meaning in entry["result"]}
    required = [name for name in members if name not in optional]
    return {"title": f"{method[0].upper()}{method[1:]}Result", "type": "object",
            "properties": members, "additionalProperties": False,
            **({"required": required} if required else {})}


# Methods


def params_of(schema, meanings):
    required = schema.get("required", [])
    params = [{"name": name, "description": meanings[name], "required": name in required,
               "schema": published(member)} for name, member in schema["properties"].items()]
    # The format requires mandatory parameters in front.
    return sorted(params, key=lambda param: not param["required"])


def example_of(method, exchange):
    params = json.loads(exchange["request"])["params"]
    result = json.loads(exchange["answer"])["result"]
    return {"name": f"{method} of the simulated chassis",
            "params": [{"name": name, "value": value} for name, value in params.items()],
            "result": {"name": "result", "value": result}}


def errors_of(schema, entry, table, statuses):
    """References to the errors of a method, in the order of the components."""
    common = [code for _, codes in table["common_errors"] for code in codes]
    wanted = {*common, *entry["errors"]}
    names = [status.constant for status in statuses if status.code in wanted]
    if "session_id" not in schema["properties"]:
        names = [name for name in names if name not in SESSION_ERRORS]
    if not DEVICE_PARAMETERS & set(schema["properties"]):
        names = [name for name in names if name not in DEVICE_ERRORS]
    return [{"$ref": f"#/components/errors/{name}"} for name in names]


def method_object(method, schema, table, exchange, statuses):
    entry = table["methods"][method]
    meanings = {**table["parameters"], **entry.get("parameters", {})}
    exclusive = exclusive_members(schema)
    return {"name": method, "summary": entry["purpose"], "paramStructure": "by-name",
            "params": params_of(schema, meanings),
            **({"x-at-most-one-of": exclusive} if exclusive else {}),
            "result": {"name": "result", "schema": result_schema(method, entry, table)},
            "errors": errors_of(schema, entry, table, statuses),
            "examples": [example_of(method, exchange)]}


# Errors


def component_errors(statuses):
    general = next(status for status in statuses if status.code == SERVER_ERROR)
    return {status.constant: error_object(status, general)
            for status in statuses if status.code < 0}


def stands_in_error_code(status):
    return status.raiser == "json-rpc" and status.constant != "skipped"


def error_object(status, general):
    text = " ".join(status.texts["eng"])
    if stands_in_error_code(status):
        return {"code": status.code, "message": text}
    return {"code": general.code, "message": " ".join(general.texts["eng"]),
            "data": {"qitrmc_code": status.code, "qitrmc_message": text}}


# The document


def document():
    """Return the document. Raises Fault when a source lacks something."""
    methods, table, statuses = read_methods(), read_json(make_methods.TABLE), read_statuses()
    exchanges = {exchange["method"]: exchange for exchange in read_json(make_methods.EXCHANGES)}
    version = PROJECT_VERSION.search(PROJECT.read_text(encoding="utf-8"))[1]
    try:
        objects = [method_object(name, schema, table, exchanges[name], statuses)
                   for name, schema in methods.items()]
    except KeyError as error:
        raise Fault(f"{make_methods.TABLE}: says nothing of {error}") from error
    return {"openrpc": "1.3.2",
            "info": {"title": "qitrmc", "version": version, "description": RULES,
                     "license": {"name": "Apache-2.0"}},
            "servers": [{"name": "scripts/run", "url": "http://127.0.0.1:8080/qitrmc/Call"}],
            "x-rules": {"notifications": False,
                        "batch": {"stops_at_first_failure": True, "skipped_error": "skipped",
                                  "most_requests": MOST_REQUESTS_IN_BATCH}},
            "methods": objects,
            "components": {"schemas": component_schemas(table), "errors": component_errors(statuses)}}


def document_text():
    return json.dumps(document(), ensure_ascii=False, indent=2) + "\n"


def main():
    parser = argparse.ArgumentParser(description=__doc__.partition("\n")[0])
    parser.add_argument("--document", type=Path, default=DOCUMENT, help="document to write")
    arguments = parser.parse_args()
    try:
        arguments.document.write_text(document_text(), encoding="utf-8")
    except Fault as fault:
        print(fault, file=sys.stderr)
        return 1
    return 0


if __name__ == "__main__":
    sys.exit(main())
