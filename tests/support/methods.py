"""The methods of the service: their names, and a well-formed request for each.

    for method in methods.NAMES:
        session = methods.request(method).prepare(ask)

The names are those of methods.def. The requests are the documented ones of docs/methods.json, with
the calls that prepare them; a test that needs other values replaces documented ones by them, and
cannot give a parameter that the method does not have.
"""

import json
import sys
from dataclasses import dataclass
from pathlib import Path

DOCS = Path(__file__).resolve().parents[2] / "docs"
sys.path.insert(0, str(DOCS))

import make_methods  # noqa: E402 from the folder of the page

SCHEMAS = make_methods.read_methods()
NAMES = list(SCHEMAS)
DOCUMENTED = json.loads((DOCS / "methods.json").read_text(encoding="utf-8"))["methods"]


def in_session(method, params, session_id):
    takes_session = "session_id" in SCHEMAS[method]["properties"]
    return {"session_id": session_id, **params} if takes_session else params


@dataclass(frozen=True)
class Request:
    """A request without its session. before: the methods and params that prepare it."""

    method: str
    params: dict
    before: tuple

    def prepare(self, ask):
        """Makes the calls that prepare the request. ask(method, params) returns a result. Returns
        the id of the session that was opened, None for a method that needs none."""
        session_id = None
        for method, params in self.before:
            result = ask(method, in_session(method, params, session_id))
            session_id = result.get("session_id", session_id)
        return session_id

    def params_in(self, session_id):
        return in_session(self.method, self.params, session_id)


def request(method, opened_on=None, without=(), **members):
    """The documented request with other members. A given resource replaces the documented one.

    opened_on: params of initializeSession for the session, if not the documented ones
    without: documented members to leave out
    """
    schema, entry = SCHEMAS[method], DOCUMENTED[method]
    unknown = {*members, *without} - set(schema["properties"])
    if unknown:
        raise ValueError(f"{method} has no {', '.join(sorted(unknown))}")
    alternatives = set(make_methods.exclusive_members(schema))
    replaced = {*without, *(alternatives if alternatives & set(members) else ())}
    documented = {name: value for name, value in entry["params"].items() if name not in replaced}
    before = entry["before"] if opened_on is None else [["initializeSession", opened_on]]
    return Request(method, {**documented, **members},
                   tuple((step, params) for step, params in before))
