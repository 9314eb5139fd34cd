"""Calls of the library: each writes its result to a place of its type, and a failure becomes an exception."""

import ctypes
from typing import Any, Dict, List, Optional, Tuple

from ._library import Position, library, lock, text_of
from ._messages import fail, raised

# Where the library writes its results; used under the lock.
_text = ctypes.c_char_p()
_number = ctypes.c_int32()
_mask = ctypes.c_uint32()
_collection = ctypes.c_void_p()
_integer = ctypes.c_int()
_TEXT = ctypes.byref(_text)
_NUMBER = ctypes.byref(_number)
_MASK = ctypes.byref(_mask)
_COLLECTION = ctypes.byref(_collection)
_INTEGER = ctypes.byref(_integer)


def _check(status: int) -> None:
    if status or raised:
        fail(status)


def call(function: Any, *arguments: Any) -> None:
    with lock:
        _check(function(*arguments))


def ask_flag(function: Any, *arguments: Any) -> bool:
    with lock:
        status = function(*arguments, _INTEGER)
        if status or raised:
            fail(status)
        return _integer.value != 0


def ask_integer(function: Any, *arguments: Any) -> int:
    with lock:
        status = function(*arguments, _INTEGER)
        if status or raised:
            fail(status)
        return _integer.value


def ask_number(function: Any, *arguments: Any) -> int:
    with lock:
        status = function(*arguments, _NUMBER)
        if status or raised:
            fail(status)
        return _number.value


def ask_mask(function: Any, *arguments: Any) -> int:
    with lock:
        status = function(*arguments, _MASK)
        if status or raised:
            fail(status)
        return _mask.value


def ask_text(function: Any, *arguments: Any) -> Optional[str]:
    with lock:
        status = function(*arguments, _TEXT)
        if status or raised:
            fail(status)
        value = _text.value
    return None if value is None else text_of(value)


def ask_texts(function: Any, *arguments: Any) -> Tuple[str, ...]:
    with lock:
        _check(function(*arguments, _COLLECTION))
        reference = ctypes.byref(Position())
        texts: List[str] = []
        while (text := library.tarvik_text_set_next(_collection, reference)) is not None:
            texts.append(text_of(text))
    return tuple(texts)


def ask_map(function: Any) -> Dict[str, str]:
    entries: Dict[str, str] = {}
    with lock:
        _check(function(_COLLECTION))
        reference = ctypes.byref(Position())
        while (key := library.tarvik_text_map_next(_collection, reference, _TEXT)) is not None:
            entries[text_of(key)] = text_of(_text.value)
    return entries


def ask_orders(function: Any) -> List[int]:
    values = (ctypes.c_int * 32)()
    count = ctypes.c_size_t()
    call(function, values, len(values), ctypes.byref(count))
    return values[: count.value]
