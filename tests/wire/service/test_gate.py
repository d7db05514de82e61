"""The checks before a request is processed: setting, transport, method, entry, body."""

import subprocess

import pytest

from hostlib import Host
from jsonrpc import Client, blanked, call, error_response

NOT_HTTP = b"Only HTTP protocol is supported."
NOT_POST = b"Only HTTP POST request is supported."

REQUEST = call("x")
UNKNOWN_METHOD = error_response("1", -32601)
SERVED_TYPE = "application/json; charset=utf-8"


@pytest.mark.parametrize("method", ["GET", "PUT", "DELETE", "OPTIONS", "PATCH"])
def test_only_post_is_served(host, method):
    for entry in ("Call", "call"):
        status, _, body = host.request(method, f"/qitrmc/{entry}", REQUEST)
        assert (status, body) == (404, NOT_POST)


def test_a_get_without_body_is_refused(host):
    status, _, body = host.request("GET", "/qitrmc/Call")
    assert (status, body) == (404, NOT_POST)


def test_a_head_is_refused_without_a_body(host):
    status, headers, body = host.request("HEAD", "/qitrmc/Call")
    assert (status, body) == (404, b"")
    assert headers["Content-Length"] == str(len(NOT_POST))


def test_the_method_is_checked_before_the_entry(host):
    status, _, body = host.request("GET", "/qitrmc/Other")
    assert (status, body) == (404, NOT_POST)


@pytest.mark.parametrize("method", ["post", "Post", "POSTS"])
def test_the_letter_case_of_the_method_matters(host, method):
    with host.raw_socket() as connection:
        connection.sendall(f"{method} /qitrmc/Call HTTP/1.1\r\nHost: localhost\r\n"
                           "Connection: close\r\nContent-Length: 0\r\n\r\n".encode())
        with connection.makefile("rb") as stream:
            answer = stream.read()
    assert answer.startswith(b"HTTP/1.1 404 ") and answer.endswith(b"\r\n\r\n" + NOT_POST), answer


@pytest.mark.parametrize("entry", ["Call", "call", "CALL", "cAlL", "caLL"])
def test_the_letter_case_of_the_entry_does_not_matter(host, entry):
    status, headers, body = host.post(REQUEST, entry)
    assert (status, blanked(body)) == (200, UNKNOWN_METHOD)
    assert headers.get_all("Content-Type") == [SERVED_TYPE]


@pytest.mark.parametrize("entry", ["Cal", "Calls", "xCall", "Call%20", "%20Call", "C%C3%A4ll",
                                   "Other", "Call%00", "Ca-ll", "%F0%9F%98%80"])
def test_another_entry_is_not_found_and_has_an_empty_body(host, entry):
    status, _, body = host.post(REQUEST, entry)
    assert (status, body) == (404, b"")


def test_another_entry_is_not_found_whatever_the_body(host):
    for body in (b"", b"{", b"x" * 100000):
        assert host.post(body, "Other")[0::2] == (404, b"")


def test_a_served_answer_has_the_type_and_the_length(host):
    for body, answer in ((REQUEST, UNKNOWN_METHOD), (b"", error_response("null", -32700)),
                         (b"[]", error_response("null", -32600))):
        status, headers, served = host.post(body)
        assert (status, blanked(served)) == (200, answer)
        assert headers.get_all("Content-Type") == [SERVED_TYPE]
        assert headers.get_all("Content-Length") == [str(len(served))]


@pytest.mark.parametrize("header", [
    {"Content-Type": "text/plain"}, {"Content-Type": "application/json; charset=utf-16"},
    {"Content-Type": ""}, {"Accept": "text/html"}, {"Accept-Language": "de"},
    {"Content-Encoding": "gzip"}, {"X-Forwarded-Proto": "https"},
    {"X-HTTP-Method-Override": "GET"}])
def test_headers_change_nothing(host, header):
    status, headers, body = host.post(REQUEST, headers=header)
    assert (status, headers["Content-Type"], blanked(body)) == (200, SERVED_TYPE, UNKNOWN_METHOD)


def test_an_absent_body_is_an_empty_body(host):
    with host.raw_socket() as connection:
        connection.sendall(b"POST /qitrmc/Call HTTP/1.1\r\nHost: localhost\r\nConnection: close\r\n"
                           b"Content-Length: 0\r\n\r\n")
        with connection.makefile("rb") as stream:
            answer = stream.read()
    assert answer.startswith(b"HTTP/1.1 200 ")
    assert blanked(answer).endswith(b"\r\n\r\n" + error_response("null", -32700))


@pytest.mark.parametrize("length", [*range(250, 262), 510, 511, 512, 513, 4095, 4096, 4097, 65535,
                                    65536, 65537])
def test_a_body_of_any_length_arrives_whole(host, length):
    """The last byte closes the JSON text: without it the request would be a parse error."""
    with Client(host) as client:
        body = REQUEST[:-1].ljust(length - 1) + b"}"
        assert len(body) == length
        assert client.ask(body) == UNKNOWN_METHOD
        assert client.ask(body[:-1] + b" ") == error_response("null", -32700)


def test_a_body_in_chunks_arrives_whole(host):
    status, _, body = host.post(iter([REQUEST[:10], REQUEST[10:11], REQUEST[11:]]))
    assert (status, blanked(body)) == (200, UNKNOWN_METHOD)


def test_a_long_answer_arrives_whole(client):
    id = '"' + "y" * 3_000_000 + '"'
    assert client.ask(call("x", id=id)) == error_response(id, -32601)


@pytest.fixture(scope="module")
def certificate(tmp_path_factory):
    """The options of a host that serves HTTPS with a self-signed certificate."""
    directory = tmp_path_factory.mktemp("tls")
    key, certificate = directory / "key.pem", directory / "certificate.pem"
    subprocess.run(["openssl", "req", "-x509", "-newkey", "rsa:2048", "-nodes", "-subj",
                    "/CN=localhost", "-days", "2", "-keyout", key, "-out", certificate],
                   check=True, capture_output=True)
    return "--tls-cert", certificate, "--tls-key", key


@pytest.fixture(scope="module")
def secure_host(certificate):
    """A host that passes the real transport to the plug-in."""
    with Host(options=(*certificate, "--pass-transport")) as running:
        yield running


@pytest.mark.parametrize("method", ["POST", "GET", "PUT"])
@pytest.mark.parametrize("entry", ["Call", "Other"])
def test_the_secure_transport_is_refused_before_anything_else(secure_host, method, entry):
    status, _, body = secure_host.request(method, f"/qitrmc/{entry}", REQUEST)
    assert (status, body) == (404, NOT_HTTP)


def test_a_host_with_tls_files_serves_requests(certificate):
    with Host(options=certificate) as host:
        assert host.base_url.startswith("https://")
        status, _, body = host.post(REQUEST)
        assert (status, blanked(body)) == (200, UNKNOWN_METHOD)
