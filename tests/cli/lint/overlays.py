"""Holds docs/overlays.md to its word: makes the files that it shows, runs its commands on them, and compares what
they print. A line "..." stands for any lines.

usage: overlays.py TOOL DATABASE DOCUMENT
"""
import os
import pathlib
import re
import shlex
import subprocess
import sys
import tempfile

BLOCK = re.compile(r"^```(\w+)\n(.*?)^```$", re.MULTILINE | re.DOTALL)


def commands(block):
    """The commands of a console block, each with the text that it prints."""
    for part in re.split(r"^\$ ", block, flags=re.MULTILINE)[1:]:
        command, _, shown = part.partition("\n")
        yield command, shown


def run(tool, command, directory):
    environment = {name: value for name, value in os.environ.items() if not name.startswith("TARVIK_")}
    environment["COLUMNS"] = "80"
    words = shlex.split(command)
    assert words[0] == "tarvik", command
    done = subprocess.run([tool, *words[1:]], cwd=directory, env=environment, stdout=subprocess.PIPE,
                          stderr=subprocess.STDOUT, check=False)
    return done.stdout.decode("utf-8")


def matches(shown, printed):
    pattern = "".join("(?:.*\n)*?" if line == "...\n" else re.escape(line) for line in shown.splitlines(True))
    return re.fullmatch(pattern, printed) is not None


def main(tool, database, document):
    text = pathlib.Path(document).read_text(encoding="utf-8")
    faults = 0
    count = 0
    with tempfile.TemporaryDirectory() as scratch:
        directory = pathlib.Path(scratch)
        (directory / "company").symlink_to(database)
        for kind, block in BLOCK.findall(text):
            if kind == "acd":
                path = directory / block.partition("\n")[0].removeprefix("# ")
                path.parent.mkdir(exist_ok=True)
                path.write_text(block, encoding="utf-8")
                continue
            for command, shown in commands(block):
                printed = run(tool, command, directory)
                count += 1
                if not matches(shown, printed):
                    faults += 1
                    print(f"$ {command}\nshown:\n{shown}printed:\n{printed}")
    print(f"{count} commands, {faults} of them print something else than the document shows")
    return 1 if faults or count == 0 else 0


if __name__ == "__main__":
    sys.exit(main(*sys.argv[1:4]))
