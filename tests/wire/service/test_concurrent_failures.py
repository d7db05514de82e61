"""Failures that are described at the same time: every byte of each response."""

import threading

import pytest

from error_texts import (METHOD, PARAMS, PARSE, REQUEST, RESOURCE, SESSION, SKIPPED, standing, text,
                         wrapped)
from jsonrpc import Client, batch, call

pytestmark = pytest.mark.concurrent

CONNECTIONS = 8
# Requests of each connection.
REQUESTS = 60

# One request of each kind, with its response. Its id and one of its details contain the mark.


def unknown_method(mark):
    return call(f"m{mark}", id=mark), standing(-32601, text(METHOD, f"Method: m{mark}"), id=mark)


def unknown_session(mark):
    return (call("closeSession", {"session_id": f"_session9{mark}"}, id=mark),
            wrapped(-250833, text(SESSION, f"Session ID: _session9{mark}"), id=mark))


def unsupported_parameter(mark):
    details = "Details: This parameter you specified is unsupported."
    return (call("initializeSession", {f"p{mark}": 1}, id=mark),
            standing(-32602, text(PARAMS, f"Parameter: #/params/p{mark}", details), id=mark))


def malformed_name(mark):
    name = f"Mod1/ch{mark}:1"
    return (call("initializeSession", {"physical_channels": name}, id=mark),
            wrapped(-250828, text(RESOURCE, f"Requested Value: {name}"), id=mark))


def no_json(mark):
    details = "Details: Missing a name for object member."
    return (b" " * mark + b"{x}",
            standing(-32700, text(PARSE, details, f"Offset: {mark + 1}"), id="null"))


def no_envelope(mark):
    return (f'{{"id":{mark}}}'.encode(),
            standing(-32600, text(REQUEST, "Invalid Member: jsonrpc"), id=mark))


def failing_batch(mark):
    first, answer = unknown_method(mark)
    return (batch(first, call("closeSession", id=f'"{mark}"')),
            batch(answer, wrapped(-32001, text(SKIPPED), id=f'"{mark}"')))


KINDS = (unknown_method, unknown_session, unsupported_parameter, malformed_name, no_json, no_envelope,
         failing_batch)


def ask_all(host, number, start, wrong):
    """Sends one failing request after another, and adds unexpected responses to `wrong`."""
    with Client(host) as client:
        start.wait()
        for count in range(REQUESTS):
            mark = 10 + number * REQUESTS + count
            body, expected = KINDS[(number + count) % len(KINDS)](mark)
            answer = client.ask_whole(body)
            if answer != expected:
                wrong.append((body, answer, expected))


def test_failures_that_overlap_keep_their_own_texts(host):
    start = threading.Barrier(CONNECTIONS)
    wrong, unfinished = [], set(range(CONNECTIONS))

    def run(number):
        ask_all(host, number, start, wrong)
        unfinished.remove(number)

    threads = [threading.Thread(target=run, args=(number,)) for number in range(CONNECTIONS)]
    for thread in threads:
        thread.start()
    for thread in threads:
        thread.join()
    assert wrong == []
    assert unfinished == set()
