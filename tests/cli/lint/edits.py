"""Applies single edits to the demonstration database, as people make them, and checks that the linter finds each at
the expected line, and nothing else. Then applies edits that are right, and checks that the linter stays silent.

usage: edits.py TOOL DATABASE [LEAST]
LEAST is how many of the edits must be found at least, by default all of them.
"""
import json
import pathlib
import shutil
import subprocess
import sys
import tempfile


class Edit:
    """Replaces `old` by `new` in a file; without `old` the file is written into a layer on top. The finding is
    expected at the line where `at` begins, by default the first line that the edit changed; findings of the codes
    `also` may come with it."""

    def __init__(self, what, code, file, old, new, at=None, at_file=None, also=()):
        self.what, self.code, self.file, self.old, self.new, self.also = what, code, file, old, new, also
        self.at, self.at_file = at, at_file or file

    def apply(self, base, site):
        if self.old is None:
            site.mkdir(exist_ok=True)
            (site / self.file).write_bytes(self.new.encode("utf-8"))
            return 1
        path = base / self.file
        text = path.read_bytes().decode("utf-8")
        if self.old not in text:
            raise SystemExit(f"{self.what}: {self.file} does not contain {self.old!r}")
        path.write_bytes(text.replace(self.old, self.new, 1).encode("utf-8"))
        place = text.index(self.old)
        same = 0
        while same < min(len(self.old), len(self.new)) and self.old[same] == self.new[same]:
            same += 1
        return text.count("\n", 0, place + same) + 1

    def line(self, base, site, changed):
        if self.at is None:
            return changed
        directory = site if self.old is None and self.at_file == self.file else base
        text = (directory / self.at_file).read_bytes().decode("utf-8")
        if self.at not in text:
            raise SystemExit(f"{self.what}: {self.at_file} does not contain {self.at!r}")
        return text.count("\n", 0, text.index(self.at)) + 1


PARTS = "NOT_SUPPORTED_PART_IN_MODE = SS_BZ2_PL84"


def excluded(part):
    return "base.acd", PARTS, PARTS.replace("SS_BZ2_PL84", part)


TABLES_AND_LISTS = [
    Edit("a part excluded from a mode without its family", "M205", *excluded("DP770_KS50_TQ144,SS_BZ2_PL84")),
    Edit("a CPLD excluded from Slave Serial", "M205", *excluded("SS_PT24_CB48,SS_BZ2_PL84")),
    Edit("a PROM excluded from Select Map", "M205", *excluded("SM_CW256K_SO8,SS_BZ2_PL84")),
    Edit("a Kite part of a family without Kite", "M205", *excluded("KITECF_BZ2_PL84,SS_BZ2_PL84")),
    Edit("a flash excluded from Slave Serial", "M205", *excluded("SS_OVD1_SO8,SS_BZ2_PL84")),
    Edit("a flash excluded from SPI by its name", "M206", *excluded("SPI_OVD1_SO8,SS_BZ2_PL84")),
    Edit("another flash excluded from SPI by its name", "M206", *excluded("SPI_QLE64M_SO16,SS_BZ2_PL84")),
    Edit("a device excluded from SPI", "M206", *excluded("SPI_KS50_TQ144,SS_BZ2_PL84")),
    Edit("SPI in upper case excluded from SPI", "M206", *excluded("SPI_SPI_SO8,SS_BZ2_PL84")),
    Edit("a package that only other devices have", "M204", *excluded("SS_BZ2_FB900,SS_BZ2_PL84")),
    Edit("SS renamed", "K102", "base.acd", "SS      = outputs", "SSER    = outputs", also=["M105"]),
    Edit("KITECF renamed", "K102", "base.acd", "KITECF  = outputs", "KITE_CF = outputs"),
    Edit("PFF renamed", "K102", "base.acd", "PFF     = outputs", "PROMFF  = outputs", also=["M105"]),
    Edit("DP770 renamed", "K102", "base.acd", "DP770   = outputs", "DP700   = outputs"),
    Edit("a CPLD under Slave Serial", "M106", "base.acd", "families,buzzard,goshawk,harrier,kestrel,merlin,osprey\n",
         "families,buzzard,goshawk,harrier,kestrel,merlin,osprey,pipit\n"),
    Edit("a PROM under Select Map", "M106", "base.acd", "families,buzzard,goshawk,harrier,kestrel,osprey\n",
         "families,buzzard,curlew,goshawk,harrier,kestrel,osprey\n"),
    Edit("an FPGA under Desktop Programming", "M106", "base.acd", "families,curlew,dunlin,linnet,pipit,plover,siskin,spi",
         "families,curlew,dunlin,kestrel,linnet,pipit,plover,siskin,spi"),
    Edit("a family under Kite without the property", "M106", "base.acd", "families,goshawk,kestrel,osprey",
         "families,buzzard,goshawk,kestrel,osprey"),
    Edit("a family under SPI", "M106", "base.acd", "families,spi\n", "families,kestrel,spi\n"),
    Edit("a family under PFF without the property", "M106", "base.acd", "families,buzzard,curlew,dunlin,goshawk,kestrel,merlin,osprey,plover,spi",
         "families,buzzard,curlew,dunlin,goshawk,kestrel,linnet,merlin,osprey,plover,spi"),
    Edit("kestrel missing under KITECF", "P205", "base.acd", "families,goshawk,kestrel,osprey\n", "families,goshawk,osprey\n",
         at="PROGRAM,7,BS", at_file="kestrel.acd"),
    Edit("kestrel missing under PFF", "P205", "base.acd", "goshawk,kestrel,merlin,osprey,plover,spi", "goshawk,merlin,osprey,plover,spi",
         at="PROGRAM,7,BS", at_file="kestrel.acd"),
    Edit("harrier missing under KITEMPM", "P205", "base.acd", "families,harrier,kestrel,osprey", "families,kestrel,osprey",
         at="PROGRAMFLASH,3", at_file="harrier.acd"),
    Edit("spi missing under PFF", "P205", "base.acd", "osprey,plover,spi\n\n# Parts", "osprey,plover\n\n# Parts",
         at="PROGRAM,4,BS,DP770,SPI,PFF", at_file="spi.acd"),
    Edit("buzzard missing under SS", "T112", "base.acd", "families,buzzard,goshawk,harrier,kestrel,merlin,osprey\n",
         "families,goshawk,harrier,kestrel,merlin,osprey\n", at="PROGRAM,SSerial", at_file="buzzard.acd"),
    Edit("PFF in a property of linnet", "P205", "linnet.acd", "PROGRAM,3,BS,BSFILE,DP770", "PROGRAM,4,BS,BSFILE,DP770,PFF"),
    Edit("KITECF in a property of merlin", "P205", "merlin.acd", "PROGRAM,4,BS,SS,BSFILE,PFF", "PROGRAM,5,BS,SS,BSFILE,PFF,KITECF"),
    Edit("KITEMPM in a property of goshawk", "P205", "goshawk.acd", "PROGRAM,6,BS,SS,SM,BSFILE,KITECF,PFF",
         "PROGRAM,7,BS,SS,SM,BSFILE,KITECF,KITEMPM,PFF"),
    Edit("a package table of a device of DEVICE_SUPPORTED", "B107", "base.acd", "OS2000E,base,buzzard,curlew,dunlin, \\",
         "OS2000E,OS2000EFB900,base,buzzard,curlew,dunlin, \\"),
    Edit("a package table of HR4", "B107", "base.acd", "DN1VS20,HR4,", "DN1VS20,HR4,HR4CB132,"),
    Edit("a device of DEVICE_SUPPORTED without tables", "B108", "base.acd", "DEVICE_SUPPORTED       = HR4,OS2000E",
         "DEVICE_SUPPORTED       = HR4,DN1,OS2000E"),
    Edit("another one", "B108", "base.acd", "DEVICE_SUPPORTED       = HR4,OS2000E", "DEVICE_SUPPORTED       = HR4,KS50,OS2000E"),
    Edit("a flash of NV1 without properties", "S110", "spi.acd", "MRS256K,MRS1M,MRS4M\n", "MRS256K,MRS1M,MRS4M,MRS8M\n"),
    Edit("a property key of NV1 with a typo", "K102", "spi.acd", "MRS1M_PROPERTY", "MRS1_PROPERTY"),
    Edit("properties of a family that is no class", "S111", "spi.acd", "\nMRS256K_PROPERTY", "\nNV1_PROPERTY = VENDOR,Quillan\nMRS256K_PROPERTY",
         at="NV1_PROPERTY"),
]

STEPS = {  # file: a property record and the same without one mode, and a table record without its property
    "kestrel.acd": [("VERIFY,3,BS,SM,BSFILE", "VERIFY,2,BS,BSFILE", "VERIFY,Smap"),
                    ("READBACKTOFILE,2,BS,SM", "READBACKTOFILE,1,BS", "READBACKTOFILE,Smap"),
                    ("BYPASS,2,BS,BSFILE", "BYPASS,1,BS", "BYPASS,BSFILE")],
    "osprey.acd": [("VERIFY,3,BS,SM,BSFILE", "VERIFY,2,BS,SM", "VERIFY,BSFILE")],
    "pipit.acd": [("ERASE,3,BS,BSFILE,DP770", "ERASE,2,BS,BSFILE", "ERASE,DP770"),
                  ("CHECKSUM,2,BS,DP770", "CHECKSUM,1,BS", "CHECKSUM,DP770")],
    "curlew.acd": [("BLANKCHECK,3,BS,BSFILE,DP770", "BLANKCHECK,2,BS,DP770", "BLANKCHECK,BSFILE")],
    "linnet.acd": [("READIDCODE,3,BS,BSFILE,DP770", "READIDCODE,2,BS,BSFILE", "READIDCODE,DP770")],
    "merlin.acd": [("VERIFY,2,BS,BSFILE", "VERIFY,1,BS", "VERIFY,BSFILE")],
    "goshawk.acd": [("READBACKTOFILE,2,BS,SM", "READBACKTOFILE,1,BS", "READBACKTOFILE,Smap")],
    "harrier.acd": [("VERIFY,3,BS,SM,BSFILE", "VERIFY,2,BS,SM", "VERIFY,BSFILE")],
    "spi.acd": [("BLANKCHECK,3,BS,DP770,SPI", "BLANKCHECK,2,BS,DP770", "BLANKCHECK,SPI")],
    "buzzard.acd": [("READIDCODE,2,BS,BSFILE", "READIDCODE,1,BS", "READIDCODE,BSFILE")],
}

PROPERTIES_AND_TABLES = [
    *[Edit(f"{file}: {old} loses a mode", "P207", file, old, new, at=record)
      for file, steps in STEPS.items() for old, new, record in steps],
    *[Edit(f"{file}: {old} is missing", "P207", file, old + ": \\\n", "\\\n", at=old.split(",")[0] + ",Bscan")
      for file, old in [("kestrel.acd", "READUSERCODE,1,BS"), ("pipit.acd", "READUES,1,BS"), ("curlew.acd", "CONLD,1,BS"),
                        ("linnet.acd", "ISPENABLE,1,BS"), ("merlin.acd", "READBACKTOFILE,1,BS")]],
    *[Edit(f"{file}: {old} gains a mode", "P206", file, old, new)
      for file, old, new in [
          ("kestrel.acd", "READUSERCODE,1,BS", "READUSERCODE,2,BS,SM"),
          ("kestrel.acd", "VERIFY,3,BS,SM,BSFILE", "VERIFY,4,BS,SS,SM,BSFILE"),
          ("osprey.acd", "READTEMP,1,BS", "READTEMP,2,BS,SM"),
          ("pipit.acd", "READUES,1,BS", "READUES,2,BS,DP770"),
          ("curlew.acd", "CONLD,1,BS", "CONLD,2,BS,BSFILE"),
          ("linnet.acd", "FUNCTIONTEST,1,BS", "FUNCTIONTEST,2,BS,BSFILE"),
          ("merlin.acd", "VERIFY,2,BS,BSFILE", "VERIFY,3,BS,SS,BSFILE"),
          ("buzzard.acd", "BYPASS,1,BS", "BYPASS,2,BS,BSFILE"),
          ("spi.acd", "CHECKSUM,1,SPI", "CHECKSUM,2,BS,SPI"),
          ("harrier.acd", "CHECKSUM,1,BS", "CHECKSUM,2,BS,BSFILE")]],
    *[Edit(f"{file}: the operation {old} is removed", "P206", file, old + ": \\\n", "\\\n", at=at)
      for file, old, at in [
          ("kestrel.acd", "VERIFY,Smap,ZORVA,USB2", "VERIFY,3,BS,SM"),
          ("kestrel.acd", "READUSERCODE,Bscan,PARALLEL,ZORVA,USB2", "READUSERCODE,1,BS"),
          ("pipit.acd", "CHECKSUM,DP770,PARALLEL,USB2", "CHECKSUM,2,BS,DP770"),
          ("spi.acd", "CHECKSUM,SPI,PARALLEL,USB2", "CHECKSUM,1,SPI")]],
    Edit("an option that no table allows", "P208", "kestrel.acd", "OP_PROGRAM_BS,2,VERIFY,PROG: \\\n                 OP_PROGRAM_SM",
         "OP_PROGRAM_BS,2,VERIFY,ERASE: \\\n                 OP_PROGRAM_SM"),
    Edit("an option that the mode does not allow", "P208", "kestrel.acd", "OP_PROGRAM_BSFILE,1,VERIFY", "OP_PROGRAM_BSFILE,2,VERIFY,PROG"),
    Edit("an option for all modes that no table allows", "P208", "linnet.acd", "OP_PROGRAM,4,ERASE", "OP_PROGRAM,5,LOADFPGA,ERASE"),
    Edit("an option of PROMs for CPLDs", "P208", "pipit.acd", "OP_PROGRAM_DP770,3,ERASE", "OP_PROGRAM_DP770,4,LOADFPGA,ERASE"),
    Edit("an option of another mode of flashes", "P208", "spi.acd", "OP_ERASE_SPI,1,SECTOR_PROTECT", "OP_ERASE_BS,1,SECTOR_PROTECT"),
    Edit("a device with options that its table lacks", "P208", "kestrel.acd", "OP_PROGRAM_SM,1,VERIFY\n", "OP_PROGRAM_SM,2,VERIFY,PROG\n"),
    Edit("options of an operation that lacks the mode", "P209", "pipit.acd", "OP_VERIFY_BS,1,OTF", "OP_PROGRAMUES_DP770,1,ERASE"),
    Edit("options of an operation that there is not", "P209", "kestrel.acd", "OP_PROGRAM_BSFILE,1,VERIFY", "OP_ERASE_BSFILE,1,VERIFY"),
    Edit("options of an operation that the mode lacks", "P209", "spi.acd", "OP_ERASE_SPI,1,SECTOR_PROTECT",
         "OP_CHECKSUM_DP770,1,SECTOR_PROTECT"),
    Edit("options in lower case", "P203", "kestrel.acd", "OP_PROGRAM_BSFILE,1,VERIFY", "op_program_bsfile,1,VERIFY"),
    Edit("options in mixed case", "P203", "kestrel.acd", "OP_PROGRAM_BSFILE,1,VERIFY", "OP_Program_BSFILE,1,VERIFY"),
    Edit("a prefix in lower case", "P203", "pipit.acd", "OP_VERIFY_BS,1,OTF", "Op_VERIFY_BS,1,OTF"),
]

OVERLAYS_AND_SECTIONS = [
    Edit("+= in a section without OPERATION", "R101", "osprey.acd", "[OS2000E]\n", "[OS2000E]\nBSDL_OPERATION += :CONLD,USB2\n",
         at="BSDL_OPERATION += :CONLD"),
    Edit("+= in a section without PROGRAM_OPTION", "R101", "kestrel.acd", "[KS100]\n", "[KS100]\nPROGRAM_OPTION += :PROG,Bscan,USB2\n",
         at="PROGRAM_OPTION += :PROG"),
    Edit("+= in a section of a layer", "R101", "kestrel.acd", None, "[KS100]\nPROGRAM_OPTION += :ERASE,Bscan,USB2\n", at="PROGRAM_OPTION"),
    *[Edit(f"{key} = in a layer", "R102", file, None, f"{key} = {value}\n")
      for file, key, value in [
          ("base.acd", "IDCODE", "KS50,0xX4104FB7"), ("base.acd", "DEVICE_SUPPORTED", "base,kestrel"),
          ("base.acd", "PROGRAM_OPTION_PACKAGE", "base,spi"), ("base.acd", "BS", "outputs,USB2:families,kestrel"),
          ("base.acd", "SM", "outputs,ZORVA,USB2:families,kestrel"), ("base.acd", "NOT_SUPPORTED_PART_IN_MODE", "SS_BZ2_PL84"),
          ("spi.acd", "DEVICE_FAMILY", "AT1"), ("spi.acd", "ST1_DEVICES", "TMF512K"), ("spi.acd", "NV1_DEVICES", "MRS256K"),
          ("spi.acd", "TYPE_MB_SPI_NONE_LEAD", "KS600"), ("spi.acd", "TYPE_BPI_SERIAL_CHAIN", "KS600")]],
    *[Edit(f"{key} += without a separator", "R104", file, None, f"{key} += {value}\n")
      for file, key, value in [
          ("base.acd", "IDCODE", "KS50,0xX4104FB7"), ("base.acd", "DEVICE_SUPPORTED", "KS100"),
          ("base.acd", "PROGRAM_OPTION_PACKAGE", "KS100"), ("base.acd", "KITECF", "harrier"),
          ("base.acd", "NOT_SUPPORTED_PART_IN_MODE", "SS_BZ2_VQ100"), ("spi.acd", "NV1_DEVICES", "MRS16M"),
          ("spi.acd", "TYPE_MB_SPI_NONE_CHAIN", "TMF64M"), ("kestrel.acd", "OPERATION", "ERASE,Bscan,USB2"),
          ("kestrel.acd", "PROPERTIES", "ERASE,1,BS"), ("kestrel.acd", "PROPERTY", "SPEED,5")]],
    *[Edit(f"{file}: {text!r} drops properties", "R103", file, None, text, at="PROPERT")
      for file, text in [
          ("kestrel.acd", "PROPERTY = VENDOR,Site\n"), ("kestrel.acd", "[KS100]\nPROPERTY = CELLS,2305\n"),
          ("osprey.acd", "PROPERTIES = PROGRAM,7,BS,SS,SM,BSFILE,KITECF,KITEMPM,PFF\n"), ("pipit.acd", "[PT48A]\nPROPERTY = PINS,34\n"),
          ("spi.acd", "OVD1_PROPERTY = PAGE,256\n"), ("spi.acd", "AT1_PROPERTY = CLOCK,1\n")]],
]


def prop(file, old, new, code):
    return Edit(f"{file}: {old!r} becomes {new!r}", code, file, old, new)


NEAR_IDENTICAL = [
    *[prop(file, old, new, "C101") for file, old, new in [
        ("kestrel.acd", "PINS,140", "PINNS,140"), ("kestrel.acd", "PINS,182", "PNIS,182"), ("osprey.acd", "CELLS,15360", "CELL,15360"),
        ("kestrel.acd", "BITS,1229952", "BIST,1229952"), ("pipit.acd", "MACROCELLS,96:PINS,72\n", "MACROCELS,96:PINS,72\n"),
        ("kestrel.acd", "CELLS,4800", "Cells,4800"), ("osprey.acd", "IRLENGTH,10:FLASH", "IRLENGHT,10:FLASH"),
        ("linnet.acd", "VENDOR,Korvel", "VENDER,Korvel"), ("spi.acd", "DENSITY,4096:PAGE", "DENSTIY,4096:PAGE"),
        ("spi.acd", "SECTOR,32768:PACKAGE,SO8\nTMF1M", "SECTORS,32768:PACKAGE,SO8\nTMF1M"),
        ("kestrel.acd", "PACKAGES,3,TQ144,PQ208,BG256", "PACKAGE,3,TQ144,PQ208,BG256"), ("siskin.acd", "PINS,", "PIN,"),
        ("merlin.acd", "KIND,FPGA", "KND,FPGA"), ("harrier.acd", "CORE,", "COER,")]],
    *[prop(file, old, new, "C102") for file, old, new in [
        ("kestrel.acd", "CELLS,3456:PINS,182:BITS", "CELLS,3456:BITS"), ("osprey.acd", "CELLS,38400:PINS,344:BITS", "PINS,344:BITS"),
        ("pipit.acd", "MACROCELLS,144:PINS,98", "PINS,98"), ("kestrel.acd", "PINS,316:BITS,4879488", "PINS,316"),
        ("spi.acd", "QLE16M_PROPERTY  = DENSITY,16384:PACKAGE,SO8", "QLE16M_PROPERTY  = PACKAGE,SO8")]],
    *[prop(file, old, new, "C103") for file, old, new in [
        ("kestrel.acd", "PINS,140", "PINS,14O"), ("osprey.acd", "CELLS,15360", "CELLS,15 360"), ("kestrel.acd", "BITS,418944", "BITS,about 420000"),
        ("kestrel.acd", "FLASH,FALSE", "FLASH,NO"), ("pipit.acd", "FLASH,TRUE", "FLASH,YES"), ("spi.acd", "DENSITY,2048", "DENSITY,2M"),
        ("spi.acd", "CLOCK,33000", "CLOCK,33MHz"), ("pipit.acd", "PINS,98", "PINS,l98"), ("merlin.acd", "IRLENGTH,", "IRLENGTH,0x"),
        ("linnet.acd", "PINS,", "PINS,~")]],
    *[prop(file, old, new, "C104") for file, old, new in [
        ("kestrel.acd", "TQ144,PQ208,BG256", "TQ144,PQ2O8,BG256"), ("pipit.acd", "PACKAGES,1,VQ100", "PACKAGES,1,VQI00"),
        ("pipit.acd", "VQ44,CB48\n\n[PT48]", "VQ44,C848\n\n[PT48]"), ("osprey.acd", "BG352,FB484\n\n[OS250]", "BG3S2,FB484\n\n[OS250]")]],
    *[prop(file, old, new, "C105") for file, old, new in [
        ("kestrel.acd", "VENDOR,Korvel", "VENDOR,K\u043ervel"), ("kestrel.acd", "PINS,140", "\u0420INS,140"), ("kestrel.acd", "[KS100]", "[\u041aS100]"),
        ("base.acd", "HR4,OS2000E,base,buzzard", "HR4,OS2000E,b\u0430se,buzzard"), ("kestrel.acd", "PINS,140", "PINS,\u00a0140"),
        ("kestrel.acd", "PINS,140", "PINS,140\u200b"), ("base.acd", "KS50,0xX4104FB7", "KS50,0\u0445X4104FB7"),
        ("spi.acd", "OVD2,OVD4", "OVD2,\u039fVD4"), ("kestrel.acd", "VERIFY,Bscan", "VERIFY,\u0412scan")]],
    prop("kestrel.acd", "BITS,824448", "BITS,824448# measured", "F106"),
    prop("kestrel.acd", "BITS,824448", "BITS,824448 #measured", "F106"),
    prop("osprey.acd", "PINS,248", "PINS,248#", "F106"),
    prop("base.acd", "outputs,ZORVA,USB2: ", "outputs,ZORVA,USB2#: ", "F106"),
    prop("kestrel.acd", "PROPERTY       =", "PROPERTY       ==", "F107"),
    prop("kestrel.acd", "PROPERTY       =", "PROPERTY       =+", "F107"),
    prop("base.acd", "BS      =", "BS      ==", "F107"),
    Edit("=+ for +=", "F107", "base.acd", None, "DEVICE_SUPPORTED =+ ,sparrow\n"),
    Edit("a file with CR as line end", "L113", "sparrow.acd", None, "# sparrow\rPROPERTY = VENDOR,Site\r[SW1]\r"),
    Edit("CR between two keys", "L113", "kestrel.acd", "BITS,824448\nPROPERTIES", "BITS,824448\rPROPERTIES"),
]

EDITS = [*TABLES_AND_LISTS, *PROPERTIES_AND_TABLES, *OVERLAYS_AND_SECTIONS, *NEAR_IDENTICAL]

LEGITIMATE = [
    Edit("a part of spi excluded from SPI mode", None, *excluded("SPI_spi_SO8,SS_BZ2_PL84")),
    Edit("a flash excluded from Desktop Programming", None, *excluded("DP770_OVD1_SO8,SS_BZ2_PL84")),
    Edit("a device excluded from PFF", None, *excluded("PFF_ML8_VQ64,SS_BZ2_PL84")),
    Edit("an appended IDCODE", None, "base.acd", None, "IDCODE += :KS50,0x14104FB7\n"),
    Edit("an appended IDCODE that frees the former one", None, "base.acd", None, "IDCODE += :KS50,0xX4FF0FB7:KS100,0xX4104FB7\n"),
    Edit("an appended property", None, "kestrel.acd", None, "PROPERTY += :VENDOR,Site\n"),
    Edit("an appended property of a device", None, "kestrel.acd", None, "[KS100]\nPROPERTY += :PINS,175\n"),
    Edit("an appended list in place of a single value", None, "kestrel.acd", None, "PROPERTIES += :VENDOR,1,Site\n"),
    Edit("no excluded parts", None, "base.acd", None, "NOT_SUPPORTED_PART_IN_MODE =\n"),
    Edit("an empty multiboot list", None, "spi.acd", None, "TYPE_MB_SPI_NONE_CHAIN =\n"),
    Edit("a family more under a mode", None, "base.acd", None, "IDCODE += :KS50,0xX4104FB7\n"),
    Edit("a mode key with an output more", None, "base.acd", None,
         "KITECF = outputs,SVF,STAPL:families,goshawk,kestrel,osprey\n"),
    Edit("a new multiboot flash", None, "spi.acd", None, "TYPE_MB_SPI_NONE_CHAIN += ,TMF64M\n"),
    Edit("a new flash", None, "spi.acd", None, "ST1_DEVICES += ,TMF128M\nTMF128M_PROPERTY = DENSITY,131072:SECTOR,65536:PACKAGE,SO16\n"),
    Edit("a property that only one device has", None, "kestrel.acd", "PINS,140:BITS,418944", "PINS,140:BITS,418944:GRADE,5"),
    Edit("a property whose name is new", None, "osprey.acd", "PROPERTY       = VENDOR,Korvel", "PROPERTY       = SPEED,7:VENDOR,Korvel"),
    Edit("a text for a property", None, "kestrel.acd", "TITLE,Kestrel mid-range FPGA", "TITLE,Kestrel #1"),
    Edit("a package that is new", None, "kestrel.acd", "PACKAGES,3,TQ144,PQ208,BG256", "PACKAGES,4,TQ144,PQ208,BG256,CS280"),
    Edit("accents in a title", None, "kestrel.acd", "TITLE,Kestrel mid-range FPGA", "TITLE,K\u00e9strel \u2264 5 \u00b5s"),
    Edit("a title in Greek letters", None, "kestrel.acd", "TITLE,Kestrel mid-range FPGA", "TITLE,\u039a\u03b9\u03c1\u03ba\u03b9\u03bd\u03ad\u03b6\u03b9"),
    Edit("a site property in a new section key", None, "kestrel.acd", None, "[KS1500]\nPROPERTY += :SITE,1\n"),
    Edit("a device of DEVICE_SUPPORTED with BSDL operations only", None, "kestrel.acd", "[KS100]\n", "[KS100]\n"),
    Edit("IDCODE in lower case digits", None, "base.acd", "KS50,0xX4104FB7", "KS50,0xX4104fb7"),
    Edit("CRLF line ends", None, "kestrel.acd", "[KS100]\n", "[KS100]\r\n"),
]


def findings(tool, base, site):
    directories = [str(site), str(base)] if site.exists() else [str(base)]
    run = subprocess.run([tool, "lint", *directories, "--format", "json"], capture_output=True, check=False)
    report = json.loads(run.stdout.decode("utf-8"))
    return [(finding["code"], pathlib.Path(finding["file"]), finding["line"]) for finding in report["findings"]]


def main(tool, database, least=None):
    missed, wrong, noisy = [], [], []
    with tempfile.TemporaryDirectory() as scratch:
        for number, edit in enumerate([*EDITS, *LEGITIMATE]):
            base = pathlib.Path(scratch) / str(number) / "base"
            site = pathlib.Path(scratch) / str(number) / "site"
            shutil.copytree(database, base)
            changed = edit.apply(base, site)
            found = findings(tool, base, site)
            shown = sorted({f"{code} {path.parent.name}/{path.name}:{line}" for code, path, line in found})
            if edit.code is None:
                if found:
                    wrong.append(f"{edit.what}: {shown[:5]}")
                continue
            directory = site if edit.old is None and edit.at_file == edit.file else base
            place = (edit.code, directory / edit.at_file, edit.line(base, site, changed))
            if place not in found:
                missed.append(f"{edit.what}: no {place[0]} {place[1].name}:{place[2]}, but {shown[:5]}")
            elif len([code for code, _, _ in found if code not in edit.also]) > 1:
                noisy.append(f"{edit.what}: {len(found)} findings: {shown[:5]}")
    print(f"{len(EDITS) - len(missed)} of {len(EDITS)} edits found at their line, {len(noisy)} of them not alone; "
          f"{len(wrong)} of {len(LEGITIMATE)} legitimate edits have findings")
    for kind, texts in (("missed", missed), ("not alone", noisy), ("false alarm", wrong)):
        for text in texts:
            print(f"{kind}: {text}")
    return 1 if len(EDITS) - len(missed) < int(least or len(EDITS)) or noisy or wrong else 0


if __name__ == "__main__":
    sys.exit(main(*sys.argv[1:]))
