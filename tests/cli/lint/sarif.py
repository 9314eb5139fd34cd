"""Holds what `tarvik lint --format sarif` writes against the schema, and against what the linter says in JSON.

    sarif.py TARVIK SCHEMA DIRECTORY...
"""

import json
import subprocess
import sys
from pathlib import Path
from urllib.parse import unquote, urlparse

import jsonschema


def lint(tool, directory, form):
    run = subprocess.run([tool, "lint", directory, "--format", form], capture_output=True, check=False)
    assert run.returncode in (0, 1), run.stderr
    return json.loads(run.stdout)


def check_fixes(fixes, fix, path):
    """Only safe fixes are in the log; they replace the same bytes by the same texts."""
    if not fix or not fix["safe"]:
        assert not fixes
        return
    ((change,),) = (each["artifactChanges"] for each in fixes)
    assert unquote(urlparse(change["artifactLocation"]["uri"]).path) == path
    for replacement, edit in zip(change["replacements"], fix["edits"], strict=True):
        region = replacement["deletedRegion"]
        source = Path(path).read_bytes().split(b"\n")[edit["line"] - 1]
        assert region["startLine"] == region["endLine"] == edit["line"]
        characters = source.decode()[region["startColumn"] - 1 : region["endColumn"] - 1]
        assert characters.encode() == source[edit["column"] - 1 : edit["column"] - 1 + edit["length"]]
        assert len(source.decode()[: region["startColumn"] - 1].encode()) == edit["column"] - 1
        assert replacement["insertedContent"]["text"] == edit["text"]


def check(tool, validator, directory):
    log = lint(tool, directory, "sarif")
    validator.validate(log)
    report = lint(tool, directory, "json")
    (run,) = log["runs"]
    rules = run["tool"]["driver"]["rules"]
    assert len(run["results"]) == len(report["findings"])
    for result, finding in zip(run["results"], report["findings"], strict=True):
        assert result["ruleId"] == finding["code"] == rules[result["ruleIndex"]]["id"]
        assert result["level"] == finding["level"]
        assert result["message"]["text"] == finding["text"]
        assert result["partialFingerprints"]["tarvikLint/v1"] == finding["fingerprint"]
        (location,) = result["locations"]
        place = location["physicalLocation"]
        path = unquote(urlparse(place["artifactLocation"]["uri"]).path)
        assert path == finding["file"]
        # The range holds the same text, whether it is counted in characters or in bytes.
        source = Path(path).read_bytes().split(b"\n")[finding["line"] - 1]
        region = place["region"]
        assert region["startLine"] == region["endLine"] == finding["line"]
        characters = source.decode()[region["startColumn"] - 1 : region["endColumn"] - 1]
        begin = finding["column"] - 1
        assert characters.encode() == source[begin : begin + finding["length"]]
        check_fixes(result.get("fixes", []), finding.get("fix"), path)
    return len(run["results"])


def refuses(validator, log, spoil):
    """The schema would find it if a log were wrong."""
    copy = json.loads(json.dumps(log))
    spoil(copy)
    return not validator.is_valid(copy)


def main():
    tool, schema, *directories = sys.argv[1:]
    definition = json.loads(Path(schema).read_text())
    jsonschema.Draft7Validator.check_schema(definition)
    validator = jsonschema.Draft7Validator(definition)
    found = sum(check(tool, validator, directory) for directory in directories)
    assert found, "no finding in any of the directories"

    log = next(log for log in (lint(tool, each, "sarif") for each in directories) if log["runs"][0]["results"])
    assert refuses(validator, log, lambda copy: copy.update(version="2.0"))
    assert refuses(validator, log, lambda copy: copy["runs"][0].pop("tool"))
    assert refuses(validator, log, lambda copy: copy["runs"][0]["results"][0].pop("message"))
    assert refuses(validator, log, lambda copy: copy["runs"][0]["results"][0].update(rule="T101"))
    print(f"{found} findings in {len(directories)} databases")
    return 0


if __name__ == "__main__":
    sys.exit(main())
