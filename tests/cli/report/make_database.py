#!/usr/bin/env python3
"""Writes a big database, the same for the same arguments, to try a report on.

    make_database.py DIRECTORY [--devices 30000] [--families 120] [--bytes-each 1000]
"""

import argparse
import pathlib
import random

MODES = {"BS": "Bscan", "SS": "SSerial", "SM": "Smap", "BSFILE": "BSFILE"}
OUTPUTS = ["PARALLEL", "ZORVA", "USB2", "SVF", "STAPL"]
OPERATIONS = ["PROGRAM", "VERIFY", "ERASE", "BLANKCHECK", "READBACKTOFILE", "READIDCODE", "CHECKSUM",
              "READUSERCODE", "BYPASS", "HIGHZ", "READSTATUSREGISTER", "LOADCONFIGURATIONREVISION"]


def records(pick, names, modes):
    lines = []
    for name in names:
        for mode in modes:
            if pick.random() < 0.6:
                chosen = [output for output in OUTPUTS if pick.random() < 0.5] or OUTPUTS[:1]
                lines.append(",".join([name, mode] + chosen))
    return ": \\\n    ".join(lines)


def family_text(pick, devices, size):
    modes = list(MODES.values())
    lines = [f"OPERATION = {records(pick, OPERATIONS, modes)}",
             f"PROGRAM_OPTION = {records(pick, ['ERASE', 'VERIFY', 'PROG', 'USERCODE'], modes)}",
             "PROPERTY = VENDOR,Korvel:KIND,FPGA:CORE,2.5:IRLENGTH,6",
             "PROPERTIES = PROGRAM,2,BS,SM:VERIFY,1,BS"]
    for device in devices:
        entries = [f"CELLS,{pick.randrange(100, 99999)}", f"PINS,{pick.randrange(20, 900)}"]
        while sum(map(len, entries)) < size - 60:
            entries.append(f"TIMING{len(entries)},{pick.randrange(10**6, 10**7)}")
        lines += [f"[{device}]", "PROPERTY = " + ":".join(entries),
                  f"PROPERTIES = PACKAGES,2,TQ{pick.randrange(100, 150)},BG{pick.randrange(200, 900)}"]
    return "\n".join(lines) + "\n"


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("directory", type=pathlib.Path)
    parser.add_argument("--devices", type=int, default=30000)
    parser.add_argument("--families", type=int, default=120)
    parser.add_argument("--bytes-each", type=int, default=1000)
    arguments = parser.parse_args()

    pick = random.Random(7)
    arguments.directory.mkdir(parents=True, exist_ok=True)
    families = [f"bird{number:03}" for number in range(arguments.families)]
    idcodes = []
    for number, family in enumerate(families):
        devices = [f"BD{device:05}" for device in range(number, arguments.devices, len(families))]
        idcodes += [f"{device},0x{pick.randrange(1 << 32):08x}" for device in devices]
        (arguments.directory / f"{family}.acd").write_text(
            family_text(pick, devices, arguments.bytes_each))
    names = ",".join(families)
    modes = "".join(f"{mode} = outputs,{','.join(OUTPUTS)}:families,{names}\n" for mode in MODES)
    (arguments.directory / "base.acd").write_text(
        f"DEVICE_SUPPORTED = {names},spi\nPROGRAM_OPTION_PACKAGE = {names},spi\n{modes}"
        f"IDCODE = {':'.join(idcodes)}\n")
    (arguments.directory / "spi.acd").write_text(
        "DEVICE_FAMILY = ST1\nST1_DEVICES = FLA,FLB\nST1_PROPERTY = BUS,SPI\nOPERATION = ERASE,SPI,USB2\n"
        "TYPE_MB_SPI_NONE_LEAD = FLA,BD00001,BD00002\n")


if __name__ == "__main__":
    main()
