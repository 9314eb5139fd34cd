#!/usr/bin/env python3
"""Measures how long the compiler takes for a file that includes the manager's header, and for one that includes <map>.

compile_time.py [COMPILER]: the results as lines of the table, CPU time in milliseconds. The two are compiled in turn,
because the speed of a machine varies.
"""
import os
import resource
import subprocess
import sys
import tempfile

ROOT = os.path.abspath(os.path.join(os.path.dirname(os.path.abspath(__file__)), ".."))
SOURCES = {"ConstraintsManager.h": "#include <tarvik/ConstraintsManager.h>\n", "<map>": "#include <map>\n"}
ROUNDS = 11


def children_time():
    usage = resource.getrusage(resource.RUSAGE_CHILDREN)
    return usage.ru_utime + usage.ru_stime


def main():
    compiler = sys.argv[1] if len(sys.argv) > 1 else "c++"
    with tempfile.TemporaryDirectory() as folder:
        for round_number in range(ROUNDS):
            for name, text in SOURCES.items():
                source = os.path.join(folder, "source.cpp")
                with open(source, "w", encoding="ascii") as file:
                    file.write(text)
                before = children_time()
                subprocess.run([compiler, "-std=c++17", f"-I{ROOT}/include", f"-I{ROOT}/host/include", "-c", source,
                                "-o", os.path.join(folder, "source.o")], check=True)
                # The first round reads the headers from the disk.
                if round_number > 0:
                    print(f"compile time\theader\t{name}\tms\t{1000 * (children_time() - before):.1f}")


main()
