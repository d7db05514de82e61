"""What is JSON and what is not, in the body of a request."""

import pytest

from jsonrpc import blanked, call, error_response

PARSE_ERROR = error_response("null", -32700)
INVALID_REQUEST = error_response("null", -32600)
UNKNOWN_METHOD = error_response("1", -32601)
REFUSED_ID = -32600

COMPLETE = b'{"jsonrpc":"2.0","id":1,"method":"x","params":{"a":[true,false,null,-1.5e3,"\\u00e9"]}}'

NOT_JSON = [
    b"", b" ", b" \t\r\n ",                                       # nothing
    b"x", b"nul", b"tru", b"falsy", b"TRUE", b"None", b"'a'",      # no value
    b"{", b"[", b"}", b"]", b",", b":", b'"',
    b"{1:2}", b"{a:1}", b'{"a":1,}', b"{,}", b"{null:1}",          # no name
    b'{"a" 1}', b'{"a"}', b'{"a",1}', b'{"a"=1}',                  # no colon
    b'{"a":1 "b":2}', b'{"a":1]', b'{"a":1', b'{"a":}',            # no comma or brace
    b"[1 2]", b"[1}", b"[1,]", b"[,1]", b"[1", b"[1:2]",           # no comma or bracket
    b'"\\u12"', b'"\\u12g4"', b'"\\uD83D\\u12"', b'"\\u+123"',     # no hexadecimal digits
    b'"\\ud800"', b'"\\ud83dx"', b'"\\ud83d\\ud83d"', b'"\\ud83d\\n"', b'"\\uDBFF\\u0041"',
    b'"\\x41"', b'"\\a"', b'"\\\'"', b'"\\"',                      # no escape
    b'"abc', b'{"abc', b'"\\',                                     # no closing quotation mark
    b'"a\nb"', b'"a\tb"', b'"\x01"', b'"\x1f"',                    # a control character
    b"1e309", b"-1e309", b"1" * 310, b"1e99999999999", b"10e308",  # too big for a double
    b"1.", b"1.e1", b"-1.x", b".5",                                # no fraction
    b"1e", b"1e+", b"1E-", b"1ex",                                 # no exponent
    b"01", b"+1", b"-", b"--1", b"- 1", b"0x10", b"1_000",         # no number
    b"NaN", b"Infinity", b"-Infinity", b"-inf", b"nan",
    b"// x\n{}", b"/* x */ {}", b"# x\n{}",                        # comments
    b"\xef\xbb\xbf{}", b"\xff\xfe{\x00}\x00", b"\xfe\xff\x00{\x00}",  # byte order marks
    b"\x0c{}", b"\xa0{}", b"\xe2\x80\xa8{}",                       # blanks of other languages
]

TRAILING = [b"x", b"{}", b"[]", b",", b"}", b"]", b"1", b'"', b" x", b"\n{}", b"\xff",
            b"\xef\xbb\xbf", b";", COMPLETE]

INVALID_ROOTS = [b"0", b"1", b"-1.5", b'""', b'"x"', b"true", b"false", b"null", b"[]", b" [ ] ",
                 b"18446744073709551616", b'"{}"', b"\r\n null \t"]


@pytest.mark.parametrize("body", NOT_JSON, ids=ascii)
def test_a_body_that_is_not_json_is_a_parse_error(client, body):
    assert client.ask(body) == PARSE_ERROR


@pytest.mark.parametrize("value", [body for body in NOT_JSON if body.strip() and
                                   not body.startswith((b"}", b"]", b",", b":", b"\xff", b"\xfe"))],
                         ids=ascii)
def test_a_fault_inside_a_request_is_a_parse_error_with_id_null(client, value):
    body = b'{"jsonrpc":"2.0","id":1,"method":"x","params":{"a":' + value + b"}}"
    assert client.ask(body) == PARSE_ERROR


@pytest.mark.parametrize("rest", TRAILING, ids=ascii)
def test_text_after_a_request_is_a_parse_error(client, rest):
    assert client.ask(COMPLETE + rest) == PARSE_ERROR


def test_text_after_a_batch_is_a_parse_error(client):
    assert client.ask(b"[" + COMPLETE + b"]]") == PARSE_ERROR


def test_a_request_cut_at_any_byte_is_a_parse_error(client):
    assert client.ask(COMPLETE) == UNKNOWN_METHOD
    answers = {length: client.ask(COMPLETE[:length]) for length in range(len(COMPLETE))}
    assert {length for length, answer in answers.items() if answer != PARSE_ERROR} == set()


def test_a_batch_cut_at_any_byte_runs_nothing(client):
    body = b"[" + call("initializeSession") + b"]"
    answers = {length: client.ask(body[:length]) for length in range(len(body))}
    assert {length for length, answer in answers.items() if answer != PARSE_ERROR} == set()


@pytest.mark.parametrize("body", INVALID_ROOTS, ids=ascii)
def test_a_root_that_is_not_a_request_is_an_invalid_request(client, body):
    assert client.ask(body) == INVALID_REQUEST


@pytest.mark.parametrize("rest", [b"", b"x", b"{}", b"\x00", b"\x00" * 300, b"y" * 100000],
                         ids=lambda text: ascii(text)[:20])
def test_a_body_ends_at_its_first_nul(client, rest):
    assert client.ask(COMPLETE + b"\x00" + rest) == UNKNOWN_METHOD


def test_a_nul_before_a_request_leaves_an_empty_body(client):
    assert client.ask(b"\x00" + COMPLETE) == PARSE_ERROR


def test_a_nul_at_any_byte_of_a_request_cuts_it(client):
    answers = {position: client.ask(COMPLETE[:position] + b"\x00" + COMPLETE[position + 1:])
               for position in range(len(COMPLETE))}
    assert {position for position, answer in answers.items() if answer != PARSE_ERROR} == set()


def test_an_escaped_nul_does_not_cut_a_body(client):
    assert client.ask(call("x", '{"a":"\\u0000"}')) == UNKNOWN_METHOD


def test_a_single_low_surrogate_is_returned_as_its_three_bytes(client):
    echoed = b'"\xed\xb0\x80"'.decode("utf-8", "surrogateescape")
    assert client.ask(call("x", id='"\\udc00"')) == error_response(echoed, -32601)


@pytest.mark.parametrize("text", [
    b"\xff", b"\xc0\x80", b"\xed\xa0\x80", b"\xf5\x80\x80\x80", b"\xe2\x82", b"\x80", b"\xf0\x9f"],
    ids=ascii)
def test_bytes_that_are_not_utf8_pass_through(client, text):
    """The body is compared as bytes, since it is not a text in Python."""
    body = b'{"jsonrpc":"2.0","id":"' + text + b'","method":"x"}'
    assert client.ask(body) == error_response(
        '"' + text.decode("utf-8", "surrogateescape") + '"', -32601)


def test_a_parse_error_leaves_the_connection_usable(host):
    connection = host.connection()
    try:
        for body, expected in ((b"{", PARSE_ERROR), (COMPLETE, UNKNOWN_METHOD)) * 3:
            connection.request("POST", "/qitrmc/Call", body)
            assert blanked(connection.getresponse().read()) == expected
    finally:
        connection.close()


# A number whose exponent is the lowest that 32 bits hold, with digits after the point: it is zero.
TINY = ["0.0000000001e-2147483639", "-0.0000000001e-2147483639", "0.1e-2147483647",
        "0.00000000001E-2147483638", "1.5e-2147483639", "0.1e-99999999999999999999",
        "0." + "0" * 400 + "1e-2147483639", "1e-2147483648", "0.1e-000000002147483647",
        "0.123456789012345678901234567890e-2147483630"]


@pytest.mark.parametrize("number", TINY)
def test_a_vanishing_number_as_id_is_zero(client, number):
    zero = "-0.0" if number.startswith("-") else "0.0"
    assert client.ask(call("x", id=number)) == error_response(zero, REFUSED_ID)


@pytest.mark.parametrize("number", TINY)
def test_a_vanishing_number_as_reservation_timeout_is_served(client, number):
    with client.session(f'{{"reservation_timeout":{number}}}'):
        pass


@pytest.mark.parametrize("number", TINY)
def test_a_text_that_looks_like_a_vanishing_number_is_untouched(client, number):
    for text in (f'"{number}"', f'"\\"{number}"', f'"\\\\\\"{number}\\\\"'):
        assert client.ask(call("x", id=text)) == error_response(text, -32601)


@pytest.mark.parametrize("number", TINY)
def test_text_after_a_vanishing_number_is_still_a_parse_error(client, number):
    assert client.ask(call("x", id=number + "x")) == PARSE_ERROR


@pytest.mark.parametrize("number", ["10e308", "-10e308", "100e307", "1e309", "1" + "0" * 309,
                                    "0.1e310", "17976931348623159e292"])
def test_a_number_above_the_largest_double_is_a_parse_error(client, number):
    assert client.ask(call("x", id=number)) == PARSE_ERROR
    assert client.ask(call("initializeSession",
                           f'{{"reservation_timeout":{number}}}')) == PARSE_ERROR


def test_a_large_number_that_a_double_represents_is_accepted(client):
    with client.session('{"reservation_timeout":1e308}'):
        pass


def test_a_procedure_uses_the_first_of_two_equal_params(client):
    body = (b'{"jsonrpc":"2.0","id":1,"method":"closeSession",'
            b'"params":{"session_id":"_session999998"},"params":{"session_id":"_session999999"}}')
    assert client.ask(body) == error_response("1", -250833)


def test_both_of_two_equal_members_are_checked(client):
    for first, second in (('"_session999999"', "5"), ("5", '"_session999999"')):
        answer = client.ask(call("closeSession",
                                 f'{{"session_id":{first},"session_id":{second}}}'))
        assert answer == error_response("1", -32602)
