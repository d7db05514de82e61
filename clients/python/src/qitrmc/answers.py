"""Errors made of answers, and suggestions for names that are nearly right."""

from __future__ import annotations

import difflib
from typing import Any, Iterable, List, Mapping

from .errors import StatusError, UnknownStatus
from .statuses import BY_CODE, UnknownMethod


def error_of(error: Mapping[str, Any], request: Mapping[str, Any]) -> StatusError:
    """The exception for the `error` of an answer."""
    data = error.get("data")
    code = data["qitrmc_code"] if data else error["code"]
    message = data["qitrmc_message"] if data else error["message"]
    return BY_CODE.get(code, UnknownStatus)(message, request, code)


def named(error: StatusError, methods: Iterable[str]) -> StatusError:
    """The error, with a suggestion if it is about the name of the method."""
    if isinstance(error, UnknownMethod) and error.request:
        suggest(error, str(error.request["method"]), methods)
    return error


def nearest(name: str, candidates: Iterable[str]) -> List[str]:
    """Up to three candidates that look like a name, the nearest first, in any letter case."""
    by_folded = {candidate.casefold(): candidate for candidate in candidates}
    folded = name.casefold()
    close = difflib.get_close_matches(folded, list(by_folded), n=3, cutoff=0.6)
    parts = [candidate for candidate in by_folded if candidate.rpartition(".")[2] == folded]
    return [by_folded[candidate] for candidate in dict.fromkeys([*parts, *close])][:3]


def suggest(error: Any, name: str, candidates: Iterable[str]) -> None:
    """Set the suggestion of an error about a name that none of the candidates is."""
    known = list(candidates)
    close = nearest(name, known) if name not in known else []
    if close:
        error.suggestion = f"Did you mean {' or '.join(close)}?"
