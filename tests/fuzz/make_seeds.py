#!/usr/bin/python3
"""Writes first inputs for the harnesses that take requests and chassis files, and a dictionary of
the words in them.

Usage: make_seeds.py FOLDER. Writes FOLDER/<harness>/* and FOLDER/words.dict.
"""

import json
import random
import sys
from pathlib import Path

TESTS = Path(__file__).resolve().parents[1]
CHASSIS = Path(__file__).resolve().parents[2] / "simulator" / "chassis"
sys.path[:0] = [str(TESTS / "support"), str(TESTS / "unit" / "embedded"),
                str(TESTS / "unit" / "qitrmcwebsvc")]
import methods  # noqa: E402
from parameter_model import INLINE, METHODS  # noqa: E402
from test_random_requests import random_params, request_text  # noqa: E402

REQUESTS_PER_METHOD = 12
ENVELOPE = ["jsonrpc", "id", "method", "params", "2.0", "_session1", "$ConnectedDevices"]


def documented(method) -> str:
    """The request on the method's page, which a fresh service accepts in its first session."""
    params = methods.request(method.name).params_in("_session1")
    return request_text(method, list(params.items()))


def requests_of(method, source: random.Random) -> list[str]:
    return [
        documented(method),
        *(request_text(method, random_params(method, source)) for _ in range(REQUESTS_PER_METHOD)),
    ]


def write(folder: Path, number: int, text: str):
    folder.mkdir(parents=True, exist_ok=True)
    (folder / f"seed{number}").write_text(text, encoding="utf-8")


def write_requests(folder: Path):
    source = random.Random(1)
    everything = []
    for method in METHODS:
        schema = method.file.removeprefix("procedure_").removesuffix(".json")
        for request in requests_of(method, source):
            write(folder / "validateSchema", len(everything), f"{schema}\n{request}")
            write(folder / "handleRequest", len(everything), request)
            everything.append(request)
    for number in range(len(everything), len(everything) + 50):
        batch = source.sample(everything, source.randint(1, 5))
        write(folder / "handleRequest", number, f"[{','.join(batch)}]")


def write_chassis(folder: Path):
    for number, name in enumerate(["bench", "full", "small"]):
        text = (CHASSIS / f"{name}.json").read_text(encoding="utf-8")
        write(folder / "parseChassis", number, text)


def members_of(schema) -> set[str]:
    """The names of all members that a JSON Schema describes."""
    if isinstance(schema, list):
        return set().union(*map(members_of, schema))
    if not isinstance(schema, dict):
        return set()
    return set(schema.get("properties", {})).union(*map(members_of, schema.values()))


def write_words(path: Path):
    chassis = json.loads((CHASSIS / "chassis.schema.json").read_text(encoding="utf-8"))
    words = {method.name for method in METHODS}.union(
        *(method.members for method in METHODS), ENVELOPE, members_of(chassis)
    )
    words |= {str(item) for shape in INLINE.values() for item in getattr(shape, "items", ())}
    path.write_text("".join(f"{json.dumps(word)}\n" for word in sorted(words)), encoding="utf-8")


if __name__ == "__main__":
    target = Path(sys.argv[1])
    write_requests(target)
    write_chassis(target)
    write_words(target / "words.dict")
