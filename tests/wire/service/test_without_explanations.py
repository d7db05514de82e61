"""How the service behaves without installed explanation files."""

import pytest

from hostlib import BUILD_DIR, Host
from jsonrpc import Client, call, result_response

FILES = {"etc/qinstal/share/qitrmc.ini": b"[WebService]\nEnable=1\n"}


@pytest.fixture(scope="module")
def bare_host():
    with Host(plugin=BUILD_DIR / "lib/libqitrmcsvc_cwd.so", files=FILES) as host:
        yield host


def message(code, details, id="1"):
    text = f"Error description not found  {details}"
    return (f'{{"jsonrpc":"2.0","id":{id},"error":{{"code":{code},"message":"{text}"}}}}').encode()


def test_requests_that_succeed_are_answered(bare_host):
    with Client(bare_host) as client, client.session() as session:
        assert client.ask_whole(call("abortSession", {"session_id": session})) == result_response()


@pytest.mark.parametrize("body, answer", [
    (b"{}", message(-32600, "Invalid Member: id", id="null")),
    (b"", message(-32700, "Details: The document is empty. Offset: 0", id="null")),
    (call("x"), message(-32601, "Method: x")),
    (call("closeSession"), message(
        -32602, "Parameter: #/params Details: The following parameter(s) is required: session_id.")),
])
def test_failures_with_a_code_of_their_own_and_details_keep_their_details(bare_host, body, answer):
    assert bare_host.post(body)[::2] == (200, answer)


@pytest.mark.parametrize("body", [
    b"[]",
    b"1",
    call("closeSession", {"session_id": "_session999"}),
    call("initializeSession", {"devices": "None"}),
    b"[" + call("x") + b"," + call("y") + b"]",
])
def test_failures_without_details_that_need_a_text_are_an_empty_500(bare_host, body):
    assert bare_host.post(body)[::2] == (500, b"")


def test_the_service_goes_on_after_such_a_failure(bare_host):
    bare_host.post(b"[]")
    with Client(bare_host) as client, client.session() as session:
        assert client.ask_whole(call("abortSession", {"session_id": session})) == result_response()
