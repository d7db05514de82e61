"""Closing at the end of the program what it has left open."""

from __future__ import annotations

import atexit
import dataclasses
from typing import Dict

import httpx

from .connection import Settings, encoded

# A service that is gone must not hold up the end of the program.
PATIENCE_SECONDS = 2.0
_open: Dict[str, Settings] = {}


def remember(settings: Settings, session_id: str) -> None:
    """Close a session at the end of the program unless it is forgotten before."""
    if not _open:
        atexit.register(close_all)
    _open[f"{session_id} {settings.url}"] = settings


def forget(settings: Settings, session_id: str) -> None:
    """The session is closed."""
    _open.pop(f"{session_id} {settings.url}", None)


def close_all() -> None:
    """Close all sessions that are open, whatever comes of it. Works without an event loop."""
    while _open:
        key, settings = _open.popitem()
        request = {"jsonrpc": "2.0", "id": 1, "method": "closeSession",
                   "params": {"session_id": key.partition(" ")[0]}}
        patient = dataclasses.replace(settings, timeout=PATIENCE_SECONDS)
        try:
            with httpx.Client(**patient.client_options()) as client:
                client.post(settings.url, content=encoded(request))
        except httpx.HTTPError:
            continue
