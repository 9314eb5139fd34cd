#!/usr/bin/env python3
"""Writes tarvik/_enumerations.py from the enumerations of the library.

    generate_enumerations.py LIBRARY > tarvik/_enumerations.py

The file is kept under version control so that type checkers see the names; a test compares it with the library.
"""

import ctypes
import sys

# In the order of `tarvik_enumeration`.
ENUMERATIONS = (
    ("Mode", "Configuration modes."),
    ("Output", "Cables and output file types."),
    ("Operation", "Device operations, in the order in which they are presented."),
    ("Option", "Programming options."),
    ("Status", "What a function of the C interface returns."),
    ("Channel", "Whom a message is for."),
)


def names(library, enumeration):
    library.tarvik_enumerator_name.restype = ctypes.c_char_p
    value = 0
    while (name := library.tarvik_enumerator_name(enumeration, value)) is not None:
        yield name.decode("ascii")
        value += 1


def main():
    library = ctypes.CDLL(sys.argv[1])
    print('"""The enumerations of the library. Written by generate_enumerations.py: do not edit."""\n')
    print("from enum import IntEnum")
    for number, (enumeration, description) in enumerate(ENUMERATIONS):
        print(f'\n\nclass {enumeration}(IntEnum):\n    """{description}"""\n')
        for value, name in enumerate(names(library, number)):
            print(f"    {name} = {value}")


if __name__ == "__main__":
    main()
