"""The envelope of a request: id, jsonrpc, method and params, and how the id is returned."""

import pytest

from jsonrpc import call, error_response

INVALID_REQUEST = -32600
UNKNOWN_METHOD = -32601
UNKNOWN_SESSION = -250833

NOT_UTF8 = b"\xff\xc0\x80".decode("utf-8", "surrogateescape")

# The id that is sent, and the id in the response. None of these ids is accepted.
REFUSED_IDS = [
    ("null", "null"),
    ("true", "true"),
    ("false", "false"),
    ("2147483648", "2147483648"),
    ("-2147483649", "-2147483649"),
    ("4294967295", "4294967295"),
    ("4294967296", "4294967296"),
    ("9223372036854775807", "9223372036854775807"),
    ("9223372036854775808", "9223372036854775808"),
    ("-9223372036854775808", "-9223372036854775808"),
    ("18446744073709551615", "18446744073709551615"),
    ("1.5", "1.5"),
    ("-1.5", "-1.5"),
    ("1.0", "1.0"),
    ("0.0", "0.0"),
    ("-0.0", "-0.0"),
    ("1e2", "100.0"),
    ("1E+2", "100.0"),
    ("1e-2", "0.01"),
    ("1e22", "1e22"),
    ("[]", "[]"),
    ("{}", "{}"),
    ("[ 1 , [ null ] , \"x\" ]", '[1,[null],"x"]'),
    ('{ "b" : 1 , "a" : { "id" : 2 } }', '{"b":1,"a":{"id":2}}'),
    ('{"a":1,"a":2}', '{"a":1,"a":2}'),
]

ACCEPTED_IDS = [
    ("0", "0"),
    ("1", "1"),
    ("-1", "-1"),
    ("2147483647", "2147483647"),
    ("-2147483648", "-2147483648"),
    ('""', '""'),
    ('" "', '" "'),
    ('"abc"', '"abc"'),
    ('"null"', '"null"'),
    (r'"\"\\\/\b\f\n\r\t"', r'"\"\\/\b\f\n\r\t"'),
    (r'"a\u0000b"', r'"a\u0000b"'),
    (r'"\u0000"', r'"\u0000"'),
    (r'"\u001f\u001F"', r'"\u001F\u001F"'),
    ('"\x7f"', '"\x7f"'),
    (r'"\u0041"', '"A"'),
    (r'"\u00e9"', '"é"'),
    ('"é€"', '"é€"'),
    (r'"\ud83d\ude00"', '"😀"'),
    ('"😀"', '"😀"'),
    (f'"{NOT_UTF8}"', f'"{NOT_UTF8}"'),
    ('"' + "x" * 70000 + '"', '"' + "x" * 70000 + '"'),
]


def envelope(**members):
    """A request for an unknown method with members replaced by JSON texts; None leaves one out."""
    request = {"jsonrpc": '"2.0"', "id": "1", "method": '"x"', "params": "{}", **members}
    texts = (f'"{name}":{text}' for name, text in request.items() if text is not None)
    return ("{" + ",".join(texts) + "}").encode()


@pytest.mark.parametrize("sent, echoed", REFUSED_IDS)
def test_an_id_other_than_a_32_bit_integer_or_string_is_refused_and_echoed(client, sent, echoed):
    assert client.ask(call("x", id=sent)) == error_response(echoed, INVALID_REQUEST)


@pytest.mark.parametrize("sent", ["18446744073709551616", "-9223372036854775809", "0.1",
                                  "1234.5625", "1e300", "-2.5e-300", "5e-324"])
def test_an_id_that_only_a_double_represents_is_echoed_with_its_value(client, sent):
    """Several texts represent one double, so its value is compared."""
    answer = client.ask(call("x", id=sent))
    echoed = answer.split(b'"id":')[1].split(b",")[0].decode()
    assert float(echoed) == float(sent) and not echoed.lstrip("-").isdigit()
    assert answer == error_response(echoed, INVALID_REQUEST)


@pytest.mark.parametrize("sent, echoed", ACCEPTED_IDS, ids=lambda text: ascii(text)[:30])
def test_an_id_of_a_right_type_is_echoed_as_sent(client, sent, echoed):
    assert client.ask(call("x", id=sent)) == error_response(echoed, UNKNOWN_METHOD)


def test_a_request_without_id_is_refused_with_id_null(client):
    assert client.ask(envelope(id=None)) == error_response("null", INVALID_REQUEST)


def test_a_request_without_id_for_a_known_method_opens_no_session(client):
    answer = client.ask(b'{"jsonrpc":"2.0","method":"initializeSession"}')
    assert answer == error_response("null", INVALID_REQUEST)


@pytest.mark.parametrize("name", ["ID", "Id", "id ", "id\\u0000", ""])
def test_an_id_under_another_name_is_ignored(client, name):
    body = f'{{"jsonrpc":"2.0","{name}":1,"method":"x"}}'.encode()
    assert client.ask(body) == error_response("null", INVALID_REQUEST)


@pytest.mark.parametrize("jsonrpc", [
    None, '"1.0"', '"2"', '"2.00"', '"2.0 "', '" 2.0"', '""', '"2.0x"', '"\\u00002.0"',
    "2.0", "2", "null", "true", "[]", "{}", '["2.0"]'])
def test_a_wrong_or_absent_version_is_refused(client, jsonrpc):
    answer = client.ask(envelope(jsonrpc=jsonrpc, id='"v"'))
    assert answer == error_response('"v"', INVALID_REQUEST)


def test_the_version_is_read_up_to_its_first_nul(client):
    assert client.ask(envelope(jsonrpc='"2.0\\u0000x"')) == error_response("1", UNKNOWN_METHOD)


def test_an_escaped_version_is_the_same_version(client):
    assert client.ask(envelope(jsonrpc='"\\u0032.0"')) == error_response("1", UNKNOWN_METHOD)


@pytest.mark.parametrize("method", [None, "1", "null", "true", "[]", "{}", '["closeSession"]'])
def test_a_wrong_or_absent_method_is_refused(client, method):
    assert client.ask(envelope(method=method, id="7")) == error_response("7", INVALID_REQUEST)


@pytest.mark.parametrize("method", [
    '""', '" "', '"x"', '"\\u0000"', '"InitializeSession"', '"INITIALIZESESSION"',
    '"initializesession"', '" initializeSession"', '"initializeSession "', '"initializeSession\\n"',
    '"getChassisIpOrHostname"', '"é"', '"' + "x" * 100000 + '"'], ids=lambda text: text[:30])
def test_a_name_that_is_not_exactly_a_method_is_unknown(client, method):
    assert client.ask(envelope(method=method)) == error_response("1", UNKNOWN_METHOD)


def test_a_method_is_read_up_to_its_first_nul(client):
    body = envelope(method='"closeSession\\u0000x"', params='{"session_id":"_session999999"}')
    assert client.ask(body) == error_response("1", UNKNOWN_SESSION)


@pytest.mark.parametrize("params", ["[]", "[1]", "1", '"x"', "null", "true", '{"session_id":5}'])
def test_an_unknown_method_is_reported_whatever_its_params(client, params):
    assert client.ask(envelope(params=params)) == error_response("1", UNKNOWN_METHOD)


@pytest.mark.parametrize("params", ["[]", "[1]", "1", "1.5", '"x"', '""', "null", "true", "false"])
def test_params_that_are_not_an_object_make_an_invalid_request(client, params):
    answer = client.ask(envelope(method='"closeSession"', params=params))
    assert answer == error_response("1", INVALID_REQUEST)


@pytest.mark.parametrize("body, echoed", [
    ('{"id":null,"jsonrpc":1,"method":1}', "null"),
    ('{"id":"a","jsonrpc":1,"method":1}', '"a"'),
    ('{"id":"a","jsonrpc":"2.0","method":1,"params":1}', '"a"'),
    ('{"id":"a","method":"x"}', '"a"'),
    ('{"id":1.5,"jsonrpc":"2.0","method":"x"}', "1.5"),
])
def test_a_faulty_envelope_takes_precedence_over_an_unknown_method(client, body, echoed):
    assert client.ask(body.encode()) == error_response(echoed, INVALID_REQUEST)


def test_an_empty_object_is_an_invalid_request(client):
    assert client.ask(b"{}") == error_response("null", INVALID_REQUEST)


def test_an_object_of_params_alone_is_an_invalid_request(client):
    assert client.ask(b'{"params":{}}') == error_response("null", INVALID_REQUEST)


def test_further_members_of_the_envelope_are_ignored(client):
    body = b'{"x":[1],"jsonrpc":"2.0","":null,"id":3,"result":{},"method":"x","error":1}'
    assert client.ask(body) == error_response("3", UNKNOWN_METHOD)


def test_further_members_of_the_envelope_of_a_known_method_are_ignored(client):
    body = (b'{"x":{"a":[1]},"jsonrpc":"2.0","id":3,"method":"closeSession",'
            b'"params":{"session_id":"_session999999"},"y":null}')
    assert client.ask(body) == error_response("3", UNKNOWN_SESSION)


def test_members_come_in_any_order(client):
    body = b'{"params":{},"method":"x","id":3,"jsonrpc":"2.0"}'
    assert client.ask(body) == error_response("3", UNKNOWN_METHOD)


def test_the_first_of_two_ids_counts(client):
    body = b'{"jsonrpc":"2.0","id":3,"id":4,"method":"x"}'
    assert client.ask(body) == error_response("3", UNKNOWN_METHOD)


def test_escaped_names_of_members_are_the_same_names(client):
    body = rb'{"\u006asonrpc":"2.0","\u0069d":3,"m\u0065thod":"x"}'
    assert client.ask(body) == error_response("3", UNKNOWN_METHOD)


def test_blanks_are_allowed_wherever_json_allows_them(client):
    body = b' \t\r\n{ "jsonrpc"\n:\t"2.0" ,\r"id" : 3 , "method" : "x" , "params" : { } } \r\n\t '
    assert client.ask(body) == error_response("3", UNKNOWN_METHOD)
