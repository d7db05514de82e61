"""Numbers keep their decimal point while the host's process uses a locale with a decimal comma."""

import json

import pytest

from error_texts import NOT_CHASSIS, text, wrapped
from hostlib import BUILD_DIR, Host
from jsonrpc import Client, call, result_response

CODE = -3000001  # known to no explanation file

# The code of the cause is a whole number in exponent form.
STATUS = """{"translator": "mxlator_qitrmc", "translator_info": {"ordered_data": [
{"type": "usage", "usage": "kUsageTypeDetails", "value": 0.5, "value_type": "double"},
{"type": "usage", "usage": "kUsageTypeOffset", "value": [-1.25, 3], "value_type": "double"}]},
"nested_error": {"code": -2.50812e5, "translator": "mxlator_qitrmc"}}"""

CHASSIS = {"devices": [{
    "name": "Dev",
    "category": 2,
    "properties": {"Level": {"type": "Double", "access": "ReadWrite", "value": -0.25,
                             "min": -1.5, "max": 1e21}},
    "commands": {"Fail": {"fails": {"status": {"code": CODE, "json": STATUS}}}},
}]}


@pytest.fixture(scope="module")
def comma_host():
    with Host(plugin=BUILD_DIR / "lib" / "libhost_locale_plugin.so",
              options=("--chassis", "chassis.json"),
              files={"chassis.json": json.dumps(CHASSIS).encode()},
              env={"LOCPATH": str(BUILD_DIR / "locales"), "LC_ALL": "de_DE.UTF-8",
                   # The C library never frees the list that it makes of LOCPATH.
                   "ASAN_OPTIONS": "detect_leaks=0"}) as host:
        yield host
        assert (host.stop(), host.stderr) == (0, "")


@pytest.fixture
def client(comma_host):
    with Client(comma_host) as connected:
        yield connected


@pytest.fixture
def session(client):
    with client.session({"devices": "Dev"}) as session_id:
        yield session_id


def get_level(client, session):
    return client.ask(call("getProperty", {"session_id": session, "property": "Level"}))


def set_level(client, session, value):
    return client.ask_whole(call("setProperty", '{"session_id":"%s","property":"Level",'
                                 '"value":%s}' % (session, value)))


def test_numbers_are_read_and_written_with_a_point(client, session):
    assert get_level(client, session) == result_response('{"data_type":"Double","value":-0.25}')
    for value in ("1.5", "-0.125", "0.1"):
        assert set_level(client, session, value) == result_response('{"data_type":"Double"}')
        assert get_level(client, session) == result_response(
            '{"data_type":"Double","value":%s}' % value)


def test_a_decimal_comma_is_not_json(client, session):
    assert b'"code":-32700' in set_level(client, session, "1,5")


def test_the_limits_in_an_error_text_have_a_point(client, session):
    answer = json.loads(set_level(client, session, "-2.75"))["error"]["data"]
    assert answer["qitrmc_code"] == -250971
    assert "-2.75" in answer["qitrmc_message"]
    assert "-1.5" in answer["qitrmc_message"]


def test_the_numbers_of_a_drivers_status_have_a_point(client, session):
    params = {"session_id": session, "command": "Fail"}
    assert client.ask_whole(call("executeCommand", params)) == wrapped(
        CODE, text("Error description not found", "Details: 0.5", "Offset: -1.25, 3") + "     "
        + NOT_CHASSIS)
