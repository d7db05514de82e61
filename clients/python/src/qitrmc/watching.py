"""Reading at an interval, and writing down what was read."""

from __future__ import annotations

import contextlib
import csv
import dataclasses
import datetime
import itertools
import math
import os
import time
from typing import (Any, AsyncIterator, Awaitable, Callable, Dict, IO, Iterator, List, Optional, Sequence,
                    cast)

from .errors import Error
from .tables import shown

PANDAS = "pandas"


@dataclasses.dataclass(frozen=True)
class Row:
    """What was read at one moment.

    time: when the reading began, in UTC. elapsed: seconds since the first reading was due. values: by
    name of the property. error: why there are none, with keep_going.
    """

    time: datetime.datetime
    elapsed: float
    values: Dict[str, Any]
    error: Optional[Error] = None

    def __getitem__(self, property: str) -> Any:
        return self.values[property]


async def rows(read: Callable[[str], Awaitable[Any]], properties: Sequence[str],
               pause: Callable[[float], Awaitable[None]], every: float, count: Optional[int],
               keep_going: bool) -> AsyncIterator[Row]:
    """Yield a row at each multiple of the interval that is not over yet."""
    start = time.monotonic()
    turn = 0
    for _ in itertools.count() if count is None else range(count):
        turn = next_turn(turn, time.monotonic() - start, every)
        await pause(max(0.0, start + turn * every - time.monotonic()))
        yield await row(read, properties, time.monotonic() - start, keep_going)
        turn += 1


def next_turn(turn: int, elapsed: float, every: float) -> int:
    """The next multiple of the interval: the one in turn, or the first that is still to come."""
    if every <= 0 or elapsed <= turn * every:
        return turn
    return turn if elapsed < (turn + 1) * every else math.ceil(elapsed / every)


async def row(read: Callable[[str], Awaitable[Any]], properties: Sequence[str], elapsed: float,
              keep_going: bool) -> Row:
    now = datetime.datetime.now(datetime.timezone.utc)
    try:
        return Row(now, elapsed, {property: await read(property) for property in properties})
    except Error as error:
        if not keep_going:
            raise
        return Row(now, elapsed, {}, error)


async def recorded(rows: AsyncIterator[Row], properties: Sequence[str], to: Any) -> Any:
    """Write rows down and return what `record` returns."""
    if to == PANDAS:
        return await data_frame(rows)
    with opened(to) as file:
        writer = csv.writer(file)
        writer.writerow(["time", "elapsed", *properties, "error"])
        written = 0
        async for row in rows:
            writer.writerow(cells(row, properties))
            file.flush()
            written += 1
        return written


def cells(row: Row, properties: Sequence[str]) -> List[str]:
    values = [csv_text(row.values.get(property)) for property in properties]
    return [row.time.isoformat(timespec="milliseconds"), f"{row.elapsed:.3f}", *values,
            str(row.error or "")]


def csv_text(value: Any) -> str:
    """Lists with blanks between their items, so that they stay one cell without quotes."""
    return " ".join(map(shown, value)) if isinstance(value, list) else shown(value)


@contextlib.contextmanager
def opened(to: Any) -> Iterator[IO[str]]:
    if isinstance(to, (str, os.PathLike)):
        with open(to, "w", newline="", encoding="utf-8") as file:
            yield file
    else:
        yield cast("IO[str]", to)


async def data_frame(rows: AsyncIterator[Row]) -> Any:
    import pandas  # type: ignore[import]  # only where it is wanted: it is large
    read = [row async for row in rows]
    return pandas.DataFrame([row.values for row in read],
                            index=pandas.DatetimeIndex([row.time for row in read], name="time"))
