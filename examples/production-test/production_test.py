#!/usr/bin/env python3
"""A step of a production test: identifies the devices of a JTAG chain by their IDCODEs, asks what can be done with them,
and prints a report.

    production_test.py [--database DIRECTORY] [--cable USB2] [--step VERIFY]... IDCODE...

The IDCODEs are those that the tester has read, in the order of the chain. Exits with 0 if every device is known and offers
every step, with 1 otherwise, and with 2 if the database is faulty.
"""

import argparse
import sys
from typing import Dict, FrozenSet, List

import tarvik


def matches(pattern: str, idcode: int) -> bool:
    """Is this the IDCODE of the database? An X there stands for any digit."""
    digits = f"{idcode:08X}"
    return all(wanted in ("X", digit) for wanted, digit in zip(pattern[2:].upper(), digits))


def identify(idcodes: Dict[str, str], idcode: int) -> List[str]:
    return [device for device, pattern in idcodes.items() if matches(pattern, idcode)]


def names(operations: FrozenSet[tarvik.Operation]) -> str:
    """The operations as users know them, in the order in which they are presented."""
    return ", ".join(
        tarvik.Manager.operation_type_to_display_string(operation).strip()
        for operation in tarvik.Manager.get_operation_orders()
        if operation in operations
    )


def test_device(
    manager: tarvik.Manager, device: str, cable: tarvik.Output, steps: FrozenSet[tarvik.Operation]
) -> bool:
    """Prints what can be done with one device.

    Returns whether it offers every step."""
    offered = manager.get_device_operations(device, tarvik.Mode.BS, cable)
    options = manager.get_program_options(device, tarvik.Mode.BS, cable)
    print(f"    family {manager.get_part_family(device)}, {len(offered)} operations through {cable.name}")
    if options:
        print("    options: " + ", ".join(option.name for option in sorted(options)))
    missing = steps - offered
    print(f"    cannot: {names(missing)}" if missing else f"    can: {names(steps)}")
    return not missing


def parse_arguments() -> argparse.Namespace:
    parser = argparse.ArgumentParser(description="Tests what can be done with the devices of a chain.")
    parser.add_argument("--database", help="directory; the installed database if it is not given")
    parser.add_argument("--cable", choices=[output.name for output in tarvik.Output], default="USB2")
    parser.add_argument("--step", choices=[operation.name for operation in tarvik.Operation], action="append")
    parser.add_argument("idcodes", nargs="+", type=lambda text: int(text, 16), metavar="IDCODE")
    return parser.parse_args()


def main() -> int:
    arguments = parse_arguments()
    tarvik.set_message_callback(lambda message: sys.stderr.write(message.text))
    manager = tarvik.Manager(arguments.database)
    cable = tarvik.Output[arguments.cable]
    steps = frozenset(tarvik.Operation[name] for name in arguments.step or ["PROGRAM", "VERIFY"])
    passed = True
    for position, idcode in enumerate(arguments.idcodes, 1):
        devices = identify(manager.get_all_device_idcodes(), idcode)
        print(f"{position}. 0x{idcode:08X}: {' or '.join(devices) or 'unknown'}")
        passed = passed and bool(devices)
        for device in devices:
            try:
                passed = test_device(manager, device, cable, steps) and passed
            except tarvik.TarvikException as error:
                print(f"    the database is faulty: {error}")
                return 2
    print("PASS" if passed else "FAIL")
    return 0 if passed else 1


if __name__ == "__main__":
    sys.exit(main())
