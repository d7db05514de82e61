#!/usr/bin/python3
"""Write the page about the methods, or record the exchanges that it shows.

usage: make_methods.py [--page FILE]
       make_methods.py --record HOST

The page is generated from the sources of the program itself, so that it cannot differ from them:

    ../src/qitrmcwebsvc/methods.def   the methods and their order
    ../src/embedded/schemas           the parameters with their types and limits
    ../share/statuses                 the names of the error codes
    methods.json                      all other information: purposes, meanings, results, errors
    exchanges.json                    one recorded exchange of each method

With --record, HOST is the program qitrmc-host. For each exchange it is started with the built-in
chassis and receives the preparatory requests that methods.json lists. exchanges.json is replaced.

The page depends only on these sources. An error in them is reported on standard error.
"""

import argparse
import http.client
import json
import re
import subprocess
import sys
import urllib.parse
from pathlib import Path

HERE = Path(__file__).resolve().parent
ROOT = HERE.parent
METHODS = ROOT / "src" / "qitrmcwebsvc" / "methods.def"
SCHEMAS = ROOT / "src" / "embedded" / "schemas"
TABLE = HERE / "methods.json"
EXCHANGES = HERE / "exchanges.json"
PAGE = HERE / "methods.md"

sys.path.insert(0, str(ROOT / "share" / "statuses"))
from status_tables import SIMULATED_RAISER, read_statuses

METHOD_ROW = re.compile(r'QITRMC_METHOD\(\s*"(\w+)",\s*\w+,\s*"([\w.]+)"\s*\)')
# The id of the first session after a start of the host with the built-in chassis.
FIRST_SESSION = "_session1"
PATIENCE_SECONDS = 60
WITHOUT_RESOURCES = "Without any of them the session's default resources are meant."


class Fault(Exception):
    """A source lacks information for the page."""


def read_json(path):
    return json.loads(path.read_text(encoding="utf-8"))


def read_methods():
    """Return {method: params schema}, in the order of the list."""
    rows = METHOD_ROW.findall(METHODS.read_text(encoding="utf-8"))
    return {name: read_json(SCHEMAS / file)["properties"]["params"] for name, file in rows}


# The parameters


def limits_of(schema):
    """Describe the limits of a schema."""
    words = []
    if "pattern" in schema:
        words.append(f"matches `{schema['pattern']}`")
    if "enum" in schema:
        words.append("one of " + ", ".join(f"`{json.dumps(item)}`" for item in schema["enum"]))
    if "minimum" in schema and "maximum" in schema:
        words.append(f"{schema['minimum']} to {schema['maximum']}")
    elif "minimum" in schema:
        words.append(f"at least {schema['minimum']}")
    if "minItems" in schema:
        words.append(f"at least {schema['minItems']} element")
    if "items" in schema and limits_of(schema["items"]):
        words.append("each " + limits_of(schema["items"]))
    return ", ".join(words)


def type_of(schema, definitions):
    """Describe the type of a schema."""
    if "$ref" in schema:
        return type_of(resolved(schema, definitions), definitions)
    if "oneOf" in schema:
        return " or ".join(type_of(form, definitions) for form in schema["oneOf"])
    if "enum" in schema:
        return " or ".join(dict.fromkeys("string" if isinstance(item, str) else "number"
                                         for item in schema["enum"]))
    if schema["type"] == "array":
        return f"array of {type_of(schema['items'], definitions)}s"
    return schema["type"]


def resolved(schema, definitions):
    reference = schema.get("$ref")
    return definitions[reference.removeprefix("#/definitions/")] if reference else schema


def exclusive_members(schema):
    """Return the parameters of which a request may contain only one, in order."""
    return [form["required"][0] for form in schema.get("oneOf", []) if "required" in form]


def parameter_lines(schema, definitions, meanings):
    lines = ["| Parameter | Type | Required | Limits | Meaning |", "|---|---|---|---|---|"]
    for name, reference in schema["properties"].items():
        definition = resolved(reference, definitions)
        required = "yes" if name in schema.get("required", []) else "no"
        lines.append(f"| `{name}` | {type_of(definition, definitions)} | {required} | "
                     f"{limits_of(definition)} | {meanings[name]} |")
    exclusive = exclusive_members(schema)
    if exclusive:
        named = ", ".join(f"`{name}`" for name in exclusive)
        lines += ["", f"At most one of {named} may be given." +
                  (f" {WITHOUT_RESOURCES}" if "session_id" in schema["properties"] else "")]
    return lines


# The results and errors


def result_lines(result):
    if not result:
        return ["The result is an empty object."]
    lines = ["| Result member | Type | Meaning |", "|---|---|---|"]
    return lines + [f"| `{name}` | {kind} | {meaning} |" for name, kind, meaning in result]


def named_codes(codes, statuses):
    return ", ".join(f"{code} `{statuses[code].constant}`" for code in codes)


def error_lines(codes, statuses):
    """List codes with their names, those of the simulated driver separately."""
    simulated = [code for code in codes if statuses[code].raiser == SIMULATED_RAISER]
    real = [code for code in codes if code not in simulated]
    if not real:
        lines = ["Errors: the common ones."]
    else:
        lines = [f"Errors: the common ones, {named_codes(real, statuses)}."]
    if simulated:
        lines += ["", f"With the simulated driver also: {named_codes(simulated, statuses)}."]
    return lines


# The page


def section(name, schema, definitions, table, exchange, statuses):
    entry = table["methods"][name]
    meanings = {**table["parameters"], **entry.get("parameters", {})}
    parts = [[f"## {name}", "", entry["purpose"]],
             parameter_lines(schema, definitions, meanings),
             result_lines(entry["result"]),
             error_lines(entry["errors"], statuses),
             ["```json", exchange["request"], "```"],
             ["```json", exchange["answer"], "```"]]
    return "\n\n".join("\n".join(lines) for lines in parts)


def head(table, statuses, methods):
    index = "\n".join(f"- [`{name}`](#{name.lower()}): {table['methods'][name]['purpose']}"
                      for name in methods)
    common = "\n\n".join(f"{text} {named_codes(codes, statuses)}."
                         for text, codes in table["common_errors"])
    return "\n\n".join(["<!-- Generated by docs/make_methods.py. Change its sources, not this "
                        "page. -->", *table["head"], index, "## Errors of every method", common])


def page_text():
    """Return the page. Raises Fault when a source lacks something."""
    methods, table = read_methods(), read_json(TABLE)
    exchanges = {exchange["method"]: exchange for exchange in read_json(EXCHANGES)}
    definitions = read_json(SCHEMAS / "definitions.json")["definitions"]
    statuses = {status.code: status for status in read_statuses()}
    for source, names in ((TABLE, table["methods"]), (EXCHANGES, exchanges)):
        if list(names) != list(methods):
            raise Fault(f"{source}: holds {', '.join(names)}; the methods are "
                        f"{', '.join(methods)}")
    try:
        sections = [section(name, schema, definitions, table, exchanges[name], statuses)
                    for name, schema in methods.items()]
        return "\n\n".join([head(table, statuses, methods), *sections]) + "\n"
    except KeyError as error:
        raise Fault(f"{TABLE}: says nothing of {error}") from error


# The exchanges


def request_text(method, params, id):
    if method != "initializeSession":
        params = {"session_id": FIRST_SESSION, **params}
    return json.dumps({"jsonrpc": "2.0", "id": id, "method": method, "params": params},
                      ensure_ascii=False)


def play(method, entry, ask):
    """Return the exchange of a method with a newly started host. ask(body) posts a text and returns
    the text of the response."""
    for number, (step, params) in enumerate(entry["before"], start=1):
        answer = json.loads(ask(request_text(step, params, number)))
        if "result" not in answer:
            raise Fault(f"{step} before {method}: {answer}")
    request = request_text(method, entry["params"], len(entry["before"]) + 1)
    return {"method": method, "request": request, "answer": ask(request)}


def post(url, body):
    connection = http.client.HTTPConnection(url.hostname, url.port, timeout=PATIENCE_SECONDS)
    try:
        connection.request("POST", url.path, body.encode("utf-8"))
        return connection.getresponse().read().decode("utf-8")
    finally:
        connection.close()


def record(program, method, entry):
    with subprocess.Popen([program, "--listen", "127.0.0.1:0"], stdout=subprocess.PIPE,
                          text=True) as host:
        try:
            url = urllib.parse.urlsplit(host.stdout.readline().split()[-1])
            return play(method, entry, lambda body: post(url, body))
        finally:
            host.terminate()


def write_exchanges(program):
    entries = read_json(TABLE)["methods"]
    exchanges = [record(program, method, entries[method]) for method in read_methods()]
    text = json.dumps(exchanges, ensure_ascii=False, indent=2) + "\n"
    EXCHANGES.write_text(text, encoding="utf-8")


def main():
    parser = argparse.ArgumentParser(description=__doc__.partition("\n")[0])
    parser.add_argument("--page", type=Path, default=PAGE, help="page to write")
    parser.add_argument("--record", metavar="HOST", help="program that serves the exchanges")
    arguments = parser.parse_args()
    try:
        if arguments.record:
            write_exchanges(arguments.record)
        else:
            arguments.page.write_text(page_text(), encoding="utf-8")
    except Fault as fault:
        print(fault, file=sys.stderr)
        return 1
    return 0


if __name__ == "__main__":
    sys.exit(main())
