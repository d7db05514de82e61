"""What docs/deployment.md says, for the tests that compare it with the packages."""

import re

from machine import ROOT

PAGE = (ROOT / "docs" / "deployment.md").read_text(encoding="utf-8")
LANGUAGES = ("English", "French", "German", "Japanese", "Korean", "ChineseS")


def documented_files():
    """Paths by package. One that ends in / stands for all files below it."""
    files = {}
    for package, path in re.findall(r"^\| `([a-z0-9-]+)` \| `(/[^`]+)` \|$", PAGE, re.MULTILINE):
        for language in LANGUAGES if "<Language>" in path else [""]:
            files.setdefault(package, set()).add(path.replace("<Language>", language))
    return files


def as_documented(package, path):
    """The entry of the page for a file of a package: the file, or a folder that it lies in."""
    folders = [entry for entry in documented_files().get(package, ()) if entry.endswith("/")]
    return next((folder for folder in folders if path.startswith(folder)), path)


def documented_libraries():
    """Packages, or "of the controller", by library that the plug-in needs."""
    return dict(re.findall(r"^\| `(lib\S+\.so\.\d+)` \| `?([^|`]+?)`? \|$", PAGE, re.MULTILINE))


def commands(heading):
    """The command blocks of a section, each as one script."""
    section = re.search(rf"^## {re.escape(heading)}\n(.*?)(?=^## |\Z)", PAGE, re.MULTILINE | re.DOTALL)
    blocks = re.findall(r"(?:^    .*\n)+", section[1], re.MULTILINE)
    return [re.sub(r"^    ", "", block, flags=re.MULTILINE) for block in blocks]


def headings():
    """The names of all sections."""
    return re.findall(r"^## (.*)$", PAGE, re.MULTILINE)
