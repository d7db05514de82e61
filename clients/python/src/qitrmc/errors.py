"""What can go wrong, below `Error`. The class of each status of the service is in `statuses`."""

from __future__ import annotations

import functools
import re
from typing import Any, Dict, List, Mapping, Optional, Pattern

from .labels import LABELS

SESSION_ID = re.compile(r"_session[0-9]+")


class Error(Exception):
    """Any failure that this package reports.

    Attributes: code (the status code; None where no status came from the service), name (of the
    status), text (what happened and what to do), details (of the status, by label), request (the
    method and parameters that failed, or None), suggestion (what may have been meant, or None).
    """

    code: Optional[int] = None
    name: str = ""

    def __init__(self, text: str, request: Optional[Mapping[str, Any]] = None) -> None:
        super().__init__(text)
        self.text = text
        self.details: Dict[str, str] = {}
        self.request = request
        self.suggestion: Optional[str] = None
        #: The number of the failed request in its batch, from 0; None outside of a batch.
        self.index: Optional[int] = None
        #: The results of the requests before the failed one in its batch.
        self.results: List[Any] = []

    @property
    def message(self) -> str:
        """The whole text, with the details."""
        details = "; ".join(f"{label}: {value}" for label, value in self.details.items())
        return f"{self.text} ({details})" if details else self.text

    def __str__(self) -> str:
        where = "" if self.index is None else f"Request {self.index + 1} of the batch{self._named()}: "
        meant = f" {self.suggestion}" if self.suggestion else ""
        return f"{where}{self.message}{meant}"

    def _named(self) -> str:
        return f" ({self.request['method']})" if self.request else ""


class StatusError(Error):
    """A failure with a status code of the service or of the driver."""

    code: int

    def __init__(self, message: str, request: Optional[Mapping[str, Any]] = None,
                 code: Optional[int] = None) -> None:
        text, _, details = message.partition("  ")
        super().__init__(text, request)
        self.details = parsed_details(details)
        if code is not None:
            self.code = code


class UnknownStatus(StatusError):
    """A status code that the catalogue of this package does not have, such as one of the driver."""


class Reserved(StatusError):
    """Base of the failure that says who holds a device."""

    @property
    def sessions(self) -> List[str]:
        """The ids of the sessions that hold the device for writing, as far as the service says."""
        return SESSION_ID.findall(self.details.get("Reserved by Sessions", ""))


class ConnectionFailure(Error):
    """The service could not be reached. A request that was under way may have been carried out."""


class ServiceDown(ConnectionFailure):
    """Nothing listens at the address."""


class ConnectionBroken(ConnectionFailure):
    """The connection ended in the middle of a request."""


class NoAnswerInTime(ConnectionFailure):
    """The answer took longer than the timeout of the connection."""


class NotTheService(ConnectionFailure):
    """Something answers at the address, but not this service."""


class SwitchedOff(ConnectionFailure):
    """The web server answers, but its service is switched off."""


class AuthenticationRequired(ConnectionFailure):
    """The server in front of the service requires a user and a password, or refuses those given."""


class ServerFailure(ConnectionFailure):
    """The web server answered with an HTTP error."""


class WrongItem(Error, ValueError):
    """A name or number that is not in the enumeration of the property."""


class WrongValue(Error, ValueError):
    """A value that cannot be sent."""


class SessionClosed(Error):
    """The session object was closed before."""


@functools.lru_cache(maxsize=None)
def label_pattern() -> Pattern[str]:
    longest_first = sorted(LABELS, key=len, reverse=True)
    return re.compile(rf"(?:^| )({'|'.join(map(re.escape, longest_first))}): ?")


def parsed_details(text: str) -> Dict[str, str]:
    """The `Label: value` pairs of a message. Texts without a label are left out."""
    details: Dict[str, str] = {}
    pieces = label_pattern().split(text)
    for label, value in zip(pieces[1::2], pieces[2::2]):
        details[label] = f"{details[label]}, {value.strip()}" if label in details else value.strip()
    return details
