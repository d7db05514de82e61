"""The command `qitrmc`."""

from .app import main

__all__ = ["main"]
