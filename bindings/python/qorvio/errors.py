"""What qorvio raises. The messages are the library's own."""


class Error(Exception):
    """The base of all of them."""


class LinkError(Error, OSError):
    """The device, the link or a file that was being written failed."""


class UsageError(Error, ValueError):
    """A value, file or option that cannot be used. Nothing was sent."""


class UnknownSignal(Error, AttributeError):
    """No signal of that name; the message gives the nearest one, if one is near."""


class Timeout(Error, TimeoutError):
    """What was waited for did not come in time; the message says what was seen last."""
