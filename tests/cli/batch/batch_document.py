"""Compares batch with its schema and its document.

    batch_document.py TARVIK SCHEMA DOCUMENT [--update]

Answers of all kinds are valid by the schema, the document's examples are answered as it shows, and its table of calls
is what the call "help" lists; --update writes that table.
"""

import json
import os
import re
import subprocess
import sys
from pathlib import Path

import jsonschema

REQUESTS = """
{"call": "help"}
{"call": "help", "args": [1]}
{"id": "a", "call": "getDeviceOperations", "args": ["KS50", 0, 2]}
{"id": [1], "call": "getDeviceOperations", "args": {"device": "KS50", "mode": "bs", "output": "usb2 cable"}}
{"id": 2, "call": "getDeviceOperations", "args": {"device": "KS50", "mode": "zz", "output": "usb2 cable"}}
{"id": 3, "call": "getDeviceOperations", "args": ["ZZ", 0, 2]}
{"id": 4, "call": "getAllDeviceIdcodes"}
{"id": 5, "call": "getOperationOrders"}
{"id": 6, "call": "zz"}
{"id": 7, "call": 7}
{"id": 8, "call": "dumpOperationsTable"}
{"id": 9, "call": "dumpOperationsTable", "args": ["recorder"]}
{"id": 10, "call": "getPartFamily", "args": [null]}
not JSON
"""
TABLE = re.compile(r"(?<=<!-- calls -->\n).*?(?=<!-- end of calls -->)", re.DOTALL)


def batch(tool, requests):
    environment = {name: value for name, value in os.environ.items() if not name.startswith("TARVIK_")}
    run = subprocess.run([tool, "batch"], input=requests, capture_output=True, check=True, env=environment, text=True)
    return [json.loads(line) for line in run.stdout.splitlines()]


def table_of(calls):
    lines = ["| call | arguments | result |", "|---|---|---|"]
    for call in calls:
        arguments = ", ".join(f"`{argument['name']}`: {argument['type']}" for argument in call["args"])
        lines.append(f"| `{call['call']}` | {arguments} | {call['result']} |")
    return "\n".join(lines) + "\n"


def main():
    tool, schema, document = map(os.path.abspath, sys.argv[1:4])
    definitions = json.loads(Path(schema).read_text())
    jsonschema.Draft202012Validator.check_schema(definitions)

    def validator(name):
        return jsonschema.Draft202012Validator({"$ref": f"#/$defs/{name}", "$defs": definitions["$defs"]})

    answers = batch(tool, REQUESTS)
    assert len(answers) == len(REQUESTS.split("\n")) - 2, answers
    kinds = set()
    for answer in answers:
        validator("answer").validate(answer)
        kinds |= answer.keys()
        assert not validator("answer").is_valid({**answer, "result": 1, "error": "both", "messages": []})
    assert kinds == {"id", "result", "exception", "error", "messages"}, kinds
    calls = answers[0]["result"]
    validator("help").validate(calls)

    text = Path(document).read_text()
    if sys.argv[4:] == ["--update"]:
        Path(document).write_text(TABLE.sub(lambda _: table_of(calls), text))
        return 0
    assert TABLE.search(text)[0] == table_of(calls), f"{document} does not list the calls: run this test with --update"
    examples = re.findall(r"^(\{.*\"call\": .*\})\n(\{.*\})$", text, re.MULTILINE)
    assert len(examples) > 1, examples
    for request, answer in examples:
        validator("request").validate(json.loads(request))
        assert batch(tool, request) == [json.loads(answer)], (request, batch(tool, request))
    print(f"{len(answers)} answers, {len(calls)} calls, {len(examples)} examples")
    return 0


if __name__ == "__main__":
    sys.exit(main())
