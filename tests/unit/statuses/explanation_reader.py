"""A small reader of explanation files and the searches of the two translators, written from the
rules of the files, independently of the program that reads them."""

import re

NUMBER = re.compile(rb"\s*([-+]?)(0[xX][0-9a-fA-F]+|0[0-7]*|[1-9][0-9]*)")


class BadFile(Exception):
    """An error that stops the search of a whole directory."""


def lines_of(path):
    """Yield the lines as a reader with a buffer of 1024 bytes sees them."""
    with path.open("rb") as file:
        while line := file.readline(1023):
            yield line


def begins(line, tag):
    return line.lower().startswith(tag)


def scanned_number(text):
    found = NUMBER.match(text)
    if not found:
        raise BadFile("code not readable")
    sign, digits = found.groups()
    base = 16 if digits[:2].lower() == b"0x" else 8 if digits.startswith(b"0") else 10
    return int(sign + digits, base)


def blocks_of(path):
    """Yield (code, bytes) of the error blocks of a file."""
    lines = lines_of(path)
    if not begins(next(lines, b""), b'<?xml version="1.0"'):
        return
    if not begins(next(lines, b""), b"<qidocument>"):
        return
    for line in lines:
        if begins(line, b"</qidocument>"):
            return
        if begins(line, b'<qierror code="'):
            code = scanned_number(line[len(b'<qierror code="'):])
            yield code, block_text(lines)
        elif begins(line, b"<qicomment>"):
            while not begins(next(lines, b"</qicomment>"), b"</qicomment>"):
                pass
        elif line.startswith(b"\0"):
            raise BadFile("unidentified section heading")


def block_text(lines):
    text = b""
    for line in lines:
        if begins(line, b"</qierror>"):
            return text.rstrip(b"\r\n")
        text += line
    raise BadFile("end of file inside an error block")


def find_in_directory(directory, wanted):
    """Return the text of a code, b"" if no file has it; FileNotFoundError without directory."""
    for path in sorted(directory.iterdir()):
        if path.is_file() and path.suffix in (".txt", ".err"):
            for code, text in blocks_of(path):
                if code == wanted and text:
                    return text
    return b""


def find_in_errors(shared, language, wanted):
    errors = shared / "errors"
    return find_in_directory(errors / language, wanted) or find_in_directory(errors, wanted)


def default_translator(shared, language, wanted):
    """The text of a status without details; None where the translation fails."""
    for attempt in (language, "English"):
        try:
            if text := find_in_errors(shared, attempt, wanted):
                return text.decode("utf-8")
        except FileNotFoundError:
            pass
    return None


def mxlator(shared, language, wanted):
    """The text of a status with details."""
    own = shared / "mierrors" / "qitrmc"
    searches = [lambda: find_in_directory(own / language, wanted),
                lambda: find_in_directory(own / "English", wanted),
                lambda: find_in_errors(shared, language, wanted),
                lambda: find_in_errors(shared, "English", wanted)]
    for search in searches:
        try:
            if text := search():
                return text.decode("utf-8")
        except FileNotFoundError:
            pass
    return "Error description not found"
