#!/usr/bin/env python3
"""The tool on streams that are not ready, or cannot be read: streams.py TOOL DATABASE."""
import fcntl
import json
import os
import subprocess
import sys
import time

QUESTION = json.dumps({"call": "isSpiDevice", "args": ["OVD1"]}) + "\n"


def not_blocking(descriptor):
    fcntl.fcntl(descriptor, fcntl.F_SETFL, fcntl.fcntl(descriptor, fcntl.F_GETFL) | os.O_NONBLOCK)


def asleep(process):
    """Waits until the process waits for something, and not just for a moment."""
    times = 0
    while times < 10:
        with open(f"/proc/{process.pid}/stat", encoding="utf-8") as file:
            times = times + 1 if file.read().rpartition(")")[2].split()[0] == "S" else 0
        time.sleep(0.01)


def output_is_not_ready(tool, database):
    """A page that is larger than a pipe arrives whole although writing to the pipe would block."""
    command = [tool, "--database", database, "report", "--file", "-"]
    expected = subprocess.run(command, capture_output=True, check=True).stdout
    reading, writing = os.pipe()
    not_blocking(writing)
    with subprocess.Popen(command, stdout=writing) as process:
        os.close(writing)
        asleep(process)
        with os.fdopen(reading, "rb") as page:
            assert page.read() == expected
        assert process.wait() == 0
    assert len(expected) > 65536, "the page fits into a pipe"


def input_is_not_ready(tool, arguments, text, expected):
    """The tool waits for an input that has nothing yet."""
    reading, writing = os.pipe()
    not_blocking(reading)
    with subprocess.Popen([tool, *arguments], stdin=reading, stdout=subprocess.PIPE, text=True) as process:
        os.close(reading)
        asleep(process)
        os.write(writing, text.encode())
        os.close(writing)
        assert expected in process.stdout.read(), arguments
        process.wait()


def input_cannot_be_read(tool, arguments):
    directory = os.open("/", os.O_RDONLY)
    result = subprocess.run([tool, *arguments], stdin=directory, capture_output=True, text=True, check=False)
    os.close(directory)
    assert result.returncode == 2, result
    assert "Is a directory" in result.stderr, result


def temporary_files_cannot_be_made(tool, database):
    """What needs temporary files says that there can be none."""
    result = subprocess.run([tool, "diff", "--against", "HEAD", database], capture_output=True, text=True, check=False,
                            env=os.environ | {"TMPDIR": "/proc"})
    assert result.returncode == 2, result
    assert "cannot make the directory \"/proc/" in result.stderr, result


def main(tool, database):
    os.environ["TARVIK_DATABASE"] = database
    output_is_not_ready(tool, database)
    input_is_not_ready(tool, ["batch"], QUESTION, '"result":true')
    initialize = json.dumps({"jsonrpc": "2.0", "id": 1, "method": "initialize", "params": {"capabilities": {}}})
    input_is_not_ready(tool, ["lsp"], f"Content-Length: {len(initialize)}\r\n\r\n{initialize}", '"capabilities"')
    input_cannot_be_read(tool, ["batch"])
    input_cannot_be_read(tool, ["lsp"])
    temporary_files_cannot_be_made(tool, database)
    return 0


if __name__ == "__main__":
    sys.exit(main(*sys.argv[1:]))
