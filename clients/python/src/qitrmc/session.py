"""Sessions: what a program holds of a chassis while it works with it."""

from __future__ import annotations

import contextlib
import functools
import logging
import random
import time
from typing import (Any, Awaitable, Callable, Dict, Generic, List, Optional, Tuple, Type, TypeVar,
                    Union)

from . import leftovers, names, statuses
from .calls import SESSION_METHODS, AsyncMethods, Calls, Methods
from .connection import Connection, Request
from .errors import Error, Reserved, SessionClosed
from .operations import Awaiting, Blocking, operation
from .resource import AsyncResource, Resource

log = logging.getLogger("qitrmc")

SHORTEST_PAUSE, LONGEST_PAUSE = 0.05, 1.0
Access = Union[int, str]
R = TypeVar("R", Resource, AsyncResource)
T = TypeVar("T")


class SessionOperations(Generic[R]):
    """An open session. `session["Mod1"]` is a device, `session["Mod1/ch0:3"]` a range of channels.

    It closes itself at the end of its `with` block, and at the end of the program. Blocking sessions
    may be used by several threads; requests of one session run side by side.
    """

    _resource_class: Type[R]

    def __init__(self, connection: Connection, book: names.NameBook, session_id: str) -> None:
        #: The id of the session, for `call`.
        self.id = session_id
        self._connection = connection
        self._calls = Calls(connection)
        self._book = book
        self._resources: Dict[names.Name, R] = {}
        self._is_open = True
        leftovers.remember(connection.settings, session_id)

    def __repr__(self) -> str:
        return f"<{type(self).__name__} {self.id}{'' if self._is_open else ' (closed)'}>"

    def __getitem__(self, name: Union[str, Tuple[str, ...]]) -> R:
        """A resource, or several of one kind: `session["Mod1", "Mod2"]`. Sends nothing."""
        if name not in self._resources:
            wanted = list(name) if isinstance(name, tuple) else name
            self._resources[name] = self._resource_class(self, wanted)
        return self._resources[name]

    @operation
    async def close(self) -> None:
        """End the session and give up all that it holds. A session that is gone is no failure."""
        await self._close()

    @operation
    async def get(self, property: str) -> Any:
        """Read a property of the session or of the system."""
        self._check_open()
        return (await self._calls.get_property(session_id=self.id, property=property))["value"]

    @operation
    async def set(self, property: str, value: Any) -> None:
        """Write a property of the session or of the system."""
        self._check_open()
        await self._calls.set_property(session_id=self.id, property=property, value=value)

    @operation
    async def properties(self) -> List[str]:
        """The names of the properties of the session, then of those of the system."""
        self._check_open()
        return (await self._calls.get_session_property_list(session_id=self.id))["properties"]

    @operation
    async def commit(self) -> None:
        """Put pending changes of the resources that the session was opened on into effect."""
        self._check_open()
        await self._calls.commit_properties(session_id=self.id)

    @operation
    async def reserve(self, *devices: str, wait: float = 0.0, read_only: bool = False,
                      group: Optional[str] = None) -> None:
        """Reserve devices. Waits for them as `Chassis.session` does; raises DeviceReserved."""
        self._check_open()
        attempt = functools.partial(
            self._calls.reserve_devices, session_id=self.id, devices=list(devices) or None,
            access=1 if read_only else 3, reservation_group=group)
        await in_turn(attempt, self._connection, wait)

    @operation
    async def unreserve(self, *devices: str) -> None:
        """Give devices up; those that the session was opened on if none is named."""
        self._check_open()
        await self._calls.unreserve_devices(session_id=self.id, devices=list(devices) or None)

    @operation
    async def connect(self, *devices: str) -> None:
        """Connect to devices; to those that the session was opened on if none is named."""
        self._check_open()
        await self._calls.connect_to_devices(session_id=self.id, devices=list(devices) or None)

    @operation
    async def disconnect(self, *devices: str) -> None:
        """Disconnect from devices; from those that the session was opened on if none is named."""
        self._check_open()
        await self._calls.disconnect_from_devices(session_id=self.id, devices=list(devices) or None)

    @operation
    async def abort(self) -> None:
        """End what other threads or tasks are waiting for in this session. It stays open."""
        self._check_open()
        await self._calls.abort_session(session_id=self.id)

    @operation
    async def call(self, /, method: str, **params: Any) -> Any:
        """Call any method by its name on the wire, in this session. Returns the result."""
        self._check_open()
        return await self._connection.call(method, with_session(method, params, self.id))

    @operation
    async def batch(self, *requests: Request) -> List[Any]:
        """Send requests as one batch and return their results.

        requests: pairs of method and parameters; the session is put in. The batch stops at its first
        failure, which is raised with its number as `index` and the results before it as `results`.
        """
        self._check_open()
        return await self._connection.batch(
            [(method, with_session(method, params, self.id)) for method, params in requests])

    def _check_open(self) -> None:
        if not self._is_open:
            raise SessionClosed(f"The session {self.id} was closed before.")

    async def _close(self) -> None:
        if not self._is_open:
            return
        self._is_open = False
        leftovers.forget(self._connection.settings, self.id)
        with contextlib.suppress(statuses.UnknownSession):
            await self._calls.close_session(session_id=self.id)

    async def _leave(self, failure: Optional[BaseException]) -> None:
        """Close at the end of a block. A failure in the block goes before one of the closing."""
        try:
            await self._close()
        except Error:
            if failure is None:
                raise


def with_session(method: str, params: Any, session_id: str) -> Any:
    takes_session = method in SESSION_METHODS and "session_id" not in params
    return {"session_id": session_id, **params} if takes_session else params


async def in_turn(attempt: Callable[[], Awaitable[T]], connection: Connection, wait: float) -> T:
    """Repeat an attempt until its device is free or the wait is over.

    Each attempt goes without a timeout of the service: a request that waits there would
    hold up the very session that it waits for.
    """
    deadline = time.monotonic() + wait
    pause = SHORTEST_PAUSE
    is_logged = False
    while True:
        try:
            return await attempt()
        except Reserved as error:
            left = deadline - time.monotonic()
            if left <= 0:
                raise
            if not is_logged:
                log_holders(error, wait)
            is_logged = True
        await connection.post.pause(min(left, pause * random.uniform(0.5, 1.0)))
        pause = min(2 * pause, LONGEST_PAUSE)


def log_holders(error: Reserved, wait: float) -> None:
    device = error.details.get("Device") or error.details.get("Devices") or "The device"
    holders = ", ".join(error.sessions) or "another session"
    log.warning("%s is held by %s; waiting up to %g s.", device, holders, wait)


class Session(Blocking, SessionOperations[Resource]):
    """A session in a blocking program."""

    _resource_class = Resource

    @property
    def methods(self) -> Methods:
        """All methods of the service with their types, as they are on the wire."""
        return Methods(self._connection)

    def __enter__(self) -> Session:
        return self

    def __exit__(self, _type: Any, failure: Optional[BaseException], _trace: Any) -> None:
        self._perform(self._leave(failure))


class AsyncSession(Awaiting, SessionOperations[AsyncResource]):
    """A session in an asyncio program."""

    _resource_class = AsyncResource

    @property
    def methods(self) -> AsyncMethods:
        """All methods of the service with their types, as they are on the wire."""
        return AsyncMethods(self._connection)

    async def __aenter__(self) -> AsyncSession:
        return self

    async def __aexit__(self, _type: Any, failure: Optional[BaseException], _trace: Any) -> None:
        await self._leave(failure)
