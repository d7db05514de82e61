"""Puts this folder on the import path of the wire tests below it, for hostlib."""
