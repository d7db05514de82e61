"""What the host tells supervisors: /healthz."""

import pytest

from hostlib import BUILD_DIR, PATIENCE, Host, clean_host
from jsonrpc import batch, call

FILES = {"etc/qinstal/share/qitrmc.ini": b"[WebService]\nEnable=1\n"}
BARE_PLUGIN = BUILD_DIR / "lib/libqitrmcsvc_cwd.so"  # reads the files of its working directory


def test_a_service_that_works_is_healthy():
    with clean_host() as host:
        status, headers, body = host.request("GET", "/healthz")
        assert (status, body) == (200, b"The service works.\n")
        assert (headers["Content-Type"], headers["Cache-Control"]) == (
            "text/plain; charset=utf-8", "no-store")


def test_missing_explanation_files_are_reported():
    with Host(plugin=BARE_PLUGIN, files=FILES) as host:
        assert host.request("GET", "/healthz")[::2] == (
            503, b"The explanation files of the service are not found. "
            b"Install them in the shared directory.\n")


def test_a_service_that_is_switched_off_is_reported_in_its_own_words():
    with Host(plugin=BARE_PLUGIN) as host:
        status, _, body = host.request("GET", "/healthz")
        assert status == 503
        assert body.startswith(b"The plug-in answers with HTTP 404: QI-TRMC web server is disabled.")


def test_another_plug_in_is_reported(host):
    status, _, body = host.request("GET", "/healthz")
    assert status == 503
    assert body.startswith(b"The plug-in does not answer like the service: ")


def test_a_batch_that_waits_for_a_device_does_not_delay_it():
    """The batch keeps all later requests waiting, but the service works."""
    open_and_reserve = batch(
        call("initializeSession"),
        call("reserveDevices", {"session_id": "_session2", "devices": "Mod1", "access": "ReadWrite",
                                "reservation_timeout": 10 * PATIENCE}))
    with Host() as host:
        host.post(call("initializeSession"))
        host.post(call("reserveDevices", {"session_id": "_session1", "devices": "Mod1",
                                          "access": "ReadWrite"}))
        waiting = host.connection()
        waiting.request("POST", "/qitrmc/Call", open_and_reserve)
        while b"\nqitrmc_requests_in_flight 2\n" not in host.request("GET", "/metrics")[2]:
            pass
        assert host.request("GET", "/healthz")[0] == 200
        waiting.close()


@pytest.mark.parametrize("method", ["POST", "PUT", "DELETE"])
def test_it_can_only_be_read(host, method):
    status, headers, _ = host.request(method, "/healthz", b"{}")
    assert (status, headers["Allow"]) == (405, "GET, HEAD")


def test_it_can_be_switched_off(start_host):
    host = start_host("--no-health")
    assert host.request("GET", "/healthz")[0] == 404
    assert host.request("GET", "/metrics")[0] == 200
