"""docs/methods.md describes what the program does: it is up to date, and its exchanges are real."""

import json
import pathlib
import subprocess
import sys

import pytest

from hostlib import BUILD_DIR, clean_host

DOCS = pathlib.Path(__file__).resolve().parents[3] / "docs"
sys.path.insert(0, str(DOCS))

import make_methods  # from the folder of the page

TABLE = json.loads((DOCS / "methods.json").read_text(encoding="utf-8"))
EXCHANGES = json.loads((DOCS / "exchanges.json").read_text(encoding="utf-8"))

pytestmark = pytest.mark.same_in_each_build


@pytest.fixture
def sources(monkeypatch, tmp_path):
    """Replaces a source during a test: sources("TABLE", value), or the same with its text."""
    def put(name, content):
        path = tmp_path / name
        text = content if isinstance(content, str) else json.dumps(content)
        path.write_text(text, encoding="utf-8")
        monkeypatch.setattr(make_methods, name, path)
    return put


def without(mapping, key):
    return {name: value for name, value in mapping.items() if name != key}


def test_the_page_is_up_to_date(tmp_path):
    page = tmp_path / "methods.md"
    subprocess.run([DOCS / "make_methods.py", "--page", page], check=True, timeout=60)
    assert page.read_bytes() == (DOCS / "methods.md").read_bytes()


def test_the_page_has_a_section_for_each_method():
    methods = list(make_methods.read_methods())
    page = (DOCS / "methods.md").read_text(encoding="utf-8")
    sections = [line.removeprefix("## ") for line in page.splitlines() if line.startswith("## ")]
    assert sections == ["Errors of every method", *methods]


def test_a_method_without_an_entry_is_an_error(sources):
    methods = make_methods.METHODS.read_text(encoding="utf-8")
    row = 'QITRMC_METHOD("newMethod", NewMethod,\n              "procedure_close_session.json")\n'
    sources("METHODS", methods.replace("#undef", row + "#undef"))
    with pytest.raises(make_methods.Fault, match="newMethod"):
        make_methods.page_text()


@pytest.mark.parametrize("method", TABLE["methods"])
def test_a_missing_entry_is_an_error(sources, method):
    sources("TABLE", {**TABLE, "methods": without(TABLE["methods"], method)})
    with pytest.raises(make_methods.Fault, match="TABLE"):
        make_methods.page_text()


def test_a_missing_exchange_is_an_error(sources):
    sources("EXCHANGES", EXCHANGES[:-1])
    with pytest.raises(make_methods.Fault, match="EXCHANGES"):
        make_methods.page_text()


@pytest.mark.parametrize("part", ["purpose", "result", "errors"])
def test_a_missing_part_of_an_entry_is_an_error(sources, part):
    entry = without(TABLE["methods"]["readRegister"], part)
    sources("TABLE", {**TABLE, "methods": {**TABLE["methods"], "readRegister": entry}})
    with pytest.raises(make_methods.Fault, match=part):
        make_methods.page_text()


def test_a_parameter_without_a_description_is_an_error(sources):
    sources("TABLE", {**TABLE, "parameters": without(TABLE["parameters"], "force_reserve")})
    with pytest.raises(make_methods.Fault, match="force_reserve"):
        make_methods.page_text()


@pytest.mark.parametrize("recorded", EXCHANGES, ids=lambda exchange: exchange["method"])
def test_a_recorded_exchange_is_reproduced(recorded):
    method = recorded["method"]
    with clean_host() as host:
        played = make_methods.play(method, TABLE["methods"][method],
                                   lambda body: host.post(body.encode())[2].decode())
    assert played == recorded


@pytest.mark.parametrize("recorded", EXCHANGES, ids=lambda exchange: exchange["method"])
def test_the_members_of_a_recorded_result_are_those_of_the_table(recorded):
    listed = [name for name, *_ in TABLE["methods"][recorded["method"]]["result"]]
    result = list(json.loads(recorded["answer"])["result"])
    assert result == [name for name in listed if name in result]
    assert bool(result) == bool(listed)


def test_recording_writes_the_committed_exchanges(sources):
    sources("EXCHANGES", [])
    make_methods.write_exchanges(str(BUILD_DIR / "bin" / "qitrmc-host"))
    assert make_methods.EXCHANGES.read_bytes() == (DOCS / "exchanges.json").read_bytes()
