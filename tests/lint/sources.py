"""The files that the rules are about."""

import pathlib
import re
import subprocess

ROOT = pathlib.Path(__file__).resolve().parents[2]


def tracked(*patterns):
    """The files of the repository that match, new ones included."""
    listing = subprocess.run(["git", "ls-files", "-co", "--exclude-standard", "--", *patterns],
                             cwd=ROOT, check=True, capture_output=True, text=True).stdout
    return [path for path in map(ROOT.joinpath, sorted(set(listing.splitlines()))) if path.is_file()]


def scripts(interpreter):
    """The files without an ending whose first line names this interpreter."""
    first_line = re.compile(rb"#!.*\b" + interpreter.encode() + rb"\d?\b")
    return [path for path in tracked() if not path.suffix and not path.is_symlink()
            and first_line.match(path.read_bytes()[:80])]


def cpp_files(*folders):
    """The C++ files below these folders, or all except the C headers of include/."""
    patterns = [f"{folder}/*.{ending}" for folder in folders or ("*",) for ending in ("cpp", "h")]
    return [path for path in tracked(*patterns) if path.parent != ROOT / "include"]


def code_of(path):
    """The text of a C++ file, its comments and the contents of its literals replaced by blanks."""
    def blank(match):
        text = match[0]
        if text.startswith("/"):
            return re.sub(r"[^\n]", " ", text)
        return '"' + re.sub(r"[^\n]", " ", text[1:-1]) + '"'

    return re.sub(r'R"(\w*)\((?s:.*?)\)\1"|"(?:[^"\\\n]|\\.)*"|\'(?:[^\'\\\n]|\\.)+\''
                  r"|//[^\n]*|/\*(?s:.*?)\*/", blank, path.read_text(encoding="utf-8"))


def matches(pattern, paths):
    """Where the pattern is in the code of these files, as "file:line: text"."""
    found = []
    for path in paths:
        text = code_of(path)
        for match in re.finditer(pattern, text, re.MULTILINE):
            line = text.count("\n", 0, match.start()) + 1
            found.append(f"{path.relative_to(ROOT)}:{line}: {match[0].strip()}")
    return found
