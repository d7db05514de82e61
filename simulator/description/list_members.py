#!/usr/bin/python3
"""Lists the members that objects of described files may have, for C++. They come from the JSON
Schemas of the files: a list for each object whose members are all known, named by its title.

usage: list_members.py HEADER SCHEMA...
"""

import json
import sys
from pathlib import Path

HEAD = """// Generated from the JSON Schemas of chassis files and faults files.
#pragma once

#include <string_view>

namespace simulator::members {
"""
TAIL = """
}  // namespace simulator::members
"""


def closed_objects(node):
    """(title, schema) of each object that has no members but those that the schema knows."""
    if isinstance(node, dict):
        if node.get("additionalProperties") is False:
            yield node["title"], node
        for child in node.values():
            yield from closed_objects(child)
    elif isinstance(node, list):
        for child in node:
            yield from closed_objects(child)


def main():
    header, *files = sys.argv[1:]
    lists = {}
    for file in files:
        for title, node in closed_objects(json.loads(Path(file).read_text(encoding="utf-8"))):
            if title in lists:
                sys.exit(f"{file}: has two objects with the title {title}")
            lists[title] = list(node["properties"])
    lines = [HEAD]
    for title, names in lists.items():
        listed = ", ".join(f'"{name}"' for name in names)
        lines.append(f"\ninline constexpr std::string_view {title}[] = {{{listed}}};\n")
    Path(header).write_text("".join(lines) + TAIL, encoding="utf-8")


if __name__ == "__main__":
    main()
