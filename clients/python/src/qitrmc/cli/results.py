"""What commands have to say, and how it is shown: as text, as a table on a terminal, or as JSON."""

from __future__ import annotations

import dataclasses
import enum
import json
import sys
from typing import Any, List, Sequence, Tuple

import click
from rich.console import Console
from rich.table import Table

from .. import statuses
from ..errors import (ConnectionFailure, Error, StatusError, WrongItem, WrongValue)
from ..names import UNKNOWN_RESOURCE

RESERVED, UNKNOWN_NAME, REFUSED_VALUE, UNREACHABLE = 3, 4, 5, 6
EXIT_CODES: Tuple[Tuple[Tuple[type, ...], int], ...] = (
    ((statuses.DeviceReserved, statuses.ReadOnlyReservation), RESERVED),
    ((*UNKNOWN_RESOURCE, statuses.UnknownProperty, statuses.UnknownCommand, statuses.UnknownMethod,
      statuses.NotChassis), UNKNOWN_NAME),
    ((WrongItem, WrongValue, statuses.InvalidParams, statuses.WrongValueType, statuses.ValueNotEnumerated,
      statuses.ValueOutOfRange, statuses.WrongElementCount, statuses.DataTooWide), REFUSED_VALUE),
    ((ConnectionFailure,), UNREACHABLE),
)


@dataclasses.dataclass
class Result:
    """data: for scripts. headings, rows: for people; without headings a row is a line."""

    data: Any
    rows: Sequence[Sequence[str]] = ()
    headings: Sequence[str] = ()


def exit_code(error: Error) -> int:
    """3 reserved, 4 unknown name, 5 refused value, 6 service not reached, 1 anything else."""
    return next((code for kinds, code in EXIT_CODES if isinstance(error, kinds)), 1)


def show(result: Result, as_json: bool) -> None:
    """Write a result on standard output."""
    if as_json:
        print(json_text(result.data))
    elif result.headings and sys.stdout.isatty():
        Console().print(terminal_table(result))
    else:
        for line in aligned(result):
            print(line)


def show_error(error: Error, as_json: bool) -> None:
    """Write an error on standard error."""
    if as_json:
        click.echo(json_text({"error": error_data(error)}), err=True)
    else:
        Console(stderr=True, soft_wrap=True).print(f"qitrmc: {error}", style="red", markup=False,
                                                   highlight=False)


def error_data(error: Error) -> Any:
    """An error for scripts."""
    return {"kind": type(error).__name__, "code": error.code, "name": error.name, "text": error.text,
            "details": error.details, "suggestion": error.suggestion}


def json_text(data: Any) -> str:
    return json.dumps(data, indent=2, ensure_ascii=False, default=plain)


def plain(value: Any) -> Any:
    if isinstance(value, StatusError):
        return {"error": error_data(value)}
    if isinstance(value, bytes):
        return value.hex()
    if dataclasses.is_dataclass(value):
        return {field.name: getattr(value, field.name) for field in dataclasses.fields(value)
                if not isinstance(getattr(value, field.name), enum.EnumMeta)}
    return str(value)


def terminal_table(result: Result) -> Table:
    table = Table()
    for heading in result.headings:
        table.add_column(heading, overflow="fold")
    for row in result.rows:
        table.add_row(*(cell.replace("[", r"\[") for cell in row))
    return table


def aligned(result: Result) -> List[str]:
    """The rows as lines of aligned columns, two blanks apart."""
    rows = [list(result.headings), *result.rows] if result.headings else list(result.rows)
    widths = [max(len(row[column]) for row in rows if column < len(row))
              for column in range(max((len(row) for row in rows), default=0))]
    return ["  ".join(cell.ljust(width) for cell, width in zip(row, widths)).rstrip() for row in rows]
