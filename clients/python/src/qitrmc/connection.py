"""Posting requests and reading answers, over httpx.

`BlockingPost` and `AwaitingPost` are all that differs between blocking and asyncio programs.
"""

from __future__ import annotations

import asyncio
import contextlib
import dataclasses
import itertools
import json
import socket
import time
from typing import Any, Dict, Iterator, List, Mapping, Optional, Protocol, Sequence, Tuple, Union

import httpx

from . import errors
from .answers import error_of, named
from .calls import METHODS

SERVICE_PATH = "/qitrmc/Call"
HEADERS = {"Content-Type": "application/json"}
COMMAND_SECONDS = 10.0
Request = Tuple[str, Mapping[str, Any]]


@dataclasses.dataclass(frozen=True)
class Settings:
    """Where the service is and how it is reached.

    url: of the service; without a path that of the service is meant. timeout: seconds that an answer
    may take beyond the time that the request itself allows. auth: user and password. verify: whether
    certificates are checked, or the path of a bundle of them.
    """

    url: str
    timeout: float = 30.0
    auth: Optional[Tuple[str, str]] = None
    verify: Union[bool, str] = True
    headers: Mapping[str, str] = dataclasses.field(default_factory=dict)

    @staticmethod
    def of(url: str, **others: Any) -> Settings:
        """Settings for an address as people write it, with or without scheme and path."""
        address = httpx.URL(url if "://" in url else f"http://{url}")
        if address.path in ("", "/"):
            address = address.copy_with(path=SERVICE_PATH)
        return Settings(str(address), **others)

    def client_options(self) -> Dict[str, Any]:
        """The arguments of an httpx client."""
        return {"auth": self.auth, "verify": self.verify, "headers": {**HEADERS, **self.headers},
                "timeout": self.timeout}


class Post(Protocol):
    """What reaches the world."""

    async def post(self, body: bytes, timeout: float) -> httpx.Response: ...

    async def pause(self, seconds: float) -> None: ...

    async def close(self) -> None: ...


def send_at_once(event: str, info: Mapping[str, Any]) -> None:
    """Turn off the delay of small packets on each new connection: a request is two of them, and the
    second one would wait for the acknowledgement of the first, some 40 ms."""
    if event.endswith("connect_tcp.complete"):
        connection = info["return_value"].get_extra_info("socket")
        if connection is not None:
            connection.setsockopt(socket.IPPROTO_TCP, socket.TCP_NODELAY, 1)


class BlockingPost:
    """Blocks until the answer is there. May be used by several threads."""

    def __init__(self, settings: Settings) -> None:
        self._url = httpx.URL(settings.url)
        self._client = httpx.Client(**settings.client_options())

    async def post(self, body: bytes, timeout: float) -> httpx.Response:
        return self._client.post(self._url, content=body, timeout=timeout,
                                 extensions={"trace": send_at_once})

    async def pause(self, seconds: float) -> None:
        time.sleep(seconds)

    async def close(self) -> None:
        self._client.close()


class AwaitingPost:
    """Lets other tasks run until the answer is there. Belongs to one event loop."""

    def __init__(self, settings: Settings) -> None:
        self._url = httpx.URL(settings.url)
        self._client = httpx.AsyncClient(**settings.client_options())

    async def post(self, body: bytes, timeout: float) -> httpx.Response:
        return await self._client.post(self._url, content=body, timeout=timeout)

    async def pause(self, seconds: float) -> None:
        await asyncio.sleep(seconds)

    async def close(self) -> None:
        await self._client.aclose()


class Connection:
    """Sends requests and returns results, as `Caller` of the methods. Raises Error."""

    def __init__(self, settings: Settings, post: Post) -> None:
        self.settings = settings
        self.post = post
        self._ids = itertools.count(1)

    async def call(self, method: str, params: Mapping[str, Any]) -> Any:
        """Return the result of a method. Parameters that are None are left out."""
        request = self._request(method, params)
        answer = await self._answer_to(request, patience_for([request], self.settings.timeout))
        if not isinstance(answer, dict):
            raise errors.NotTheService(f"{self.settings.url} does not answer as this service.", request)
        if "error" in answer:
            raise named(error_of(answer["error"], request), METHODS)
        return answer["result"]

    async def batch(self, requests: Sequence[Request]) -> List[Any]:
        """Return the results of requests that are sent as one batch. The error of the first that
        failed has its number in `index`, and the results of those before it in `results`."""
        batch = [self._request(method, params) for method, params in requests]
        if not batch:
            return []
        answers = await self._answer_to(batch, patience_for(batch, self.settings.timeout))
        if not isinstance(answers, list):
            raise error_of(answers["error"], batch[0])
        results: List[Any] = []
        for index, (request, answer) in enumerate(zip(batch, answers)):
            if "error" in answer:
                error = named(error_of(answer["error"], request), METHODS)
                error.index, error.results = index, results
                raise error
            results.append(answer["result"])
        return results

    def _request(self, method: str, params: Mapping[str, Any]) -> Dict[str, Any]:
        given = {name: value for name, value in params.items() if value is not None}
        return {"jsonrpc": "2.0", "id": next(self._ids), "method": method, "params": given}

    async def _answer_to(self, message: Any, timeout: float) -> Any:
        request = message if isinstance(message, dict) else message[0]
        with explained(self.settings.url, request):
            response = await self.post.post(encoded(message), timeout)
        if response.status_code != httpx.codes.OK:
            raise http_failure(self.settings.url, response, request)
        return decoded(self.settings.url, response, request)


def encoded(message: Any) -> bytes:
    try:
        return json.dumps(message, allow_nan=False, default=plain).encode("utf-8")
    except (TypeError, ValueError) as error:
        raise errors.WrongValue(f"The value cannot be sent: {error}.") from error


def plain(value: Any) -> Any:
    """Arrays and numbers of other libraries, bytes and tuples as plain values."""
    if isinstance(value, (bytes, bytearray)):
        return list(value)
    if hasattr(value, "tolist"):
        return value.tolist()
    raise TypeError(f"{type(value).__name__} has no form in JSON")


def decoded(url: str, response: httpx.Response, request: Mapping[str, Any]) -> Any:
    try:
        answer = json.loads(response.content.decode("utf-8", "replace"))
    except ValueError:
        answer = None
    messages = answer if isinstance(answer, list) else [answer]
    if not all(isinstance(message, dict) and ("result" in message or "error" in message)
               for message in messages):
        raise errors.NotTheService(f"{url} answers, but not as this service: is the address right?",
                                   request)
    return answer


def patience_for(batch: Sequence[Mapping[str, Any]], timeout: float) -> float:
    """How long the answer may take: the requests may wait and work by themselves."""
    return timeout + sum(seconds_of(request["method"], request["params"]) for request in batch)


def seconds_of(method: str, params: Mapping[str, Any]) -> float:
    if method == "executeCommand":
        return float(params.get("timeout", COMMAND_SECONDS))
    return max(0.0, float(params.get("reservation_timeout", 0.0)))


@contextlib.contextmanager
def explained(url: str, request: Mapping[str, Any]) -> Iterator[None]:
    """Turn failures of httpx into those of this package, each in one sentence."""
    try:
        yield
    except (httpx.ConnectError, httpx.ConnectTimeout) as error:
        raise errors.ServiceDown(f"Nothing answers at {url}: is the service running there? ({error})",
                                 request) from error
    except httpx.TimeoutException as error:
        raise errors.NoAnswerInTime(f"{url} did not answer in time.", request) from error
    except httpx.TransportError as error:
        raise errors.ConnectionBroken(
            f"The connection to {url} ended before the answer: {error or type(error).__name__}.",
            request) from error


def http_failure(url: str, response: httpx.Response, request: Mapping[str, Any]) -> errors.Error:
    """What an HTTP status other than 200 means, in one sentence."""
    status = response.status_code
    if status == httpx.codes.NOT_FOUND and "is disabled" in response.text:
        return errors.SwitchedOff(f"The service at {url} is switched off: set Enable=1 in section "
                                  "WebService of its qitrmc.ini, and start its web server again.", request)
    if status in (httpx.codes.UNAUTHORIZED, httpx.codes.FORBIDDEN, httpx.codes.PROXY_AUTHENTICATION_REQUIRED):
        return errors.AuthenticationRequired(
            f"{url} requires a user and a password, or refuses those given (HTTP {status}).", request)
    if status >= httpx.codes.INTERNAL_SERVER_ERROR or status in (400, 413):
        return errors.ServerFailure(f"{url} failed on the request with HTTP {status}: "
                                    f"{response.text.strip()[:200] or response.reason_phrase}", request)
    return errors.NotTheService(f"{url} answers with HTTP {status}, and is not this service: is the "
                                "address right?", request)
