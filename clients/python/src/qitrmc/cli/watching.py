"""The command watch."""

from __future__ import annotations

import contextlib
import csv
import sys
from typing import Any, Dict, Iterator, List, Optional, Tuple

import click
from rich.console import Console
from rich.live import Live
from rich.table import Table

from ..tables import shown
from ..watching import Row, cells, opened
from . import completion, results, texts
from .context import Context, common_options


@click.command()
@click.argument("resource", shell_complete=completion.resources)
@click.argument("properties", metavar="PROPERTY...", nargs=-1, required=True,
                shell_complete=completion.properties)
@click.option("--every", type=float, default=1.0, metavar="SECONDS", help="Time between readings (1).")
@click.option("--count", type=int, help="End after so many readings.")
@click.option("--csv", "path", type=click.Path(dir_okay=False), help="Write the readings to a file too.")
@common_options
def watch(context: Context, resource: str, properties: Tuple[str, ...], every: float,
          count: Optional[int], path: Optional[str]) -> None:
    """Read properties of RESOURCE again and again, until Ctrl-C.

    On a terminal there is a table with the latest course of each; otherwise a line for each reading.
    """
    with context.connect() as chassis, chassis.session() as session, view(properties, context) as show:
        with writer(path, properties) as write, contextlib.suppress(KeyboardInterrupt):
            for row in session[resource].watch(*properties, every=every, count=count):
                show(row)
                write(row)


@contextlib.contextmanager
def writer(path: Optional[str], properties: Tuple[str, ...]) -> Iterator[Any]:
    if path is None:
        yield lambda row: None
        return
    with opened(path) as file:
        lines = csv.writer(file)
        lines.writerow(["time", "elapsed", *properties, "error"])

        def write(row: Row) -> None:
            lines.writerow(cells(row, properties))
            file.flush()
        yield write


@contextlib.contextmanager
def view(properties: Tuple[str, ...], context: Context) -> Iterator[Any]:
    """A function that shows a row."""
    if context.as_json:
        yield show_json
    elif not sys.stdout.isatty():
        yield lambda row: show_line(row, properties)
    else:
        with Live(console=Console(), auto_refresh=False) as live:
            course: Dict[str, List[Any]] = {property: [] for property in properties}

            def show(row: Row) -> None:
                live.update(live_table(row, course), refresh=True)
            yield show


def show_json(row: Row) -> None:
    text = results.json_text({"time": row.time.isoformat(), **row.values})
    print(" ".join(text.split()), flush=True)


def show_line(row: Row, properties: Tuple[str, ...]) -> None:
    values = (shown(row[property]) for property in properties)
    print(row.time.isoformat(timespec="milliseconds"), *values, sep="  ", flush=True)


def live_table(row: Row, course: Dict[str, List[Any]]) -> Table:
    table = Table("Property", "Value", "Course", title=row.time.astimezone().strftime("%H:%M:%S"))
    for property, values in course.items():
        values.append(row[property])
        del values[:-100]
        table.add_row(property, shown(row[property]), texts.sparkline(values))
    return table


COMMANDS = (watch,)
