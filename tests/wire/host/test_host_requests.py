"""What the plug-in sees of a request, and what the client sees of the plug-in's response."""

import http.client

import pytest


def described(body):
    """The lines of the describing entry as a dictionary."""
    return dict(line.split(" ", 1) for line in body.decode().splitlines())


def test_the_plugin_sees_entry_transport_method_and_body(host):
    seen = described(host.post(b"abc")[2])
    assert seen["entry"] == "Call"
    assert seen["transport"] == "http"
    assert seen["method"] == "POST"
    assert seen["body"] == "3"


def test_an_unknown_variable_has_no_size(host):
    assert described(host.post(b"")[2])["other"] == "none, size 0"


@pytest.mark.parametrize("method", ["GET", "PUT", "DELETE", "PATCH", "OPTIONS", "CALL"])
def test_every_method_reaches_the_plugin(host, method):
    status, _, body = host.request(method, "/qitrmc/Call")
    assert status == 200
    assert described(body)["method"] == method


def test_head_is_answered_without_a_body(host):
    status, headers, body = host.request("HEAD", "/qitrmc/Echo")
    assert (status, body) == (200, b"")
    assert headers["Content-Type"] == "application/json; charset=utf-8"


@pytest.mark.parametrize("path, entry", [
    ("/qitrmc/call", "call"),
    ("/qitrmc/Call?id=1&x=%2F", "Call"),
    ("/qitrmc/%43all", "Call"),
    ("/qitrmc/Call%00", "Call<0>"),
    ("/qitrmc/a%2Fb", "a/b"),
    ("/qitrmc/a+b", "a+b"),
    ("/qitrmc/caf%C3%A9", "caf<E9>"),
    ("/qitrmc/%F0%9F%98%80", "<1F600>"),
    ("/qitrmc/%FF", "<FFFD>"),
    ("/qitrmc/50%", "50%"),
])
def test_the_entry_is_the_decoded_last_segment(host, path, entry):
    status, _, body = host.request("POST", path, b"")
    assert status == 200
    assert described(body)["entry"] == entry


def test_the_absolute_form_of_a_target_is_understood(host):
    status, _, body = host.request("POST", host.base_url + "/qitrmc/Call", b"")
    assert (status, described(body)["entry"]) == (200, "Call")


@pytest.mark.parametrize("path", ["/", "/qitrmc", "/qitrmc/", "/qitrmc/a/b", "/QITRMC/Call", "/x"])
@pytest.mark.parametrize("method", ["GET", "POST"])
def test_other_paths_are_not_found(host, method, path):
    status, headers, body = host.request(method, path, b"abc" if method == "POST" else None)
    assert (status, headers["Content-Type"]) == (404, "text/plain")
    assert body == b"There is nothing here. The service is at /qitrmc/Call.\n"


@pytest.mark.parametrize("size, first_read_failed", [
    (0, "0"), (1, "0"), (255, "0"), (256, "0"), (257, "1"), (5000, "1"), (1000000, "1"),
])
def test_a_body_of_any_size_is_read_whole(host, size, first_read_failed):
    seen = described(host.post(b"x" * size)[2])
    assert (seen["first"], seen["body"]) == (f"read {first_read_failed}", str(size))


@pytest.mark.parametrize("size", [0, 255, 256, 257, 65536, 3000000])
def test_a_body_is_passed_unchanged_in_both_directions(host, size):
    text = bytes(33 + i % 94 for i in range(size))
    status, headers, body = host.post(text, "Echo")
    assert (status, body) == (200, text)
    assert headers["Content-Type"] == "application/json; charset=utf-8"
    assert headers["Content-Length"] == str(size)


def test_a_chunked_body_is_put_together(host):
    connection = host.connection()
    connection.request("POST", "/qitrmc/Echo", iter([b"ab", b"c", b"d" * 300]),
                       encode_chunked=True)
    response = connection.getresponse()
    assert (response.status, response.read()) == (200, b"abc" + b"d" * 300)
    connection.close()


def test_a_response_without_code_type_or_body_is_200_and_plain_text(host):
    status, headers, body = host.post(b"", "Nothing")
    assert (status, headers["Content-Type"], body) == (200, "text/plain", b"")
    assert headers["Content-Length"] == "0"


@pytest.mark.parametrize("code", [200, 201, 400, 404, 500, 503, 599])
def test_the_plugin_sets_the_status_code(host, code):
    status, _, body = host.post(b"%d" % code, "Code")
    assert (status, body) == (code, b"coded")


def test_a_code_that_has_no_body_leaves_it_out(host):
    connection = host.connection()
    for code in (204, 304, 200):
        connection.request("POST", "/qitrmc/Code", b"%d" % code)
        response = connection.getresponse()
        assert (response.status, response.read()) == (code, b"coded" if code == 200 else b"")
    connection.close()


@pytest.mark.parametrize("code", [0, -1, 99, 100, 101, 199, 600, 1000, 2147483647])
def test_an_invalid_status_code_is_500(host, code):
    status, _, body = host.post(b"%d" % code, "Code")
    assert (status, body) == (500, b"The service failed on this request.\n")


def test_the_plugin_sets_the_content_type(host):
    assert host.post(b"image/png", "Type")[1]["Content-Type"] == "image/png"


def test_a_content_type_cannot_add_headers(host):
    status, headers, _ = host.post(b"a/b\r\nX-More: 1", "Type")
    assert status == 500
    assert "X-More" not in headers


def test_a_large_response_is_complete(host):
    assert host.post(b"20000001", "Much")[2] == b"x" * 20000001


@pytest.mark.parametrize("entry, text", [
    ("Throw", "The plug-in's qitrmcRun failed: thrown on request\n"),
    ("ThrowNumber", "The plug-in's qitrmcRun failed: an exception of an unknown kind\n"),
])
def test_an_exception_from_the_plugin_is_500_and_the_host_keeps_serving(host, entry, text):
    status, headers, body = host.post(b"", entry)
    assert (status, headers["Content-Type"]) == (500, "text/plain")
    assert body == b"The service failed on this request.\n"
    assert host.stderr == text
    assert host.post(b"abc", "Echo")[2] == b"abc"


def test_a_body_at_the_limit_is_accepted_and_one_byte_more_is_refused(start_host):
    host = start_host("--max-body", "1000")
    assert host.post(b"x" * 1000, "Echo")[0] == 200
    status, headers, body = host.post(b"x" * 1001, "Echo")
    assert (status, headers["Content-Type"]) == (413, "text/plain")
    assert body == b"The request body is too large: at most 1000 bytes are taken.\n"


def test_the_limit_is_16_mebibytes_by_default(host):
    assert host.post(b"x" * 16777216, "Nothing")[0] == 200
    assert host.post(b"x" * 16777217, "Nothing")[0] == 413


def test_a_chunked_body_above_the_limit_is_refused_and_the_connection_stays_open(start_host):
    host = start_host("--max-body", "1000")
    connection = host.connection()
    connection.request("POST", "/qitrmc/Echo", iter([b"x" * 600] * 2), encode_chunked=True)
    response = connection.getresponse()
    assert response.status == 413
    response.read()
    connection.request("POST", "/qitrmc/Echo", b"after")
    assert connection.getresponse().read() == b"after"
    connection.close()


def test_a_refused_body_is_not_kept_in_memory(start_host):
    host = start_host("--max-body", "1000")

    def peak_kilobytes():
        status = open(f"/proc/{host.process.pid}/status", encoding="ascii").read()
        return int(status.split("VmHWM:")[1].split()[0])

    host.post(b"", "Nothing")
    before = peak_kilobytes()
    assert host.post(b"x" * 60_000_000, "Echo")[0] == 413
    assert peak_kilobytes() - before < 20_000


def test_expect_100_continue_is_refused_before_a_body_above_the_limit(host):
    with host.raw_socket() as client:
        client.sendall(b"POST /qitrmc/Echo HTTP/1.1\r\nHost: localhost\r\n"
                       b"Content-Length: 16777217\r\nExpect: 100-continue\r\n\r\n")
        assert client.recv(100).startswith(b"HTTP/1.1 413 ")


def test_expect_100_continue_is_answered_with_100_for_an_acceptable_body(host):
    with host.raw_socket() as client:
        client.sendall(b"POST /qitrmc/Echo HTTP/1.1\r\nHost: localhost\r\nContent-Length: 3\r\n"
                       b"Expect: 100-continue\r\n\r\n")
        assert client.recv(100) == b"HTTP/1.1 100 Continue\r\n\r\n"
        client.sendall(b"abc")
        response = http.client.HTTPResponse(client)
        response.begin()
        assert (response.status, response.read()) == (200, b"abc")


def test_what_is_not_http_is_refused_and_the_host_keeps_serving(host):
    with host.raw_socket() as client:
        client.sendall(b"\x16\x03\x01\x02\x00\x01\x00\r\n\r\n")
        client.recv(1000)
    assert host.post(b"abc", "Echo")[2] == b"abc"
