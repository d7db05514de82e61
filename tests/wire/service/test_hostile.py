"""Hostile bodies: very long, deep or wide ones, and unusual texts.

Each is answered in a time that grows linearly with its length, and the service keeps working.
"""

import time

import pytest

from jsonrpc import call, error_response

PARSE_ERROR = error_response("null", -32700)
UNKNOWN_METHOD = error_response("1", -32601)
INVALID_PARAMS = error_response("1", -32602)

# Seconds that a body may take under a sanitizer on a busy machine. Processing in quadratic time
# takes many times as long.
BOUND = 40

MANY = 100_000
DEEP = 200_000
MAX_BODY = 16 * 1024 * 1024


@pytest.fixture(autouse=True)
def service_goes_on(client):
    """Limits the time of each test here, and checks an ordinary request afterwards."""
    begin = time.monotonic()
    yield
    assert time.monotonic() - begin < BOUND
    assert client.ask(call("x")) == UNKNOWN_METHOD


def members(count, value="1"):
    return ",".join(f'"m{number}":{value}' for number in range(count))


@pytest.mark.parametrize("opening, closing", [("[", "]"), ('{"a":', "}")], ids=["arrays", "objects"])
@pytest.mark.parametrize("closed", [True, False], ids=["closed", "open"])
def test_a_root_nested_deeply_is_a_parse_error(client, opening, closing, closed):
    body = opening * DEEP + ("1" + closing * DEEP if closed else "")
    assert client.ask(body.encode()) == PARSE_ERROR


@pytest.mark.parametrize("method, params, id", [
    ("x", None, "{deep}"),
    ("x", "{deep}", "1"),
    ("closeSession", "{deep}", "1"),
    ("closeSession", '{{"session_id":{deep}}}', "1"),
    ("initializeSession", '{{"devices":{deep}}}', "1"),
    ("setProperty", '{{"session_id":"_session1","property":"p","value":{deep}}}', "1"),
])
def test_a_request_nested_deeply_is_a_parse_error(client, method, params, id):
    deep = "[" * DEEP + "]" * DEEP
    filled = params and params.format(deep=deep)
    assert client.ask(call(method, filled, id.format(deep=deep))) == PARSE_ERROR


@pytest.mark.parametrize("opening, closing", [("[", "]"), ('{"a":', "}")], ids=["arrays", "objects"])
def test_a_hundred_levels_of_nesting_are_accepted(client, opening, closing):
    nested = opening * 100 + "1" + closing * 100
    assert client.ask(call("x", id=nested)) == error_response(nested, -32600)
    assert client.ask(call("x", f'{{"a":{nested}}}')) == UNKNOWN_METHOD


def test_a_very_deeply_nested_value_is_refused_by_the_schema(client):
    nested = "[" * 900 + "1" + "]" * 900
    answer = client.ask(call("initializeSession", f'{{"devices":{nested}}}'))
    assert answer == INVALID_PARAMS


def test_many_unknown_members_of_the_envelope_are_ignored(client):
    body = f'{{"jsonrpc":"2.0","id":1,"method":"x",{members(MANY)}}}'
    assert client.ask(body.encode()) == UNKNOWN_METHOD


def test_many_unknown_members_beside_a_known_method_are_ignored(client):
    body = ('{"jsonrpc":"2.0","id":1,"method":"closeSession",'
            f'"params":{{"session_id":"_session999999"}},{members(MANY, "[[[[]]]]")}}}')
    assert client.ask(body.encode()) == error_response("1", -250833)


def test_many_unknown_params_are_refused(client):
    params = f'{{"session_id":"_session999999",{members(MANY)}}}'
    assert client.ask(call("closeSession", params)) == INVALID_PARAMS


def test_many_equal_members_are_checked(client):
    params = "{" + ",".join(['"session_id":"_session999999"'] * MANY) + "}"
    assert client.ask(call("closeSession", params)) == error_response("1", -250833)


def test_an_array_of_many_wrong_items_is_refused(client):
    names = "[" + '"Mod1",' * MANY + "1]"
    assert client.ask(call("initializeSession", f'{{"devices":{names}}}')) == INVALID_PARAMS


def test_a_wide_value_inside_a_wrong_value_is_refused(client):
    wide = "{" + members(MANY, "[{}]") + "}"
    assert client.ask(call("initializeSession", f'{{"devices":{wide}}}')) == INVALID_PARAMS


def test_a_wide_id_is_echoed(client):
    wide = "[" + ",".join(str(number) for number in range(MANY)) + "]"
    assert client.ask(call("x", id=wide)) == error_response(wide, -32600)


def test_a_session_id_of_a_megabyte_is_unknown(client):
    params = f'{{"session_id":"_session{"1" * 1_000_000}"}}'
    assert client.ask(call("closeSession", params)) == error_response("1", -250833)


def test_a_session_id_of_a_megabyte_of_letters_is_refused(client):
    params = f'{{"session_id":"_session{"a" * 1_000_000}"}}'
    assert client.ask(call("closeSession", params)) == INVALID_PARAMS


def test_a_name_list_of_a_million_empty_names_opens_nothing(client):
    answer = client.ask(call("initializeSession", f'{{"devices":"{"," * 1_000_000}"}}'))
    assert answer.startswith(b'{"jsonrpc":"2.0","id":1,"error":{"code":-32000,'), answer


def test_a_big_batch_of_failures_stops_at_the_first(client):
    answer = client.ask(b"[" + b",".join([b"1"] * 1000) + b"]")
    skipped = error_response("null", -32001)
    assert answer == b"[" + b",".join([error_response("null", -32600)] + [skipped] * 999) + b"]"


def test_a_body_of_the_largest_size_is_served(client):
    assert client.ask(call("x").ljust(MAX_BODY)) == UNKNOWN_METHOD


def test_a_body_of_the_largest_size_in_one_text_is_served(client):
    empty = len(call("x", '{"a":""}'))
    body = call("x", '{"a":"' + "y" * (MAX_BODY - empty) + '"}')
    assert len(body) == MAX_BODY
    assert client.ask(body) == UNKNOWN_METHOD


def test_a_body_of_one_byte_more_is_refused_by_the_host(host):
    status, _, _ = host.post(call("x").ljust(MAX_BODY + 1))
    assert status == 413


@pytest.mark.parametrize("text", [
    b"\xff", b"\xc0\x80", b"\xed\xa0\x80", b"\xf5\x80\x80\x80", b"Mod1\xe2\x82", b"\\u0000",
    b"Mod1\\u0000", b"Mod1\\u0000x", b"Mod1/ch0\\u0000", b"\\u0000Mod1", b"\\udc00", b"\\uffff",
    b"\xff/ch0", b"Mod1/\xff", b"Mod1/\xff:1", b"\x7f", b"%s%n%1%", b"$DefaultDevices", b"/", b"//",
    b":", b",", b"Mod1/ch0:\xff", b"{}", b"'; --", b"\\\"", b"\\\\", b"\\n\\r\\t"], ids=ascii)
@pytest.mark.parametrize("member", ["devices", "physical_channels", "nvmem_areas"])
@pytest.mark.parametrize("form", [b'"%b"', b'["%b"]', b'["Mod1","%b"]'], ids=["text", "array", "two"])
def test_unusual_names_get_a_complete_response(client, member, text, form):
    body = (b'{"jsonrpc":"2.0","id":1,"method":"initializeSession","params":{"' + member.encode() +
            b'":' + form.replace(b"%b", text) + b"}}")
    answer = client.ask(body)
    client.close_if_opened(answer)
    assert answer.startswith((b'{"jsonrpc":"2.0","id":1,"error":{"code":-32000,"message":""',
                              b'{"jsonrpc":"2.0","id":1,"result":{"session_id":"_session'))
    assert answer.endswith(b"}}")


@pytest.mark.parametrize("group", [b"\xff", b"\xc0\x80", b"\\u0000", b"a\\u0000b", b"\\udc00",
                                   b"\xed\xa0\x80", b"%s%n", b"g" * 1_000_000],
                         ids=lambda text: ascii(text)[:20])
def test_unusual_groups_open_a_session(client, group):
    body = (b'{"jsonrpc":"2.0","id":1,"method":"initializeSession",'
            b'"params":{"devices":"Mod1","reservation_group":"' + group + b'"}}')
    answer = client.ask(body)
    client.close_if_opened(answer)
    assert answer.startswith(b'{"jsonrpc":"2.0","id":1,"result":{"session_id":"_session')


@pytest.mark.parametrize("access", [b"\xff", b"ReadOnly\\u0000", b"\\u0000", b"\\udc00",
                                    b"ReadWrite\\u0000x"], ids=ascii)
def test_unusual_words_for_access_are_refused(client, access):
    body = (b'{"jsonrpc":"2.0","id":1,"method":"initializeSession","params":{"access":"' + access +
            b'"}}')
    assert client.ask(body) == INVALID_PARAMS
