"""What properties are and how their values look in Python."""

from __future__ import annotations

import dataclasses
import enum
from typing import Any, Callable, Dict, Mapping, Optional, Type, Union

from .answers import nearest
from .calls import GetPropertyInformationResult
from .errors import WrongItem

Number = Union[int, float]


@dataclasses.dataclass(frozen=True)
class PropertyInfo:
    """What the chassis says about a property; None where it says nothing.

    minimum and maximum are numbers in the unit of the property. items are the names and numbers of
    an enumeration, and enum is a class of them, with the letters that Python allows.
    """

    name: str
    data_type: str
    access: str
    unit: Optional[str] = None
    minimum: Optional[Number] = None
    maximum: Optional[Number] = None
    description: Optional[str] = None
    document: Optional[str] = None
    driver_defined: bool = False
    pending_changes: bool = False
    items: Mapping[str, int] = dataclasses.field(default_factory=dict)
    enum: Optional[Type[enum.IntEnum]] = None

    @property
    def readable(self) -> bool:
        """Whether the property can be read."""
        return self.access != "WriteOnly"

    @property
    def writable(self) -> bool:
        """Whether the property can be written."""
        return self.access != "ReadOnly"

    def limits(self) -> str:
        """The limits or items in words; empty where there are none."""
        if self.items:
            return ", ".join(f"{name} ({number})" for name, number in self.items.items())
        low, high = ("" if limit is None else f"{limit:g}" for limit in (self.minimum, self.maximum))
        return f"{low} to {high}".strip() if low or high else ""


def property_info(name: str, result: GetPropertyInformationResult) -> PropertyInfo:
    """The answer of the service as an object."""
    data_type = result["data_type"]
    number = number_reader(data_type)
    enumeration = result.get("enum")
    items: Dict[str, int] = dict(enumeration["values"]) if enumeration else {}
    return PropertyInfo(
        name=name, data_type=data_type, access=result["access"], unit=result.get("unit"),
        minimum=number(result.get("min_value")), maximum=number(result.get("max_value")),
        description=result.get("description"), document=result.get("document"),
        driver_defined=result["driver_defined"], pending_changes=result["pending_changes"], items=items,
        enum=enum_class(enumeration["name"], items) if enumeration else None)


def number_reader(data_type: str) -> Callable[[Optional[str]], Optional[Number]]:
    """How the limits of a type are read; a text that is no number is no limit."""
    convert = int if "Int" in data_type else float

    def read(text: Optional[str]) -> Optional[Number]:
        try:
            return None if text is None else convert(text)
        except ValueError:
            return None
    return read


def enum_class(name: str, items: Mapping[str, int]) -> Type[enum.IntEnum]:
    """An IntEnum of the items. A name that Python keeps for itself gets `item_` in front."""
    members = [(f"item_{item}" if item == "mro" or item.startswith("_") else item, number)
               for item, number in items.items()]
    return enum.IntEnum(name, members)  # type: ignore[return-value]


def is_enumerable(data_type: str) -> bool:
    """Whether properties of a type may have an enumeration."""
    return data_type in ("Int32", "Int32Array")


def decoded_value(value: Any, info: PropertyInfo) -> Any:
    """A value as read, with items of the enumeration in place of their numbers."""
    if info.enum is None:
        return value
    if isinstance(value, list):
        return [decoded_value(item, info) for item in value]
    try:
        return info.enum(value)
    except ValueError:
        return value


def has_names(value: Any) -> bool:
    """Whether a value to write may hold names of items."""
    if isinstance(value, (list, tuple)):
        return any(isinstance(item, str) for item in value)
    return isinstance(value, str)


def encoded_value(value: Any, info: PropertyInfo) -> Any:
    """A value to write, with numbers in place of the names of items. Raises WrongItem."""
    if not info.items:
        return value
    if isinstance(value, (list, tuple)):
        return [encoded_value(item, info) for item in value]
    return item_number(value, info) if isinstance(value, str) else value


def item_number(name: str, info: PropertyInfo) -> int:
    folded = {item.casefold(): number for item, number in info.items.items()}
    if name in info.items:
        return info.items[name]
    if name.casefold() in folded:
        return folded[name.casefold()]
    error = WrongItem(f"{info.name} has no item {name!r}; its items are {info.limits()}.")
    close = nearest(name, info.items)
    if close:
        error.suggestion = f"Did you mean {' or '.join(close)}?"
    raise error
