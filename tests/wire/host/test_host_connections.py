"""Many clients, slow clients, shutdown, HTTPS, and lack of memory."""

import concurrent.futures
import contextlib
import http.client
import resource
import select
import signal
import socket
import subprocess
import time

import pytest

from hostlib import BUILD_DIR, PATIENCE, TEST_PLUGIN


def read_response(client):
    """(status, body) of the next response on a raw socket."""
    response = http.client.HTTPResponse(client)
    response.begin()
    return response.status, response.read()


def raw_post(entry, body):
    return (f"POST /qitrmc/{entry} HTTP/1.1\r\nHost: localhost\r\n"
            f"Content-Length: {len(body)}\r\n\r\n".encode() + body)


def seconds_until_closed(client):
    """Waits for the host to close a connection on which it sends nothing."""
    begin = time.monotonic()
    assert client.recv(1000) == b""
    return time.monotonic() - begin


@contextlib.contextmanager
def waiting_requests(host, count):
    """Makes `count` requests wait in the plug-in; yields their futures, then releases them."""
    with concurrent.futures.ThreadPoolExecutor(count) as pool:
        waiting = [pool.submit(host.post, b"", "Wait") for _ in range(count)]
        host.post(b"%d" % count, "AwaitWaiting")
        try:
            yield waiting
        finally:
            if host.process.poll() is None:
                with contextlib.suppress(OSError):
                    host.post(b"", "Release")


def test_a_connection_serves_many_requests(host):
    connection = host.connection()
    local_ports = set()
    for i in range(100):
        connection.request("POST", "/qitrmc/Echo", b"%d" % i)
        local_ports.add(connection.sock.getsockname())
        assert connection.getresponse().read() == b"%d" % i
    connection.close()
    assert len(local_ports) == 1


def test_a_client_may_ask_for_the_connection_to_end(host):
    with host.raw_socket() as client:
        client.sendall(b"POST /qitrmc/Echo HTTP/1.1\r\nHost: localhost\r\nConnection: close\r\n"
                       b"Content-Length: 1\r\n\r\nx")
        received = b""
        while piece := client.recv(1000):
            received += piece
    assert received.startswith(b"HTTP/1.1 200 ") and received.endswith(b"\r\n\r\nx")


def test_pipelined_requests_are_answered_in_order(host):
    bodies = [b"%d" % i * (i + 1) for i in range(50)]
    with host.raw_socket() as client:
        client.sendall(b"".join(raw_post("Echo", body) for body in bodies))
        received = b""
        while received.count(b"HTTP/1.1 200 OK") < 50 or not received.endswith(bodies[-1]):
            received += client.recv(65536)
    answers = received.split(b"HTTP/1.1 200 OK")[1:]
    assert [answer.split(b"\r\n\r\n", 1)[1] for answer in answers] == bodies


def test_a_request_that_comes_byte_by_byte_is_served(host):
    with host.raw_socket() as client:
        client.setsockopt(socket.IPPROTO_TCP, socket.TCP_NODELAY, 1)
        for byte in raw_post("Echo", b"slow"):
            client.sendall(bytes([byte]))
        assert read_response(client) == (200, b"slow")


def test_requests_that_wait_in_the_plugin_delay_no_other(host):
    with waiting_requests(host, 100) as waiting:
        assert host.post(b"abc", "Echo")[2] == b"abc"
        assert not any(future.done() for future in waiting)
    assert [future.result()[::2] for future in waiting] == [(200, b"released")] * 100


def test_many_clients_at_once_each_get_their_own_answer(host):
    def converse(number):
        connection = host.connection()
        answers = []
        for i in range(50):
            connection.request("POST", "/qitrmc/Echo", b"%d of %d" % (i, number))
            answers.append(connection.getresponse().read())
        connection.close()
        return answers == [b"%d of %d" % (i, number) for i in range(50)]

    with concurrent.futures.ThreadPoolExecutor(32) as pool:
        assert all(pool.map(converse, range(32)))


def test_more_clients_than_connection_slots_are_all_served(start_host):
    host = start_host("--connections", "2")
    with concurrent.futures.ThreadPoolExecutor(16) as pool:
        answers = pool.map(lambda i: host.post(b"%d" % i, "Echo")[2], range(200))
        assert list(answers) == [b"%d" % i for i in range(200)]


def test_clients_beyond_the_connection_limit_wait_for_a_slot(start_host):
    host = start_host("--connections", "2")
    with contextlib.ExitStack() as stack:
        clients = [stack.enter_context(host.raw_socket()) for _ in range(200)]
        for client in clients:
            client.sendall(raw_post("Echo", b"abc"))
        for client in clients:
            assert read_response(client) == (200, b"abc")
            client.close()


@pytest.mark.parametrize("start", [
    b"",
    b"POST /qitrmc/Echo HTTP/1.1\r\n",
    b"POST /qitrmc/Echo HTTP/1.1\r\nHost: localhost\r\nContent-Length: 10\r\n\r\nabc",
    raw_post("Nothing", b"")[:30],
], ids=["nothing", "request line", "half a body", "half a head"])
def test_a_silent_client_is_disconnected(start_host, start):
    host = start_host("--timeout", "1")
    with host.raw_socket() as client:
        client.sendall(start)
        assert 1 <= seconds_until_closed(client) < 10
    assert host.post(b"abc", "Echo")[2] == b"abc"


def test_an_idle_connection_is_closed_after_its_request(start_host):
    host = start_host("--timeout", "1")
    with host.raw_socket() as client:
        client.sendall(raw_post("Echo", b"abc"))
        assert read_response(client) == (200, b"abc")
        assert 1 <= seconds_until_closed(client) < 10


def test_a_client_that_sends_its_head_too_slowly_is_disconnected(start_host):
    host = start_host("--timeout", "1")
    with host.raw_socket() as client:
        client.sendall(b"POST /qitrmc/Echo HTTP/1.1\r\n")
        client.settimeout(0.05)
        begin = time.monotonic()
        with pytest.raises(OSError) as caught:
            while time.monotonic() - begin < PATIENCE:
                client.sendall(b"X: y\r\n")
                with contextlib.suppress(TimeoutError):
                    if client.recv(1) == b"":
                        raise ConnectionResetError
    assert isinstance(caught.value, (ConnectionResetError, BrokenPipeError))
    assert time.monotonic() - begin >= 1


def test_a_client_that_does_not_read_its_response_is_disconnected(start_host):
    host = start_host("--timeout", "1")
    with host.raw_socket() as client:
        client.sendall(raw_post("Much", b"100000000"))
        # Only from here on is the closed connection the one under test.
        assert select.select([client], [], [], PATIENCE)[0], "the response does not begin"
        deadline = time.monotonic() + PATIENCE
        while len(open_sockets(host)) > 1:
            assert time.monotonic() < deadline
        received = 0
        with contextlib.suppress(ConnectionResetError):
            while piece := client.recv(1 << 20):
                received += len(piece)
    assert received < 100000000


def open_sockets(host):
    """The TCP sockets that the host has open, the listening one among them."""
    listing = subprocess.run(["ls", "-l", f"/proc/{host.process.pid}/fd"], check=True,
                             capture_output=True, text=True).stdout
    inodes = {line.split("socket:[")[1].rstrip("]") for line in listing.splitlines()
              if "socket:[" in line}
    table = open(f"/proc/{host.process.pid}/net/tcp", encoding="ascii").read().splitlines()[1:]
    return [line for line in table if line.split()[9] in inodes]


def test_a_request_in_the_plugin_outlives_the_timeout(start_host):
    host = start_host("--timeout", "1")
    with waiting_requests(host, 1) as waiting, host.raw_socket() as silent:
        seconds_until_closed(silent)
    assert waiting[0].result()[::2] == (200, b"released")


def test_ten_thousand_idle_clients_keep_no_other_out(start_host):
    resource.setrlimit(resource.RLIMIT_NOFILE, (resource.getrlimit(resource.RLIMIT_NOFILE)[1],) * 2)
    host = start_host("--timeout", "86400")
    with contextlib.ExitStack() as stack:
        for number in range(10000):
            idle = stack.enter_context(host.raw_socket())
            if number % 10 == 0:
                idle.sendall(b"POST /qit")
        begin = time.monotonic()
        assert host.post(b"abc", "Echo")[2] == b"abc"
        assert time.monotonic() - begin < 10


@pytest.mark.parametrize("is_encrypted", [False, True], ids=["http", "https"])
def test_a_connection_with_a_large_descriptor_is_served_like_any_other(start_host, certificate,
                                                                       is_encrypted):
    resource.setrlimit(resource.RLIMIT_NOFILE, (resource.getrlimit(resource.RLIMIT_NOFILE)[1],) * 2)
    options = ("--tls-cert", certificate[0], "--tls-key", certificate[1]) if is_encrypted else ()
    host = start_host("--timeout", "86400", *options)
    text = b"x" * 3000000
    with contextlib.ExitStack() as stack:
        for _ in range(1100):
            stack.enter_context(host.raw_socket())
        assert host.post(text, "Echo")[2] == text


def test_silent_clients_in_all_slots_are_disconnected_long_before_the_timeout(start_host):
    host = start_host("--connections", "3", "--timeout", "86400")
    with contextlib.ExitStack() as stack:
        silent = [stack.enter_context(host.raw_socket()) for _ in range(6)]
        for client in silent:
            client.sendall(b"POST /qit")
        assert host.post(b"abc", "Echo")[2] == b"abc"


def test_requests_in_flight_are_completed_before_the_host_exits(start_host, tmp_path):
    log = tmp_path / "log"
    host = start_host(HOST_PLUGIN_LOG=str(log))
    with host.raw_socket() as open_before, waiting_requests(host, 3) as waiting:
        open_before.sendall(raw_post("Echo", b"1"))
        assert read_response(open_before) == (200, b"1")
        host.process.send_signal(signal.SIGTERM)
        wait_until_refused(host)
        # A connection that was opened before is the last way in. It is no longer served ...
        open_before.sendall(raw_post("Release", b""))
        assert read_response(open_before) == (503, b"The server is stopping.\n")
        assert not any(future.done() for future in waiting)
        assert host.process.poll() is None
        host.process.send_signal(signal.SIGTERM)
    # ... so a second signal has to end what would otherwise wait forever.
    assert host.process.wait(PATIENCE) == -signal.SIGTERM
    assert "finalize" not in log.read_text()


def wait_until_refused(host):
    """Waits until the host accepts no more connections."""
    deadline = time.monotonic() + PATIENCE
    while time.monotonic() < deadline:
        try:
            host.raw_socket().close()
        except ConnectionResetError:
            continue  # the socket was shut in the middle of a connection
        except ConnectionRefusedError:
            return
    raise AssertionError("the host goes on accepting connections")


@pytest.mark.parametrize("end_signal", [signal.SIGTERM, signal.SIGINT])
def test_a_signal_lets_the_request_in_flight_complete(start_host, tmp_path, end_signal):
    log = tmp_path / "log"
    host = start_host(HOST_PLUGIN_LOG=str(log))
    body = b"x" * 1000
    with host.raw_socket() as client:
        request = raw_post("Echo", body)
        client.sendall(request[:-500])
        wait_until_in_flight(host)
        host.process.send_signal(end_signal)
        wait_until_refused(host)
        client.sendall(request[-500:])
        assert read_response(client) == (200, body)
        assert client.recv(1) == b""
    assert host.process.wait(PATIENCE) == 0
    assert log.read_text() == "init\nrun Echo\nfinalize\n"


def wait_until_in_flight(host):
    """Waits until the host has read all that its clients have sent."""
    deadline = time.monotonic() + PATIENCE
    while time.monotonic() < deadline:
        established = [line.split() for line in open_sockets(host) if line.split()[3] == "01"]
        if established and all(fields[4].endswith(":00000000") for fields in established):
            return
    raise AssertionError("the host does not read")


def test_a_stop_does_not_wait_for_idle_connections(host):
    with host.raw_socket() as silent, host.raw_socket() as idle:
        idle.sendall(raw_post("Echo", b"abc"))
        assert read_response(idle) == (200, b"abc")
        silent.sendall(b"POST /qit")
        host.process.terminate()
        assert host.process.wait(PATIENCE) == 0


def test_clients_that_vanish_do_no_harm(host):
    with waiting_requests(host, 1):
        with host.raw_socket() as client:
            client.sendall(raw_post("Wait", b""))
            host.post(b"2", "AwaitWaiting")
        with host.raw_socket() as client:
            client.sendall(raw_post("Much", b"10000000"))
    assert host.post(b"abc", "Echo")[2] == b"abc"
    assert host.stop() == 0


@pytest.mark.parametrize("options, transport", [
    ((), b"http"), (("--pass-transport",), b"https"),
], ids=["as it is behind a proxy", "as it is"])
def test_the_plugin_sees_plain_http_behind_https_by_default(start_host, certificate, options,
                                                            transport):
    host = start_host("--tls-cert", certificate[0], "--tls-key", certificate[1], *options)
    assert host.first_line.startswith("Listening on https://127.0.0.1:")
    status, _, body = host.post(b"x" * 1000)
    assert status == 200
    assert b"transport " + transport + b"\n" in body
    text = b"x" * 3000000
    assert host.post(text, "Echo")[2] == text
    assert host.stop() == 0


def test_plain_http_on_an_https_port_is_disconnected(start_host, certificate):
    host = start_host("--tls-cert", certificate[0], "--tls-key", certificate[1])
    with host.raw_socket() as client:
        client.sendall(raw_post("Echo", b"abc"))
        received = b""
        with contextlib.suppress(ConnectionResetError):
            while piece := client.recv(1000):
                received += piece
        assert b"HTTP" not in received
    assert host.post(b"abc", "Echo")[2] == b"abc"


def test_a_silent_https_client_is_disconnected(start_host, certificate):
    host = start_host("--tls-cert", certificate[0], "--tls-key", certificate[1], "--timeout", "1")
    with host.raw_socket() as client:
        assert 1 <= seconds_until_closed(client) < 10


def test_a_tls_file_that_cannot_be_read_is_named(refused_start, certificate, tmp_path):
    missing = tmp_path / "none.pem"
    assert refused_start("--tls-cert", missing, "--tls-key", certificate[1]) == (
        f"The certificate {missing} cannot be read: No such file or directory. Name a readable "
        "file with --tls-cert.")
    assert refused_start("--tls-cert", certificate[0], "--tls-key", missing) == (
        f"The private key {missing} cannot be read: No such file or directory. Name a readable "
        "file with --tls-key.")


@pytest.mark.parametrize("content", [b"", b"not a key", None], ids=["empty", "text", "mismatch"])
def test_unusable_tls_files_are_refused(refused_start, certificate, tmp_path, content):
    key = tmp_path / "key.pem"
    if content is None:
        subprocess.run(["openssl", "genrsa", "-out", key, "2048"], check=True, capture_output=True)
    else:
        key.write_bytes(content)
    log = tmp_path / "log"
    message = refused_start("--listen", "127.0.0.1:0", "--plugin", TEST_PLUGIN, "--tls-cert",
                            certificate[0], "--tls-key", key, HOST_PLUGIN_LOG=str(log))
    assert message == ("HTTPS cannot be served with these files. Name a certificate in PEM form "
                       "with --tls-cert and the private key that belongs to it with --tls-key.")
    assert log.read_text() == "init\nfinalize\n"


def is_sanitized():
    return "QITRMC_SANITIZE:STRING=\n" not in (BUILD_DIR / "CMakeCache.txt").read_text()


needs_memory_limit = pytest.mark.skipif(is_sanitized(),
                                        reason="a sanitizer's memory cannot be limited")


def limit_memory(host, size):
    resource.prlimit(host.process.pid, resource.RLIMIT_AS, (size, resource.RLIM_INFINITY))


@needs_memory_limit
@pytest.mark.parametrize("entry, body", [
    ("Echo", b"x" * 300_000_000), ("Much", b"300000000"),
], ids=["request", "response"])
def test_lack_of_memory_fails_one_request_only(start_host, entry, body):
    host = start_host("--max-body", "4294967295")
    limit_memory(host, 300 * 1024 * 1024)
    try:
        assert host.post(body, entry)[0] == 500
    except (ConnectionResetError, BrokenPipeError, http.client.RemoteDisconnected):
        pass
    assert host.post(b"abc", "Echo")[2] == b"abc"
    assert host.stop() == 0


@needs_memory_limit
def test_clients_that_get_no_memory_take_no_connection_slot(start_host):
    host = start_host("--connections", "2")
    with host.raw_socket() as holder:
        holder.sendall(raw_post("Echo", b"abc"))
        assert read_response(holder) == (200, b"abc")
        limit_memory(host, 1)
        for _ in range(10):
            with host.raw_socket() as client, contextlib.suppress(ConnectionResetError):
                client.sendall(raw_post("Echo", b"abc"))
                # Small allocations succeed as long as the heap has room.
                assert client.recv(1000)[:15] in (b"", b"HTTP/1.1 200 OK")
        limit_memory(host, resource.RLIM_INFINITY)
        assert host.post(b"abc", "Echo")[2] == b"abc"
