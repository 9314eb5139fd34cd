"""A second reader of database files, written from the document of the format as a grammar of regular expressions.

It shares nothing with the engine. Run as a program it holds the engine against itself, over the files given and
over generated texts that are all edge:

    reader.py DUMP_LINES GENERATED FILE...
"""

import json
import random
import re
import subprocess
import sys
import tempfile
from pathlib import Path

LONGEST = 16 << 20
BLANKS = b" \t"

HEADER = re.compile(rb"\[(?P<name>[^\] \t\0]+)\]\Z")
ASSIGNMENT = re.compile(
    rb"(?P<key>[^=\0]*?)(?P<blanks>[ \t]*)(?P<plus>\+?)=[ \t]*(?P<value>.*?)[ \t]*\Z", re.S
)


def physical_lines(text):
    """The lines of a file without their ends."""
    if text.startswith(b"\xef\xbb\xbf"):
        text = text[3:]
    pieces = text.split(b"\n")
    ended = [piece[:-1] if piece.endswith(b"\r") else piece for piece in pieces[:-1]]
    return ended + ([pieces[-1]] if pieces[-1] else [])


def join(lines, index):
    """Joins what goes on: the bytes, the place of each, the index behind, and whether the file has it all."""
    text = b""
    places = []
    while True:
        line = lines[index]
        start = len(line) - len(line.lstrip(BLANKS))
        piece = line[start:]
        goes_on = piece.endswith(b"\\")
        kept = piece[:-1] if goes_on and index + 1 < len(lines) else piece
        text += kept
        places += [(index + 1, start + i + 1) for i in range(len(kept))]
        index += 1
        if not goes_on:
            break
        if index == len(lines):
            return text, places, index, False
        kept_length = len(text.rstrip(BLANKS))
        text, places = text[:kept_length], places[:kept_length]
    stripped = len(text.rstrip(BLANKS))
    return text[:stripped], places[:stripped], index, True


def fault(kind, header):
    return {"kind": "fault", "fault": kind, "closes": header}


def header_fault(text):
    if b"\0" in text:
        return "NUL byte"
    if b"]" not in text:
        return "unclosed header"
    name, _, behind = text[1:].partition(b"]")
    if not name:
        return "empty name"
    if re.search(rb"[ \t]", name):
        return "blank in name"
    return "text behind header" if behind else None


def read_header(text, places):
    wrong = header_fault(text)
    if wrong:
        return fault(wrong, True)
    return {"kind": "header", "name": HEADER.match(text)["name"], "place": places[1]}


def read_assignment(text, places):
    if b"\0" in text:
        return fault("NUL byte", False)
    match = ASSIGNMENT.match(text)
    if not match:
        return fault("no equals sign", False)
    key = match["key"]
    if not key:
        return fault("empty key", False)
    if re.search(rb"[ \t]", key):
        return fault("blank in key", False)
    return {
        # The "+" is only that of "+=" when it stands right before the "=".
        "kind": "append" if match["plus"] else "assignment",
        "name": key,
        "value": match["value"],
        "place": places[0],
        "value_places": places[match.start("value") : match.end("value")],
    }


def read(text):
    """The lines of a file as they are meant, and its comments."""
    lines = physical_lines(text)
    meant = []
    comments = []
    index = 0
    while index < len(lines):
        stripped = lines[index].lstrip(BLANKS)
        if not stripped:
            index += 1
            continue
        if stripped.startswith(b"#"):
            comments.append((index + 1, len(lines[index]) - len(stripped) + 1, stripped))
            index += 1
            continue
        first = index + 1
        is_header = stripped.startswith(b"[")
        joined, places, index, is_whole = join(lines, index)
        if len(joined) > LONGEST:
            line = fault("line too long", is_header)
        elif not is_whole:
            line = fault("continued at end", is_header)
        elif is_header:
            line = read_header(joined, places)
        else:
            line = read_assignment(joined, places)
        meant.append({**line, "first": first, "last": index})
    return meant, comments


def same(meant, engine):
    """What differs between a line of this reader and the engine's, or nothing."""
    expected = {
        "kind": meant["kind"],
        "first": meant["first"],
        "last": meant["last"],
        "name": list(meant.get("name", b"")),
        "value": list(meant.get("value", b"")),
        "fault": meant.get("fault", "none"),
        "closes": meant.get("closes", False),
    }
    found = {key: engine[key] for key in expected}
    if expected != found:
        return f"expected {expected}\nfound    {found}"
    if "place" in meant and meant["place"] != (engine["line"], engine["column"]):
        return f"expected at {meant['place']}, found at {engine['line']}:{engine['column']}"
    spans = engine["spans"]
    for offset, place in enumerate(meant.get("value_places", [])):
        fragment = [candidate for candidate in spans if candidate[0] <= offset][-1]
        if place != (fragment[1], fragment[2] + offset - fragment[0]):
            return f"byte {offset} of the value expected at {place}, found in {fragment}"
    return None


def compare(path, answer):
    meant, comments = read(Path(path).read_bytes())
    faults = []
    if len(meant) != len(answer["lines"]):
        faults.append(f"{len(meant)} lines, the engine has {len(answer['lines'])}")
    for line, engine in zip(meant, answer["lines"]):
        difference = same(line, engine)
        if difference:
            faults.append(difference)
    if [[line, column, list(text)] for line, column, text in comments] != answer["comments"]:
        faults.append("the comments differ")
    return faults


TOKENS = [
    b"\n", b"\n", b"\n", b"\\\n", b"\\\n", b"\r\n", b"\\\r\n", b"\r", b"\\", b" ", b"\t", b"[", b"]", b"[A]",
    b"\n[B]\n", b"\n [a]", b"[C c]", b"[]", b"#", b"\n#", b"=", b"+=", b"+", b"\nA=1\n", b"\nB += 2", b"A = ",
    b"b", b"A", b"\0", b"\xef\xbb\xbf", b"# [D]\\\n", b"\n\\\n", b"[E]\\\n", b"x = [F]\n", b"\xff", b"a,b:c",
]  # fmt: skip


def generate(directory, count):
    """Texts that are all edge, the same in every run."""
    chance = random.Random(1)
    for number in range(count):
        text = b"".join(chance.choice(TOKENS) for _ in range(chance.randrange(40)))
        if chance.randrange(8) == 0:
            text = b"\xef\xbb\xbf" + text
        path = Path(directory) / f"{number}.acd"
        path.write_bytes(text)
        yield str(path)


def main():
    dump_lines, generated, *files = sys.argv[1:]
    with tempfile.TemporaryDirectory() as directory:
        files += generate(directory, int(generated))
        found = 0
        for begin in range(0, len(files), 500):
            batch = files[begin : begin + 500]
            output = subprocess.run([dump_lines, *batch], check=True, capture_output=True).stdout
            for path, answer in zip(batch, output.splitlines(), strict=True):
                for difference in compare(path, json.loads(answer)):
                    found += 1
                    print(f"{path}: {Path(path).read_bytes()[:200]!r}\n{difference}")
        print(f"{len(files)} files, {found} differences")
        return 1 if found or not files else 0


if __name__ == "__main__":
    sys.exit(main())
