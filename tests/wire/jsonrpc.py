"""JSON-RPC over a running host: requests as bytes, the expected response bytes, and a client.

Ids, params and results are JSON texts here, not Python values, so that a test states every byte
that it compares. A byte that is not UTF-8 stands in them as os.fsdecode() writes it.
"""

import contextlib
import json
import re
import select

STANDING_CODES = (-32700, -32603, -32602, -32601, -32600, -32000)

# Stands for the text of every failure on both sides of a comparison.
ANY_TEXT = ""

ENCODING = ("utf-8", "surrogateescape")

_TEXT_MEMBER = re.compile(rb'("(?:qitrmc_)?message":)"((?:[^"\\]|\\.)*)"', re.DOTALL)


def call(method, params=None, id="1"):
    """A request. params: JSON text, or a dict for convenience, or None to leave the member out."""
    if isinstance(params, dict):
        params = json.dumps(params)
    rest = "" if params is None else f',"params":{params}'
    return f'{{"jsonrpc":"2.0","id":{id},"method":{json.dumps(method)}{rest}}}'.encode(*ENCODING)


def batch(*requests):
    return b"[" + b",".join(requests) + b"]"


def result_response(result="{}", id="1"):
    return f'{{"jsonrpc":"2.0","id":{id},"result":{result}}}'.encode(*ENCODING)


def error_response(id, code):
    """The response to a failure, with the code as the service raised it."""
    if code in STANDING_CODES:
        error = f'{{"code":{code},"message":"{ANY_TEXT}"}}'
    else:
        error = (f'{{"code":-32000,"message":"{ANY_TEXT}",'
                 f'"data":{{"qitrmc_code":{code},"qitrmc_message":"{ANY_TEXT}"}}}}')
    return f'{{"jsonrpc":"2.0","id":{id},"error":{error}}}'.encode(*ENCODING)


def _blank(member):
    name, text = member.groups()
    assert rb"\n" not in text.replace(rb"\\", b""), f"a text of several lines: {text!r}"
    return name + b'"' + ANY_TEXT.encode() + b'"'


def blanked(body):
    """A response body with ANY_TEXT in place of the text of every failure."""
    return _TEXT_MEMBER.sub(_blank, body)


class Client:
    """One connection to a host, kept open. Used by one thread at a time."""

    def __init__(self, host, entry="Call"):
        self.path = f"/qitrmc/{entry}"
        self.connection = host.connection()

    def __enter__(self):
        return self

    def __exit__(self, *_):
        self.connection.close()

    def send(self, body):
        """Sends a request whose answer is fetched later with receive()."""
        self.connection.request("POST", self.path, body)

    def is_answered(self, timeout=0):
        """Whether the answer has begun to arrive; waits for it up to timeout seconds."""
        return bool(select.select([self.connection.sock], [], [], timeout)[0])

    def receive(self):
        """The answer to what was sent: its body, with the texts of failures blanked."""
        return blanked(self.receive_whole())

    def receive_whole(self):
        """The answer to what was sent: its body as it is."""
        try:
            response = self.connection.getresponse()
            body = response.read()
        except BaseException:
            self.connection.close()  # the next request opens it again
            raise
        served = (response.status, response.getheader("Content-Type"))
        assert served == (200, "application/json; charset=utf-8"), body
        return body

    def ask(self, body):
        self.send(body)
        return self.receive()

    def ask_whole(self, body):
        self.send(body)
        return self.receive_whole()

    def open_session(self, params=None):
        """Opens a session, which must succeed, and returns its id."""
        answer = self.ask(call("initializeSession", params))
        opened = re.fullmatch(
            rb'\{"jsonrpc":"2\.0","id":1,"result":\{"session_id":"(_session[0-9]+)"\}\}', answer)
        assert opened, answer
        return opened[1].decode()

    def close_session(self, session_id):
        """Closes a session, which must succeed."""
        assert self.ask(call("closeSession", {"session_id": session_id})) == result_response()

    @contextlib.contextmanager
    def session(self, params=None):
        """A session that is closed at the end of the block."""
        session_id = self.open_session(params)
        try:
            yield session_id
        finally:
            self.close_session(session_id)

    def close_if_opened(self, answer):
        """Closes the session that an answer names, if it names one."""
        opened = re.search(rb'"result":\{"session_id":"(_session[0-9]+)"\}', answer)
        if opened:
            self.close_session(opened[1].decode())
