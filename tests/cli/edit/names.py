"""The commands `rename`, `remove` and `new`: what they write, what they refuse, and that a refusal writes nothing.

usage: names.py TOOL DATABASE DOCUMENT
"""
import json
import os
import pathlib
import re
import shutil
import subprocess
import sys
import tempfile
import unittest

TOOL, DEMONSTRATION, DOCUMENT = map(os.path.abspath, sys.argv[1:4])
NOBODY = 65534
REFUSED_NAMES = ["", "KS_5", "KS 5", "KS,5", "KS:5", "KS]5", "..", "a/b", ".hidden", "-x", "K\xe9", "K\x01", "K" * 300,
                 "K" * 16, "base", "SPI", "ks5"]
WORDS = ["--mode", "BS,SM", "--output", "usb2,PARALLEL", "--operation", "program,VERIFY"]


def files_of(directory):
    return {path.name: path.read_bytes() for path in pathlib.Path(directory).iterdir()}


class Names(unittest.TestCase):
    def setUp(self):
        self.scratch = pathlib.Path(self.enterContext(tempfile.TemporaryDirectory()))
        self.scratch.chmod(0o755)
        self.database = self.scratch / "database"
        shutil.copytree(DEMONSTRATION, self.database)

    def run_tool(self, *arguments, layers=None, user=None):
        databases = [word for layer in layers or [self.database] for word in ("--database", layer)]
        # As root may write anywhere, the tool runs as somebody else where permissions matter.
        who = {"user": user, "group": user, "extra_groups": []} if user is not None and os.getuid() == 0 else {}
        return subprocess.run([TOOL, *databases, *arguments], capture_output=True, text=True, check=False, cwd=self.scratch,
                              **who)

    def succeeds(self, *arguments, **how):
        outcome = self.run_tool(*arguments, **how)
        self.assertEqual(outcome.returncode, 0, outcome)
        return outcome.stdout

    def refuses(self, status, reason, *arguments, **how):
        """The command ends with a status, says why, and writes nothing."""
        before = files_of(self.database)
        outcome = self.run_tool(*arguments, **how)
        self.assertEqual(outcome.returncode, status, outcome)
        self.assertIn(reason, outcome.stderr)
        self.assertEqual(files_of(self.database), before)

    def answer(self, *arguments, **how):
        return json.loads(self.succeeds(*arguments, "--json", **how))

    def lint(self):
        return subprocess.run([TOOL, "lint", "--strict", self.database], capture_output=True, text=True, check=False).stdout

    # rename

    def test_rename_of_a_device(self):
        former = self.succeeds("show", "KS50")
        self.succeeds("rename", "ks50", "KS55")
        renamed = self.succeeds("show", "KS55")
        self.assertEqual([line.replace("KS55", "KS50") for line in renamed.split("\n")], former.split("\n"))
        self.assertEqual(self.run_tool("show", "KS50").returncode, 1)
        self.assertEqual(self.lint(), "")

    def test_rename_of_a_family(self):
        self.succeeds("rename", "kestrel", "falcon")
        self.assertFalse((self.database / "kestrel.acd").exists())
        self.assertEqual(self.answer("show", "KS50")["family"], "falcon")
        self.assertEqual(self.lint(), "")

    def test_rename_of_a_flash_and_of_its_family(self):
        self.succeeds("rename", "OVD1", "OVX1")
        family = next(line.split(",")[-1] for line in (self.database / "spi.acd").read_text().split("\n")
                      if line.startswith("DEVICE_FAMILY"))
        self.succeeds("rename", family, "NEW9")
        self.assertIn("NEW9_DEVICES", (self.database / "spi.acd").read_text())
        self.assertEqual(self.lint(), "")

    def test_rename_to_a_name_that_cannot_be(self):
        for name in REFUSED_NAMES:
            with self.subTest(name):
                before = files_of(self.database)
                self.assertEqual(self.run_tool("rename", "--", "KS50", name).returncode, 2)
                self.assertEqual(self.run_tool("new", "device", "--like", "KS50", "--idcode", "0xX4105FB7", "--",
                                               name).returncode, 2)
                self.assertEqual(files_of(self.database), before)

    def test_rename_to_a_name_that_exists(self):
        self.refuses(2, 'the database has "KS100" already', "rename", "KS50", "KS100")
        self.refuses(2, "already", "rename", "KS50", "OVD1")
        self.refuses(2, "already", "rename", "KS50", "KESTREL")
        base = self.database / "base.acd"
        base.write_text(base.read_text().replace("PFF_ML5_CB48", "PFF_ML5_CB48,PFF_KS75_TQ144"))
        self.refuses(2, "base.acd:", "rename", "KS50", "KS75")

    def test_rename_of_what_is_not_there(self):
        self.refuses(1, 'did you mean "KS50"?', "rename", "KS5O", "KS55")
        self.refuses(2, "fixed name", "rename", "spi", "XSPI")
        self.refuses(2, "fixed name", "rename", "AT1", "AT9")

    def test_rename_in_all_layers(self):
        layer = self.scratch / "layer"
        layer.mkdir()
        (layer / "kestrel.acd").write_text("[KS50]\nPROPERTY += :SITE,1\n")
        (layer / "base.acd").write_text("NOT_SUPPORTED_PART_IN_MODE += ,SS_KS50_TQ100\n")
        self.succeeds("rename", "KS50", "KS55", layers=[layer, self.database])
        self.assertIn("[KS55]", (layer / "kestrel.acd").read_text())
        self.assertIn("SS_KS55_TQ100", (layer / "base.acd").read_text())
        self.assertEqual(self.answer("property", "KS55", "SITE", layers=[layer, self.database])["values"], ["1"])
        self.succeeds("rename", "kestrel", "falcon", layers=[layer, self.database])
        self.assertEqual({path.name for path in layer.iterdir()}, {"base.acd", "falcon.acd"})

    def test_other_answers_and_findings_never_change(self):
        # The names of a flash and of its property are joined: "OVD1" + "2PAGE" is "OVD12" + "PAGE".
        spi = self.database / "spi.acd"
        spi.write_text(spi.read_text().replace("OVD1_PROPERTY  = DENSITY,1024",
                                               "OVD1_PROPERTY  = DENSITY,1024:2PAGE,7", 1))
        before = files_of(self.database)
        outcome = self.run_tool("rename", "OVD2", "OVD12")
        self.assertEqual(outcome.returncode, 2, outcome)
        self.assertIn("nothing is written", outcome.stderr)
        self.assertEqual(files_of(self.database), before)

    def test_comments_are_for_their_author(self):
        outcome = self.run_tool("rename", "KS50", "KS55")
        self.assertIn("comments mention KS50: ", outcome.stderr)
        self.assertIn("kestrel.acd:19", outcome.stderr)

    # remove

    def test_remove_of_a_device_a_flash_and_a_family(self):
        self.succeeds("remove", "KS50")
        statements = [line for line in (self.database / "base.acd").read_text().split("\n") if not line.startswith("#")]
        self.assertNotIn("KS50", "".join(statements))
        self.succeeds("remove", "OVD1")
        self.assertNotIn("OVD1,", (self.database / "spi.acd").read_text())
        self.succeeds("remove", "kestrel")
        self.assertFalse((self.database / "kestrel.acd").exists())
        self.assertEqual(self.lint(), "")

    def test_remove_and_new_of_a_device_are_opposites(self):
        before = files_of(self.database)
        self.succeeds("new", "device", "KS75", "--like", "KS100", "--idcode", "0xX4105FB7")
        self.assertNotEqual(files_of(self.database), before)
        self.succeeds("remove", "KS75")
        self.assertEqual(files_of(self.database), before)

    def test_remove_of_what_is_not_there(self):
        self.refuses(1, "did you mean", "remove", "KS5O")
        self.refuses(2, "fixed name", "remove", "base")

    # new

    def test_new_family_of_ten_devices_from_nothing(self):
        self.database = self.scratch / "nothing"
        self.database.mkdir()
        self.succeeds("new", "family", "sparrow", *WORDS)
        self.succeeds("new", "device", "SW10", "--family", "sparrow", "--idcode", "0xX9010FB7", "--packages", "TQ100,TQ144")
        for number in range(10, 1, -1):
            self.succeeds("new", "device", f"SW{number}0", "--like", "SW10", "--idcode", f"0xX90{number:02}1FB7"[:10])
        self.assertEqual(self.lint(), "")
        self.assertEqual(subprocess.run([TOOL, "format", "--check", self.database], check=False).returncode, 0)
        devices = [device["name"] for device in self.answer("devices")["devices"]]
        self.assertEqual(devices, [f"SW{number}0" for number in range(1, 11)])
        for device in devices:
            self.assertTrue(self.answer("check", device, "--mode", "BS", "--output", "USB2", "--operation",
                                        "PROGRAM")["allowed"])
            self.assertFalse(self.run_tool("check", device, "--mode", "SS").returncode == 0)
            self.assertIn("VERIFY", self.succeeds("operations", device, "--mode", "SM", "--output", "PARALLEL"))
        sections = [line for line in (self.database / "sparrow.acd").read_text().split("\n") if line.startswith("[")]
        self.assertEqual(sections, [f"[SW{number}0]" for number in range(1, 11)])
        self.succeeds("remove", "sparrow")
        self.assertEqual(self.lint(), "")

    def test_new_family_with_an_output_that_tables_cannot_have(self):
        self.database = self.scratch / "nothing"
        self.database.mkdir()
        self.succeeds("new", "family", "sparrow", "--mode", "BS", "--output", "SVF,EXPRESSSVF", "--operation", "PROGRAM")
        self.assertTrue(self.answer("check", "--mode", "BS", "--output", "EXPRESSSVF")["allowed"])
        self.assertIn("PROGRAM,Bscan,SVF\n", (self.database / "sparrow.acd").read_text())
        self.refuses(2, "a new device needs --idcode", "new", "device", "SW10", "--family", "sparrow")
        self.assertEqual(self.lint(), "")

    def test_new_flash_from_nothing(self):
        self.database = self.scratch / "nothing"
        self.database.mkdir()
        self.succeeds("new", "flash", "TMF1M", "--family", "ST1", "--packages", "SO8")
        self.succeeds("new", "flash", "TMF2M", "--like", "TMF1M", "--packages", "SO16")
        self.assertEqual(self.answer("spi", "TMF2M", "PACKAGE")["values"], ["SO16"])
        self.assertEqual(self.lint(), "")

    def test_new_device_like_another(self):
        self.succeeds("new", "device", "KS75", "--like", "KS50", "--idcode", "0xX4105FB7", "--packages", "TQ144,PQ208")
        self.assertEqual(self.answer("property", "KS75", "PACKAGES")["values"], ["PQ208", "TQ144"])
        base = (self.database / "base.acd").read_text()
        self.assertIn("SM_KS75_TQ144", base)
        self.assertNotIn("KS75_TQ100", base)
        self.assertIn("KS50,0xX4104FB7:KS75,0xX4105FB7:KS100", base)
        self.assertEqual(self.lint(), "")

    def test_new_family_like_another(self):
        self.succeeds("new", "family", "falcon", "--like", "kestrel")
        self.succeeds("new", "device", "FK1", "--family", "falcon", "--idcode", "0xX5104FB7", "--packages", "TQ100")
        self.assertTrue(self.answer("check", "FK1", "--mode", "SM", "--output", "USB2")["allowed"])
        self.assertEqual(self.lint(), "")

    def test_new_is_refused(self):
        code = ["--idcode", "0xX4105FB7"]
        self.refuses(2, "--family or --like", "new", "device", "KS75", *code)
        self.refuses(2, '--like needs a flash, which "KS50" is not', "new", "flash", "TMF3M", "--like", "KS50")
        self.refuses(2, '--like needs a family, which "KS50" is not', "new", "family", "falcon", "--like", "KS50")
        self.refuses(2, '"TMF1M" is of family "ST1", so it cannot be copied to "AT1"', "new", "flash", "TMF3M", "--like",
                     "TMF1M", "--family", "AT1")
        self.refuses(2, "--idcode", "new", "device", "KS75", "--like", "KS50")
        self.refuses(2, "[D103]", "new", "device", "KS75", "--like", "KS50", "--idcode", "0xX4104FB7")
        self.refuses(2, "not an IDCODE", "new", "device", "KS75", "--like", "KS50", "--idcode", "1:KS9,2")
        self.refuses(1, "did you mean", "new", "device", "KS75", "--family", "kestrle", *code)
        self.refuses(1, "did you mean", "new", "device", "KS75", "--like", "KS5O", *code)
        self.refuses(2, "cannot be copied", "new", "device", "KS75", "--like", "KS50", "--family", "osprey", *code)
        self.refuses(2, "--like needs a device", "new", "device", "KS75", "--like", "OVD1", *code)
        self.refuses(2, "cannot be a package", "new", "device", "KS75", "--like", "KS50", *code, "--packages", "A_B")
        self.refuses(2, "has no IDCODE", "new", "flash", "OVD3", "--family", "AT1", *code)
        self.refuses(2, "--like, or --mode", "new", "family", "falcon", "--mode", "BS")
        self.refuses(2, "does not have the output", "new", "family", "falcon", *WORDS)
        self.refuses(2, "unknown mode", "new", "family", "falcon", "--mode", "XX", "--output", "USB2")
        self.refuses(2, "in mode SPI", "new", "family", "falcon", "--mode", "SPI", "--output", "USB2", "--operation",
                     "PROGRAM")
        self.refuses(2, "a flash has no second package", "new", "flash", "OVD3", "--like", "OVD1", "--packages", "SO8,SO16")
        self.refuses(2, "a family has no packages", "new", "family", "falcon", "--like", "kestrel", "--packages", "SO8")
        self.refuses(2, "a family has no family", "new", "family", "falcon", "--like", "kestrel", "--family", "osprey")
        self.refuses(2, "of a new family without --like", "new", "device", "KS75", "--like", "KS50", *code, "--mode", "BS")
        self.refuses(2, "of a new family without --like", "new", "family", "falcon", "--like", "kestrel", "--mode", "BS")
        self.refuses(2, "there is no directory", "new", "device", "KS75", "--like", "KS50", *code, "--layer", "/nowhere")

    def test_new_in_a_layer(self):
        layer = self.scratch / "layer"
        layer.mkdir()
        before = files_of(self.database)
        self.succeeds("new", "device", "KS75", "--like", "KS50", "--idcode", "0xX4105FB7", "--layer", layer)
        self.succeeds("new", "family", "falcon", "--like", "kestrel", "--layer", layer, layers=[layer, self.database])
        self.succeeds("new", "flash", "OVD128", "--like", "OVD64", "--layer", layer, layers=[layer, self.database])
        self.assertEqual(files_of(self.database), before)
        self.assertEqual(set(files_of(layer)), {"base.acd", "falcon.acd", "kestrel.acd", "spi.acd"})
        for line in (layer / "base.acd").read_text().split("\n"):
            self.assertTrue(not line or "+=" in line, line)
        self.assertTrue(self.answer("check", "KS75", "--mode", "SM", layers=[layer, self.database])["allowed"])

    def test_walk_through_of_the_document(self):
        (self.scratch / "bin").mkdir()
        (self.scratch / "bin" / "tarvik").symlink_to(TOOL)
        environment = {**os.environ, "PATH": f"{self.scratch}/bin:{os.environ['PATH']}"}
        shown = "".join(re.findall(r"^```console\n(.*?)^```$", pathlib.Path(DOCUMENT).read_text(), re.M | re.S))
        commands = re.findall(r"^\$ (.*)\n((?:(?!\$ ).*\n)*)", shown, re.M)
        self.assertGreater(len(commands), 8)
        for command, output in commands:
            outcome = subprocess.run(["sh", "-c", command], capture_output=True, text=True, cwd=self.scratch,
                                     env=environment, check=False)
            self.assertEqual((outcome.returncode, outcome.stdout, outcome.stderr), (0, output, ""), command)

    # All three

    def test_dry_run_is_a_patch(self):
        os.chdir(self.scratch)
        for arguments in (["rename", "KS50", "KS55"], ["rename", "kestrel", "falcon"], ["remove", "OVD1"],
                          ["remove", "osprey"], ["new", "device", "KS75", "--like", "KS50", "--idcode", "0xX4105FB7"],
                          ["new", "family", "falcon", "--like", "kestrel"]):
            with self.subTest(arguments):
                before = files_of(self.database)
                patch = self.succeeds(*arguments, "--dry-run", layers=["database"])
                self.assertEqual(files_of(self.database), before)
                copy = self.scratch / "copy"
                shutil.copytree(self.database, copy / "database")
                subprocess.run(["patch", "-p0", "--silent"], input=patch, text=True, cwd=copy, check=True)
                self.succeeds(*arguments)
                self.assertEqual(files_of(copy / "database"), files_of(self.database))
                shutil.rmtree(copy)
                shutil.rmtree(self.database)
                shutil.copytree(DEMONSTRATION, self.database)

    def test_answer_in_json(self):
        answer = self.answer("rename", "kestrel", "falcon", "--dry-run")
        self.assertFalse(answer["written"])
        self.assertIn("falcon.acd", answer["diff"])
        self.assertIn(str(self.database / "falcon.acd"), answer["files"])
        self.assertIn(str(self.database / "kestrel.acd"), answer["files"])

    def test_locked_files_and_directories(self):
        self.refuses(2, "is locked: Permission denied", "rename", "KS50", "KS55", user=NOBODY)
        for path in self.database.iterdir():
            path.chmod(0o666)
        self.refuses(2, "is locked: Permission denied", "rename", "kestrel", "falcon", user=NOBODY)
        self.refuses(2, "is locked: Permission denied", "remove", "kestrel", user=NOBODY)
        self.refuses(2, "is locked: Permission denied", "new", "family", "falcon", "--like", "kestrel", user=NOBODY)
        # A directory that takes no new file is no hindrance where files are only changed.
        self.succeeds("rename", "KS50", "KS55", user=NOBODY)

    def test_demonstration_cannot_be_changed(self):
        environment = {**os.environ, "TARVIK_DATABASE": ""}
        for arguments in (["rename", "KS50", "KS55"], ["remove", "KS50"], ["new", "family", "x", "--like", "kestrel"]):
            outcome = subprocess.run([TOOL, *arguments], capture_output=True, text=True, check=False, env=environment)
            self.assertEqual(outcome.returncode, 2)
            self.assertIn("demonstration cannot be changed", outcome.stderr)


if __name__ == "__main__":
    unittest.main(argv=sys.argv[:1])
