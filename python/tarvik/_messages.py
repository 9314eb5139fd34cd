"""Messages of the library, and how a status becomes an exception."""

import atexit
import logging
from typing import Any, Callable, List, NamedTuple, NoReturn, Optional

from . import _errors
from ._enumerations import Channel, Status
from ._library import CALLBACK, library, lock, text_of


class Message(NamedTuple):
    """One message of the library."""

    channel: Channel
    line: int
    text: str
    product: str
    source: str
    revision: str


MessageCallback = Callable[[Message], object]

_LOGGER = logging.getLogger("tarvik")
_LEVELS = {Channel.INFO: logging.INFO, Channel.STATUS: logging.INFO, Channel.DEBUG: logging.DEBUG}


def _log(message: Message) -> None:
    level = _LEVELS[message.channel]
    if _LOGGER.isEnabledFor(level):
        _LOGGER.log(level, "%s", message.text.rstrip("\n"), extra={"tarvik": message})


_callback: MessageCallback = _log

# What callbacks raised during the current call. They must not raise into the library: it is raised after the call.
raised: List[BaseException] = []


def _receive(pointer: Any, _context: Optional[int]) -> None:
    try:
        message = pointer.contents
        _callback(
            Message(
                Channel(message.channel),
                message.line,
                text_of(message.text),
                text_of(message.product),
                text_of(message.source),
                text_of(message.revision),
            )
        )
    except BaseException as error:  # pylint: disable=broad-except
        raised.append(error)


# The library keeps this function: it must live as long as that does.
_RECEIVE = CALLBACK(_receive)


def set_message_callback(callback: Optional[MessageCallback]) -> None:
    """Sends all messages to a function from now on; None restores the default.

    By default messages go to the logger "tarvik": notices and status lines with level INFO, trace output with level
    DEBUG. The record's attribute `tarvik` is the `Message`.

    The function is called in the middle of the call that issues the message. It cannot use the manager: that raises
    `StateError`. What it raises is raised by that call, after the manager has completed it.

    >>> reasons = []
    >>> tarvik.set_message_callback(lambda message: reasons.append(message.text))
    >>> manager.check_constraints(mode=tarvik.Mode.BS, output=tarvik.Output.STAPL)
    False
    >>> reasons
    ['Stapl is not supported in Boundary Scan mode\\n']
    >>> tarvik.set_message_callback(None)
    """
    global _callback  # pylint: disable=global-statement
    if callback is not None and not callable(callback):
        raise TypeError("a message callback must be callable")
    with lock:
        _callback = _log if callback is None else callback


_EXCEPTIONS = {
    Status.DATA_MISMATCH: _errors.DataMismatchException,
    Status.OUT_OF_RANGE: _errors.OutOfRangeException,
    Status.DATA_NOT_FOUND: _errors.DataNotFoundException,
}
_STATE_ERRORS = (Status.TOO_LATE, Status.REMOVED, Status.BUSY)


def _exception(status: int) -> Exception:
    """The exception that a status stands for."""
    error = library.tarvik_last_error().contents
    text = text_of(error.text)
    if status == Status.NO_MEMORY:
        return MemoryError(text)
    if status in _STATE_ERRORS:
        return _errors.StateError(text)
    if status in _EXCEPTIONS or error.line != 0:
        return _EXCEPTIONS.get(Status(status), _errors.TarvikException)(
            text, error.line, text_of(error.product), text_of(error.source), text_of(error.revision)
        )
    return RuntimeError(text)


def fail(status: int) -> NoReturn:
    """Raises what a callback raised, otherwise what the status stands for."""
    if not raised:
        raise _exception(status)
    error = raised[0]
    raised.clear()
    if status != Status.OK:
        raise error from _exception(status)
    raise error


def _start() -> None:
    library.tarvik_set_message_callback(_RECEIVE, None)
    # No message may reach an interpreter that has ended.
    atexit.register(library.tarvik_set_message_callback, CALLBACK(0), None)


_start()
