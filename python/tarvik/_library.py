"""Finds and loads libtarvik, declares its functions, and converts texts and numbers."""

import ctypes
import operator
import os
import sys
import threading
from ctypes import POINTER, c_char_p, c_int, c_int32, c_size_t, c_uint32, c_void_p
from pathlib import Path
from typing import Dict, Iterator, List, Optional, Tuple

from ._errors import LibraryNotFoundError

MAJOR_VERSION = 1

if sys.platform == "win32":
    _FILE_NAME = "libtarvik.dll"
elif sys.platform == "darwin":
    _FILE_NAME = f"libtarvik.{MAJOR_VERSION}.dylib"
else:
    _FILE_NAME = f"libtarvik.so.{MAJOR_VERSION}"

_PACKAGE = Path(__file__).resolve().parent


class Error(ctypes.Structure):
    """`tarvik_error`"""

    _fields_ = [
        ("status", c_int),
        ("line", c_int),
        ("type", c_char_p),
        ("product", c_char_p),
        ("source", c_char_p),
        ("revision", c_char_p),
        ("text", c_char_p),
    ]


class CMessage(ctypes.Structure):
    """`tarvik_message`"""

    _fields_ = [
        ("channel", c_int),
        ("line", c_int),
        ("product", c_char_p),
        ("source", c_char_p),
        ("revision", c_char_p),
        ("text", c_char_p),
    ]


class MemoryFile(ctypes.Structure):
    """`tarvik_memory_file`"""

    _fields_ = [("name", c_char_p), ("text", c_char_p), ("length", c_size_t)]


class Position(ctypes.Structure):
    """`tarvik_iterator`"""

    _fields_ = [("position", c_void_p)]


CALLBACK = ctypes.CFUNCTYPE(None, POINTER(CMessage), c_void_p)

# The arguments of each function that returns a status.
_TEXT_RESULT = POINTER(c_char_p)
_INT_RESULT = POINTER(c_int)
_MASK_RESULT = POINTER(c_uint32)
_NUMBER_RESULT = POINTER(c_int32)
_COLLECTION_RESULT = POINTER(c_void_p)
_STATUS_FUNCTIONS: Dict[str, Tuple[object, ...]] = {
    "set_search_path": (POINTER(c_char_p), c_size_t),
    "set_memory_files": (POINTER(MemoryFile), c_size_t),
    "set_message_callback": (CALLBACK, c_void_p),
    "get_constraints_manager": (),
    "remove_constraints_manager": (),
    "set_exceptions": (c_int,),
    "get_operation_orders": (_INT_RESULT, c_size_t, POINTER(c_size_t)),
    "get_program_option_orders": (_INT_RESULT, c_size_t, POINTER(c_size_t)),
    "mode_string_to_type": (c_char_p, _INT_RESULT),
    "mode_type_to_string": (c_int, _TEXT_RESULT),
    "cable_string_to_type": (c_char_p, _INT_RESULT),
    "cable_type_to_string": (c_int, _TEXT_RESULT),
    "operation_string_to_type": (c_char_p, _INT_RESULT),
    "operation_display_string_to_type": (c_char_p, _INT_RESULT),
    "operation_type_to_string": (c_int, _TEXT_RESULT),
    "operation_type_to_display_string": (c_int, _TEXT_RESULT),
    "option_string_to_type": (c_char_p, _INT_RESULT),
    "option_type_to_string": (c_int, _TEXT_RESULT),
    "remove_package_name": (c_char_p,),
    "check_output": (c_int, c_int, _INT_RESULT),
    "check_device": (c_int, c_char_p, c_char_p, _INT_RESULT),
    "check_output_and_device": (c_int, c_int, c_char_p, c_char_p, _INT_RESULT),
    "check_operation": (c_int, c_int, c_char_p, c_int, c_char_p, _INT_RESULT),
    "check_operation_property": (c_char_p, c_int, c_int, c_char_p, _INT_RESULT),
    "get_device_operations": (c_char_p, c_int, c_int, _MASK_RESULT),
    "get_program_options": (c_char_p, c_int, c_int, c_char_p, _MASK_RESULT),
    "get_bsdl_operations": (c_char_p, c_int, _MASK_RESULT),
    "get_device_operation_options": (c_char_p, c_char_p, c_int, _COLLECTION_RESULT),
    "get_device_string_properties": (c_char_p, c_char_p, _COLLECTION_RESULT),
    "get_device_string_property": (c_char_p, c_char_p, _TEXT_RESULT),
    "get_device_bool_property": (c_char_p, c_char_p, _INT_RESULT),
    "get_device_long_property": (c_char_p, c_char_p, _NUMBER_RESULT),
    "get_part_family": (c_char_p, _TEXT_RESULT),
    "add_cached_device_family": (c_char_p, c_char_p),
    "is_korvel_device": (c_char_p, _INT_RESULT),
    "get_all_device_idcodes": (_COLLECTION_RESULT,),
    "is_spi_device": (c_char_p, _INT_RESULT),
    "get_spi_device_string_property": (c_char_p, c_char_p, _TEXT_RESULT),
    "get_spi_device_bool_property": (c_char_p, c_char_p, _INT_RESULT),
    "get_spi_device_long_property": (c_char_p, c_char_p, _NUMBER_RESULT),
    "is_mb_bpi_spi_support": (c_char_p, c_char_p, c_char_p, c_int, _INT_RESULT),
    "dump_operations_table": (_TEXT_RESULT,),
    "dump_bsdl_operations_table": (_TEXT_RESULT,),
    "dump_program_options_table": (_TEXT_RESULT,),
    "dump_cached_device_families": (_TEXT_RESULT,),
    "dump_mb_bpi_spi": (),
}


def _places() -> Iterator[str]:
    """Where the library is looked for, in order. One that is named explicitly is the only place."""
    named = os.environ.get("TARVIK_LIBRARY")
    if named:
        yield named
    else:
        yield str(_PACKAGE / "lib" / _FILE_NAME)
        yield _FILE_NAME


def _declare(library: ctypes.PyDLL) -> None:
    library.tarvik_version.restype = c_char_p
    library.tarvik_last_error.restype = POINTER(Error)
    for name, arguments in _STATUS_FUNCTIONS.items():
        getattr(library, "tarvik_" + name).argtypes = arguments
    library.tarvik_text_set_next.argtypes = (c_void_p, POINTER(Position))
    library.tarvik_text_set_next.restype = c_char_p
    library.tarvik_text_map_next.argtypes = (c_void_p, POINTER(Position), _TEXT_RESULT)
    library.tarvik_text_map_next.restype = c_char_p


def _load() -> ctypes.PyDLL:
    failures: List[str] = []
    for place in _places():
        try:
            # Calls take microseconds: to release the interpreter's lock for each would cost more than it gives.
            library = ctypes.PyDLL(place)
            _declare(library)
            found = text_of(library.tarvik_version())
        except (OSError, AttributeError) as error:
            failures.append(f"{place}: {error}")
            continue
        if found.split(".")[0] == str(MAJOR_VERSION):
            return library
        failures.append(f"{place}: has version {found}, but version {MAJOR_VERSION} is needed")
    raise LibraryNotFoundError(
        "the library of the constraints manager cannot be loaded. Tried:\n"
        + "".join(f"  {failure}\n" for failure in failures)
        + "The environment variable TARVIK_LIBRARY can name the file."
    )


def text_of(text: Optional[bytes]) -> str:
    """A text of the library. Bytes that are no UTF-8 become lone surrogates, as in file names."""
    return "" if text is None else text.decode("utf-8", "surrogateescape")


def bytes_of(text: Optional[str]) -> Optional[bytes]:
    """A text for the library; None for its null."""
    if text is None:
        return None
    encoded = str.encode(text, "utf-8", "surrogateescape")
    if b"\0" in encoded:
        raise ValueError("embedded null character")
    return encoded


def number_of(value: int) -> int:
    """A number for the library, which takes 32 bits; ctypes would cut a larger one silently."""
    number = operator.index(value)
    if -0x80000000 <= number <= 0x7FFFFFFF:
        return number
    raise OverflowError(f"{number} does not fit into 32 bits")


library = _load()

# Held while the library is called: it takes no lock, and a message callback lets other threads run.
lock = threading.RLock()


def version() -> str:
    """The version of the library.

    >>> tarvik.version().split(".")[0]
    '1'
    """
    return text_of(library.tarvik_version())


def demonstration() -> Path:
    """The directory of the demonstration database: invented devices, to try the package with.

    Raises FileNotFoundError, with the places that were tried, if it is not installed.
    """
    tried = [_PACKAGE, Path(sys.prefix), Path("/usr/local"), Path("/usr")]
    for prefix in tried:
        directory = prefix / "share" / "tarvik" / "demonstration"
        if directory.is_dir():
            return directory
    raise FileNotFoundError(
        "the demonstration database is not installed in " + ", ".join(f"{prefix}/share/tarvik" for prefix in tried)
    )
