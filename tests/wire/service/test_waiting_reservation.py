"""The holder of a device cannot release it while another session waits for it.

The holder's requests are blocked until the waiting request has failed. So a long
reservation_timeout cannot get a device, whereas repeated requests without one can.
"""

import pytest

from hostlib import clean_host
from jsonrpc import Client, call, error_response, result_response

pytestmark = pytest.mark.concurrent

TRACE = "trace.txt"
RESERVED = error_response("1", -250811)
DEVICES = {"devices": "Mod1"}

# Seconds that the waiting request waits.
WAIT = 0.5

# How often the holder may be faster than the request that should wait for its device.
ATTEMPTS = 20


@pytest.fixture
def traced():
    """A host that traces each driver call when it ends."""
    with clean_host(("--trace", TRACE)) as running:
        yield running


@pytest.fixture
def holder(traced):
    with Client(traced) as connected:
        yield connected


@pytest.fixture
def waiter(traced):
    with Client(traced) as connected:
        yield connected


def calls_of(host, function, session):
    """The calls of a driver function by a session so far, as line numbers. The handle of a session
    is the number in its id."""
    begin = f" {function}(session={session.removeprefix('_session')}"
    lines = (host.directory / TRACE).read_text(encoding="utf-8").splitlines()
    return [number for number, line in enumerate(lines)
            if f"{begin}," in line or f"{begin})" in line]


def start_waiting(host, waiter, session):
    """Sends a request that waits for the device. Returns once it has looked up the device's
    name, the last step before it waits."""
    waiter.send(call("reserveDevices",
                     {"session_id": session, **DEVICES, "reservation_timeout": WAIT}))
    while not calls_of(host, "getSystemPropertyStringArray", session):
        pass


def was_held_up(host, holder, waiter, method):
    """Whether the holder's request was carried out only after the wait. It is not when the holder
    is faster than the request that should wait, which then succeeds."""
    holding, waiting = holder.open_session(DEVICES), waiter.open_session()
    start_waiting(host, waiter, waiting)
    assert holder.ask(call(method, {"session_id": holding})) == result_response()
    waited = waiter.receive()
    failed, = calls_of(host, "reserveDevices", waiting)
    given_up, = calls_of(host, method, holding)
    waiter.close_session(waiting)
    if method != "closeSession":
        holder.close_session(holding)
    return waited == RESERVED and failed < given_up


@pytest.mark.parametrize("method", ["closeSession", "unreserveDevices"])
def test_a_holder_can_release_a_device_only_after_the_wait_for_it(traced, holder, waiter, method):
    assert any(was_held_up(traced, holder, waiter, method) for _ in range(ATTEMPTS))


def test_repeated_requests_without_a_wait_get_the_device(holder, waiter):
    holding, asking = holder.open_session(DEVICES), waiter.open_session()
    request = call("reserveDevices", {"session_id": asking, **DEVICES, "reservation_timeout": 0})
    assert waiter.ask(request) == RESERVED
    holder.close_session(holding)
    assert waiter.ask(request) == result_response()
