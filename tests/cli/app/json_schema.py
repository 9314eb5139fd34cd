"""Holds what every command answers with --json against the schemas that are installed with the tool.

    json_schema.py TARVIK SCHEMA DOCUMENT DATABASE BAD_DATABASES

DOCUMENT shows an example of each command, which is compared with the real answer.
"""

import json
import os
import re
import shlex
import subprocess
import sys
import tempfile
from pathlib import Path

import jsonschema

NOT_IN_JSON = {"batch", "help", "lsp"}

# Beside the examples of the help: what reaches every branch of an answer, refusals and mistakes too.
QUESTIONS = """
devices
devices 'zz*'
identify 0x14104FB7 0x24104FB5
identify 0x14104FX7
identify zz
families
vocabulary
show KS50
show OVD16
show kestrel
show ZZ9
operations KS50 --mode BS --output USB2
operations KS50 --mode SPI --output NONE
operations ks50 --mode BS --output USB2
operations ks50_zz --mode BS --output USB2
operations ZZ9 --literal --mode BS --output USB2
options ks50_tq144 --mode BS --output USB2
bsdl ks50_tq144 --output SVF
operation-options ks50_tq144 PROGRAM --mode BS
property ks50_tq144 VENDOR
property ks50 ZZ
spi ovd16
multiboot ovd16 --type MB_SPI --width NONE --lead
show ks50_tq144
operations ZZ9 --mode BS --output USB2
operations KS50 --mode ZZ --output USB2
options KS50 --mode BS --output USB2
options KS50 --mode BS --output USB2 --package TQ144
options ZZ9 --mode BS --output USB2
bsdl KS50 --output SVF
bsdl KS50 --output NONE
bsdl ZZ9 --output SVF
operation-options KS50 PROGRAM --mode BS
operation-options KS50 BYPASS --mode SPI
operation-options ZZ9 PROGRAM --mode BS
check --mode BS --output USB2
check KS50 --mode BS
check KS50 --mode BSFILE --verbose
check KS50 --mode DP770
check ZZ9 --mode BS --package TQ144
check KS50 --mode BS --output USB2 --operation VERIFY
check KS50 --mode BS --operation PROGRAM
check KS50 --mode BS --output USB2 --package TQ144 --operation VERIFY
check ks50_tq144 --mode BS --operation PROGRAM
check KS50 --mode SPI
check KS50 --mode BS --package ZZ
check KS50 --mode ZZ
check KS50
why KS50
why --mode BS --output USB2
why KS50 --mode BS
why KS50_TQ144 --mode BS
why KS50 --mode SM --package TQ100
why KS50 --mode SM --output PARALLEL --package TQ100
why KS50 --mode SS --output USB2 --operation VERIFY
why KS50 --mode BS --operation PROGRAM
why KS50 --mode BS --output USB2 --option PROG --package PQ208
why KS50 --output SVF --bsdl HIGHZ
why KS50 --property FLASH
why KS50 --property FLASH --value FALSE
why OVD16 --property DENSITY
why OVD16 --multiboot MB_SPI --width NONE --lead
why OVD16 --multiboot MB_SPI --width NONE --chain
why ks50_tq144 --mode BS --operation-options PROGRAM
why KS50 --mode SPI --operation-options PROGRAM --value VERIFY
why KS50 --mode SM --output PARALLEL --package TQ144 --operation VERIFY
why KS50 --mode SPI
why ZZ9 --mode BS
which --operation ERASE --mode BS --output USB2
which --operation PROGRAM --mode BS
which --property VENDOR=Korvel
which --property VENDOR=nobody
which --property VENDOR
property KS50 VENDOR
property OVD16 DENSITY
property KS50 ZZ
property ZZ9 VENDOR
spi
spi OVD16
spi OVD16 DENSITY
spi ZZ9
spi OVD16 ZZ
multiboot OVD16 --type MB_SPI --width NONE --lead
multiboot OVD16 --type BPI --width SERIAL --chain
multiboot ZZ9 --type BPI --width SERIAL --chain
multiboot OVD16 --type ZZ --width SERIAL --chain
dump operations KS50
dump bsdl KS50
dump options KS50
dump families KS50
dump multiboot
dump operations ZZ9
dump zz
lint
lint --explain all
lint --explain ZZ
lint nowhere
format --check database
format --diff mine
format nowhere
--database database new device KS75 --like KS50 --idcode 0xX4105FB7 --dry-run
--database database new flash OVD128 --like OVD64 --dry-run
--database database rename kestrel falcon --dry-run
--database database remove KS50 --dry-run
new family kestrel --like osprey
rename KS50 KS55
remove spi
diff nowhere nowhere
report
report --file page.html
report --file -
report --file nowhere/page.html
index nowhere
index --show nowhere
index --show site
index site
index --show site
--database site:database show KS50
--database site:database why KS50 --property PINS
families extra
vocabulary extra
show
frobnicate
"""


class Tool:
    """The tool, run in a folder with what the examples speak of."""

    def __init__(self, path, folder, database, bad):
        self.path = path
        self.folder = folder
        self.environment = {name: value for name, value in os.environ.items() if not name.startswith("TARVIK_")}
        Path(folder, "database").symlink_to(database)
        Path(folder, "mine").symlink_to(Path(bad, "T101"))
        Path(folder, "site").mkdir()
        Path(folder, "site", "kestrel.acd").write_text("[KS50]\nPROPERTY = CELLS,1152:PINS,144:BITS,418944\n")

    def run(self, *arguments):
        return subprocess.run(
            [self.path, *arguments], capture_output=True, check=False, cwd=self.folder, env=self.environment, text=True
        )

    def answer(self, arguments):
        run = self.run("--json", *arguments)
        lines = run.stdout.splitlines()
        assert len(lines) == 1, (arguments, run)
        return run.returncode, json.loads(lines[0])

    def commands(self):
        listed = self.run("--help").stdout.split("Commands:")[1]
        return {line.split()[0] for line in listed.splitlines() if re.match(r"  \S", line)}


def validator_of(document, name):
    return jsonschema.Draft202012Validator({"$ref": f"#/$defs/{name}", "$defs": document["$defs"]})


def examples_of(text):
    """The command lines that a text shows with their answers."""
    for line, answer in re.findall(r"^\$ tarvik (.*--json.*)\n((?:(?!```).*\n)+)", text, re.MULTILINE):
        yield [word for word in shlex.split(line) if word != "--json"], json.loads(answer)


def refuses(validator, answer, spoil):
    """The schema would find it if an answer were wrong."""
    copy = json.loads(json.dumps(answer))
    spoil(copy)
    return not validator.is_valid(copy)


def close(schema):
    """The installed schemas accept further members; here they accept none, so that each is described."""
    for part in schema.values() if isinstance(schema, dict) else schema if isinstance(schema, list) else []:
        close(part)
    if isinstance(schema, dict) and schema.get("type") == "object" and "properties" in schema:
        assert "additionalProperties" not in schema, "the installed schemas promise that members may be added"
        schema["additionalProperties"] = False
    return schema


def main():
    path, schema, document, database, bad = map(os.path.abspath, sys.argv[1:])
    definitions = close(json.loads(Path(schema).read_text()))
    jsonschema.Draft202012Validator.check_schema(definitions)
    whole = jsonschema.Draft202012Validator(definitions)
    with tempfile.TemporaryDirectory() as folder:
        tool = Tool(path, folder, database, bad)
        commands = tool.commands() - NOT_IN_JSON
        described = {name for name in definitions["$defs"] if name[0].islower()} - {"error"}
        assert commands == described, commands ^ described
        listed = {entry["$ref"].removeprefix("#/$defs/") for entry in definitions["anyOf"]}
        assert listed == commands | {"error"}, listed ^ (commands | {"error"})

        validators = {name: validator_of(definitions, name) for name in commands | {"error"}}
        answered, refused, checked = {}, set(), 0
        examples = list(examples_of(Path(document).read_text()))
        questions = [shlex.split(line) for line in QUESTIONS.splitlines() if line]
        questions += [words for words, _ in examples]
        questions += [["lint", str(directory)] for directory in sorted(Path(bad).iterdir())]
        questions += [["show", device["name"]] for device in tool.answer(["devices"])[1]["devices"]]
        for words in questions:
            status, answer = tool.answer(words)
            command = words[2] if words[0] == "--database" else words[0]
            if "error" in answer:
                assert status in (1, 2), (words, status)
                validators["error"].validate(answer)
                refused.add(command)
            else:
                assert status in (0, 1), (words, status)
                validators[command].validate(answer)
                answered[command] = answer
            whole.validate(answer)
            checked += 1

        assert answered.keys() == commands, answered.keys() ^ commands
        assert refused >= commands, commands - refused
        shown = {words[0] for words, _ in examples}
        assert shown == commands, f"{document} shows no example of {commands - shown}"
        for words, answer in examples:
            assert tool.answer(words)[1] == answer, f"{document}: {words} is answered by {tool.answer(words)[1]}"
        for command, answer in answered.items():
            assert refuses(validators[command], answer, lambda copy: copy.update(extra=1))
            assert refuses(validators[command], answer, lambda copy: copy.update(version=2))
            assert refuses(validators[command], answer, lambda copy: copy.pop("messages"))
        print(f"{checked} answers of {len(commands)} commands")
    return 0


if __name__ == "__main__":
    sys.exit(main())
