"""Batches: one response per element, in order; no element runs after the first failure."""

import pytest

from jsonrpc import batch, call, error_response, result_response

UNKNOWN_METHOD = -32601
INVALID_REQUEST = -32600
SKIPPED = -32001
UNKNOWN_SESSION = -250833
NO_ID = "null"

# Stands for the id of any session.
SESSION = b"<session>"

# The id sent in an element that is not run, and the id in its response.
SKIPPED_IDS = [
    ("1", "1"), ("-2147483648", "-2147483648"), ("2147483648", "2147483648"),
    ("9223372036854775808", "9223372036854775808"), ("1.5", "1.5"), ("1.0", "1.0"),
    ("1e2", "100.0"), ('""', '""'), (r'"\u0000\"\u00e9"', r'"\u0000\"é"'), ("null", "null"),
    ("true", "true"), ("false", "false"), ("[]", "[]"), ("[ 1, [ 2 ] ]", "[1,[2]]"),
    ("{}", "{}"), ('{ "id" : [ null ] }', '{"id":[null]}')]

FAILING = call("x")
FAILED = error_response("1", UNKNOWN_METHOD)

# Elements that cannot be run, with their responses.
FAULTY_ELEMENTS = [
    (b"1", error_response(NO_ID, INVALID_REQUEST)),
    (b"1.5", error_response(NO_ID, INVALID_REQUEST)),
    (b'"x"', error_response(NO_ID, INVALID_REQUEST)),
    (b'"id"', error_response(NO_ID, INVALID_REQUEST)),
    (b"null", error_response(NO_ID, INVALID_REQUEST)),
    (b"true", error_response(NO_ID, INVALID_REQUEST)),
    (b"[]", error_response(NO_ID, INVALID_REQUEST)),
    (b"{}", error_response(NO_ID, INVALID_REQUEST)),
    (b"[" + call("initializeSession") + b"]", error_response(NO_ID, INVALID_REQUEST)),
    (b'["id",1]', error_response(NO_ID, INVALID_REQUEST)),
    (b'{"params":{}}', error_response(NO_ID, INVALID_REQUEST)),
    (b'{"jsonrpc":"2.0","method":"initializeSession"}', error_response(NO_ID, INVALID_REQUEST)),
    (b'{"jsonrpc":"2.0","id":5}', error_response("5", INVALID_REQUEST)),
    (b'{"jsonrpc":"2.0","id":[5],"method":"x"}', error_response("[5]", INVALID_REQUEST)),
    (b'{"id":5,"method":"x"}', error_response("5", INVALID_REQUEST)),
    (call("x", "[]", "5"), error_response("5", UNKNOWN_METHOD)),
    (call("closeSession", "[]", "5"), error_response("5", INVALID_REQUEST)),
    (call("closeSession", None, "5"), error_response("5", -32602)),
    (call("closeSession", '{"session_id":"_session999999"}', "5"),
     error_response("5", UNKNOWN_SESSION)),
]


def opened(client, answer, expected):
    """Closes the sessions that a batch opened. The response must match the expected one, in which
    SESSION stands for a session id."""
    ids, rest = [], answer
    for piece in expected.split(SESSION)[:-1]:
        assert rest.startswith(piece), answer
        session_id, rest = rest[len(piece):].split(b'"', 1)
        ids.append(session_id.decode())
        rest = b'"' + rest
    for session_id in ids:
        client.close_session(session_id)
    assert rest == expected.split(SESSION)[-1]
    return ids


def open_result(id):
    return f'{{"jsonrpc":"2.0","id":{id},"result":{{"session_id":"'.encode() + SESSION + b'"}}'


def test_a_batch_of_one_is_answered_by_an_array_of_one(client):
    assert client.ask(batch(FAILING)) == batch(FAILED)


def test_the_responses_are_in_the_order_of_the_requests(client):
    ids = ["3", "1", '"b"', '"a"', "2"]
    answer = client.ask(batch(*(call("initializeSession", id=id) for id in ids)))
    assert len(set(opened(client, answer, batch(*map(open_result, ids))))) == len(ids)


def test_equal_ids_are_answered_one_by_one(client):
    answer = client.ask(batch(*[call("initializeSession")] * 3))
    opened(client, answer, batch(*[open_result("1")] * 3))


def test_a_session_is_used_and_closed_in_one_batch(client):
    session_id = client.open_session()
    close = call("closeSession", {"session_id": session_id}, '"c"')
    answer = client.ask(batch(
        call("abortSession", {"session_id": session_id}, '"a"'), close, close, FAILING))
    assert answer == batch(result_response(id='"a"'), result_response(id='"c"'),
                           error_response('"c"', UNKNOWN_SESSION), error_response("1", SKIPPED))


def test_a_device_that_one_element_releases_is_free_for_the_next(client):
    holder = client.open_session('{"devices":"Mod1"}')
    answer = client.ask(batch(call("closeSession", {"session_id": holder}),
                              call("initializeSession", '{"devices":"Mod1"}', "2")))
    opened(client, answer, batch(result_response(), open_result("2")))


def test_the_first_failure_stops_a_batch_and_undoes_nothing(client):
    answer = client.ask(batch(call("initializeSession", id="1"), call("x", id="2"),
                              call("initializeSession", id="3")))
    opened(client, answer, batch(open_result("1"), error_response("2", UNKNOWN_METHOD),
                                 error_response("3", SKIPPED)))


def test_an_element_after_a_failure_is_not_run(client):
    with client.session() as session_id:
        close = call("closeSession", {"session_id": session_id}, "2")
        assert client.ask(batch(FAILING, close)) == batch(FAILED, error_response("2", SKIPPED))
        abort = call("abortSession", {"session_id": session_id})
        assert client.ask(abort) == result_response()


@pytest.mark.parametrize("element, answer", FAULTY_ELEMENTS, ids=lambda text: ascii(text)[2:50])
def test_a_faulty_element_fails_and_stops_the_batch(client, element, answer):
    assert client.ask(batch(element, call("initializeSession", id="2"), element)) == batch(
        answer, error_response("2", SKIPPED), skipped(answer))


def skipped(answer):
    """The response to an element that was skipped, made from its response when it was run."""
    id = answer.split(b'"id":', 1)[1].rsplit(b',"error":', 1)[0].decode()
    return error_response(id, SKIPPED)


@pytest.mark.parametrize("element, answer", FAULTY_ELEMENTS, ids=lambda text: ascii(text)[2:50])
def test_a_faulty_element_does_not_undo_the_elements_before_it(client, element, answer):
    with client.session() as session_id:
        abort = call("abortSession", {"session_id": session_id}, '"a"')
        assert client.ask(batch(abort, abort, element)) == batch(
            result_response(id='"a"'), result_response(id='"a"'), answer)


@pytest.mark.parametrize("sent, echoed", SKIPPED_IDS)
def test_a_skipped_element_is_answered_with_its_id(client, sent, echoed):
    answer = client.ask(batch(FAILING, call("initializeSession", id=sent)))
    assert answer == batch(FAILED, error_response(echoed, SKIPPED))


@pytest.mark.parametrize("sent, echoed", SKIPPED_IDS)
def test_the_envelope_of_a_skipped_element_is_not_checked(client, sent, echoed):
    answer = client.ask(batch(FAILING, f'{{"x":[{{}}],"id":{sent},"method":5}}'.encode()))
    assert answer == batch(FAILED, error_response(echoed, SKIPPED))


@pytest.mark.parametrize("element", [
    b"1", b"null", b'"id"', b"[]", b'[{"id":5}]', b"{}", b'{"ID":5}', b'{"params":{"id":5}}'])
def test_a_skipped_element_without_id_is_answered_with_id_null(client, element):
    assert client.ask(batch(FAILING, element)) == batch(FAILED, error_response(NO_ID, SKIPPED))


def test_an_element_without_params_gets_empty_ones(client):
    answer = client.ask(batch(call("initializeSession", id="1"), call("closeSession", id="2")))
    opened(client, answer, batch(open_result("1"), error_response("2", -32602)))


def test_blanks_in_a_batch_do_not_matter(client):
    assert client.ask(b" [ " + FAILING + b"\n,\t" + FAILING + b" ] ") == batch(
        FAILED, error_response("1", SKIPPED))


def test_an_empty_array_is_one_invalid_request(client):
    assert client.ask(b"[]") == error_response(NO_ID, INVALID_REQUEST)


def test_an_empty_array_in_an_array_is_one_invalid_element(client):
    assert client.ask(b"[[]]") == batch(error_response(NO_ID, INVALID_REQUEST))


def test_a_hundred_elements_are_run_in_order(client):
    with client.session() as session_id:
        aborts = [call("abortSession", {"session_id": session_id}, str(id)) for id in range(100)]
        expected = [result_response(id=str(id)) for id in range(100)]
        assert client.ask(batch(*aborts)) == batch(*expected)
