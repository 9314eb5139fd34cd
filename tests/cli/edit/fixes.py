"""Spoils the demonstration database by single mistakes, and checks that `lint --fix` finds each and mends it: afterwards the
database must be as it was, to the byte, so that exactly the answers that the mistake changed are changed back.

usage: fixes.py TOOL DATABASE
"""
import json
import pathlib
import shutil
import subprocess
import sys
import tempfile

# code, file, text, spoilt text, and what the text is after the fix if it is not the former one
MISTAKES = [
    ("F101", "kestrel.acd", "PINS,140:BITS", "PINS,140: BITS"),
    ("F101", "kestrel.acd", "PINS,140:BITS", "PINS, 140:BITS"),
    ("F102", "base.acd", "families,goshawk,kestrel,osprey\n", "families,goshawk,kestrel,osprey,\n"),
    ("F102", "kestrel.acd", "BITS,418944\n", "BITS,418944:\n"),
    ("F103", "kestrel.acd", "PINS,140:BITS", "PINS,140::BITS"),
    ("F103", "base.acd", "HR4,OS2000E,base", "HR4,,OS2000E,base"),
    ("F104", "base.acd", "base,buzzard,curlew,dunlin,goshawk", "base,buzzard,buzzard,curlew,dunlin,goshawk"),
    ("F107", "kestrel.acd", "PROPERTY       = VENDOR", "PROPERTY       == VENDOR"),
    ("F107", "base.acd", "IDCODE += :CW256K", "IDCODE =+ :CW256K"),
    ("T102", "kestrel.acd", "PROG,Bscan", "Prog,Bscan"),
    ("T105", "kestrel.acd", "PROGRAM,Bscan,PARALLEL,ZORVA,USB2,SVF", "PROGRAM,BS,PARALLEL,ZORVA,USB2,SVF"),
    ("T106", "kestrel.acd", "PROGRAM,Smap,ZORVA,USB2", "PROGRAM,Smap,ZORVA,usb2"),
    ("T107", "kestrel.acd", "PROGRAM,BSFILE,SVF,STAPL", "PROGRAM,BSFILE,SVF,STAPL,EXPRESSSVF"),
    ("T110", "kestrel.acd", "PROGRAM,Smap,ZORVA,USB2", "PROGRAM,Smap,ZORVA,USB2,ZORVA"),
    ("P101", "kestrel.acd", "PACKAGES,3,TQ144,PQ208,BG256", "PACKAGES,2,TQ144,PQ208,BG256"),
    ("P101", "kestrel.acd", "PACKAGES,3,TQ144,PQ208,BG256", "PACKAGES,4,TQ144,PQ208,BG256"),
    ("P102", "kestrel.acd", "PACKAGES,3,TQ144,PQ208,BG256", "PACKAGES,TQ144,PQ208,BG256"),
    ("P107", "kestrel.acd", "FLASH,FALSE", "FLASH,False"),
    ("P201", "kestrel.acd", "VERIFY,3,BS,SM,BSFILE", "VERIFY,3,Bscan,SM,BSFILE"),
    ("P201", "kestrel.acd", "VERIFY,3,BS,SM,BSFILE", "VERIFY,3,BS,sm,BSFILE"),
    ("P202", "kestrel.acd", "OP_PROGRAM_BSFILE,1,VERIFY", "OP_PROGRAM_BSFILE,1,Verify"),
    ("P203", "kestrel.acd", "OP_PROGRAM_BSFILE,1,VERIFY", "op_program_bsfile,1,VERIFY"),
    ("D101", "base.acd", "KS50,0xX4104FB7", "KS50,0Xx4104FB7"),
    ("D104", "base.acd", ":KS50,0xX", ":ks50,0xX"),
    ("L106", "kestrel.acd", "PACKAGES,2,FB676,FB900\n$", "PACKAGES,2,FB676,FB900: \\\n$"),
    ("L107", "kestrel.acd", "[KS100]\n", "[KS100\n"),
    ("L109", "kestrel.acd", "[KS100]\n", "[ KS100 ]\n"),
    ("L110", "kestrel.acd", "[KS100]\n", "[KS100] # the second\n", "# the second\n[KS100]\n"),
    ("R104", "base.acd", "IDCODE += :CW256K", "IDCODE += CW256K"),
    ("S101", "spi.acd", "OVD1,OVD2", "ovd1,OVD2"),
    ("S102", "spi.acd", "DENSITY,1024:PAGE,264", "Density,1024:PAGE,264"),
    ("B101", "base.acd", "OS2000E,base,buzzard,curlew,dunlin,goshawk", "OS2000E,Base,buzzard,curlew,dunlin,goshawk"),
    ("B102", "base.acd", "= DN1,DN1SO20", "= dn1,DN1SO20"),
    ("B103", "base.acd", "DN1,DN1SO20", "DN1,DN1so20"),
    ("M101", "base.acd", "outputs,PARALLEL,ZORVA,USB2,SVF", "outputs,PARALLEL,ZORVA,USB2,svf"),
    ("M102", "base.acd", "families,goshawk,kestrel,osprey\n", "families,goshawk,Kestrel,osprey\n"),
    ("M202", "base.acd", "SS_BZ2_PL84", "ss_BZ2_PL84"),
    ("M203", "base.acd", "SS_BZ2_PL84", "SS_bz2_PL84"),
    ("M204", "base.acd", "SS_BZ2_PL84", "SS_BZ2_pl84"),
    ("M206", "base.acd", "= SS_BZ2_PL84", "= SPI_SPI_SO8,SS_BZ2_PL84", "= SPI_spi_SO8,SS_BZ2_PL84"),
    ("K102", "kestrel.acd", "[KS100]\nPROPERTY ", "[KS100]\nProperty "),
]


def run(tool, *arguments):
    return subprocess.run([tool, "lint", *arguments], capture_output=True, check=False)


def codes(tool, directory):
    report = json.loads(run(tool, directory, "--format", "json").stdout)
    return [finding["code"] for finding in report["findings"]]


def main(tool, database):
    wrong = []
    with tempfile.TemporaryDirectory() as scratch:
        for number, (code, name, text, spoilt, *after) in enumerate(MISTAKES):
            directory = pathlib.Path(scratch) / str(number)
            shutil.copytree(database, directory)
            path = directory / name
            whole = path.read_text(encoding="utf-8") + "$"  # so that a mistake may be at the end
            assert text in whole, (code, text)
            path.write_text(whole.replace(text, spoilt, 1).removesuffix("$"), encoding="utf-8")
            if code not in codes(tool, directory):
                wrong.append(f"{code}: {spoilt!r} is not found")
            outcome = run(tool, directory, "--fix")
            expected = whole.replace(text, after[0] if after else text, 1).removesuffix("$")
            found = path.read_text(encoding="utf-8")
            if found != expected:
                changed = [line for line in found.split("\n") if line not in expected.split("\n")]
                wrong.append(f"{code}: {spoilt!r} becomes {changed}; {outcome.stderr.decode()}")
            elif codes(tool, directory):
                wrong.append(f"{code}: afterwards there are {codes(tool, directory)}")
            for other in pathlib.Path(database).iterdir():
                if other.name != name and (directory / other.name).read_bytes() != other.read_bytes():
                    wrong.append(f"{code}: {other.name} has changed, too")
    rules = {mistake[0] for mistake in MISTAKES}
    print(f"{len(MISTAKES)} mistakes of {len(rules)} rules, {len(wrong)} not mended")
    print("\n".join(wrong))
    return 1 if wrong or len(rules) < 25 else 0


if __name__ == "__main__":
    sys.exit(main(*sys.argv[1:]))
