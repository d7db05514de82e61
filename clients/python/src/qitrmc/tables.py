"""Lists that notebooks show as tables."""

from __future__ import annotations

import dataclasses
import html
from typing import Any, List, Optional, Protocol, Sequence, Tuple, TypeVar

from .values import PropertyInfo


class TableRow(Protocol):
    """A row knows its headings and its cells."""

    def headings(self) -> Tuple[str, ...]: ...

    def cells(self) -> Tuple[str, ...]: ...


R = TypeVar("R", bound=TableRow)


class Table(List[R]):
    """A list of rows of one kind."""

    def _repr_html_(self) -> str:
        if not self:
            return "<table></table>"
        head = cells_html("th", self[0].headings())
        rows = "".join(f"<tr>{cells_html('td', row.cells())}</tr>" for row in self)
        return f"<table><thead><tr>{head}</tr></thead><tbody>{rows}</tbody></table>"


def cells_html(tag: str, texts: Sequence[str]) -> str:
    return "".join(f"<{tag}>{html.escape(text)}</{tag}>" for text in texts)


def shown(value: Any) -> str:
    """A value in a table cell: items by name, numbers as short as they are exact."""
    if value is None:
        return ""
    if isinstance(value, list):
        return ", ".join(shown(item) for item in value)
    if isinstance(value, Exception):
        return f"({type(value).__name__})"
    name = getattr(value, "name", None)
    return name if isinstance(name, str) else str(value)


@dataclasses.dataclass(frozen=True)
class PropertyRow:
    """A property with its value at one moment; None where it cannot be read, or the error."""

    name: str
    value: Any
    info: PropertyInfo

    def headings(self) -> Tuple[str, ...]:
        """The names of the columns."""
        return ("Property", "Value", "Unit", "Access", "Limits", "Description")

    def cells(self) -> Tuple[str, ...]:
        """The texts of the columns."""
        return (self.name, shown(self.value), self.info.unit or "", self.info.access,
                self.info.limits(), self.info.description or "")


@dataclasses.dataclass(frozen=True)
class Module:
    """A device in a slot.

    slot is None for a device that has none. state is "ready", or why the device does not answer.
    holders are the ids of the sessions that hold it for writing; None where that was not found out.
    """

    name: str
    slot: Optional[int]
    product: str
    serial: str
    chassis: Optional[str] = None
    state: str = "ready"
    holders: Optional[Tuple[str, ...]] = None

    def headings(self) -> Tuple[str, ...]:
        """The names of the columns."""
        return ("Slot", "Module", "Product", "Serial number", "State", "Held by")

    def cells(self) -> Tuple[str, ...]:
        """The texts of the columns."""
        return (shown(self.slot), self.name, self.product, self.serial, self.state,
                ", ".join(self.holders or ()))
