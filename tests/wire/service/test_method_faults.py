"""Faults that name a method of the service: the table of the driver's functions that each method
calls, held against what the methods really call."""

import collections
import csv
import json
import re

import pytest

from hostlib import ROOT, clean_host
from jsonrpc import Client, call
from method_calls import CHASSIS, REQUESTS

pytestmark = pytest.mark.same_in_each_build

with (ROOT / "simulator" / "faults" / "methods.tsv").open(encoding="utf-8") as _file:
    ROWS = [(row["method"], row["function"], row["part"])
            for row in csv.DictReader(_file, delimiter="\t")]
METHODS = re.findall(r'QITRMC_METHOD\("(\w+)"', (
    ROOT / "src" / "qitrmcwebsvc" / "methods.def").read_text(encoding="utf-8"))
FUNCTION = re.compile(r"\d+\.\d+ t\d+ (\w+)\(", re.ASCII)
FAULT_CODE = -77777
# Where the function that does the work also looks up the name in the request, and a list that cannot
# be read knows no name.
UNKNOWN_RESOURCE = -250828
LOOKED_UP = [("getDevicePropertyList", {"device": "Unit"}),
             ("getCommandList", {"physical_channel": "Unit/ch0"})]


class Service:
    """A host on the chassis of the requests, with one session on all its devices when needed."""

    def __init__(self, host, client):
        self.host, self.client = host, client
        self.session = None
        self.by_request = False

    def prepare(self, method):
        """Opens the session for a method, or closes it for one that opens another."""
        if method == "initializeSession" or self.by_request:
            self.close()
        if method != "initializeSession" and self.session is None:
            self.session = self.client.open_session({"devices": "Rack,Unit"})

    def ask(self, method, params):
        """The answer to a request after prepare()."""
        if method != "initializeSession":
            params = {"session_id": self.session, **params}
        answer = json.loads(self.client.ask_whole(call(method, params)))
        if "result" in answer and method == "closeSession":
            self.session = None
        elif "result" in answer and method == "initializeSession":
            self.session, self.by_request = answer["result"]["session_id"], True
        return answer

    def close(self):
        if self.session is not None:
            self.client.close_session(self.session)
            self.session, self.by_request = None, False


@pytest.fixture
def service():
    with clean_host(("--chassis", "chassis.json", "--faults", "faults.json", "--trace", "trace"),
                    {"chassis.json": CHASSIS}) as host, Client(host) as client:
        running = Service(host, client)
        yield running
        running.close()


def test_the_table_knows_each_method_and_what_does_its_work():
    assert {method for method, _, _ in ROWS} == set(METHODS)
    assert len({row[:2] for row in ROWS}) == len(ROWS)
    assert {part for _, _, part in ROWS} == {"work", "check"}
    assert {method for method, _, part in ROWS if part == "work"} == set(METHODS)


def test_the_table_lists_what_the_methods_call(service):
    trace = service.host.directory / "trace"
    called = collections.defaultdict(set)
    for method, params in REQUESTS:
        # The one by force finds the session of the request before, and closes it.
        if "force_reserve" not in params:
            service.prepare(method)
        before = trace.stat().st_size
        answer = service.ask(method, params)
        assert "result" in answer, (method, params, answer)
        called[method] |= {FUNCTION.match(line)[1]
                           for line in trace.read_text(encoding="ascii")[before:].splitlines()}
    listed = collections.defaultdict(set)
    for method, function, _ in ROWS:
        listed[method].add(function)
    assert called == listed


@pytest.mark.parametrize("method", METHODS)
def test_a_fault_of_a_method_strikes_it(service, method):
    faults = {"faults": [{"method": method, "status": {"code": FAULT_CODE}}]}
    requests = [params for name, params in REQUESTS if name == method]
    service.prepare(method)
    (service.host.directory / "faults.json").write_text(json.dumps(faults))
    for params in requests:
        answer = service.ask(method, params)
        code = UNKNOWN_RESOURCE if (method, params) in LOOKED_UP else FAULT_CODE
        assert answer["error"]["data"]["qitrmc_code"] == code, (params, answer)
    (service.host.directory / "faults.json").write_text("{}")
