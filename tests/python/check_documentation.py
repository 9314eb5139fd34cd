#!/usr/bin/env python3
"""Runs the examples of the documentation: those of the package's docstrings, and the Python blocks of a document.

    check_documentation.py DOCUMENT

Blocks with ">>>" are a session, all of a document in one process. Any other block is a script that must succeed.
"""

import doctest
import importlib
import pathlib
import re
import subprocess
import sys
import tempfile

import tarvik

MODULES = ("tarvik", "tarvik._library", "tarvik._manager", "tarvik._messages")


def check_docstrings():
    names = {"tarvik": tarvik, "manager": tarvik.Manager(tarvik.demonstration())}
    failed = attempted = 0
    for module in MODULES:
        result = doctest.testmod(importlib.import_module(module), extraglobs=dict(names))
        failed += result.failed
        attempted += result.attempted
    return failed, attempted


def blocks(document):
    text = document.read_text(encoding="utf-8")
    for match in re.finditer(r"^```python\n(.*?)^```$", text, re.MULTILINE | re.DOTALL):
        yield text.count("\n", 0, match.start()) + 1, match[1]


def run_script(document, line, script):
    with tempfile.TemporaryDirectory() as directory:
        path = pathlib.Path(directory, "script.py")
        path.write_text(script, encoding="utf-8")
        result = subprocess.run([sys.executable, path], capture_output=True, text=True, check=False)
    if result.returncode != 0:
        print(f"{document}:{line}\n{result.stderr}")
    return result.returncode


def check_document(document):
    failed = attempted = 0
    names = {}
    for line, block in blocks(document):
        attempted += 1
        if ">>>" in block:
            test = doctest.DocTestParser().get_doctest(block, names, str(document), str(document), line)
            runner = doctest.DocTestRunner()
            failed += runner.run(test, clear_globs=False).failed
            names = test.globs
        else:
            failed += 1 if run_script(document, line, block) != 0 else 0
    return failed, attempted


def main():
    for failed, attempted, least in ((*check_docstrings(), 15), (*check_document(pathlib.Path(sys.argv[1])), 7)):
        if failed or attempted < least:
            sys.exit(f"{failed} of {attempted} examples failed")


if __name__ == "__main__":
    main()
