"""Finds and loads libtarvik, declares its functions, and converts texts and numbers."""

import ctypes
import operator
import os
import sys
import threading
from ctypes import POINTER, c_char_p, c_int, c_size_t, c_void_p
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

# The arguments of those functions whose callers pass sizes, structures or functions. All others are given nothing but
# bytes, numbers that `number_of` has checked, and pointers to results: to declare them would double the time of a call.
_ARGUMENTS: Dict[str, Tuple[object, ...]] = {
    "set_search_path": (POINTER(c_char_p), c_size_t),
    "set_memory_files": (POINTER(MemoryFile), c_size_t),
    "set_message_callback": (CALLBACK, c_void_p),
    "get_operation_orders": (POINTER(c_int), c_size_t, POINTER(c_size_t)),
    "get_program_option_orders": (POINTER(c_int), c_size_t, POINTER(c_size_t)),
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
    library.tarvik_text_set_next.restype = c_char_p
    library.tarvik_text_map_next.restype = c_char_p
    for name, arguments in _ARGUMENTS.items():
        getattr(library, "tarvik_" + name).argtypes = arguments


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
    if text is None:
        return ""
    try:
        return text.decode()  # by far the most; with an error handler it takes twice as long
    except UnicodeDecodeError:
        return text.decode("utf-8", "surrogateescape")


def bytes_of(text: Optional[str]) -> Optional[bytes]:
    """A text for the library; None for its null."""
    if text is None:
        return None
    try:
        encoded = text.encode()
    except UnicodeEncodeError:
        encoded = text.encode("utf-8", "surrogateescape")
    except AttributeError:
        raise TypeError(f"a text must be a str, not {type(text).__name__}") from None
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
