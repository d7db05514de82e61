"""Fixtures of the wire tests."""

import signal

import pytest

from hostlib import PATIENCE, Host
from jsonrpc import Client

# Longer than any test leaves its connection idle, so that no test meets a connection closed by the
# host.
IDLE_SECONDS = 600


def assert_clean_end(host):
    """Ends the host as a service manager does. It must end well and have complained of nothing;
    built with sanitizers it reports leaks and races here."""
    host.process.send_signal(signal.SIGTERM)
    status = host.process.wait(PATIENCE)
    assert (status, host.stderr) == (0, "")


@pytest.fixture(scope="module")
def host():
    """One host for a file of tests; they leave no session behind."""
    with Host(options=("--timeout", IDLE_SECONDS)) as running:
        yield running
        assert_clean_end(running)


@pytest.fixture
def own_host():
    """A host that no other test uses."""
    with Host(options=("--timeout", IDLE_SECONDS)) as running:
        yield running
        assert_clean_end(running)


@pytest.fixture(scope="module")
def client(host):
    with Client(host) as connected:
        yield connected
