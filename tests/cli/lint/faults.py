"""Injects faults into the demonstration database, one at a time, as those who write databases make them, and checks
that the linter finds each where it stands.

usage: faults.py TOOL DATABASE
"""
import json
import pathlib
import shutil
import subprocess
import sys
import tempfile


class Fault:
    """One edit of one file, and the finding that tells it."""

    def __init__(self, what, file, old, new, code, at=None, in_file=None):
        self.what = what
        self.file = file
        self.old = old  # None: the file is written anew
        self.new = new
        self.code = code
        self.at = at if at is not None else new  # the finding's line is the one where this text begins
        self.in_file = in_file if in_file is not None else file

    def inject(self, directory):
        path = directory / self.file
        if self.old is None:
            path.write_bytes(self.new.encode("utf-8"))
            return
        text = path.read_bytes().decode("utf-8")
        if self.old not in text:
            raise SystemExit(f"{self.what}: {self.file} does not hold {self.old!r}")
        path.write_bytes(text.replace(self.old, self.new, 1).encode("utf-8"))

    def line(self, directory):
        text = (directory / self.in_file).read_bytes().decode("utf-8")
        at = text.find(self.at)
        if at < 0:
            raise SystemExit(f"{self.what}: {self.in_file} does not hold {self.at!r}")
        return text.count("\n", 0, at) + 1


FAULTS = [
    # Lines.
    Fault("the \\ at the end of a line is missing", "base.acd", "linnet,merlin, \\\n                         osprey",
          "linnet,merlin\n                         osprey", "L101", at="osprey,pipit"),
    Fault("a blank behind the \\", "base.acd", "KS300,0xX4114FB7: \\\n", "KS300,0xX4114FB7: \\ \n", "L101",
          at="KS400,0xX4118FB7"),
    Fault("a conflict of a merge is left", "osprey.acd", "\n[OS250]", "\n<<<<<<< HEAD\n[OS250]", "L101", at="<<<<<<<"),
    Fault("the key is lost", "kestrel.acd", "PROPERTIES = PACKAGES,3,TQ144", "= PACKAGES,3,TQ144", "L102"),
    Fault("a blank for the _ of a key", "osprey.acd", "BSDL_OPERATION =", "BSDL OPERATION =", "L103"),
    Fault("a NUL byte", "merlin.acd", "VENDOR,Korvel", "VENDOR,Kor\0vel", "L104"),
    Fault("the file is cut off", "siskin.acd", None, "PROPERTY = VENDOR,Korvel: \\", "L106"),
    Fault("no ] behind a header", "kestrel.acd", "[KS100]", "[KS100", "L107"),
    Fault("a header without a name", "kestrel.acd", "[KS100]", "[]", "L108"),
    Fault("a blank in a header", "kestrel.acd", "[KS100]", "[KS 100]", "L109"),
    Fault("a comment behind a header", "kestrel.acd", "[KS100]", "[KS100] # small", "L110"),
    Fault("the last line of a value goes on into a header", "kestrel.acd", "BG256,FB324\n\n[KS300]",
          "BG256,FB324 \\\n[KS300]", "L112", at="[KS300]"),
    Fault("a value goes on into the next key", "kestrel.acd", "CELLS,2304:PINS,176:BITS,824448\n",
          "CELLS,2304:PINS,176:BITS,824448 \\\n", "L112", at="PROPERTIES = PACKAGES,3,TQ144"),
    Fault("a record in a continuation is commented out", "kestrel.acd", "                 VERIFY,Smap",
          "               # VERIFY,Smap", "L112", at="# VERIFY,Smap"),
    # Items and fields.
    Fault("a blank behind a comma", "base.acd", "HR4,OS2000E,base", "HR4, OS2000E,base", "F101",
          at="DEVICE_SUPPORTED       = HR4, OS"),
    Fault("a comma at the end of a list", "base.acd", "pipit,plover,siskin,spi\nPROGRAM",
          "pipit,plover,siskin,spi,\nPROGRAM", "F102", at="osprey,pipit,plover,siskin,spi,\n"),
    Fault("two commas", "spi.acd", "OVD2,OVD4", "OVD2,,OVD4", "F103"),
    Fault("a colon at the end of the records", "kestrel.acd", "PINS,140:BITS,418944", "PINS,140:BITS,418944:", "F102"),
    Fault("a name twice in a list", "base.acd", "curlew,dunlin,goshawk,harrier,kestrel,linnet",
          "curlew,dunlin,goshawk,harrier,kestrel,curlew,linnet", "F104"),
    Fault("a comment behind a value", "kestrel.acd", "BITS,824448", "BITS,824448 # measured", "F106"),
    Fault("a semicolon between records", "kestrel.acd", "VERIFY,Bscan,PARALLEL,ZORVA,USB2: \\",
          "VERIFY,Bscan,PARALLEL,ZORVA,USB2;READTEMP,Bscan,USB2: \\", "T106"),
    # Keys and sections.
    Fault("a key twice in a section", "kestrel.acd", "[KS100]\n", "[KS100]\nPROPERTY   = CELLS,1\n", "K101",
          at="PROPERTY   = CELLS,2304"),
    Fault("a misspelt key", "osprey.acd", "BSDL_OPERATION =", "BDSL_OPERATION =", "K102", at="BDSL_OPERATION"),
    Fault("a key in lower case", "kestrel.acd", "[KS100]\nPROPERTY ", "[KS100]\nproperty ", "K102",
          at="property   = CELLS"),
    Fault("operations of a device that is not listed", "kestrel.acd", "[KS100]\n",
          "[KS100]\nOPERATION = PROGRAM,Bscan,USB2\n", "K201", at="OPERATION = PROGRAM,Bscan,USB2\n"),
    Fault("options of a device that is not listed", "kestrel.acd", "[KS100]\n",
          "[KS100]\nPROGRAM_OPTION = VERIFY,Bscan,USB2\n", "K202", at="PROGRAM_OPTION = VERIFY,Bscan,USB2\n"),
    # Lists of names with tables.
    Fault("a misspelt family", "base.acd", "kestrel,linnet,merlin, \\\n                         osprey,pipit,plover,siskin,spi\nPROGRAM",
          "kestral,linnet,merlin, \\\n                         osprey,pipit,plover,siskin,spi\nPROGRAM", "B101"),
    Fault("a layer's list without a comma at the front", "base.acd", "\nPROGRAM_OPTION_PACKAGE",
          "\nDEVICE_SUPPORTED += KS100\nPROGRAM_OPTION_PACKAGE", "R104", at="DEVICE_SUPPORTED += KS100"),
    Fault("a package behind _", "base.acd", "KS50,KS50PQ208", "KS50,KS50_PQ208", "B102"),
    Fault("a package that the device does not have", "base.acd", "KS50,KS50PQ208", "KS50,KS50PQ280", "B103"),
    Fault("a new family that no list names", "sparrow.acd", None, "PROPERTY = VENDOR,Korvel\n", "B104"),
    Fault("a family missing from DEVICE_SUPPORTED", "base.acd", "dunlin,goshawk,harrier", "dunlin,harrier", "B105",
          at="DEVICE_SUPPORTED       ="),
    Fault("a family missing from PROGRAM_OPTION_PACKAGE", "base.acd", "                         goshawk,harrier",
          "                         harrier", "B106", at="PROGRAM_OPTION_PACKAGE = DN1"),
    # IDCODEs.
    Fault("a digit of an IDCODE is missing", "base.acd", "KS50,0xX4104FB7", "KS50,0xX4104FB", "D101"),
    Fault("an IDCODE without 0x", "base.acd", "KS100,0xX4108FB7", "KS100,X4108FB7", "D101"),
    Fault("bit 0 of an IDCODE is clear", "base.acd", "KS150,0xX410CFB7", "KS150,0xX410CFB6", "D102"),
    Fault("an IDCODE is copied and not changed", "base.acd", "KS150,0xX410CFB7", "KS150,0xX4108FB7", "D103"),
    Fault("an IDCODE of a device that is not there", "base.acd", "KS150,0xX410CFB7", "KS155,0xX410CFB7", "D104"),
    Fault("a new device without an IDCODE", "kestrel.acd", "[KS100]\n", "[KS75]\n[KS100]\n", "D105", at="[KS75]"),
    Fault("a device with two IDCODEs", "base.acd", ":KS150,0xX410CFB7", ":KS100,0xX410CFB7", "D106"),
    Fault("a comma between IDCODEs", "base.acd", "KS50,0xX4104FB7:KS100", "KS50,0xX4104FB7,KS100", "D107"),
    # Modes and excluded parts.
    Fault("an unknown output of a mode", "base.acd", "SM      = outputs,ZORVA,USB2", "SM      = outputs,ZORVA,USB3",
          "M101"),
    Fault("an output of a mode in lower case", "base.acd", "SS      = outputs,PARALLEL", "SS      = outputs,parallel",
          "M101"),
    Fault("a device among the families of a mode", "base.acd", "families,goshawk,kestrel,osprey",
          "families,goshawk,KS50,osprey", "M102"),
    Fault("a mode list without its label", "base.acd", "SPI     = outputs,PARALLEL", "SPI     = PARALLEL", "M103"),
    Fault("a comma between outputs and families", "base.acd", "KITECF  = outputs,SVF: \\", "KITECF  = outputs,SVF, \\",
          "M104"),
    Fault("an excluded part without its package", "base.acd", "SM_KS50_TQ144", "SM_KS50", "M201",
          at="SM_KS50,SM_KS100"),
    Fault("an excluded part with the mode's other text", "base.acd", "SM_KS100_TQ144", "Smap_KS100_TQ144", "M202"),
    Fault("an excluded part of a device that is not there", "base.acd", "SM_KS100_TQ144", "SM_KS110_TQ144", "M203"),
    Fault("an excluded part in another case", "base.acd", "SM_KS100_TQ144", "SM_ks100_TQ144", "M203"),
    Fault("an excluded part in a package that is not there", "base.acd", "SM_KS100_TQ144", "SM_KS100_TQ100", "M204"),
    # Names.
    Fault("a device twice in a file", "kestrel.acd", "[KS100]\n", "[KS100]\n[ks100]\n", "N101", at="[ks100]"),
    Fault("a device in two families", "osprey.acd", "[OS250]\n", "[KS100]\n[OS250]\n", "N102", at="[KS100]"),
    Fault("a device named as a family", "kestrel.acd", "[KS100]\n", "[MERLIN]\n[KS100]\n", "N103", at="[MERLIN]"),
    Fault("a device with its package", "kestrel.acd", "[KS100]\n", "[KS100_BG256]\n[KS100]\n", "N104",
          at="[KS100_BG256]"),
    Fault("a comma in a header", "kestrel.acd", "[KS100]\n", "[KS100,KS110]\n[KS100]\n", "N105", at="[KS100,"),
    Fault("a % in a name", "kestrel.acd", "[KS100]\n", "[KS%100]\n[KS100]\n", "N106", at="[KS%"),
    Fault("a name longer than the dumps show", "kestrel.acd", "[KS100]\n", "[KS100INDUSTRIAL24]\n[KS100]\n", "N107",
          at="[KS100I"),
    Fault("a file that begins with a capital", "Sparrow.acd", None, "PROPERTY = VENDOR,Korvel\n", "N108"),
    Fault("a section in base.acd", "base.acd", "# kestrel\n", "# kestrel\n[KS75]\n", "N109", at="[KS75]"),
    Fault("a copy of a file under a name in another case", "KESTREL.acd", None, "[KS1]\n", "N110", at="[KS1]"),
    # Properties.
    Fault("a count that is too small", "kestrel.acd", "PACKAGES,3,TQ144", "PACKAGES,2,TQ144", "P101"),
    Fault("no count", "kestrel.acd", "PACKAGES,3,TQ144", "PACKAGES,TQ144", "P102"),
    Fault("a property without a value", "kestrel.acd", "KIND,FPGA", "KIND", "P103", at="KIND:"),
    Fault("a comma between properties", "kestrel.acd", "PINS,176:BITS", "PINS,176,BITS", "P104"),
    Fault("a property in both keys", "kestrel.acd", "CELLS,2304:", "CELLS,2304:PACKAGES,TQ144:", "P105"),
    Fault("a property twice", "kestrel.acd", "CELLS,2304:", "CELLS,2304:CELLS,2305:", "P106"),
    Fault("a flag in lower case", "kestrel.acd", "FLASH,FALSE", "FLASH,true", "P107"),
    Fault("a mode text for its key", "kestrel.acd", "PROGRAM,7,BS,", "PROGRAM,7,Bscan,", "P201"),
    Fault("a misspelt option of an operation", "kestrel.acd", "OP_PROGRAM_BSFILE,1,VERIFY",
          "OP_PROGRAM_BSFILE,1,VERFY", "P202"),
    Fault("a misspelt operation behind OP_", "kestrel.acd", "OP_PROGRAM_SM,2", "OP_PROGRM_SM,2", "P203"),
    Fault("options of an operation for all modes and for one", "kestrel.acd", "OP_PROGRAM_BS,2,VERIFY,PROG",
          "OP_PROGRAM,1,VERIFY:OP_PROGRAM_BS,2,VERIFY,PROG", "P204"),
    # Flashes.
    Fault("a flash in lower case", "spi.acd", "OVD4,OVD8", "ovd4,OVD8", "S101"),
    Fault("a property of a flash in lower case", "spi.acd", "DENSITY,4096:PAGE,264", "Density,4096:PAGE,264", "S102"),
    Fault("a family of flashes without a list", "spi.acd", "BPI3,NV1", "BPI3,NV1,NV2", "S103"),
    Fault("a class missing from the families", "spi.acd", "DEVICE_FAMILY = AT1,ST1", "DEVICE_FAMILY = ST1", "S104",
          at="AT1_PROPERTY "),
    Fault("a flash in two classes", "spi.acd", "QLE4M,QLE8M", "QLE4M,TMF8M,QLE8M", "S105"),
    Fault("a misspelt flash in a multiboot list", "spi.acd", "ML100,OVD16,OVD32", "ML100,OVD17,OVD32", "S107"),
    Fault("a flash in two families", "spi.acd", "NV1_DEVICES", "NV2_DEVICES = TMF8M\nDEVICE_FAMILY += ,NV2\nNV1_DEVICES", "S108",
          at="NV2_DEVICES"),
    Fault("a misspelt multiboot key", "spi.acd", "TYPE_MB_SPI_NONE_LEAD", "TYPE_MB_SPI_LEAD", "K102",
          at="TYPE_MB_SPI_LEAD"),
    # Tables.
    Fault("a misspelt operation", "kestrel.acd", "VERIFY,Bscan,PARALLEL", "VERFIY,Bscan,PARALLEL", "T101"),
    Fault("an option in lower case", "kestrel.acd", "PROG,Smap,ZORVA", "prog,Smap,ZORVA", "T102"),
    Fault("an option that a database can't give", "kestrel.acd", "PROG,Smap,ZORVA", "OTP,Smap,ZORVA", "T103"),
    Fault("an unknown mode", "kestrel.acd", "PROGRAM,SSerial,", "PROGRAM,SlaveSerial,", "T104"),
    Fault("a mode's key in a record", "kestrel.acd", "VERIFY,Bscan,PARALLEL", "VERIFY,BS,PARALLEL", "T105"),
    Fault("an unknown output", "kestrel.acd", "PROGRAM,Smap,ZORVA,USB2", "PROGRAM,Smap,ZORVA,USB", "T106"),
    Fault("an output without a cell", "kestrel.acd", "PROGRAM,BSFILE,SVF,STAPL", "PROGRAM,BSFILE,SVF,EXPRESSSVF",
          "T107"),
    Fault("a mode without a cell", "kestrel.acd", "PROGRAM,BSFILE,SVF,STAPL", "PROGRAM,KITECF,SVF,STAPL", "T108"),
    Fault("no outputs", "kestrel.acd", "READUSERCODE,Bscan,PARALLEL,ZORVA,USB2", "READUSERCODE,Bscan", "T109"),
    Fault("a record is copied and not changed", "kestrel.acd", "VERIFY,Smap,ZORVA,USB2: \\",
          "VERIFY,Smap,ZORVA,USB2:VERIFY,Smap,USB2: \\", "T110"),
    Fault("SPI mode in a family's file", "kestrel.acd", "PROGRAM,Smap,ZORVA,USB2", "PROGRAM,SPI,ZORVA,USB2", "T111"),
    Fault("a mode that does not list the family", "kestrel.acd", "READUSERCODE,Bscan,PARALLEL,ZORVA,USB2",
          "READUSERCODE,DP770,PARALLEL,USB2", "T112"),
    Fault("an output that the mode can't use", "kestrel.acd", "PROGRAM,Smap,ZORVA,USB2",
          "PROGRAM,Smap,PARALLEL,USB2", "T113"),
]


def findings(tool, directory):
    run = subprocess.run([tool, "lint", str(directory), "--format", "json"], capture_output=True, check=False)
    report = json.loads(run.stdout.decode("utf-8"))
    return {(finding["code"], pathlib.Path(finding["file"]).name, finding["line"]) for finding in report["findings"]}


def main(tool, database):
    missed = []
    with tempfile.TemporaryDirectory() as scratch:
        clean = pathlib.Path(scratch) / "clean"
        shutil.copytree(database, clean)
        if findings(tool, clean):
            raise SystemExit("the demonstration database is not clean")
        for number, fault in enumerate(FAULTS):
            directory = pathlib.Path(scratch) / str(number)
            shutil.copytree(clean, directory)
            fault.inject(directory)
            wanted = (fault.code, fault.in_file, fault.line(directory))
            found = findings(tool, directory)
            if wanted not in found:
                missed.append(f"{fault.what}: no {wanted}, but {sorted(found)}")
    print(f"{len(FAULTS) - len(missed)} of {len(FAULTS)} faults found")
    for text in missed:
        print("missed:", text)
    return 1 if missed else 0


if __name__ == "__main__":
    sys.exit(main(sys.argv[1], sys.argv[2]))
