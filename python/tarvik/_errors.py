"""The exceptions of the package."""


class TarvikException(Exception):
    """A failure of the library, with its location.

    Attributes:
        cause: what went wrong: the exception, its location, and the value that was read last from the database, with
            its file, line and column
        line: the location number of the exception, as the C++ library and its documentation give it
        product, source, revision: of the code that raised it
    """

    def __init__(self, cause: str, line: int = 0, product: str = "", source: str = "", revision: str = "") -> None:
        # All arguments go to the base, so that the exception can be pickled and crosses processes.
        super().__init__(cause, line, product, source, revision)
        self.cause = cause
        self.line = line
        self.product = product
        self.source = source
        self.revision = revision

    def __str__(self) -> str:
        return self.cause


class LogicException(TarvikException):
    """A failure of the data or of the call, rather than of the machine."""


class DataMismatchException(LogicException):
    """A record of the database does not have the form it must have, or a name is no programming option."""


class OutOfRangeException(LogicException):
    """A value or a name is in no list, such as a device whose family is not supported."""


class DataNotFoundException(LogicException):
    """Data is missing, such as a property that a device does not have, or a file cannot be read."""


class StateError(RuntimeError):
    """A call at the wrong time: a second database in one process, a manager that was removed, or a manager that is
    used by a message callback."""


class LibraryNotFoundError(ImportError):
    """The shared library cannot be loaded. The text lists every place that was tried, and why it failed."""
