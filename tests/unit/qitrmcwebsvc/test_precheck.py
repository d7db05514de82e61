"""The cheap check of requests agrees with the JSON library wherever it decides, and decides on the
documented request of each method."""

import json
import os
import random
import subprocess
import sys
from collections import Counter
from pathlib import Path

import pytest

REPOSITORY = Path(__file__).resolve().parents[3]
sys.path[:0] = [str(REPOSITORY / "tests" / "support"), str(REPOSITORY / "tests" / "unit" / "embedded")]
import methods  # noqa: E402
from parameter_model import METHODS  # noqa: E402
from test_random_requests import fitting_value, request_text  # noqa: E402

BUILD = Path(os.environ.get("QITRMC_BUILD_DIR", REPOSITORY / "build" / "dev"))
PROGRAM = BUILD / "bin" / "qitrmcwebsvc_precheck_lines"

# Values as they stand in a request.
VALUES = [
    b"null", b"true", b"false", b"{}", b"[]", b"[[]]", b"[[[[[]]]]]", b'[{"a":[]}]', b'{"a":{"b":{}}}',
    b'""', b'"a"', b'"_session1"', b'"_session"', b'"_session1\\u0000"', b'"_session1\\u0000x"',
    b'"_session1\xff"', b'"_session1\xe2\x82"', b'"\\u005fsession1"', b'"\xc3"', b'"ReadOnly"',
    b'"ReadWrite\\u0000"', b"0", b"-0", b"-0.0", b"0.0", b"1", b"1.0", b"1e0", b"3", b"8", b"8.0", b"8e0",
    b"64", b"64.0000001", b"-1", b"-1e-400", b"1e-400", b"255", b"256", b"4294967295", b"4294967295.0",
    b"4294967296", b"9007199254740993", b"9223372036854775807", b"9223372036854775808",
    b"-9223372036854775808", b"-9223372036854775809", b"18446744073709551615",
    b"18446744073709551616", b"1.7976931348623157e308", b"1e400", b'["a","b"]', b'["a",1]', b'["a",[]]',
    b'["a\xff"]', b"[1,2.5]", b"[1,true]", b"[true,false]", b"[0,255]", b"[0,256]", b"[-1]", b"[0,1.0]",
    b"[null]", b"[1,{}]", b"[" + b"1," * 500 + b"2]", b"[" + b"1," * 500 + b'"x"]',
]  # fmt: skip

# Names that are no member of any method, some of which are much like one.
ODD_NAMES = [b"", b"unknown", b"Session_id", b"session_id\\u0000", b"session_id\xff", b"\xe2\x82",
             b"session_i", b"\\u0000", b"device ", b"a/b~c"]  # fmt: skip


def member_name(method, source: random.Random) -> bytes:
    if not method.members or source.random() < 0.1:
        return source.choice(ODD_NAMES)
    name = source.choice(list(method.members)).encode()
    return b"\\u%04x" % name[0] + name[1:] if source.random() < 0.1 else name


def random_members(method, source: random.Random) -> list[tuple[bytes, bytes]]:
    """Those of a valid request or nearly so, with up to three changes."""
    names = [name for name in method.members if name in method.required or source.random() < 0.2]
    members = [(name.encode(), json.dumps(fitting_value(method, name)).encode()) for name in names]
    for _ in range(source.choice([0, 0, 1, 1, 2, 3])):
        change = source.random()
        if members and change < 0.5:
            at = source.randrange(len(members))
            members[at] = (members[at][0], source.choice(VALUES))
        elif members and change < 0.6:
            members.pop(source.randrange(len(members)))
        elif members and change < 0.7:
            members.append(source.choice(members))
        else:
            members.append((member_name(method, source), source.choice(VALUES)))
    source.shuffle(members)
    return members


def object_of(members: list[tuple[bytes, bytes]]) -> bytes:
    return b"{" + b",".join(b'"%s":%s' % member for member in members) + b"}"


def random_request(method, source: random.Random) -> bytes:
    members = [(b"jsonrpc", b'"2.0"'), (b"id", b"1"), (b"method", b'"%s"' % method.name.encode()),
               (b"params", object_of(random_members(method, source)))]  # fmt: skip
    change = source.random()
    if change < 0.05:
        members.append((b"params", object_of(random_members(method, source))))
    elif change < 0.08:
        members[3] = (b"params", source.choice(VALUES))
    elif change < 0.1:
        members.pop(3)
    elif change < 0.13:
        members.append((b"method", source.choice([*VALUES, b'"closeSession"', b'"closeSession\\u0000"'])))
    elif change < 0.2:
        members.append((source.choice(ODD_NAMES), source.choice(VALUES)))
    if source.random() < 0.2:
        source.shuffle(members)
    return object_of(members)


def verdicts(method, requests: list[bytes]) -> list[str]:
    lines = b"".join(b"%s\t%s\n" % (method.file.encode(), request) for request in requests)
    answers = subprocess.run([PROGRAM], input=lines, stdout=subprocess.PIPE, check=True, timeout=60)
    return answers.stdout.decode().splitlines()


@pytest.mark.parametrize("method", METHODS, ids=lambda method: method.name)
def test_precheck_accepts_the_documented_request(method):
    request = request_text(method, list(methods.request(method.name).params_in("_session1").items()))
    assert verdicts(method, [request.encode()]) == ["valid accepted"]


@pytest.mark.parametrize("method", METHODS, ids=lambda method: method.name)
def test_precheck_agrees_with_the_library(method):
    source = random.Random(method.name)
    requests = [random_request(method, source) for _ in range(3000)]
    answers = verdicts(method, requests)
    assert len(answers) == len(requests)
    for request, answer in zip(requests, answers):
        assert answer not in ("valid refused", "invalid accepted"), request
    # There must be enough requests of each kind, or they would prove little.
    count = Counter(answers)
    assert count["valid accepted"] > 300
    assert count["invalid refused"] > 100
    assert count["undecided refused"] > 100
