"""What the host serves besides the service: the files of a page, and the description of the methods."""

import pytest

from hostlib import IDLE_SECONDS, Host

POLICY = ("default-src 'none'; script-src 'self'; style-src 'self'; img-src 'self' data: blob:; "
          "connect-src 'self'; base-uri 'none'; form-action 'none'; frame-ancestors 'none'")
NOTHING = b"There is nothing here. The service is at /qitrmc/Call.\n"
FILES = {"page/index.html": b"<!doctype html>", "page/assets/app-1.js": b"run()", "secret": b"secret"}


@pytest.fixture(scope="module")
def host():
    with Host(options=("--timeout", IDLE_SECONDS, "--web", "page"), files=FILES) as running:
        yield running
        assert (running.stop(), running.stderr) == (0, "")


def test_the_page_is_at_the_root(host):
    status, headers, body = host.request("GET", "/")
    assert (status, body) == (200, b"<!doctype html>")
    assert headers["Content-Type"] == "text/html; charset=utf-8"
    assert headers["Cache-Control"] == "no-cache"
    assert headers["Content-Security-Policy"] == POLICY
    assert headers["X-Content-Type-Options"] == "nosniff"


def test_a_file_with_a_hash_in_its_name_is_kept_by_browsers(host):
    status, headers, body = host.request("GET", "/assets/app-1.js")
    assert (status, body) == (200, b"run()")
    assert headers["Cache-Control"] == "public, max-age=31536000, immutable"


def test_a_known_file_is_not_sent_again(host):
    tag = host.request("GET", "/")[1]["ETag"]
    status, headers, body = host.request("GET", "/", headers={"If-None-Match": tag})
    assert (status, headers["ETag"], body) == (304, tag, b"")


def test_head_gives_the_length_alone(host):
    status, headers, body = host.request("HEAD", "/")
    assert (status, headers["Content-Length"], body) == (200, "15", b"")


def test_a_page_cannot_be_written(host):
    status, headers, body = host.request("POST", "/", b"abc")
    assert (status, headers["Allow"]) == (405, "GET, HEAD")
    assert body == b"This can only be read, with GET.\n"


@pytest.mark.parametrize("path", [
    "/../secret", "/%2e%2e/secret", "/..%2fsecret", "/assets/../../secret", "/assets/%2e%2e/%2e%2e/secret",
    "//secret", "/index.html%00", "/assets/", "/assets", "/page/index.html", "/" + "a" * 8000])
def test_nothing_else_is_reached(host, path):
    status, headers, body = host.request("GET", path)
    assert (status, headers["Content-Type"], body) == (404, "text/plain", NOTHING)


def test_a_path_longer_than_the_head_may_be_is_refused(host):
    assert host.request("GET", "/" + "a" * 200000)[0] in (414, 431)


@pytest.mark.parametrize("size, code", [(15 * 1024, 404), (17 * 1024, 431)])
def test_a_head_of_fifteen_kilobytes_is_read(host, size, code):
    assert host.request("GET", "/nothing", headers={"X-Long": "a" * size})[0] == code


def test_the_service_answers_beside_the_page_as_without_it(host):
    body = b'{"jsonrpc": "2.0", "id": 1, "method": "initializeSession"}'
    status, headers, answer = host.post(body)
    assert (status, answer) == (200, b'{"jsonrpc":"2.0","id":1,"result":{"session_id":"_session1"}}')
    assert "Content-Security-Policy" not in headers
    assert "ETag" not in headers


def test_the_start_ends_with_the_address_of_the_page():
    with Host(options=("--web", "page"), files=FILES) as running:
        lines = [running.process.stdout.readline() for _ in range(6)]
        assert lines[-1].decode() == f"Open {running.base_url}/ in a browser.\n"


def test_a_folder_that_is_missing_ends_the_start():
    with pytest.raises(AssertionError, match="The folder nowhere of the page cannot be read: No such "
                                             "file or directory. Name a readable folder with --web."):
        Host(options=("--web", "nowhere"))
