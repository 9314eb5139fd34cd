"""Types command lines into real shells, presses the tabulator key, and checks what the shell runs.

    completion_shells.py TARVIK FOLDER

FOLDER contains the completions.
"""

import os
import pty
import re
import select
import subprocess
import sys
import tempfile
import time
from pathlib import Path

SHELLS = {
    "bash": (["bash", "--norc", "--noprofile", "-i"], "source {folder}/tarvik.bash"),
    "zsh": (
        ["zsh", "-f", "-i"],
        "fpath=({folder} $fpath); autoload -Uz compinit; compinit -u -D; unsetopt zle_bracketed_paste; PS1='> '",
    ),
    "fish": (["fish", "--no-config", "-i"], "source {folder}/tarvik.fish"),
}

# What is typed, with "@" for the tabulator key, and the words with which the tool is run then.
LINES = [
    ("tarvik voc@", ["vocabulary"]),
    ("tarvik show KS80@", ["show", "KS800"]),
    ("tarvik show ks80@", ["show", "KS800"]),
    ("tarvik check KS50 --ou@ STA@", ["check", "KS50", "--output", "STAPL"]),
    ("tarvik check KS50 --mode=DP@", ["check", "KS50", "--mode=DP770"]),
    ("tarvik devices --family kes@", ["devices", "--family", "kestrel"]),
    ("tarvik property KS50 VEND@", ["property", "KS50", "VENDOR"]),
    ("tarvik which --property VEND@Korvel", ["which", "--property", "VENDOR=Korvel"]),
    ("tarvik which --property VENDOR=Kor@", ["which", "--property", "VENDOR=Korvel"]),
    ("tarvik check --mode=dp@ KS50", ["check", "--mode=DP770", "KS50"]),
    ("tarvik help voc@", ["help", "vocabulary"]),
    ("tarvik lint some-f@", ["lint", "some-folder"]),
]

# In place of the tool: completes as it does, and otherwise prints how it was run.
WRAPPER = """#!/bin/sh
if [ "$1" = complete ]; then exec "{tool}" "$@"; fi
printf 'ran:'; printf ' <%s>' "$@"; printf '\\n'
"""

PATIENCE = 30


class Shell:
    def __init__(self, command, folder):
        environment = {name: value for name, value in os.environ.items() if not name.startswith("TARVIK_")}
        environment.update(
            PATH=f"{folder}:{environment['PATH']}", TERM="dumb", HOME=folder, INPUTRC="/dev/null", LC_ALL="C.UTF-8"
        )
        self.process, self.terminal = pty.fork()
        if self.process == 0:
            os.chdir(folder)
            os.execvpe(command[0], command, environment)
        self.text = ""

    def type(self, text):
        os.write(self.terminal, text.encode())

    def wait_for(self, pattern):
        """The groups of the pattern in what the shell shows from now on."""
        end = time.monotonic() + PATIENCE
        while not (found := re.search(pattern, self.text)):
            ready, _, _ = select.select([self.terminal], [], [], max(0, end - time.monotonic()))
            assert ready, f"no {pattern!r} in {self.text!r}"
            self.text += os.read(self.terminal, 65536).decode(errors="replace")
        self.text = self.text[found.end() :]
        return found.groups()

    def close(self):
        os.close(self.terminal)
        os.waitpid(self.process, 0)


def check(name, folder, completions):
    command, preparation = SHELLS[name]
    shell = Shell(command, folder)
    shell.type(preparation.format(folder=completions) + "; echo rea''dy\n")
    shell.wait_for("ready")
    for line, words in LINES:
        shell.type(line.replace("@", "\t") + "\n")
        (ran,) = shell.wait_for(r"ran: ([^\r\n]*)")
        # Some shells remove the slash after a folder again.
        ran = ran.replace("/>", ">")
        expected = " ".join(f"<{word}>" for word in words)
        assert ran == expected, f"{name}: {line} ran {ran}"
    shell.type("exit\n")
    shell.close()
    print(f"{name}: {len(LINES)} lines")


def main():
    tool, completions = map(os.path.abspath, sys.argv[1:])
    for shell, file in (("bash", "tarvik.bash"), ("zsh", "_tarvik"), ("fish", "tarvik.fish")):
        subprocess.run([shell, "-n", f"{completions}/{file}"], check=True)
    with tempfile.TemporaryDirectory() as folder:
        wrapper = Path(folder, "tarvik")
        wrapper.write_text(WRAPPER.format(tool=tool))
        wrapper.chmod(0o755)
        Path(folder, "some-folder").mkdir()
        for name in SHELLS:
            check(name, folder, completions)
    return 0


if __name__ == "__main__":
    sys.exit(main())
