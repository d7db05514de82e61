"""What the host counts: /metrics."""

import re

import pytest

from hostlib import PATIENCE, clean_host
from jsonrpc import batch, call

SERVICE = "qitrmc_requests_total{handler=\"service\",outcome=\"%s\"}"
HOST = "qitrmc_requests_total{handler=\"host\",outcome=\"%s\"}"


def read(host):
    status, headers, body = host.request("GET", "/metrics")
    assert (status, headers["Content-Type"]) == (200, "text/plain; version=0.0.4; charset=utf-8")
    return {name: float(value) for name, value in
            re.findall(r"^([^#\s]\S*(?: [^\s]+)*?) (\S+)$", body.decode(), re.MULTILINE)}


class Growth:
    """How much each count grows in a block. The host counts a request when its response is gone, and the
    end of a connection when it has seen it, so a count is read until it is right."""

    def __init__(self, host):
        self.host = host
        self.before = read(host)

    def expect(self, name, count):
        for _ in range(PATIENCE * 100):
            grown = read(self.host)[name] - self.before[name]
            if grown == count:
                break
        assert grown == count


@pytest.fixture(scope="module")
def host():
    with clean_host() as running:
        yield running


@pytest.mark.parametrize("body, outcome", [
    (call("initializeSession"), "ok"),
    (call("closeSession", {"session_id": "_session999"}), "rpc_error"),
    (b"{", "rpc_error"),
    (batch(call("initializeSession"), call("initializeSession")), "ok"),
    (batch(call("initializeSession"), call("nothing")), "rpc_error"),
])
def test_requests_to_the_service_are_counted_by_outcome(host, body, outcome):
    growth = Growth(host)
    host.post(body)
    growth.expect(SERVICE % outcome, 1)
    growth.expect("qitrmc_request_duration_seconds_count", 1)
    growth.expect('qitrmc_request_duration_seconds_bucket{le="+Inf"}', 1)


def test_an_http_error_of_the_service_is_counted(host):
    growth = Growth(host)
    assert host.request("GET", "/qitrmc/Call")[0] == 404
    growth.expect(SERVICE % "http_error", 1)


def test_what_the_host_answers_itself_is_counted_apart(host):
    growth = Growth(host)
    assert host.request("GET", "/nothing")[0] == 404
    assert host.request("POST", "/qitrmc/Call", b"{}", {"Origin": "http://elsewhere.example"})[0] == 403
    growth.expect(HOST % "http_error", 2)
    growth.expect(SERVICE % "http_error", 0)


def test_a_client_that_goes_before_its_answer_is_counted(host):
    growth = Growth(host)
    with host.raw_socket() as client:
        client.sendall(b"POST /qitrmc/Call HTTP/1.1\r\nHost: localhost\r\nContent-Length: 100\r\n\r\n{")
    growth.expect(HOST % "aborted", 1)


def test_bytes_of_bodies_are_counted(host):
    body = call("initializeSession")
    growth = Growth(host)
    answer = host.post(body)[2]
    growth.expect("qitrmc_request_bytes_total", len(body))
    before = growth.before["qitrmc_response_bytes_total"]
    assert read(host)["qitrmc_response_bytes_total"] > before + len(answer)


def test_connections_and_requests_in_flight_are_shown(host):
    growth = Growth(host)
    with host.raw_socket(), host.raw_socket():
        growth.expect("qitrmc_connections", 2)
        assert read(host)["qitrmc_requests_in_flight"] >= 1
    assert read(host)["qitrmc_connections_total"] >= growth.before["qitrmc_connections_total"] + 3


def test_calls_of_the_simulated_driver_are_counted(host):
    session = host.post(call("initializeSession"))[2].split(b'"')[-2].decode()
    before = read(host)["qitrmc_driver_calls_total"]
    host.post(call("getProperty", {"session_id": session, "property": "Sys.Devices"}))
    assert read(host)["qitrmc_driver_calls_total"] > before


def test_without_the_simulated_driver_there_are_no_calls_of_it(start_host):
    assert "qitrmc_driver_calls_total" not in read(start_host())


def test_they_can_be_switched_off(start_host):
    host = start_host("--no-metrics")
    assert host.request("GET", "/metrics")[0] == 404
    assert host.post(b"{}")[0] == 200


def test_they_can_only_be_read(host):
    status, headers, _ = host.request("POST", "/metrics", b"")
    assert (status, headers["Allow"]) == (405, "GET, HEAD")
