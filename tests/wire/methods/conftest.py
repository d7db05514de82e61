"""Fixtures for the tests of the methods, beside the host with the chassis Bench and its client."""

import json

import pytest

from hostlib import clean_host
from jsonrpc import Client
from rack import RACK


@pytest.fixture(scope="module")
def rack_host():
    """One host with the chassis of rack.py for a file of tests; they leave no session behind."""
    description = json.dumps(RACK, ensure_ascii=False).encode()
    with clean_host(("--chassis", "rack.json"), {"rack.json": description}) as running:
        yield running


@pytest.fixture(scope="module")
def rack(rack_host):
    """A client of the rack."""
    with Client(rack_host) as connected:
        yield connected


@pytest.fixture
def own_bench(own_host):
    """A client of a chassis Bench that no other test sees."""
    with Client(own_host) as connected:
        yield connected
