#!/usr/bin/python3
"""Embeds files in a program.

embed.py table OUTPUT FILE...      a source with the table of embedded/EmbeddedFiles.h
embed.py constants OUTPUT FILE...  a header with a text for each file, in the namespace embedded; the
                                   text of bench.json is embedded::bench
"""

import sys
from pathlib import Path

# Characters that need no escape in a C++ string literal. The question mark is not among them, since
# two of them begin a trigraph in older versions of C++.
PLAIN = frozenset(range(0x20, 0x7F)) - frozenset(b'"\\?')


def escaped(line: bytes) -> str:
    # Always three octal digits, so that a digit after the escape is not read as part of it.
    return "".join(chr(byte) if byte in PLAIN else f"\\{byte:03o}" for byte in line)


def literal(data: bytes) -> str:
    lines = data.splitlines(keepends=True) or [b""]
    return "\n".join(f'    "{escaped(line)}"' for line in lines)


def definition(index: int, data: bytes) -> str:
    return (
        f"constexpr char data{index}[] =\n{literal(data)};\n"
        f"constexpr std::uint32_t size{index} = {len(data)};\n"
        f"static_assert(sizeof(data{index}) == size{index} + 1u);\n"
    )


def table(paths: list[Path]) -> str:
    definitions = "\n".join(
        definition(index, path.read_bytes()) for index, path in enumerate(paths)
    )
    rows = "\n".join(
        f'    {{"{escaped(path.name.encode())}", data{index}, size{index}}},'
        for index, path in enumerate(paths)
    )
    return (
        '#include "embedded/EmbeddedFiles.h"\n\n'
        f"namespace {{\n\n{definitions}\n"
        f"constexpr EmbeddedFile files[] = {{\n{rows}\n}};\n\n"
        "}  // namespace\n\n"
        "EmbeddedFiles embeddedFiles() noexcept {\n"
        f"    return {{files, files + {len(paths)}}};\n"
        "}\n"
    )


def constant(name: str, data: bytes) -> str:
    return f"inline constexpr std::string_view {name}(\n{literal(data)},\n    {len(data)});\n"


def constants(paths: list[Path]) -> str:
    definitions = "\n".join(constant(path.stem, path.read_bytes()) for path in paths)
    return (
        "#pragma once\n\n#include <string_view>\n\n"
        f"namespace embedded {{\n\n{definitions}\n}}  // namespace embedded\n"
    )


FORMS = {"table": table, "constants": constants}


def main() -> None:
    form, output, *inputs = sys.argv[1:]
    Path(output).write_text(FORMS[form](list(map(Path, inputs))), encoding="ascii")


if __name__ == "__main__":
    main()
