"""Values as people type them and see them."""

from __future__ import annotations

import json
from typing import Any, List, Sequence

from ..errors import WrongValue
from ..values import PropertyInfo

TRUE, FALSE = ("true", "on", "yes", "1"), ("false", "off", "no", "0")
SPARKS = "▁▂▃▄▅▆▇█"
BYTES_IN_LINE = 16


def parsed(text: str, info: PropertyInfo) -> Any:
    """The value that a text means for a property. An array is a JSON array or has commas."""
    if not info.data_type.endswith("Array"):
        return parsed_one(text, info.data_type, info)
    kind = info.data_type[:-len("Array")]
    if text.lstrip().startswith("["):
        return json.loads(text)
    return [parsed_one(item.strip(), kind, info) for item in text.split(",")] if text else []


def parsed_one(text: str, kind: str, info: PropertyInfo) -> Any:
    try:
        if kind == "Bool":
            return {**dict.fromkeys(TRUE, True), **dict.fromkeys(FALSE, False)}[text.casefold()]
        if kind == "Double":
            return float(text)
        if kind != "String":
            return int(text, 0) if not info.items or text.lstrip("-").isdigit() else text
    except (KeyError, ValueError):
        raise WrongValue(f"{text!r} is no value of {info.name}, which is a {info.data_type}"
                         f"{', ' + info.limits() if info.limits() else ''}.") from None
    return text


def parsed_bytes(text: str) -> bytes:
    """Hexadecimal digits, with or without blanks, as bytes."""
    try:
        return bytes.fromhex(text.removeprefix("0x"))
    except ValueError:
        raise WrongValue(f"{text!r} are no bytes in hexadecimal digits.") from None


def hex_dump(address: int, data: bytes) -> List[List[str]]:
    """Lines of an address, sixteen bytes and their characters."""
    return [[f"{address + start:08x}", data[start:start + BYTES_IN_LINE].hex(" "),
             characters(data[start:start + BYTES_IN_LINE])]
            for start in range(0, len(data), BYTES_IN_LINE)]


def characters(data: bytes) -> str:
    return "".join(chr(byte) if 0x20 <= byte < 0x7F else "." for byte in data)


def sparkline(values: Sequence[Any], width: int = 40) -> str:
    """The latest numbers as a line of blocks; empty where they are no numbers."""
    numbers = [value for value in values[-width:] if isinstance(value, (int, float))]
    if not numbers:
        return ""
    low, high = min(numbers), max(numbers)
    scale = (len(SPARKS) - 1) / (high - low) if high > low else 0
    return "".join(SPARKS[round((number - low) * scale)] for number in numbers)
