"""Fixtures of the wire tests. Their folder is on the import path of the tests below it."""

import pytest

from hostlib import clean_host
from jsonrpc import Client


@pytest.fixture(scope="module")
def host():
    """One host for a file of tests; they leave no session behind."""
    with clean_host() as running:
        yield running


@pytest.fixture
def own_host():
    """A host that no other test uses."""
    with clean_host() as running:
        yield running


@pytest.fixture(scope="module")
def client(host):
    with Client(host) as connected:
        yield connected
