"""docs/openrpc.json describes the service: it is up to date, valid, and fits what the service does."""

import copy
import json
import subprocess
import sys

import jsonschema
import pytest

from hostlib import ROOT
from npm_packages import FILES, PROJECT, exported_by

DOCS = ROOT / "docs"
sys.path.insert(0, str(DOCS))

import make_methods  # from the folder of the document
import make_openrpc

DOCUMENT = json.loads((DOCS / "openrpc.json").read_text(encoding="utf-8"))
METHODS = {method["name"]: method for method in DOCUMENT["methods"]}
ERRORS = DOCUMENT["components"]["errors"]
EXCHANGES = json.loads((DOCS / "exchanges.json").read_text(encoding="utf-8"))


def fits(value, schema):
    """Whether a value fits a schema of the document."""
    resolver = jsonschema.RefResolver("", DOCUMENT)
    return jsonschema.Draft7Validator(schema, resolver=resolver).is_valid(value)


def params_fit(method, params):
    described = METHODS[method]
    members = {param["name"]: param["schema"] for param in described["params"]}
    required = [param["name"] for param in described["params"] if param["required"]]
    exclusive = set(described.get("x-at-most-one-of", []))
    schema = {"properties": members, "required": required, "additionalProperties": False}
    return fits(params, schema) and len(exclusive & set(params)) <= 1


def test_the_document_is_up_to_date(tmp_path):
    document = tmp_path / "openrpc.json"
    subprocess.run([DOCS / "make_openrpc.py", "--document", document], check=True, timeout=60)
    assert document.read_bytes() == (DOCS / "openrpc.json").read_bytes()


def test_the_document_is_valid_openrpc():
    meta = exported_by("@open-rpc/meta-schema", "openrpcDocument")
    schema_of_schemas = exported_by("@json-schema-tools/meta-schema", "jsonSchema")
    store = {"https://meta.json-schema.tools": schema_of_schemas,
             "https://meta.json-schema.tools/": schema_of_schemas}
    resolver = jsonschema.RefResolver(meta["$id"], meta, store=store)
    validator = jsonschema.Draft7Validator(meta, resolver=resolver)
    assert [error.message for error in validator.iter_errors(DOCUMENT)] == []
    broken = copy.deepcopy(DOCUMENT)
    broken["methods"][0]["params"][0]["schema"] = "string"
    assert not validator.is_valid(broken)


def test_the_lock_file_names_no_host_of_a_registry():
    text = "".join((PROJECT / name).read_text(encoding="utf-8") for name in FILES)
    assert "://" not in text


def test_all_methods_of_the_service_are_described_in_their_order():
    assert list(METHODS) == list(make_methods.read_methods())
    assert len(METHODS) == 26


def references_of(value):
    if isinstance(value, dict):
        yield from [value["$ref"]] if "$ref" in value else []
        for member in value.values():
            yield from references_of(member)
    elif isinstance(value, list):
        for item in value:
            yield from references_of(item)


def test_every_reference_leads_to_something():
    references = set(references_of(DOCUMENT))
    assert "#/components/schemas/devices" in references
    for reference in references:
        _, components, kind, name = reference.split("/")
        assert name in DOCUMENT[components][kind], reference


@pytest.mark.parametrize("recorded", EXCHANGES, ids=lambda exchange: exchange["method"])
def test_a_recorded_exchange_fits(recorded):
    method = recorded["method"]
    assert params_fit(method, json.loads(recorded["request"])["params"])
    assert fits(json.loads(recorded["answer"])["result"], METHODS[method]["result"]["schema"])


@pytest.mark.parametrize("recorded", EXCHANGES, ids=lambda exchange: exchange["method"])
def test_a_wrong_exchange_does_not_fit(recorded):
    method = recorded["method"]
    assert not params_fit(method, {**json.loads(recorded["request"])["params"], "extra": 1})
    assert not fits({**json.loads(recorded["answer"])["result"], "extra": 1},
                    METHODS[method]["result"]["schema"])


def test_two_kinds_of_resources_do_not_fit():
    assert params_fit("initializeSession", {"devices": "Mod1"})
    assert not params_fit("initializeSession", {"devices": "Mod1", "nvmem_areas": "Mod1/user"})


def test_an_empty_array_can_be_read_but_not_written():
    read = METHODS["getProperty"]["result"]["schema"]
    assert fits({"data_type": "StringArray", "value": []}, read)
    assert not params_fit("setProperty", {"session_id": "_session1", "property": "P", "value": []})


def test_an_error_of_the_service_stands_in_the_data():
    assert ERRORS["deviceReserved"]["code"] == -32000
    assert ERRORS["deviceReserved"]["data"]["qitrmc_code"] == -250811
    assert ERRORS["deviceReserved"]["data"]["qitrmc_message"].startswith(
        "The device is reserved by another session. ")


def test_an_error_of_json_rpc_stands_in_the_code():
    assert ERRORS["invalidParams"]["code"] == -32602
    assert "data" not in ERRORS["invalidParams"]
    assert ERRORS["skipped"]["data"]["qitrmc_code"] == -32001


def error_names(method):
    return [reference["$ref"].rpartition("/")[2] for reference in METHODS[method]["errors"]]


def test_a_method_lists_its_own_and_the_common_errors():
    assert error_names("closeSession") == ["invalidRequest", "invalidParams", "skipped", "internalError",
                                           "outOfMemory", "unknownSession", "qitrmcsim_unknownSession"]
    assert "dataTooWide" in error_names("writeRegister")
    assert "unknownSession" not in error_names("initializeSession")
    assert "qitrmcsim_connectionLost" in error_names("getProperty")


def test_a_method_without_an_exchange_is_a_fault(monkeypatch, tmp_path):
    shorter = tmp_path / "exchanges.json"
    shorter.write_text(json.dumps(EXCHANGES[:-1]), encoding="utf-8")
    monkeypatch.setattr(make_methods, "EXCHANGES", shorter)
    with pytest.raises(make_methods.Fault, match="GetChassisIpOrHostname"):
        make_openrpc.document()


def test_an_optional_member_that_is_not_in_the_result_is_a_fault(monkeypatch, tmp_path):
    table = json.loads(make_methods.TABLE.read_text(encoding="utf-8"))
    table["methods"]["getModuleName"]["optional"] = ["modul"]
    wrong = tmp_path / "methods.json"
    wrong.write_text(json.dumps(table), encoding="utf-8")
    monkeypatch.setattr(make_methods, "TABLE", wrong)
    with pytest.raises(make_methods.Fault, match="modul"):
        make_openrpc.document()
