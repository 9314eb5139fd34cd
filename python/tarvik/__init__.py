"""What a device-programming application can offer its user for a device.

>>> import tarvik
>>> manager = tarvik.Manager(tarvik.demonstration())
>>> tarvik.Operation.PROGRAM in manager.get_device_operations("KS50", tarvik.Mode.BS, tarvik.Output.USB2)
True

A process has one manager and one database. To compare databases, use a process for each (`multiprocessing`).
"""

from ._enumerations import Channel, Mode, Operation, Option, Output
from ._errors import (
    DataMismatchException,
    DataNotFoundException,
    LibraryNotFoundError,
    LogicException,
    OutOfRangeException,
    StateError,
    TarvikException,
)
from ._library import demonstration, version
from ._manager import Manager
from ._messages import Message, set_message_callback

__all__ = [
    "Channel",
    "DataMismatchException",
    "DataNotFoundException",
    "LibraryNotFoundError",
    "LogicException",
    "Manager",
    "Message",
    "Mode",
    "Operation",
    "Option",
    "OutOfRangeException",
    "Output",
    "StateError",
    "TarvikException",
    "demonstration",
    "set_message_callback",
    "version",
]
