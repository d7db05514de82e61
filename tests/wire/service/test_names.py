"""Devices with names in other scripts, found in any letter case."""

import json

import pytest

from hostlib import Host
from jsonrpc import Client, call, error_response, result_response

RESERVED = error_response("1", -250811)
NO_SUCH_DEVICE = error_response("1", -250956)  # from the driver
UNKNOWN_NAME = error_response("1", -250828)
UNKNOWN_METHOD = error_response("1", -32601)

# The name in the chassis file, and the name as a client may write it.
FOLDED = [("Größe", "Größe"), ("Größe", "GRÖSSE"), ("Größe", "grÖẞe"), ("Straße", "strasse"),
          ("ΣΊΣΥΦΟΣ", "σίσυφος"), ("İx", "i\u0307X"), ("ﬃ", "FFI"), ("ﬃ", "ﬀi"), ("ﬃ", "fﬁ"),
          ("Модуль", "МОДУЛЬ"), ("Plain", "pLAIN"), ("日本", "日本"), ("😀x", "😀X")]

NOT_FOLDED = ["Grosse", "Größ", "Größe1", "Strase", "Ix", "ix", "日", "Мoдуль", "Plain ", "ff", "😀"]


@pytest.fixture(scope="module")
def client(tmp_path_factory):
    """A client of a host whose chassis has devices of these names."""
    names = dict.fromkeys(name for name, _ in FOLDED)
    chassis = tmp_path_factory.mktemp("chassis") / "chassis.json"
    chassis.write_text(json.dumps(
        {"devices": [{"name": name, "category": 2} for name in names]}), encoding="utf-8")
    with Host(options=("--chassis", chassis)) as host, Client(host) as connected:
        yield connected


def json_texts(name):
    """The name as raw UTF-8 and as escapes."""
    return json.dumps(name, ensure_ascii=False), json.dumps(name)


@pytest.mark.parametrize("name, written", FOLDED)
def test_a_session_is_opened_on_a_device_in_any_letter_case(client, name, written):
    for text in json_texts(written):
        with client.session(f'{{"devices":{text}}}'):
            assert client.ask(call("initializeSession", {"devices": name})) == RESERVED


@pytest.mark.parametrize("written", NOT_FOLDED)
def test_a_name_that_differs_in_more_than_letter_case_is_unknown(client, written):
    for text in json_texts(written):
        answer = client.ask(call("initializeSession", f'{{"devices":{text}}}'))
        assert answer == NO_SUCH_DEVICE


@pytest.fixture
def reserve(client):
    """Reserves the device that a JSON text names for a session."""
    if client.ask(call("reserveDevices")) == UNKNOWN_METHOD:
        pytest.skip("the service does not have reserveDevices yet")
    return lambda session_id, text: client.ask(
        call("reserveDevices", f'{{"session_id":"{session_id}","devices":{text}}}'))


@pytest.mark.parametrize("name, written", FOLDED)
def test_a_device_is_reserved_in_any_letter_case(client, reserve, name, written):
    for text in json_texts(written):
        with client.session() as session_id:
            assert reserve(session_id, text) == result_response()
            assert client.ask(call("initializeSession", {"devices": name})) == RESERVED


@pytest.mark.parametrize("written", NOT_FOLDED)
def test_a_name_that_differs_in_more_than_letter_case_is_not_reserved(client, reserve, written):
    for text in json_texts(written):
        with client.session() as session_id:
            assert reserve(session_id, text) == UNKNOWN_NAME
