#!/usr/bin/env python3
"""Compares what two builds of the tool answer, byte for byte.

    transcripts.py [--calls N] [--batch] --folder FOLDER REFERENCE COMMAND...

REFERENCE is the tool of this machine, COMMAND runs one that is built for another. Both answer the same random calls of
`batch` about the demonstration, about all bad databases of the tests and about databases with random damage, and then
some commands. With --batch, COMMAND runs tarvik_batch, which answers the calls only. FOLDER is where the databases are
made.
"""

import argparse
import json
import os
import pathlib
import random
import shutil
import subprocess
import sys

ROOT = pathlib.Path(__file__).resolve().parents[2]
CALLS_PER_DATABASE = 200
BYTES = b",:=_ \t\r\n[]#\\+\0\xff\xc3A0"
# How many values an enumeration has; calls use some more on each side.
VALUES = {"mode": 9, "output": 10, "operation": 32, "option": 24}
COMMANDS = [["devices"], ["families", "--json"], ["vocabulary"], ["dump", "operations"], ["dump", "options"], ["dump", "bsdl"],
            ["dump", "multiboot"], ["show", "KS50"], ["show", "KS50", "--json"], ["which", "--operation", "PROGRAM", "--json"],
            ["why", "KS50", "--mode", "BS", "--output", "USB2"], ["identify", "0x1", "--json"], ["devices", "k?[0-9]*"],
            ["--help"], ["lint", "db"], ["lint", "db", "--format", "sarif"], ["format", "--diff", "db"], ["nonsense"],
            ["diff", "db", "db"], ["index", "db"], ["devices", "--json"], ["index", "--check", "db"],
            ["report", "--file", "-"], ["report", "--file", "report.html"]]


def damaged(text, source):
    """The text with some bytes, fields or lines changed."""
    data = bytearray(text)
    for _ in range(source.randrange(1, 6)):
        place = source.randrange(len(data) + 1)
        choice = source.randrange(4)
        if choice == 0:
            data[place:place] = bytes([source.choice(BYTES)])
        elif choice == 1:
            del data[place:place + source.randrange(1, 20)]
        elif choice == 2:
            lines = bytes(data).split(b"\n")
            source.shuffle(lines)
            data = bytearray(b"\n".join(lines))
        else:
            data += bytes(data[place:place + source.randrange(1, 80)])
    return bytes(data)


def make_database(folder, number, source):
    """Fills a folder with database files; returns their words."""
    shutil.rmtree(folder, ignore_errors=True)
    folder.mkdir(parents=True)
    bad = sorted(path for path in (ROOT / "tests/data/bad").iterdir() if path.is_dir())
    origin = ROOT / "database" if number % 2 == 0 else bad[number // 2 * 7 % len(bad)]
    words = set()
    for path in sorted(origin.glob("*.acd")):
        text = path.read_bytes()
        if number > 1 and source.random() < 0.5:
            text = damaged(text, source)
        (folder / path.name).write_bytes(text)
        for byte in b":=[]\n \t":
            text = text.replace(bytes([byte]), b",")
        words.update(word for word in text.decode("latin-1").split(",") if word.isprintable())
    return sorted(words)


def argument(kind, name, words, source):
    if kind == "boolean":
        return source.random() < 0.5
    if name in VALUES and kind == name:
        return source.randrange(-1, VALUES[name] + 2)
    if kind == '"recorder" or null':
        return source.choice(["recorder", None])
    if "null" in kind and source.random() < 0.03:
        return None
    if source.random() < 0.2:
        return source.choice(words) + source.choice("_x ") + source.choice(words)
    return source.choice(words) if source.random() < 0.97 else ""


def requests(calls, words, source):
    lines = []
    for number in range(CALLS_PER_DATABASE):
        call = source.choice(calls)
        arguments = [argument(each["type"], each["name"], words, source) for each in call["args"]]
        lines.append(json.dumps({"id": number, "call": call["call"], "args": arguments}))
    return "\n".join(lines) + "\n"


def run(command, folder, text=""):
    """What a command prints, and how it ends."""
    environment = {name: value for name, value in os.environ.items()
                   if name not in ("TARVIK_DATABASE", "TARVIK_INDEX", "COLUMNS", "TERM")}
    done = subprocess.run(command, input=text.encode(), capture_output=True, cwd=folder, env=environment,
                          check=False, timeout=600)
    return done.stdout, done.stderr, done.returncode


def compare(reference, command, folder, text=""):
    """@return whether both do the same"""
    expected = run(reference, folder, text)
    found = run(command, folder, text)
    if found == expected:
        return True
    print(f"in {folder}: {' '.join(command)}")
    for stream, wanted, got in zip(("standard output", "standard error", "exit status"), expected, found):
        if wanted != got and isinstance(wanted, int):
            print(f"  {stream}: {wanted} here, {got} there")
        elif wanted != got:
            lines = zip(wanted.splitlines(True) + [b""], got.splitlines(True) + [b""])
            line, (here, there) = next((number, pair) for number, pair in enumerate(lines, 1) if pair[0] != pair[1])
            print(f"  {stream}, line {line}:\n    {here[:500]!r} here\n    {there[:500]!r} there")
    return False


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("--calls", type=int, default=10_000)
    parser.add_argument("--batch", action="store_true")
    parser.add_argument("--folder", type=pathlib.Path, required=True)
    parser.add_argument("reference")
    parser.add_argument("command", nargs=argparse.REMAINDER)
    options = parser.parse_args()
    # The calls are made in other folders.
    reference = [os.path.abspath(options.reference)]
    options.command = [os.path.abspath(word) if os.path.exists(word) else word for word in options.command]
    help_text = run(reference + ["batch"], ROOT, '{"call": "help"}\n')[0]
    excluded = ["help", "RemoveConstraintsManager"] + (["show", "why"] if options.batch else [])
    calls = [call for call in json.loads(help_text)["result"] if call["call"] not in excluded]
    answer_calls = ["--database", "db", "batch"]
    results = []
    for number in range(-(-options.calls // CALLS_PER_DATABASE)):
        source = random.Random(number)
        folder = options.folder / str(number)
        words = make_database(folder / "db", number, source)
        text = requests(calls, words, source)
        results.append(compare(reference + answer_calls, options.command + (["db"] if options.batch else answer_calls),
                               folder, text))
    make_database(options.folder / "commands/db", 0, random.Random(0))
    for command in [] if options.batch else COMMANDS:
        arguments = command if "db" in command else ["--database", "db"] + command
        results.append(compare(reference + arguments, options.command + arguments, options.folder / "commands"))
    print(f"{results.count(True)} passed, {results.count(False)} failed")
    return 0 if all(results) else 1


sys.exit(main())
