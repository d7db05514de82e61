"""The files, requests and answers of docs/simulator.md, in their order.

The page builds a chassis step by step. Each step is loaded by a host of its own, which gets the
requests up to the next step; the answers are compared byte by byte, but for the blanks between the
tokens of JSON.
"""

import json
import pathlib
import subprocess

import pytest

from hostlib import BUILD_DIR, clean_host
from jsonrpc import Client
from pages import blocks_of, compact, id_of

pytestmark = pytest.mark.same_in_each_build

PAGE = pathlib.Path(__file__).resolve().parents[3] / "docs" / "simulator.md"

KINDS = {"chassis", "add", "request", "answer", "faults", "broken", "refusal"}


def node_at(description, pointer):
    node = description
    for step in pointer.strip("/").split("/") if pointer != "/" else []:
        node = node[int(step)] if isinstance(node, list) else node[step]
    return node


def merge(node, addition):
    """Adds members to an object, and to the objects in it."""
    for name, value in addition.items():
        if isinstance(value, dict) and isinstance(node.get(name), dict):
            merge(node[name], value)
        else:
            node[name] = value


class Step:
    """A chassis, the faults, and the requests sent to it."""

    def __init__(self, description):
        self.description = json.loads(json.dumps(description))
        self.exchanges = []

    def has_faults(self):
        return any(kind == "faults" for kind, _ in self.exchanges)

    def run(self):
        files = {"rack.json": json.dumps(self.description).encode()}
        options = ("--faults", "faults.json") if self.has_faults() else ()
        with clean_host(("--chassis", "rack.json", *options), files) as host:
            with Client(host) as client:
                self.exchange(client, host.directory / "faults.json")

    def exchange(self, client, faults):
        asked = None
        for kind, text in self.exchanges:
            if kind == "faults":
                fresh = faults.with_suffix(".new")
                fresh.write_text(text)
                fresh.replace(faults)
            elif kind == "request":
                asked = id_of(text)
                client.send(text.encode())
            else:
                assert id_of(text) == asked
                assert client.receive_whole().decode() == compact(text)


class Page:
    """The steps of the page, and the invalid files with their error texts."""

    def __init__(self):
        self.steps = []
        self.broken = []
        for kind, text in blocks_of(PAGE):
            word, _, pointer = kind.partition(" ")
            assert word in KINDS, kind
            if word == "chassis":
                self.steps.append(Step(json.loads(text)))
            elif word == "add":
                self.add(pointer, json.loads(text))
            elif word in ("broken", "refusal"):
                self.broken.append((word, text))
            else:
                if word == "faults" and not self.steps[-1].has_faults():
                    self.steps.append(Step(self.steps[-1].description))
                self.steps[-1].exchanges.append((word, text))

    def add(self, pointer, addition):
        step = Step(self.steps[-1].description)
        merge(node_at(step.description, pointer), addition)
        self.steps.append(step)


def test_each_step_loads_and_answers_as_the_page_says():
    page = Page()
    for step in page.steps:
        step.run()
    assert len(page.steps) >= 9


def test_the_chassis_of_the_page_is_complete_at_the_end():
    modules = Page().steps[-1].description["devices"][0]["modules"]
    assert {"channels", "nvmem_areas", "registers"} <= modules[0].keys()


def test_each_invalid_file_is_refused_with_the_error_text_of_the_page(tmp_path):
    broken = Page().broken
    assert [kind for kind, _ in broken] == ["broken", "refusal"] * (len(broken) // 2) != []
    for (_, text), (_, refusal) in zip(broken[::2], broken[1::2]):
        (tmp_path / "rack.json").write_text(text)
        result = subprocess.run(
            [BUILD_DIR / "bin" / "qitrmc-host", "--listen", "127.0.0.1:0", "--chassis", "rack.json"],
            cwd=tmp_path, capture_output=True, text=True, timeout=60)
        assert result.stderr.splitlines()[0] == " ".join(refusal.split())
