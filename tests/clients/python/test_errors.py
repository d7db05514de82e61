"""What programs see of failures: a class for each status, with what it says."""

import contextlib
import http.server
import json
import socket
import subprocess
import threading

import pytest

from hostlib import BUILD_DIR, ROOT, Host, clean_host
import qitrmc
from qitrmc import statuses
from qitrmc.errors import parsed_details
from qitrmc.testing import chassis as simulated

ERRORS = json.loads((ROOT / "docs" / "openrpc.json").read_text(encoding="utf-8"))["components"]["errors"]
# Warnings come with a success.
CODES = [code for code in statuses.BY_CODE if code < 0]


def text_of(name):
    error = ERRORS[name]
    return error["data"]["qitrmc_message"] if "data" in error else error["message"]


@pytest.mark.parametrize("code", CODES)
def test_a_status_has_its_class(bench, chassis, code):
    bench.fail("executeCommand", code)
    with pytest.raises(qitrmc.Error) as caught:
        chassis.call("executeCommand", command="DMM.Trigger", devices="Mod1")
    error = caught.value
    assert type(error) is statuses.BY_CODE[code]
    assert error.code == code
    assert error.text == text_of(error.name)
    assert error.request["method"] == "executeCommand"
    assert error.request["params"]["command"] == "DMM.Trigger"


def test_a_status_that_nobody_knows_is_still_an_error(bench, chassis):
    bench.fail("executeCommand", -777)
    with pytest.raises(qitrmc.UnknownStatus) as caught:
        chassis.call("executeCommand", command="DMM.Trigger", devices="Mod1")
    assert caught.value.code == -777


def test_a_reserved_device_names_its_holders(chassis, held):
    with pytest.raises(qitrmc.DeviceReserved) as caught:
        chassis.session("Mod1")
    assert caught.value.sessions == [held.id]
    assert caught.value.details == {"Device": "Mod1", "Reserved by Sessions": held.id}


def test_details_are_told_apart_by_their_labels():
    assert parsed_details("Property Name: DMM.Range Requested Value: 1e+09 Minimum Value: 0.1") == {
        "Property Name": "DMM.Range", "Requested Value": "1e+09", "Minimum Value": "0.1"}
    assert parsed_details("") == {}


@pytest.mark.parametrize("wrong, call, meant", [
    ("DMM.Rnage", lambda session, name: session["Mod1"][name], "DMM.Range"),
    ("Range", lambda session, name: session["Mod1"][name], "DMM.Range"),
    ("DMM.Rnage", lambda session, name: session["Mod1"].set(name, 1.0), "DMM.Range"),
    ("DMM.Rnage", lambda session, name: session["Mod1"].info(name), "DMM.Range"),
    ("DMM.SelfTst", lambda session, name: session["Mod1"].run(name), "DMM.SelfTest"),
    ("Mod1/chan0", lambda session, name: session[name]["DMM.Voltage"], "Mod1/ch0"),
    ("Nod1", lambda session, name: session[name]["DMM.Range"], "Mod1"),
    ("getPropety", lambda session, name: session.call(name), "getProperty"),
])
def test_a_name_that_is_nearly_right_gets_a_suggestion(held, wrong, call, meant):
    with pytest.raises(qitrmc.Error) as caught:
        call(held, wrong)
    assert caught.value.suggestion.startswith(f"Did you mean {meant}")
    assert str(caught.value).endswith(caught.value.suggestion)


def test_a_device_that_is_nearly_right_gets_a_suggestion_when_a_session_is_opened(chassis):
    with pytest.raises(qitrmc.Error, match=r"Did you mean Mod2"):
        chassis.session("Nod2")


def test_a_name_that_is_like_nothing_gets_no_suggestion(held):
    with pytest.raises(qitrmc.UnknownProperty) as caught:
        held["Mod1"]["Zzzzzzzz"]
    assert caught.value.suggestion is None


def test_an_error_in_a_batch_says_which_request_failed(held):
    with pytest.raises(qitrmc.UnknownCommand, match=r"Request 2 of the batch \(executeCommand\)") as caught:
        held.batch(("getProperty", {"property": "Dev.SlotNum", "devices": "Mod1"}),
                   ("executeCommand", {"command": "DMM.Fire", "devices": "Mod1"}),
                   ("executeCommand", {"command": "DMM.Trigger", "devices": "Mod1"}))
    assert caught.value.index == 1
    assert caught.value.results == [{"data_type": "UInt32", "value": 1}]
    assert held["Mod1"]["DMM.TriggerCount"] == 0


# A service that cannot be reached


class Answering(http.server.BaseHTTPRequestHandler):
    """Answers every request with the status and body of its server."""

    def do_POST(self):
        self.rfile.read(int(self.headers["Content-Length"]))
        self.send_response(self.server.status)
        self.send_header("Content-Length", str(len(self.server.body)))
        self.end_headers()
        self.wfile.write(self.server.body)

    def log_message(self, *_):
        pass


@contextlib.contextmanager
def answering(status, body, handler=Answering):
    """The address of a server that answers so."""
    server = http.server.HTTPServer(("127.0.0.1", 0), handler)
    server.status, server.body = status, body
    thread = threading.Thread(target=server.serve_forever, args=(0.01,))
    thread.start()
    try:
        yield f"http://127.0.0.1:{server.server_port}"
    finally:
        server.shutdown()
        thread.join()
        server.server_close()


def failure_with(status, body):
    with answering(status, body) as url, qitrmc.connect(url) as chassis:
        with pytest.raises(qitrmc.Error) as caught:
            chassis.devices()
    return caught.value


@pytest.mark.parametrize("status, body, kind, says", [
    (401, b"", qitrmc.AuthenticationRequired, "requires a user and a password"),
    (403, b"", qitrmc.AuthenticationRequired, "requires a user and a password"),
    (404, b"", qitrmc.NotTheService, "is the address right"),
    (200, b"<html>", qitrmc.NotTheService, "is the address right"),
    (200, b"{}", qitrmc.NotTheService, "is the address right"),
    (502, b"Bad Gateway", qitrmc.ServerFailure, "HTTP 502: Bad Gateway"),
])
def test_what_is_not_the_service_is_said_in_one_sentence(status, body, kind, says):
    error = failure_with(status, body)
    assert type(error) is kind
    assert says in str(error)
    assert "\n" not in str(error)


def test_a_service_that_is_down_says_so():
    with socket.socket() as reserved:
        reserved.bind(("127.0.0.1", 0))
        with qitrmc.connect(f"127.0.0.1:{reserved.getsockname()[1]}") as chassis:
            with pytest.raises(qitrmc.ServiceDown, match="Nothing answers at http://127.0.0.1"):
                chassis.devices()


def test_a_service_that_is_switched_off_says_so():
    with Host(plugin=BUILD_DIR / "lib" / "libqitrmcsvc_cwd.so") as host:
        with qitrmc.connect(host.base_url) as chassis:
            with pytest.raises(qitrmc.SwitchedOff, match="set Enable=1"):
                chassis.devices()


def test_a_lost_connection_in_the_middle_of_a_request_says_so():
    with socket.create_server(("127.0.0.1", 0)) as server:
        def hang_up():
            connection, _ = server.accept()
            connection.recv(65536)
            connection.close()
        thread = threading.Thread(target=hang_up)
        thread.start()
        with qitrmc.connect(f"127.0.0.1:{server.getsockname()[1]}") as chassis:
            with pytest.raises(qitrmc.ConnectionBroken, match="ended before the answer"):
                chassis.devices()
        thread.join()


def test_an_answer_that_does_not_come_says_so():
    with socket.create_server(("127.0.0.1", 0)) as server:
        address = f"127.0.0.1:{server.getsockname()[1]}"
        with qitrmc.connect(address, timeout=0.05) as chassis:
            with pytest.raises(qitrmc.NoAnswerInTime):
                chassis.devices()


def test_a_value_that_has_no_form_on_the_wire_is_refused(held):
    for value in (float("nan"), object()):
        with pytest.raises(qitrmc.WrongValue):
            held["Mod1"]["DMM.Range"] = value


def test_a_service_that_was_restarted_does_not_know_the_session():
    with clean_host() as host:
        address = host.base_url
        chassis = qitrmc.connect(address)
        session = chassis.session("Mod1")
    with clean_host(options=["--listen", address.rpartition("/")[2]]):
        with pytest.raises(qitrmc.UnknownSession):
            session["Mod1"]["DMM.Range"]
        session.close()
        with chassis.session("Mod1") as again:
            assert again["Mod1"]["DMM.Range"] == 10.0
        chassis.close()


# Ways to the service


def test_user_password_and_headers_are_sent():
    seen = []

    class Noting(Answering):
        def do_POST(self):
            seen.append((self.headers["Authorization"], self.headers["X-Rack"]))
            super().do_POST()
    with answering(401, b"", Noting) as url:
        with qitrmc.connect(url, auth=("bench", "secret"), headers={"X-Rack": "7"}) as chassis:
            with pytest.raises(qitrmc.AuthenticationRequired):
                chassis.devices()
    assert seen == [("Basic YmVuY2g6c2VjcmV0", "7")]


@pytest.fixture(scope="module")
def certificate(tmp_path_factory):
    folder = tmp_path_factory.mktemp("tls")
    subprocess.run(["openssl", "req", "-x509", "-newkey", "rsa:2048", "-nodes", "-days", "2",
                    "-subj", "/CN=localhost", "-addext", "subjectAltName=IP:127.0.0.1",
                    "-keyout", folder / "key.pem", "-out", folder / "cert.pem"],
                   check=True, capture_output=True, timeout=60)
    return folder


def test_a_service_behind_tls_is_reached_with_its_certificate(certificate):
    options = ["--tls-cert", certificate / "cert.pem", "--tls-key", certificate / "key.pem"]
    with Host(options=options) as host:
        with qitrmc.connect(host.base_url, verify=str(certificate / "cert.pem")) as chassis:
            assert chassis.devices()[0] == "Bench"
        with qitrmc.connect(host.base_url) as chassis:
            with pytest.raises(qitrmc.ServiceDown, match="certificate"):
                chassis.devices()


@pytest.mark.parametrize("given, url", [
    ("rack", "http://rack/qitrmc/Call"),
    ("rack:8080", "http://rack:8080/qitrmc/Call"),
    ("https://rack/", "https://rack/qitrmc/Call"),
    ("http://proxy/racks/7", "http://proxy/racks/7"),
])
def test_an_address_is_completed(given, url):
    assert qitrmc.connect(given).url == url


# A service that goes away in the middle of a session


def test_a_session_whose_service_went_down_says_so():
    with simulated() as bench, bench.connect() as chassis:
        with pytest.raises(qitrmc.ConnectionFailure):
            with chassis.session("Mod1") as session:
                bench.stop()
                session["Mod1"]["DMM.Range"]
        with pytest.raises(qitrmc.ServiceDown):
            chassis.session("Mod1")


def test_a_failure_in_a_block_goes_before_that_of_closing():
    with simulated() as bench, bench.connect() as chassis:
        with pytest.raises(KeyError):
            with chassis.session("Mod1"):
                bench.stop()
                raise KeyError


def test_a_session_that_cannot_be_closed_says_so():
    with simulated() as bench, bench.connect() as chassis:
        with pytest.raises(qitrmc.ConnectionFailure):
            with chassis.session("Mod1"):
                bench.stop()


def test_requests_do_not_wait_for_acknowledgements(chassis):
    """A request is two small packets; together they would wait 40 ms for each other."""
    sockets = []
    client = chassis._connection.post._client
    client.event_hooks["response"] = [lambda response: sockets.append(
        response.extensions["network_stream"].get_extra_info("socket"))]
    chassis.devices()
    assert len(sockets) == 2
    assert all(used.getsockopt(socket.IPPROTO_TCP, socket.TCP_NODELAY) for used in sockets)
