"""Which requests overlap.

The slow request here is a reservation that waits for a device until its timeout. It blocks every
request that looks up a session, so the quick requests here need no session.
"""

import threading
import time

import pytest

from jsonrpc import Client, batch, call, error_response, result_response

pytestmark = pytest.mark.concurrent

# Seconds that a slow request takes. A quick request that is blocked takes more than half of them,
# one that is not takes less, on a busy machine too.
SLOW = 1.5

RESERVED = error_response("1", -250811)
UNKNOWN_SESSION = error_response("1", -250833)
UNKNOWN_METHOD = error_response("1", -32601)

QUICK = call("x")
QUICK_BATCH = batch(QUICK)
LOOKUP = call("closeSession", {"session_id": "_session999999"})
WAITING = call("initializeSession", {"devices": "Mod1", "reservation_timeout": SLOW})

# How often the tests are tried that hold only when the requests arrive in the order of sending.
ATTEMPTS = 20


@pytest.fixture(autouse=True)
def holder(client):
    """The session that holds the device for which the slow requests wait."""
    with client.session('{"devices":"Mod1"}') as session_id:
        yield session_id


@pytest.fixture
def clients(host):
    with Client(host) as first, Client(host) as second, Client(host) as third:
        for connected in (first, second, third):
            connected.ask(QUICK)  # opens the connection
        yield first, second, third


def longest_while_unanswered(slow, quick, body):
    """Sends a request repeatedly until another client's is answered. Returns the longest time that
    one took, and the set of responses."""
    longest, answers = 0, set()
    while not slow.is_answered():
        begin = time.monotonic()
        answers.add(quick.ask(body))
        longest = max(longest, time.monotonic() - begin)
    return longest, answers


def test_single_requests_overlap(clients):
    slow, quick, _ = clients
    slow.send(WAITING)
    longest, answers = longest_while_unanswered(slow, quick, QUICK)
    assert slow.receive() == RESERVED
    assert answers == {UNKNOWN_METHOD}
    assert longest < SLOW / 2


def test_a_waiting_reservation_blocks_requests_that_need_a_session(clients):
    slow, quick, _ = clients
    slow.send(WAITING)
    longest, answers = longest_while_unanswered(slow, quick, LOOKUP)
    assert slow.receive() == RESERVED
    assert answers == {UNKNOWN_SESSION}
    assert longest > SLOW / 2


def test_a_batch_waits_for_a_running_single_request(clients):
    slow, quick, _ = clients
    slow.send(WAITING)
    longest, answers = longest_while_unanswered(slow, quick, QUICK_BATCH)
    assert slow.receive() == RESERVED
    assert answers == {batch(UNKNOWN_METHOD)}
    assert longest > SLOW / 2


def test_single_requests_wait_for_a_running_batch(clients):
    slow, quick, _ = clients
    slow.send(batch(WAITING))
    longest, answers = longest_while_unanswered(slow, quick, QUICK)
    assert slow.receive() == batch(RESERVED)
    assert answers == {UNKNOWN_METHOD}
    assert longest > SLOW / 2


def test_batches_wait_for_a_running_batch(clients):
    slow, quick, _ = clients
    slow.send(batch(WAITING))
    longest, answers = longest_while_unanswered(slow, quick, QUICK_BATCH)
    assert slow.receive() == batch(RESERVED)
    assert answers == {batch(UNKNOWN_METHOD)}
    assert longest > SLOW / 2


@pytest.mark.parametrize("body, code", [(b"{", -32700), (b"[]", -32600)])
def test_a_body_without_requests_does_not_wait_for_a_batch(clients, body, code):
    slow, quick, _ = clients
    slow.send(batch(WAITING))
    longest, answers = longest_while_unanswered(slow, quick, body)
    assert slow.receive() == batch(RESERVED)
    assert answers == {error_response("null", code)}
    assert longest < SLOW / 2


def a_single_request_behind_a_waiting_batch(clients):
    """Sends a slow single request, then a batch, then single requests until the slow one is
    answered. Returns the longest time that one of them took. The batch may overtake the slow one
    on arrival."""
    slow, waiting, quick = clients
    slow.send(WAITING)
    assert quick.ask(QUICK) == UNKNOWN_METHOD
    waiting.send(QUICK_BATCH)
    longest, answers = longest_while_unanswered(slow, quick, QUICK)
    assert slow.receive() == RESERVED
    assert waiting.receive() == batch(UNKNOWN_METHOD)
    assert answers == {UNKNOWN_METHOD}
    return longest


def test_a_waiting_batch_delays_later_single_requests(clients):
    assert any(a_single_request_behind_a_waiting_batch(clients) > SLOW / 2
               for _ in range(ATTEMPTS))


def a_batch_behind_two_single_requests(clients):
    """Sends two slow single requests, of which the second waits behind the first in the driver, and
    then a batch. Returns whether the batch was delayed for about one of them, and no longer."""
    first, second, waiting = clients
    first.send(WAITING)
    second.send(WAITING)
    assert waiting.ask(QUICK) == UNKNOWN_METHOD
    begin = time.monotonic()
    assert waiting.ask(QUICK_BATCH) == batch(UNKNOWN_METHOD)
    answered = time.monotonic()
    assert first.receive() == second.receive() == RESERVED
    return answered - begin > SLOW / 2 and time.monotonic() - answered > SLOW / 2


def test_a_batch_starts_when_the_first_of_two_single_requests_ends(clients):
    assert any(a_batch_behind_two_single_requests(clients) for _ in range(ATTEMPTS))


def test_a_close_and_a_reservation_that_waits_for_it_run_one_after_the_other(clients, client):
    """The close cannot end the wait, as it waits for the session table. Either may come first."""
    slow, closing, _ = clients
    holder = client.open_session('{"devices":"Mod2"}')
    slow.send(call("initializeSession", {"devices": "Mod2", "reservation_timeout": SLOW}))
    closing.send(call("closeSession", {"session_id": holder}))
    assert closing.receive() == result_response()
    answer = slow.receive()
    client.close_if_opened(answer)
    assert answer == RESERVED or b'"result":{"session_id":"_session' in answer
    assert client.ask(call("closeSession", {"session_id": holder})) == UNKNOWN_SESSION


def test_the_lock_is_free_after_failures_of_every_kind(clients):
    for body, expected in (
            (QUICK, UNKNOWN_METHOD), (LOOKUP, UNKNOWN_SESSION),
            (call("closeSession"), error_response("1", -32602)),
            (b"{}", error_response("null", -32600)),
            (batch(LOOKUP), batch(UNKNOWN_SESSION)),
            (batch(b"1", QUICK),
             batch(error_response("null", -32600), error_response("1", -32001)))):
        for connected in clients:
            assert connected.ask(body) == expected
            assert connected.ask(QUICK_BATCH) == batch(UNKNOWN_METHOD)
            assert connected.ask(QUICK) == UNKNOWN_METHOD


def in_threads(count, work):
    """Runs work(number) in threads of their own; an exception in any of them fails the test."""
    failures = []

    def run(number):
        try:
            work(number)
        except BaseException as failure:
            failures.append(failure)

    threads = [threading.Thread(target=run, args=[number]) for number in range(count)]
    for thread in threads:
        thread.start()
    for thread in threads:
        thread.join()
    if failures:
        raise failures[0]


def test_every_client_is_answered_with_its_own_id(host):
    def work(number):
        with Client(host) as own:
            for turn in range(50):
                id = f'"{number}-{turn}"'
                assert own.ask(call("x", id=id)) == error_response(id, -32601)
                assert own.ask(batch(call("x", id=id), call("x", id=id))) == batch(
                    error_response(id, -32601), error_response(id, -32001))
                assert own.ask(call("closeSession", "{}", id)) == error_response(id, -32602)
    in_threads(8, work)


def test_a_device_has_one_owner_at_a_time(host):
    owners, successes = [], []

    def work(number):
        with Client(host) as own:
            while len(successes) < 100:
                answer = own.ask(call("initializeSession", '{"devices":"Mod4"}'))
                if answer != RESERVED:
                    owners.append(number)
                    assert owners == [number], answer
                    successes.append(number)
                    owners.remove(number)
                    own.close_if_opened(answer)
    in_threads(6, work)


def test_nothing_runs_between_the_elements_of_a_batch(host, client):
    """One client releases a device and takes it again in a batch; another one never gets it. Both
    send only batches, because a single request that is ending may let a batch in early."""
    held = [client.open_session('{"devices":"Mod2"}')]
    finished = threading.Event()

    def take_turns(own):
        for _ in range(100):
            answer = own.ask(batch(call("closeSession", {"session_id": held[0]}),
                                   call("initializeSession", {"devices": "Mod2"})))
            assert answer.startswith(b"[" + result_response() + b',{"jsonrpc":"2.0","id":1,"res')
            held[0] = answer.rsplit(b'"session_id":"', 1)[1].split(b'"')[0].decode()

    def work(number):
        with Client(host) as own:
            if number:
                while not finished.is_set():
                    answer = own.ask(batch(call("initializeSession", {"devices": "Mod2"})))
                    own.close_if_opened(answer)
                    assert answer == batch(RESERVED)
            else:
                try:
                    take_turns(own)
                finally:
                    finished.set()
    in_threads(3, work)
    client.close_session(held[0])
