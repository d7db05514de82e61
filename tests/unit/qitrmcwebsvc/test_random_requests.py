"""Compares the validators of all methods with the model of the parameters, on random requests."""

import json
import os
import random
import subprocess
import sys
from pathlib import Path

import pytest

REPOSITORY = Path(__file__).resolve().parents[3]
sys.path.insert(0, str(REPOSITORY / "tests" / "unit" / "embedded"))
from parameter_model import METHODS, first_failure  # noqa: E402

BUILD = Path(os.environ.get("QITRMC_BUILD_DIR", REPOSITORY / "build" / "dev"))
PROGRAM = BUILD / "bin" / "qitrmcwebsvc_validate_lines"

VALUES = [
    "_session1", "_session", "session1", "", "ReadOnly", "ReadWrite", "readonly", "a/b",
    0, 1, 2, 3, 7, 8, 16, 32, 64, -1, 255, 256, 4294967295, 4294967296, 2**63, 2**64 - 1,
    1.5, -0.5, 1e300, True, False, None, [], {}, ["a"], ["a", "b"], ["a", 1], [1, 2.5], [1, True],
    [True, False], [0, 255], [0, 256], [-1], [None], [[]], [["a"]], {"a": 1}, {"a": {"b": []}},
]  # fmt: skip

# A valid value, by the name of the member.
FITTING = {
    "session_id": "_session12", "access": "ReadOnly", "force_reserve": True, "size": 16,
    "reservation_timeout": 2.5, "timeout": 0, "address": 4096, "slot_number": 1, "value": [1, 2],
    "data": 5, "devices": ["d1", "d2"], "physical_channels": "c1", "nvmem_areas": [],
}  # fmt: skip


def fitting_value(method, name):
    if (method.name, name) == ("setNvmemBytes", "data"):
        return [1, 2]
    if (method.name, name) == ("getNvmemBytes", "size"):
        return 5
    return FITTING.get(name, "text")


def random_params(method, source: random.Random) -> list:
    names = [name for name in method.members if name in method.required or source.random() < 0.3]
    params = [(name, fitting_value(method, name)) for name in names]
    for _ in range(source.choice([0, 0, 1, 1, 2])):
        change = source.random()
        if change < 0.55 and method.members:
            params.append((source.choice(list(method.members)), source.choice(VALUES)))
        elif change < 0.7:
            params.append((source.choice(["unknown", "Session_id", "0", "x-y"]), 1))
        elif params:
            params.pop(source.randrange(len(params)))
    source.shuffle(params)
    return params


def request_text(method, params: list) -> str:
    members = ",".join(f"{json.dumps(name)}:{json.dumps(value)}" for name, value in params)
    return f'{{"jsonrpc":"2.0","id":1,"method":"{method.name}","params":{{{members}}}}}'


def usage(tag: str, value: str) -> str:
    return f'{{"type":"usage","usage":"{tag}","value":"{value}","value_type":"string"}}'


def expected_line(method, params: list, texts: dict) -> str:
    failure = first_failure(method, params, texts)
    if failure is None:
        return "accepted"
    pointer, details = failure
    return f"-32602 [{usage('kUsageTypeParameter', pointer)},{usage('kUsageTypeDetails', details)}]"


@pytest.fixture(scope="module")
def texts() -> dict:
    table = REPOSITORY / "src" / "qitrmcwebsvcerr" / "descriptions.tsv"
    return dict(line.split("\t") for line in table.read_text(encoding="ascii").splitlines())


@pytest.mark.parametrize("method", METHODS, ids=lambda method: method.name)
def test_validator_of_method_agrees_with_the_model(method, texts):
    source = random.Random(method.name)
    requests = [random_params(method, source) for _ in range(1500)]
    lines = [f"{method.file}\t{request_text(method, params)}\n" for params in requests]
    answers = subprocess.run(
        [PROGRAM], input="".join(lines), stdout=subprocess.PIPE, text=True, check=True, timeout=60
    ).stdout.splitlines()

    expected = [expected_line(method, params, texts) for params in requests]
    assert len(answers) == len(expected)
    for line, want, got in zip(lines, expected, answers):
        assert got == want, line
    # There must be enough requests of either kind, or they would prove little.
    accepted = expected.count("accepted")
    assert 100 < accepted < len(expected) - 100
