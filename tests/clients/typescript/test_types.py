"""clients/typescript/qitrmc.ts: up to date, and what a strict compiler makes of it."""

import shutil
import subprocess

from hostlib import ROOT
from npm_packages import packages

PROJECT = ROOT / "clients" / "typescript"
USES = ROOT / "tests" / "clients" / "typescript" / "uses.ts"


def compiled(folder, uses):
    """The output of the compiler for a program that uses the types; empty when it has no errors."""
    compiler = packages() / "node_modules" / ".bin" / "tsc"
    shutil.copy(PROJECT / "qitrmc.ts", folder)
    (folder / "uses.ts").write_text(uses, encoding="utf-8")
    tsc = subprocess.run([compiler, "--strict", "--target", "es2020", "--module", "es2020",
                          "--moduleResolution", "node", "uses.ts"],
                         cwd=folder, capture_output=True, text=True, timeout=120)
    assert (tsc.returncode == 0) == (tsc.stdout == ""), tsc
    return tsc.stdout


def test_the_types_are_up_to_date(tmp_path):
    types = tmp_path / "qitrmc.ts"
    subprocess.run([PROJECT / "make_types.py", "--types", types], check=True, timeout=60)
    assert types.read_bytes() == (PROJECT / "qitrmc.ts").read_bytes()


def test_right_uses_compile_and_wrong_ones_do_not(tmp_path):
    assert compiled(tmp_path, USES.read_text(encoding="utf-8")) == ""


def test_a_wrong_result_type_is_found(tmp_path):
    uses = 'import { GetModuleNameResult } from "./qitrmc";\nexport const r: GetModuleNameResult = {};\n'
    assert "Property 'present' is missing" in compiled(tmp_path, uses)
