#!/usr/bin/env python3
"""Makes a wheel, installs it with no network, and uses it from there.

    test_wheel.py SOURCE BUILD SCRATCH
"""

import base64
import hashlib
import os
import pathlib
import shutil
import subprocess
import sys
import unittest
import zipfile

SOURCE, BUILD, SCRATCH = map(pathlib.Path, sys.argv[1:4])

PROGRAM = """
import pathlib, tarvik
package = pathlib.Path(tarvik.__file__).resolve().parent
manager = tarvik.Manager(tarvik.demonstration())
assert tarvik.demonstration().is_relative_to(package), tarvik.demonstration()
assert manager.get_part_family("KS50") == "kestrel"
mapped = {line.split()[-1] for line in open("/proc/self/maps") if "arvik" in line and ".so" in line}
assert {pathlib.Path(library).parent for library in mapped} == {package / "lib"}, mapped
assert len(mapped) == 3, mapped
print("ok")
"""


def make(name):
    result = subprocess.run(
        [sys.executable, SOURCE / "scripts" / "make-wheel", BUILD, SCRATCH / name],
        capture_output=True, text=True, check=True,
    )
    return pathlib.Path(result.stdout.strip())


class Wheel(unittest.TestCase):
    @classmethod
    def setUpClass(cls):
        shutil.rmtree(SCRATCH, ignore_errors=True)
        cls.wheel = make("first")

    def test_is_the_same_each_time(self):
        self.assertEqual(self.wheel.read_bytes(), make("second").read_bytes())

    def test_records_every_file(self):
        with zipfile.ZipFile(self.wheel) as archive:
            names = archive.namelist()
            (record,) = (name for name in names if name.endswith(".dist-info/RECORD"))
            recorded = {}
            for line in archive.read(record).decode().splitlines():
                name, digest, size = line.split(",")
                recorded[name] = (digest, size)
            self.assertEqual(sorted(recorded), sorted(names))
            for name in names:
                if name != record:
                    content = archive.read(name)
                    digest = base64.urlsafe_b64encode(hashlib.sha256(content).digest()).rstrip(b"=").decode()
                    self.assertEqual(recorded[name], ("sha256=" + digest, str(len(content))), name)
        for name in ("lib/libtarvik.so.1", "lib/libTarvikHost.so.1", "py.typed", "share/tarvik/demonstration/base.acd"):
            self.assertIn("tarvik/" + name, names)

    def test_works_where_it_is_installed(self):
        installed = SCRATCH / "installed"
        subprocess.run(
            [sys.executable, "-m", "pip", "install", "--quiet", "--no-index", "--no-deps", "--root-user-action=ignore",
             "--disable-pip-version-check", "--target", installed, self.wheel],
            check=True,
        )
        environment = {name: value for name, value in os.environ.items() if name != "LD_LIBRARY_PATH"}
        result = subprocess.run(
            [sys.executable, "-c", PROGRAM], cwd=SCRATCH, env=dict(environment, PYTHONPATH=str(installed)),
            capture_output=True, text=True, check=False,
        )
        self.assertEqual(result.stdout, "ok\n", result.stderr)


if __name__ == "__main__":
    unittest.main(argv=sys.argv[:1])
