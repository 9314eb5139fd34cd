"""The enumerations of the library. Written by generate_enumerations.py: do not edit."""

from enum import IntEnum


class Mode(IntEnum):
    """Configuration modes."""

    BS = 0
    SS = 1
    SM = 2
    BSFILE = 3
    DP770 = 4
    SPI = 5
    KITECF = 6
    KITEMPM = 7
    PFF = 8


class Output(IntEnum):
    """Cables and output file types."""

    PARALLEL = 0
    ZORVA = 1
    USB2 = 2
    SVF = 3
    STAPL = 4
    QSVF = 5
    EXPRESSSVF = 6
    EXPRESSQSVF = 7
    NULLCABLE = 8
    NONE = 9


class Operation(IntEnum):
    """Device operations, in the order in which they are presented."""

    PROGRAM = 0
    PROGRAMFLASH = 1
    PROGRAMFPGAONLY = 2
    VERIFY = 3
    ERASE = 4
    FUNCTIONTEST = 5
    BLANKCHECK = 6
    READBACKTOFILE = 7
    PROGRAMUES = 8
    READIDCODE = 9
    CHECKSUM = 10
    READUSERCODE = 11
    READCUSTOMERCODE = 12
    READUES = 13
    ACTIVATEOTF = 14
    VALIDATEUSERCODE = 15
    CHECKIDCODE = 16
    READSTATUSREGISTER = 17
    LOADCONFIGURATIONREVISION = 18
    BYPASS = 19
    HIGHZ = 20
    CLAMP = 21
    DOPRELOAD = 22
    ISPENABLE = 23
    CONLD = 24
    PROGRAMKEY = 25
    SECUREMODE = 26
    READTEMP = 27
    PROGRAMUSERCODE = 28
    PROGRAMCUSTOMERCODE = 29
    EXPRESSSVF = 30
    EXPRESSQSVF = 31


class Option(IntEnum):
    """Programming options."""

    ERASE = 0
    VERIFY = 1
    READPROTECT = 2
    WRITEPROTECT = 3
    FUNCTIONTEST = 4
    SKIPUSERARRAY = 5
    LOADFPGA = 6
    PARALLELMODE = 7
    USED4 = 8
    USERCODE = 9
    UES = 10
    SECUREMODE = 11
    PROGRAMKEY = 12
    OTF = 13
    PROG = 14
    SECTOR_PROTECT = 15
    SECTOR_LOCKDOWN = 16
    PROGRAM_ONLYFPGA = 17
    READ_PROTECT_NOBSCANTEST = 18
    OTP = 19
    ASSERT_INIT = 20
    DATA_WIDTH = 21
    RS_PIN1 = 22
    RS_PIN0 = 23


class Status(IntEnum):
    """What a function of the C interface returns."""

    OK = 0
    DATA_MISMATCH = 1
    OUT_OF_RANGE = 2
    DATA_NOT_FOUND = 3
    OTHER_EXCEPTION = 4
    NO_MEMORY = 5
    INVALID_ARGUMENT = 6
    TOO_LATE = 7
    REMOVED = 8
    BUSY = 9
    CALLBACK_FAILED = 10


class Channel(IntEnum):
    """Whom a message is for."""

    INFO = 0
    STATUS = 1
    DEBUG = 2
