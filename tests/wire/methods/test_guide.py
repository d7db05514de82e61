"""The exchanges of docs/guide.md, sent in their order to a newly started service.

They are compared byte by byte, but for the blanks and line feeds between the tokens of JSON, which
wrap them on the page. The ids of sessions are those of a fresh service, so that nothing has to be
replaced.
"""

import json
import pathlib

from jsonrpc import Client, call
from pages import blocks_of, compact, id_of

GUIDE = pathlib.Path(__file__).resolve().parents[3] / "docs" / "guide.md"

BUSY, OUT_OF_TIME = -250977, -250976


def exchanges():
    """The blocks of the guide in their order."""
    blocks = blocks_of(GUIDE)
    assert {kind for kind, _ in blocks} == {"request", "answer"}
    return blocks


def wait_until_busy(host, request):
    """Returns once the device is executing the command. A second command without any timeout is
    refused from then on, and before that times out without an effect."""
    params = json.loads(request)["params"]
    probe = call("executeCommand", {**params, "timeout": 0})
    with Client(host) as client:
        while True:
            code = json.loads(client.ask(probe))["error"]["data"]["qitrmc_code"]
            if code == BUSY:
                return
            assert code == OUT_OF_TIME


def test_the_exchanges_of_the_guide_are_reproduced(own_host):
    blocks = exchanges()
    waiting = {}
    for (kind, text), following in zip(blocks, [*blocks[1:], None]):
        if kind == "request":
            client = Client(own_host)
            client.send(text.encode())
            waiting[id_of(text)] = client
            if following[0] == "request":
                wait_until_busy(own_host, text)
        else:
            with waiting.pop(id_of(text)) as client:
                assert client.receive_whole().decode() == compact(text)
    assert not waiting


def test_every_request_of_the_guide_is_answered_in_it():
    asked = [id_of(text) for kind, text in exchanges() if kind == "request"]
    answered = [id_of(text) for kind, text in exchanges() if kind == "answer"]
    assert sorted(map(str, asked)) == sorted(map(str, answered))
    assert len(set(asked)) == len(asked) > 30


def test_blanks_inside_strings_are_compared():
    assert compact('{"a b" : [1, "x \\" y"]}\n') == '{"a b":[1,"x \\" y"]}'
