"""What the tests of the methods compare: sessions, and complete error responses.

A failure is given by its code and by the details after its explanation, as "Label: value" texts in
their order. The explanations come from the tables that the product is built from.
"""

import contextlib
import csv
import json
import pathlib

from jsonrpc import ENCODING, STANDING_CODES, call

ROOT = pathlib.Path(__file__).resolve().parents[3]

INTERNAL_ERROR = -250800


def _explanations():
    texts = {}
    for name, prefix in (("share/statuses/catalogue.tsv", "eng_"),
                         ("simulator/status/statuses.tsv", "")):
        with open(ROOT / name, encoding="utf-8", newline="") as table:
            for row in csv.DictReader(table, delimiter="\t", quoting=csv.QUOTE_NONE):
                texts[int(row["code"])] = row[prefix + "happened"] + " " + row[prefix + "remedy"]
    return texts


EXPLANATIONS = _explanations()


def error(code, text, id="1"):
    """The response to a failure with a code and the whole text of its message."""
    def member(name, text):
        return f'"{name}":' + json.dumps(text, ensure_ascii=False)

    if code in STANDING_CODES:
        told = f'"code":{code},' + member("message", text)
    else:
        told = ('"code":-32000,' + member("message", EXPLANATIONS[-32000]) +
                f',"data":{{"qitrmc_code":{code},' + member("qitrmc_message", text) + "}")
    return f'{{"jsonrpc":"2.0","id":{id},"error":{{{told}}}}}'.encode(*ENCODING)


def failure(code, *details, id="1"):
    """The response to a failure with labelled details: they follow the explanation after an empty
    line, one per line, and each line feed is a blank."""
    text = EXPLANATIONS[code]
    return error(code, text + "  " + " ".join(details) if details else text, id)


def wrong_parameter(pointer, details):
    """The response to params that do not fit the schema of their method."""
    return failure(-32602, f"Parameter: {pointer}", f"Details: {details}")


class Session:
    """An open session of a client."""

    def __init__(self, client, session_id):
        self.client = client
        self.id = session_id

    def body(self, method, params="", id="1"):
        """A request in this session. params: the members after session_id, as JSON text."""
        rest = "," + params if params else ""
        return call(method, f'{{"session_id":"{self.id}"{rest}}}', id)

    def ask(self, method, params=""):
        return self.client.ask_whole(self.body(method, params))

    def send(self, method, params=""):
        self.client.send(self.body(method, params))


@contextlib.contextmanager
def session_on(client, params=None):
    """A session that is closed at the end of the block. params: those of initializeSession."""
    with client.session(params) as session_id:
        yield Session(client, session_id)
