"""The manager: what can be asked."""

import contextlib
import ctypes
import functools
import os
from typing import Any, Dict, FrozenSet, Iterable, Iterator, Mapping, Optional, Tuple, Union, overload

from ._calls import ask_flag, ask_integer, ask_map, ask_mask, ask_number, ask_orders, ask_text, ask_texts, call
from ._enumerations import Mode, Operation, Option, Output
from ._errors import StateError
from ._library import MemoryFile, bytes_of, library, lock, number_of, text_of

Directory = Union[str, "os.PathLike[str]"]

# What the first manager was given: there is no other in this process.
_database: Optional[Tuple[Any, ...]] = None
_exceptions_are_on = True


@functools.lru_cache(maxsize=None)
def _operations_of_byte(mask: int) -> FrozenSet[Operation]:
    return frozenset(operation for operation in Operation if mask >> operation & 1)


@functools.lru_cache(maxsize=None)
def _options_of_byte(mask: int) -> FrozenSet[Option]:
    return frozenset(option for option in Option if mask >> option & 1)


# A large database may have more masks than are kept. To make one of its bytes' sets is several times as fast as to go
# through the enumeration.


@functools.lru_cache(maxsize=16384)
def _operations(mask: int) -> FrozenSet[Operation]:
    part = _operations_of_byte
    return part(mask & 0xFF).union(part(mask & 0xFF00), part(mask & 0xFF0000), part(mask & 0xFF000000))


@functools.lru_cache(maxsize=16384)
def _options(mask: int) -> FrozenSet[Option]:
    part = _options_of_byte
    return part(mask & 0xFF).union(part(mask & 0xFF00), part(mask & 0xFF0000))


def _set_database(directories: Optional[Tuple[bytes, ...]], files: Optional[Tuple[Tuple[bytes, bytes], ...]]) -> None:
    if directories is not None:
        path = (ctypes.c_char_p * len(directories))(*directories)
        call(library.tarvik_set_search_path, path, len(directories))
    if files is not None:
        array = (MemoryFile * len(files))(*[MemoryFile(name, text, len(text)) for name, text in files])
        call(library.tarvik_set_memory_files, array, len(files))


def _directory_bytes(directory: Directory) -> bytes:
    encoded = os.fsencode(directory)
    if b"\0" in encoded:
        raise ValueError("embedded null character")
    return encoded


class Manager:
    """The manager of this process: what can be done with which device.

    The first `Manager` of a process sets its database and starts the manager. There is only one: a further
    `Manager()` is another name for it, and one with another database raises `StateError`. For several databases,
    use a process for each (see `multiprocessing`). All threads of the process can use it; they take turns.

    Args:
        directories: a directory with the database, or several, the first one on top. Without it, the environment
            variable TARVIK_DATABASE decides, otherwise the installed database.
        memory_files: the files of a database by name ("kestrel.acd"), in place of directories.

    Device names can be any `str`; the database decides what is known. A text may hold bytes that are no UTF-8, as
    lone surrogates (see `os.fsdecode`); None is the empty text, but for a package it is no package.

    A refusal is the answer False or an empty set, and a message with the reason (see `set_message_callback`). A fault
    of the database raises one of the exceptions derived from `TarvikException`, unless `exceptions` turns them off.

    >>> manager.get_device_string_property("KS50", "VENDOR")
    'Korvel'
    """

    def __init__(
        self,
        directories: Union[None, Directory, Iterable[Directory]] = None,
        *,
        memory_files: Optional[Mapping[str, Union[str, bytes]]] = None,
    ) -> None:
        global _database  # pylint: disable=global-statement
        if directories is not None and memory_files is not None:
            raise TypeError("a manager has directories or memory files, not both")
        path: Optional[Tuple[bytes, ...]] = None
        files: Optional[Tuple[Tuple[bytes, bytes], ...]] = None
        if directories is not None:
            several = [directories] if isinstance(directories, (str, os.PathLike)) else directories
            path = tuple(_directory_bytes(directory) for directory in several)
        if memory_files is not None:
            files = tuple(
                (bytes_of(name) or b"", text if isinstance(text, bytes) else bytes_of(text) or b"")
                for name, text in sorted(memory_files.items())
            )
        with lock:
            if _database is None:
                _set_database(path, files)
                _database = (path, files)
            elif (path, files) not in (_database, (None, None)):
                raise StateError("this process has a manager over another database: use a process for each")
            call(library.tarvik_get_constraints_manager)

    # ---- The manager itself

    @staticmethod
    def remove_constraints_manager() -> None:
        """Removes the manager and frees its memory. It cannot be made again: every later question raises
        `StateError`. A script that ends anyway need not call this."""
        call(library.tarvik_remove_constraints_manager)

    def set_exceptions(self, exceptions: bool) -> None:
        """Turns exceptions on, as they are at first, or off: a fault of the database then gives False, 0, None or an
        empty set. See `exceptions` for a block of code."""
        global _exceptions_are_on  # pylint: disable=global-statement
        with lock:
            call(library.tarvik_set_exceptions, bool(exceptions))
            _exceptions_are_on = bool(exceptions)

    @contextlib.contextmanager
    def exceptions(self, exceptions: bool) -> Iterator[None]:
        """Turns exceptions on or off in a block.

        >>> with manager.exceptions(False):
        ...     print(manager.get_device_string_property("KS50", "NO_SUCH_PROPERTY"))
        None
        """
        before = _exceptions_are_on
        self.set_exceptions(exceptions)
        try:
            yield
        finally:
            self.set_exceptions(before)

    @staticmethod
    def get_operation_orders() -> Tuple[Operation, ...]:
        """The operations in the order in which they are presented to users."""
        return tuple(map(Operation, ask_orders(library.tarvik_get_operation_orders)))

    @staticmethod
    def get_program_option_orders() -> Tuple[Option, ...]:
        """The programming options in the order in which they are presented to users."""
        return tuple(map(Option, ask_orders(library.tarvik_get_program_option_orders)))

    # ---- The vocabulary: conversions that need no manager

    @staticmethod
    def mode_string_to_type(text: str) -> Mode:
        """The mode with a key name, or a name that databases use, in any case; `Mode.BS` for every other text.

        >>> tarvik.Manager.mode_string_to_type("sserial")
        <Mode.SS: 1>
        """
        return Mode(ask_integer(library.tarvik_mode_string_to_type, bytes_of(text)))

    @staticmethod
    def mode_type_to_string(mode: int) -> str:
        """The key name of a mode; "BS" for an unknown value."""
        return ask_text(library.tarvik_mode_type_to_string, number_of(mode)) or ""

    @staticmethod
    def cable_string_to_type(text: str) -> Output:
        """The output with a key name, case-sensitive; `Output.NONE` for every other text, also for "QSVF" and
        "NULLCABLE"."""
        return Output(ask_integer(library.tarvik_cable_string_to_type, bytes_of(text)))

    @staticmethod
    def cable_type_to_string(output: int) -> str:
        """The key name of an output; empty for an unknown value."""
        return ask_text(library.tarvik_cable_type_to_string, number_of(output)) or ""

    @staticmethod
    def operation_string_to_type(text: str) -> Optional[Operation]:
        """The operation with a key name, in any case; None, after a message, for every other text."""
        return _operation(ask_integer(library.tarvik_operation_string_to_type, bytes_of(text)))

    @staticmethod
    def operation_display_string_to_type(text: str) -> Optional[Operation]:
        """The operation with a display name, in any case; None, after a message, for every other text."""
        return _operation(ask_integer(library.tarvik_operation_display_string_to_type, bytes_of(text)))

    @staticmethod
    def operation_type_to_string(operation: int) -> str:
        """The key name of an operation; empty, after a message, for an unknown value."""
        return ask_text(library.tarvik_operation_type_to_string, number_of(operation)) or ""

    @staticmethod
    def operation_type_to_display_string(operation: int) -> str:
        """The name by which an operation is shown to users; empty, after a message, for an unknown value.

        >>> tarvik.Manager.operation_type_to_display_string(tarvik.Operation.READIDCODE)
        'Get Device ID'
        """
        return ask_text(library.tarvik_operation_type_to_display_string, number_of(operation)) or ""

    @staticmethod
    def option_string_to_type(text: str) -> Option:
        """The programming option with a key name, case-sensitive, up to `Option.SECTOR_LOCKDOWN`. Every other text
        raises `DataMismatchException`."""
        return Option(ask_integer(library.tarvik_option_string_to_type, bytes_of(text)))

    @staticmethod
    def option_type_to_string(option: int) -> str:
        """The key name of a programming option. An unknown value raises `DataMismatchException`."""
        return ask_text(library.tarvik_option_type_to_string, number_of(option)) or ""

    @staticmethod
    def remove_package_name(device: str) -> str:
        """A device name up to its first "_".

        >>> tarvik.Manager.remove_package_name("KS50_PQ208")
        'KS50'
        """
        buffer = ctypes.create_string_buffer(bytes_of(device) or b"")
        call(library.tarvik_remove_package_name, buffer)
        return text_of(buffer.value)

    # ---- Checks

    @overload
    def check_constraints(self, *, mode: int, output: int) -> bool: ...
    @overload
    def check_constraints(self, *, mode: int, device: str, package: Optional[str] = None) -> bool: ...
    @overload
    def check_constraints(self, *, mode: int, output: int, device: str, package: Optional[str] = None) -> bool: ...
    @overload
    def check_constraints(self, *, mode: int, output: int, device: str, operation: int) -> bool: ...
    @overload
    def check_constraints(self, *, mode: int, device: str, operation: int) -> bool: ...

    def check_constraints(
        self,
        *,
        mode: int,
        output: Optional[int] = None,
        device: Optional[str] = None,
        package: Optional[str] = None,
        operation: Optional[int] = None,
    ) -> bool:
        """Can it be done? The arguments that are given decide what is asked:

        mode, output: can the mode use the output?
        mode, device[, package]: can the device be configured in the mode?
        mode, output, device[, package]: both of these?
        mode, output, device, operation: can the operation run on the device, in the mode, through the output?
        mode, device, operation: does the device's property with the name of the operation list the mode?

        >>> manager.check_constraints(mode=tarvik.Mode.BS, output=tarvik.Output.USB2, device="KS50")
        True
        """
        mode = number_of(mode)
        name = bytes_of(device)
        if operation is not None and device is not None and package is None:
            operation = number_of(operation)
            if output is None:
                return ask_flag(library.tarvik_check_operation_property, name, mode, operation, None)
            return ask_flag(library.tarvik_check_operation, mode, number_of(output), name, operation, None)
        if operation is None and device is not None:
            if output is None:
                return ask_flag(library.tarvik_check_device, mode, name, bytes_of(package))
            return ask_flag(
                library.tarvik_check_output_and_device, mode, number_of(output), name, bytes_of(package)
            )
        if operation is None and package is None and output is not None:
            return ask_flag(library.tarvik_check_output, mode, number_of(output))
        raise TypeError("check_constraints takes no such combination of arguments")

    # ---- What a device offers

    def get_device_operations(self, device: str, mode: int, output: int) -> FrozenSet[Operation]:
        """The operations that the device offers in the mode through the output.

        >>> names = [operation.name for operation in manager.get_device_operations("CW256K", 0, 2)]
        >>> "BLANKCHECK" in names
        True
        """
        return _operations(
            ask_mask(library.tarvik_get_device_operations, bytes_of(device), number_of(mode), number_of(output))
        )

    def get_program_options(
        self, device: str, mode: int, output: int, package: Optional[str] = None
    ) -> FrozenSet[Option]:
        """The programming options that the device, or the device in that package, has in the mode through the
        output."""
        return _options(
            ask_mask(
                library.tarvik_get_program_options,
                bytes_of(device),
                number_of(mode),
                number_of(output),
                bytes_of(package),
            )
        )

    def get_bsdl_operations(self, device: str, output: int) -> FrozenSet[Operation]:
        """The operations that the device offers by boundary scan alone."""
        return _operations(ask_mask(library.tarvik_get_bsdl_operations, bytes_of(device), number_of(output)))

    def get_device_operation_options(self, device: str, operation: str, mode: int) -> Tuple[str, ...]:
        """The names of the options that an operation of the device has in the mode, in byte order. The operation is
        a key name, as properties spell it."""
        return ask_texts(
            library.tarvik_get_device_operation_options, bytes_of(device), bytes_of(operation), number_of(mode)
        )

    # ---- Properties of devices

    def get_device_string_properties(self, device: str, key: str) -> Tuple[str, ...]:
        """All values of a property of the device, or of its family, in byte order; empty if there are none."""
        return ask_texts(library.tarvik_get_device_string_properties, bytes_of(device), bytes_of(key))

    def get_device_string_property(self, device: str, key: str) -> Optional[str]:
        """The value of a property; if there are several, the smallest in byte order. If there is none, raises
        `DataNotFoundException`, or returns None while exceptions are off."""
        return ask_text(library.tarvik_get_device_string_property, bytes_of(device), bytes_of(key))

    def get_device_bool_property(self, device: str, key: str) -> bool:
        """Is "TRUE" among the values of a property? False if there is no such property."""
        return ask_flag(library.tarvik_get_device_bool_property, bytes_of(device), bytes_of(key))

    def get_device_long_property(self, device: str, key: str) -> int:
        """The value of a property as a decimal number; 0 for a text that is no number. If there is none, raises
        `DataNotFoundException`, or returns -1 while exceptions are off."""
        return ask_number(library.tarvik_get_device_long_property, bytes_of(device), bytes_of(key))

    # ---- Families

    def get_part_family(self, device: str) -> str:
        """The family of a device; "spi" for an SPI flash, "base" for an unknown device.

        >>> manager.get_part_family("KS50")
        'kestrel'
        """
        return ask_text(library.tarvik_get_part_family, bytes_of(device)) or ""

    def add_cached_device_family(self, device: str, family: str) -> None:
        """Sets the family of a device, unless the family that was resolved last is itself cached as a device."""
        call(library.tarvik_add_cached_device_family, bytes_of(device), bytes_of(family))

    def is_korvel_device(self, device: str) -> bool:
        """Is the device known?"""
        return ask_flag(library.tarvik_is_korvel_device, bytes_of(device))

    def get_all_device_idcodes(self) -> Dict[str, str]:
        """The IDCODE of each device, both as the database spells them, in byte order of the devices.

        >>> manager.get_all_device_idcodes()["KS50"]
        '0xX4104FB7'
        """
        return ask_map(library.tarvik_get_all_device_idcodes)

    # ---- SPI flash

    def is_spi_device(self, device: str) -> bool:
        """Is the name an SPI flash or an SPI flash family, in any case?"""
        return ask_flag(library.tarvik_is_spi_device, bytes_of(device))

    # `property` is the builtin: the argument has another name than in C.
    def get_spi_device_string_property(self, device: str, key: str) -> str:
        """A property of an SPI flash, or of its class; empty if there is none. Case does not matter."""
        return ask_text(library.tarvik_get_spi_device_string_property, bytes_of(device), bytes_of(key)) or ""

    def get_spi_device_bool_property(self, device: str, key: str) -> bool:
        """Is a property of an SPI flash "true", in any case? False if there is none."""
        return ask_flag(library.tarvik_get_spi_device_bool_property, bytes_of(device), bytes_of(key))

    def get_spi_device_long_property(self, device: str, key: str) -> int:
        """A property of an SPI flash as a decimal number; 0 if there is none."""
        return ask_number(library.tarvik_get_spi_device_long_property, bytes_of(device), bytes_of(key))

    # ---- Multiboot

    def is_mb_bpi_spi_support(self, device: str, type_prefix: str, width: str, lead: bool) -> bool:
        """Does the device support a multiboot arrangement? Case does not matter.

        Args:
            device: the device
            type_prefix: "TYPE_BPI", "TYPE_MB_SPI", "TYPE_MB_BPI" or "TYPE_MB_QPRM"
            width: "SERIAL", "PARALLEL" or "NONE"
            lead: True for the lead device of the chain, False for a device further down
        """
        return ask_flag(
            library.tarvik_is_mb_bpi_spi_support, bytes_of(device), bytes_of(type_prefix), bytes_of(width), bool(lead)
        )

    # ---- Dumps for smoke tests: what the tables hold by now

    def dump_operations_table(self, *, as_messages: bool = False) -> str:
        """The operations of all families, as a table; with `as_messages`, empty, after messages with its pieces."""
        return _dump(library.tarvik_dump_operations_table, as_messages)

    def dump_bsdl_operations_table(self, *, as_messages: bool = False) -> str:
        """The boundary-scan operations of all families, likewise."""
        return _dump(library.tarvik_dump_bsdl_operations_table, as_messages)

    def dump_program_options_table(self, *, as_messages: bool = False) -> str:
        """The programming options of all option packages, likewise."""
        return _dump(library.tarvik_dump_program_options_table, as_messages)

    def dump_cached_device_families(self, *, as_messages: bool = False) -> str:
        """The family of each device that was resolved or set, likewise."""
        return _dump(library.tarvik_dump_cached_device_families, as_messages)

    def dump_mb_bpi_spi(self) -> None:
        """Issues messages with the devices of each multiboot type."""
        call(library.tarvik_dump_mb_bpi_spi)


def _operation(value: int) -> Optional[Operation]:
    return Operation(value) if value < len(Operation) else None


def _dump(function: Any, as_messages: bool) -> str:
    if as_messages:
        call(function, None)
        return ""
    return ask_text(function) or ""
