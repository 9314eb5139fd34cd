"""Compares the help with what the tool does, and the manual page with the help.

    help.py TARVIK DATABASE MANUAL UPDATE_MANUAL

Every example of the help runs, everything that the help names is in the manual, and the manual's sections of options
and commands are what UPDATE_MANUAL makes.
"""

import os
import re
import shutil
import subprocess
import sys
import tempfile
from pathlib import Path

# Commands whose examples show an obstacle or a difference.
MAY_ANSWER_NO = {"why", "diff", "lsp"}


def run(command, folder, environment):
    return subprocess.run(
        ["bash", "-c", command], stdin=subprocess.DEVNULL, capture_output=True, check=False, cwd=folder,
        env=environment, text=True,
    )


def commands_of(text):
    listed = text.split("Commands:")[1]
    return [line.split()[0] for line in listed.splitlines() if re.match(r"  \S", line)]


def options_of(text):
    names = set()
    for line in text.splitlines():
        if re.match(r" +-", line):
            names.update(re.findall(r"(?<![\w-])--?[a-zA-Z][a-z-]*", line[:28]))
    return names


def examples_of(text):
    return [line.strip() for line in text.split("Examples:\n")[1].split("\n\n")[0].splitlines()]


def prepare(folder, database):
    """Makes the files that the examples name."""
    for name in ("database", "company", "changed", "released"):
        shutil.copytree(database, Path(folder, name))
    Path(folder, "site").mkdir()
    overlay = "PROPERTY += :VENDOR,Someone\n"
    Path(folder, "site", "kestrel.acd").write_text(overlay)
    for name in ("changed", "released"):
        with Path(folder, name, "kestrel.acd").open("a") as family:
            family.write("[KS50]\n" + overlay)


def check_manual(manual, names):
    lint = subprocess.run(["mandoc", "-Tlint", manual], capture_output=True, check=False, text=True)
    assert not lint.stdout, lint.stdout
    assert lint.returncode == 0, lint
    page = subprocess.run(["mandoc", "-Tutf8", "-O", "width=200", manual], capture_output=True, check=True, text=True)
    plain = re.sub(".\b", "", page.stdout)
    for name in names:
        assert re.search(rf"(?<![\w-]){re.escape(name)}(?![\w-])", plain), f"{manual} lacks {name}"


def commit(folder):
    """Some examples compare with a revision."""
    git = ["git", "-C", folder, "-c", "user.name=N", "-c", "user.email=n@example.org"]
    for command in (["init", "--quiet"], ["add", "."], ["commit", "--quiet", "--message=start"]):
        subprocess.run(git + command, check=True)


def main():
    tool, database, manual, update_manual = map(os.path.abspath, sys.argv[1:])
    environment = {
        name: value for name, value in os.environ.items() if name != "COLUMNS" and not name.startswith("TARVIK_")
    }
    environment["PATH"] = f"{os.path.dirname(tool)}:{environment['PATH']}"
    with tempfile.TemporaryDirectory() as folder:
        prepare(folder, database)
        commit(folder)
        summary = run("tarvik --help", folder, environment).stdout
        commands = commands_of(summary)
        assert len(commands) > 15, commands
        names = set(commands) | options_of(summary)
        shown, count = summary, 0
        for command in commands:
            help_text = run(f"tarvik {command} --help", folder, environment).stdout
            shown += help_text
            names |= options_of(help_text)
            examples = examples_of(help_text)
            assert any(f"tarvik {command}" in line for line in examples), f"{command} has no example"
            for line in examples:
                outcome = run(line, folder, environment)
                assert outcome.returncode == 0 or (outcome.returncode == 1 and command in MAY_ANSWER_NO), outcome
                assert outcome.stdout or command in ("lint", "format", "lsp", "report") or "--against" in line, (line, outcome)
                count += 1
        assert len(names) > 40, names
        for line in shown.splitlines():
            assert len(line) <= 80, line
    check_manual(manual, names)
    subprocess.run([update_manual, "--check", tool], check=True)
    print(f"{count} examples of {len(commands)} commands; {len(names)} names in the manual")
    return 0


if __name__ == "__main__":
    sys.exit(main())
