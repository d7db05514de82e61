"""Requests from web pages, and requests for a name that the host does not have."""

import re
import socket

import pytest

from hostlib import PATIENCE, Host
from jsonrpc import Client, call

ALLOWED = "https://app.example"
PREFLIGHT = {"Access-Control-Request-Method": "POST"}


def raw_answer(host, head, body=b""):
    """All bytes of the answer to a request on a connection of its own, the date blanked."""
    with host.raw_socket() as client:
        client.sendall(head.replace("\n", "\r\n").encode() + b"\r\n" + body)
        client.shutdown(socket.SHUT_WR)
        with client.makefile("rb") as stream:
            return re.sub(rb"Date: [^\r]*", b"Date: -", stream.read())


def text_of(answer, status=403):
    code, headers, body = answer
    assert (code, headers["Content-Type"]) == (status, "text/plain")
    return body.decode()


@pytest.mark.parametrize("options", [(), ("--allow-origin", ALLOWED, "--host-name", "lab-pc")])
def test_a_client_without_an_origin_sees_no_difference(start_host, options):
    host = start_host(*options)
    head = "POST /qitrmc/Echo HTTP/1.1\nHost: {}\nConnection: close\nContent-Length: 3\n"
    for name in (f"127.0.0.1:{host.address[1]}", "127.1.2.3", "localhost:1", "LOCALHOST", "[::1]"):
        answer_head, body = raw_answer(host, head.format(name), b"abc").split(b"\r\n\r\n")
        first_line, *lines = answer_head.split(b"\r\n")
        assert (first_line, body) == (b"HTTP/1.1 200 OK", b"abc")
        assert sorted(lines) == [b"Connection: close", b"Content-Length: 3",
                                 b"Content-Type: application/json; charset=utf-8", b"Date: -"]


def test_a_client_without_a_host_is_served_unless_it_names_an_origin(host):
    head = "POST /qitrmc/Echo HTTP/1.0\nContent-Length: 3\n"
    assert raw_answer(host, head, b"abc").startswith(b"HTTP/1.1 200 OK\r\n")
    assert raw_answer(host, head + f"Origin: {host.base_url}\n", b"abc").startswith(
        b"HTTP/1.1 403 Forbidden\r\n")


@pytest.mark.parametrize("headers", [{}, {"Content-Type": "text/plain"}])
@pytest.mark.parametrize("origin", ["http://evil.example", "http://localhost:3000"])
def test_a_page_of_another_site_is_refused_before_the_plugin(start_host, tmp_path, origin, headers):
    host = start_host(HOST_PLUGIN_LOG=str(tmp_path / "log"))
    for method in ("POST", "GET", "OPTIONS"):
        answer = host.request(method, "/qitrmc/Nothing", b"x", {**headers, "Origin": origin})
        assert text_of(answer) == (
            f"Requests of web pages from {origin} are not taken. To take them, start the host with "
            f"--allow-origin {origin}.\n")
        assert answer[1]["Access-Control-Allow-Origin"] is None
    assert host.stop() == 0
    assert (tmp_path / "log").read_text() == "init\nfinalize\n"


def test_a_page_of_another_site_set_a_voltage():
    with Host() as host, Client(host) as client:
        session = client.open_session({"devices": "Mod2"})
        channel = {"session_id": session, "property": "PSU.Voltage",
                   "physical_channels": "Mod2/ch0"}
        read = call("getProperty", channel)
        before = client.ask(read)
        write = call("setProperty", {**channel, "value": 5})
        status, _, _ = host.post(write, headers={"Origin": "http://evil.example",
                                                 "Content-Type": "text/plain"})
        assert (status, client.ask(read)) == (403, before)
        client.ask(write)
        assert client.ask(read) != before


def test_a_page_without_an_origin_of_its_own_is_foreign(host):
    assert text_of(host.post(b"", "Echo", {"Origin": "null"})) == (
        'Requests with the Origin "null" are not taken. Serve the page from a web server, and start '
        "the host with --allow-origin and the origin of that server.\n")


def test_the_hosts_own_origin_is_served(host):
    status, headers, body = host.post(b"abc", "Echo", {"Origin": host.base_url})
    assert (status, body) == (200, b"abc")
    assert headers["Access-Control-Allow-Origin"] is None
    upper = host.base_url.upper()
    assert host.post(b"abc", "Echo", {"Origin": upper})[0] == 200


def test_a_site_whose_name_resolves_to_the_hosts_address_is_refused(host):
    """DNS rebinding: the browser regards page and host as one origin."""
    port = host.address[1]
    for origin in ({}, {"Origin": f"http://evil.example:{port}"}):
        answer = host.post(b"abc", "Echo", {"Host": f"Evil.example:{port}", **origin})
        assert text_of(answer) == (
            "Requests to the host name evil.example are not taken. Use an address of this machine, "
            "or start the host with --host-name evil.example.\n")


def test_a_host_name_of_the_command_line_is_served(start_host):
    host = start_host("--host-name", "Lab-PC.example", "--host-name", "192.0.2.7")
    for name in ("lab-pc.example", "LAB-PC.EXAMPLE:1234", "192.0.2.7:80", "localhost"):
        assert host.post(b"abc", "Echo", {"Host": name})[2] == b"abc"
    own = {"Host": "lab-pc.example:1234", "Origin": "http://lab-pc.example:1234"}
    assert host.post(b"abc", "Echo", own)[2] == b"abc"
    assert host.post(b"abc", "Echo", {"Host": "lab-pc"})[0] == 403


@pytest.mark.parametrize("listen, name", [
    ("localhost:0", "localhost"), ("0.0.0.0:0", "0.0.0.0"), ("[::]:0", "[::]"),
    ("127.0.0.2:0", "127.0.0.2"), ("[::1]:0", "[0:0:0:0:0:0:0:1]")])
def test_the_listen_address_is_served(start_host, listen, name):
    host = start_host("--listen", listen)
    port = host.address[1]
    headers = {"Host": f"{name}:{port}", "Origin": f"http://{name}:{port}"}
    assert host.post(b"abc", "Echo", headers)[2] == b"abc"


def address_of_this_machine():
    """An address that is not a loopback address; nothing is sent."""
    with socket.socket(socket.AF_INET, socket.SOCK_DGRAM) as probe:
        try:
            probe.connect(("192.0.2.1", 9))
        except OSError:
            pytest.skip("this machine has no address but the loopback ones")
        return probe.getsockname()[0]


@pytest.mark.parametrize("listen", ["0.0.0.0:0", "[::]:0"])
def test_a_host_on_all_addresses_accepts_the_address_that_was_connected_to(start_host, listen):
    address = address_of_this_machine()
    host = start_host("--listen", listen)
    with socket.create_connection((address, host.address[1]), timeout=PATIENCE) as client:
        client.sendall(f"POST /qitrmc/Echo HTTP/1.1\r\nHost: {address}:8080\r\nConnection: close\r\n"
                       f"Origin: http://{address}:8080\r\nContent-Length: 3\r\n\r\nabc".encode())
        with client.makefile("rb") as stream:
            assert stream.read().endswith(b"\r\n\r\nabc")
    assert host.post(b"abc", "Echo", {"Host": address})[0] == 403


@pytest.mark.parametrize("twice", ["Host: localhost\nHost: localhost\n",
                                   "Host: localhost\nHost: evil.example\n",
                                   f"Host: localhost\nOrigin: {ALLOWED}\nOrigin: {ALLOWED}\n"])
def test_a_header_that_comes_twice_is_refused(start_host, twice):
    host = start_host("--allow-origin", ALLOWED)
    answer = raw_answer(host, "POST /qitrmc/Echo HTTP/1.1\nConnection: close\n" + twice +
                        "Content-Length: 3\n", b"abc")
    assert answer.startswith(b"HTTP/1.1 403 Forbidden\r\n")
    assert answer.endswith(b"\r\n\r\nA request has one Host and at most one Origin.\n")


@pytest.mark.parametrize("name", ["", "a b", "127.0.0.1@evil.example", "[::1", "localhost:x"])
def test_a_malformed_host_header_is_refused(host, name):
    assert "is not a name or address" in text_of(host.post(b"", "Echo", {"Host": name}))


def test_an_allowed_origin_is_served_and_may_read_every_answer(start_host):
    host = start_host("--allow-origin", ALLOWED, "--allow-origin", "http://localhost:3000",
                      "--max-body", "5")
    for origin in (ALLOWED, "http://localhost:3000"):
        for entry, body, expected in (("Echo", b"abc", 200), ("Echo", b"abcdef", 413),
                                      ("a/b", b"", 404)):
            status, headers, _ = host.post(body, entry, {"Origin": origin})
            assert status == expected
            assert headers.get_all("Access-Control-Allow-Origin") == [origin]
            assert headers.get_all("Vary") == ["Origin"]
    assert host.post(b"", "Echo", {"Origin": "http://app.example"})[0] == 403


def test_the_preflight_of_an_allowed_origin_is_answered_without_the_plugin(start_host, tmp_path):
    host = start_host("--allow-origin", ALLOWED, HOST_PLUGIN_LOG=str(tmp_path / "log"))
    head = (f"OPTIONS /qitrmc/Call HTTP/1.1\nHost: localhost\nConnection: close\nOrigin: {ALLOWED}\n"
            "Access-Control-Request-Method: POST\nAccess-Control-Request-Headers: content-type\n")
    answer = raw_answer(host, head)
    assert answer.startswith(b"HTTP/1.1 204 No Content\r\n")
    lines, body = answer.split(b"\r\n\r\n")
    assert body == b""
    assert sorted(lines.split(b"\r\n")[1:]) == [
        b"Access-Control-Allow-Headers: content-type",
        b"Access-Control-Allow-Methods: POST",
        b"Access-Control-Allow-Origin: https://app.example",
        b"Access-Control-Max-Age: 600",
        b"Connection: close",
        b"Date: -",
        b"Vary: Origin",
    ]
    assert host.stop() == 0
    assert (tmp_path / "log").read_text() == "init\nfinalize\n"


def test_the_preflight_of_another_origin_is_refused(start_host):
    host = start_host("--allow-origin", ALLOWED)
    answer = host.request("OPTIONS", "/qitrmc/Call", headers={"Origin": "http://evil.example",
                                                              **PREFLIGHT})
    assert "--allow-origin http://evil.example" in text_of(answer)
    assert answer[1]["Access-Control-Allow-Origin"] is None


def test_options_without_a_preflight_reach_the_plugin(start_host):
    host = start_host("--allow-origin", ALLOWED)
    for headers in ({}, PREFLIGHT, {"Origin": ALLOWED}, {"Origin": host.base_url, **PREFLIGHT}):
        status, _, body = host.request("OPTIONS", "/qitrmc/Call", headers=headers)
        assert status == 200
        assert b"method OPTIONS\n" in body


def test_expect_100_continue_from_another_site_is_refused_before_the_body(host):
    with host.raw_socket() as client:
        client.sendall(b"POST /qitrmc/Echo HTTP/1.1\r\nHost: localhost\r\nContent-Length: 3\r\n"
                       b"Origin: http://evil.example\r\nExpect: 100-continue\r\n\r\n")
        assert client.recv(100).startswith(b"HTTP/1.1 403 ")


def test_behind_https_the_hosts_own_origin_is_secure(start_host, certificate):
    host = start_host("--tls-cert", certificate[0], "--tls-key", certificate[1])
    assert host.base_url.startswith("https://")
    assert host.post(b"abc", "Echo", {"Origin": host.base_url})[2] == b"abc"
    plain = host.base_url.replace("https:", "http:")
    assert host.post(b"abc", "Echo", {"Origin": plain})[0] == 403
