"""One source for blocking and for asyncio programs.

What the package does is written once, in `async def` functions that touch the world only through the
connection's `post` and `pause`. In a blocking program these two block and never suspend, so a
coroutine runs to its end in one step; in an asyncio program they are awaited as usual.
"""

from __future__ import annotations

import functools
from typing import (TYPE_CHECKING, Any, AsyncIterator, Callable, Coroutine, Generic, Iterator,
                    TypeVar, overload)

T = TypeVar("T")


class Blocking:
    """Base of the classes whose operations return when they are done."""

    def _perform(self, work: Coroutine[Any, Any, T]) -> T:
        return finished(work)

    def _stream(self, rows: AsyncIterator[T]) -> Iterator[T]:
        return iterated(rows)


class Awaiting:
    """Base of the classes whose operations are awaited."""

    def _perform(self, work: Coroutine[Any, Any, T]) -> Coroutine[Any, Any, T]:
        return work

    def _stream(self, rows: AsyncIterator[T]) -> AsyncIterator[T]:
        return rows


def finished(work: Coroutine[Any, Any, T]) -> T:
    """The result of a coroutine that never suspends."""
    try:
        work.send(None)
    except StopIteration as stop:
        return stop.value  # type: ignore[no-any-return]
    work.close()
    raise RuntimeError("a blocking operation has suspended")


def iterated(rows: AsyncIterator[T]) -> Iterator[T]:
    """The items of an asynchronous generator that never suspends."""
    try:
        while True:
            try:
                item = finished(next_of(rows))
            except StopAsyncIteration:
                return
            yield item
    finally:
        finished(rows.aclose())  # type: ignore[attr-defined]


async def next_of(rows: AsyncIterator[T]) -> T:
    return await rows.__anext__()


if TYPE_CHECKING:
    from typing_extensions import Concatenate, ParamSpec

    P = ParamSpec("P")

    class operation(Generic[P, T]):
        """A method that a blocking class runs and whose coroutine an asyncio class returns."""

        def __init__(self, work: Callable[Concatenate[Any, P], Coroutine[Any, Any, T]]) -> None: ...

        @overload
        def __get__(self, instance: Blocking, owner: Any) -> Callable[P, T]: ...

        @overload
        def __get__(self, instance: Awaiting, owner: Any) -> Callable[P, Coroutine[Any, Any, T]]: ...

        def __get__(self, instance: Any, owner: Any) -> Any: ...

    class stream(Generic[P, T]):
        """A method that gives an iterator in a blocking class and an asynchronous one otherwise."""

        def __init__(self, rows: Callable[Concatenate[Any, P], AsyncIterator[T]]) -> None: ...

        @overload
        def __get__(self, instance: Blocking, owner: Any) -> Callable[P, Iterator[T]]: ...

        @overload
        def __get__(self, instance: Awaiting, owner: Any) -> Callable[P, AsyncIterator[T]]: ...

        def __get__(self, instance: Any, owner: Any) -> Any: ...

else:

    def operation(work):
        @functools.wraps(work)
        def method(self, *args, **kwargs):
            return self._perform(work(self, *args, **kwargs))
        return method

    def stream(rows):
        @functools.wraps(rows)
        def method(self, *args, **kwargs):
            return self._stream(rows(self, *args, **kwargs))
        return method


__all__ = ["Awaiting", "Blocking", "operation", "stream"]
