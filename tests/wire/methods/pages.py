"""Reads the documents whose examples are run as tests."""

import json
import re

BLOCK = re.compile(r"^```(?:json|text) (.+)\n((?:.*\n)*?)```$", re.MULTILINE)
TEXT_OR_BLANKS = re.compile(r'("(?:[^"\\]|\\.)*")|\s+')


def compact(text):
    """JSON without the blanks outside its strings."""
    return TEXT_OR_BLANKS.sub(lambda match: match[1] or "", text)


def blocks_of(page):
    """The examples of a document in their order, as (kind, JSON text) pairs."""
    text = page.read_text(encoding="utf-8")
    blocks = BLOCK.findall(text)
    assert text.count("```json") + text.count("```text") == len(blocks), "a block does not say what it is"
    return blocks


def id_of(text):
    """The id that a response shares with its request."""
    message = json.loads(text)
    return message["id"] if isinstance(message, dict) else tuple(one["id"] for one in message)
