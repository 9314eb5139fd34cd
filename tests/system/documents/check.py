"""Does what a document shows, and fails unless everything comes out as the document says.

A block is taken by its language:
  cpp      compiled as C++17 with warnings as errors. One that holds a main function is a program: it is linked with the
           installed library and run. Any other is the inside of a function, behind Fragment.h.
  c        the same as C99, with the C interface.
  console  lines that start with "$ " are run by the shell, the lines below each are what it prints. Without such lines
           it has only to succeed.
Other blocks are not looked at. A block of any language whose first line is a comment that starts with a file's name is
written to that file, for the commands to find.

The commands run in a folder of their own in which `build/demo` is the build tree and `tarvik` is the tool in it. Their
home is empty at first. Each command has a shell of its own, in which the block's exports were made before.
"""

import argparse
import difflib
import os
import pathlib
import re
import shlex
import shutil
import subprocess
import sys

WARNINGS = ["-Wall", "-Wextra", "-Wpedantic", "-Wshadow", "-Werror"]


class Failure(Exception):
    pass


def blocks(text):
    """The blocks of a document: language, number of the first line, text."""
    for match in re.finditer(r"^```(\w*)\n(.*?)^```$", text, re.MULTILINE | re.DOTALL):
        yield match[1], text.count("\n", 0, match.start()) + 2, match[2]


def named_file(body):
    """The name that a block gives the file it stands for."""
    match = re.match(r"(?:#|//) ([\w./-]+\.\w+)(?:$|: )", body.split("\n", 1)[0])
    return match and match[1]


class Checker:
    def __init__(self, arguments):
        self.document = arguments.document
        self.compiler = [arguments.compiler, *shlex.split(arguments.flags)]
        self.fragment = pathlib.Path(__file__).with_name("Fragment.h")
        self.tree = arguments.tree
        self.libraries = arguments.tree / arguments.libraries
        self.folder = arguments.scratch
        shutil.rmtree(self.folder, ignore_errors=True)
        (self.folder / "build").mkdir(parents=True)
        (self.folder / "build/demo").symlink_to(arguments.build_tree)
        home = self.folder / "home"
        home.mkdir()
        self.environment = dict(os.environ, HOME=str(home), CXX=arguments.compiler, CXXFLAGS=arguments.flags,
                                COLUMNS="80",
                                PATH=f"{self.folder}/build/demo/cli:{os.environ['PATH']}")

    def run(self, command):
        return subprocess.run(command, cwd=self.folder, env=self.environment, stdout=subprocess.PIPE,
                              stderr=subprocess.STDOUT, text=True, check=False)

    def compile(self, language, name, text, arguments):
        source = self.folder / f"{name}.{language}"
        source.write_text(text, encoding="utf-8")
        include = self.tree / "include"
        options = ["-std=c++17", f"-I{include}/tarvik/host"] if language == "cpp" else ["-std=c99"]
        self.expect_success([*self.compiler, *options, *WARNINGS, f"-I{include}", "-x",
                             "c++" if language == "cpp" else "c", str(source), "-x", "none", *arguments])

    def located(self, line, body):
        """Code for which the compiler names the document."""
        return f'#line {line} "{self.document}"\n{body}'

    def run_program(self, language, line, body):
        program = self.folder / f"program{line}"
        libraries = ["-lTarvikConstraintsManager", "-lTarvikHost"] if language == "cpp" else ["-ltarvik"]
        self.compile(language, program.name, self.located(line, body),
                     ["-o", str(program), f"-L{self.libraries}", *libraries, f"-Wl,-rpath,{self.libraries}"])
        self.expect_success([str(program)])

    def compile_fragments(self, language, fragments):
        functions = [f"void fragment{line}(void);\nvoid fragment{line}(void) {{\n{self.located(line, body)}}}\n"
                     for line, body in fragments]
        headers = {"cpp": [f'"{self.fragment}"'], "c": ["<stdio.h>", "<tarvik/tarvik.h>"]}[language]
        self.compile(language, "fragments", "".join(f"#include {header}\n" for header in headers) + "".join(functions),
                     ["-fsyntax-only"])

    def expect_success(self, command):
        result = self.run(command)
        if result.returncode != 0:
            raise Failure(f"{shlex.join(command)}\nends with {result.returncode}:\n{result.stdout}")

    def converse(self, line, body):
        exports = ""
        for offset, command, expected in commands(body):
            if command.startswith("export "):
                exports += command + "\n"
            result = self.run(["bash", "-c", exports + command])
            if not expected and result.returncode != 0:
                raise Failure(f"line {line + offset}: {command}\nends with {result.returncode}:\n{result.stdout}")
            if expected and result.stdout != expected:
                difference = difflib.unified_diff(expected.splitlines(True), result.stdout.splitlines(True),
                                                  "as the document says", "as it is")
                raise Failure(f"line {line + offset}: {command}\n{''.join(difference)}")

    def check(self):
        counts = {"cpp": 0, "c": 0, "console": 0}
        fragments = {"cpp": [], "c": []}
        for language, line, body in blocks(self.document.read_text(encoding="utf-8")):
            if name := named_file(body):
                file = self.folder / name
                file.parent.mkdir(parents=True, exist_ok=True)
                file.write_text(body, encoding="utf-8")
            if language in fragments and "int main(" in body:
                self.run_program(language, line, body)
            elif language in fragments:
                fragments[language].append((line, body))
            elif language == "console":
                self.converse(line, body)
            if language in counts:
                counts[language] += 1
        for language, bodies in fragments.items():
            self.compile_fragments(language, bodies)
        return counts


def commands(body):
    """The commands of a console block: where they stand, the command, and what is printed below it."""
    found = []
    for offset, text in enumerate(body.splitlines(True)):
        if text.startswith("$ "):
            found.append([offset, text[2:].strip(), ""])
        elif found:
            found[-1][2] += text
        else:
            raise Failure(f"a console block starts without a command: {text}")
    return found


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("document", type=pathlib.Path)
    parser.add_argument("--build-tree", type=pathlib.Path, required=True)
    parser.add_argument("--tree", type=pathlib.Path, required=True, help="where it is installed")
    parser.add_argument("--libraries", required=True)
    parser.add_argument("--scratch", type=pathlib.Path, required=True)
    parser.add_argument("--compiler", required=True)
    parser.add_argument("--flags", default="")
    parser.add_argument("--expect", nargs=2, type=int, required=True, metavar=("CODE", "CONSOLE"),
                        help="the least numbers of blocks, so that the document does not lose them unnoticed")
    arguments = parser.parse_args()
    try:
        counts = Checker(arguments).check()
    except Failure as failure:
        sys.exit(f"{arguments.document}: {failure}")
    if counts["cpp"] + counts["c"] < arguments.expect[0] or counts["console"] < arguments.expect[1]:
        sys.exit(f"{arguments.document}: has only these blocks: {counts}")
    print(counts)


if __name__ == "__main__":
    main()
