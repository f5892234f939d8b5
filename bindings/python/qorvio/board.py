"""Boards: cores of FPGAs and their signals by name."""

import atexit
import os
import weakref
from typing import Any, Callable, Dict, Iterator, List, Mapping, NamedTuple, Optional, Tuple, TypeVar, Union

from qorvio import _qorvio
from qorvio._qorvio import Condition, Frame, Signal
from qorvio.errors import Error, UsageError
from qorvio.sampling import Sampling

T = TypeVar("T")

_open_sessions: "weakref.WeakSet[_qorvio._Session]" = weakref.WeakSet()


@atexit.register
def _close_all() -> None:
    for session in list(_open_sessions):
        session.close()


class Edge(NamedTuple):
    """An input that moved."""

    time: float
    """Seconds since `edges()` was called, of the poll that saw it."""
    signal: str
    rose: bool
    fell: bool
    """Both, when it did both between two polls."""


class Names:
    """Signals by attribute, `names.leds`, or by item, `names["leds"]`, which can be slices: `names["leds[3:0]"]`."""

    _session: _qorvio._Session
    _direction: str
    _core: str

    def __init__(self, session: _qorvio._Session, direction: str = "", core: str = "") -> None:
        self.__dict__.update(_session=session, _direction=direction, _core=core)

    def __getitem__(self, name: str) -> "Signal[Any]":
        session, core = self._session, self._core
        if core and (core, name) in self._short:
            name = f"{core}/{name}"
        signal: Signal[Any] = session.signal(name, self._direction)
        if core and signal.core != core:
            raise UsageError(f"not a signal of core {core}, but of {signal.core}: {name}")
        return signal

    def __getattr__(self, name: str) -> "Signal[Any]":
        if name.startswith("__"):
            raise AttributeError(name)
        signal = self[name]
        self.__dict__[name] = signal
        return signal

    def __setattr__(self, name: str, value: object) -> None:
        raise UsageError(f"a signal is given a value by .value: {name}.value = {value!r}")

    def __dir__(self) -> List[str]:
        return [*super().__dir__(), *self]

    def __iter__(self) -> Iterator[str]:
        """The names: those of the signals file, else of the whole ports; each once."""
        wanted = {"input": (True,), "output": (False,)}.get(self._direction, (True, False))
        rows = self._session.signals(bool(self._core))
        names = (name for name, is_input, core in rows if is_input in wanted and self._core in ("", core))
        return iter(dict.fromkeys(name.rpartition(f"{self._core}/")[2] if self._core else name for name in names))

    @property
    def _short(self) -> Dict[Tuple[str, str], None]:
        """Whole ports of further cores, which the engine knows with the core's address before their names."""
        rows = self._session.signals(True)
        return {(core, name[len(core) + 1 :]): None for name, _, core in rows if name.startswith(f"{core}/")}


class Core(Names):
    """A core of a board, and its signals: `core.inputs`, `core.outputs`, `core.leds`."""

    address: str
    version: Tuple[int, int]
    widths: Dict[str, int]
    """In bits, of "async_out", "sync_out", "async_in" and "sync_in"."""
    inputs: Names
    outputs: Names

    def __init__(self, session: _qorvio._Session, address: str, version: Tuple[int, int], widths: Dict[str, int]) -> None:
        super().__init__(session, core=address)
        names = {"inputs": Names(session, "input", address), "outputs": Names(session, "output", address)}
        self.__dict__.update(address=address, version=version, widths=widths, **names)

    def __repr__(self) -> str:
        widths = ", ".join(f"{port} {width}" for port, width in self.widths.items())
        return f"<qorvio.Core {self.address}: version {self.version[0]}.{self.version[1]}, {widths}>"


class Board(Names):
    """A board: `board.leds` or `board["leds[3]"]` is a Signal, that of the input where an output has the same name.

    Made by `qorvio.open`, and closed at the end of its `with` block. Threads can share it: one that waits lets others
    read and write between two polls.
    """

    inputs: Names
    """The signals that can be read."""
    outputs: Names
    """The signals that can be written."""
    cores: Mapping[str, Core]
    """The cores by address: `board.cores["0.1.0"]`."""

    def __init__(self, session: _qorvio._Session) -> None:
        super().__init__(session)
        _open_sessions.add(session)
        cores = {address: Core(session, address, *about) for address, about in session.cores().items()}
        self.__dict__.update(inputs=Names(session, "input"), outputs=Names(session, "output"), cores=cores)

    def __enter__(self) -> "Board":
        return self

    def __exit__(self, *_: object) -> None:
        self.close()

    def close(self) -> None:
        """Closes the link, once what other threads wait for has been ended. Closing again does nothing."""
        self._session.close()

    @property
    def closed(self) -> bool:
        """Whether the link is closed."""
        return self._session.is_closed

    @property
    def url(self) -> str:
        """Of the cable."""
        return self._session.url

    def read(self) -> Frame:
        """All inputs, in one exchange per core, with what moved since the read before. Raises LinkError."""
        return self._session.frame(True)

    def write(self, values: Optional[Mapping[str, Any]] = None, /, **more: Any) -> None:
        """Gives outputs their values, in one exchange per core: `write(leds=0x35, go=1)`, `write({"leds[3]": 1})`.

        A value is what `Signal.value` can be set to, or `pulse()` or `train()` for a synchronous output. Raises
        UsageError and UnknownSignal, with nothing sent, and LinkError.
        """
        self._session.write({**values, **more} if values else more)

    def condition(self, text: str) -> Condition:
        """A condition from a text: "state == RUN && level > 3 V", "fault rises || !ready". Raises UsageError."""
        return self._session.condition(text)

    def wait_for(self, condition: Union[Condition, "Signal[Any]", str], timeout: Optional[float] = None) -> Frame:
        """Polls until the condition is true, for `timeout` seconds or for ever; the frame of that poll.

        A signal alone is true unless it is 0; a text is what `condition()` takes. Edges count from the last poll before
        the wait on, so that none between a write and its wait is lost; `read()` reports them once more. Raises Timeout,
        with what was seen last, UsageError and LinkError.
        """
        return self._session.wait_for(condition, timeout)

    def edges(self, *names: str, timeout: Optional[float] = None, rate: Optional[float] = None) -> Iterator[Edge]:
        """Each input of those names that moves, poll after poll; without names each of the signals file.

        From the call on, and from the last poll before it, for `timeout` seconds in all or for ever. `rate` is how often
        to poll, a second; as often as the link can without one. Raises LinkError.
        """
        polls = _until_none(self._watch(names, timeout, rate).edges)
        return (Edge(time, *moved) for time, moves in polls for moved in moves)

    def watch(self, *names: str, timeout: Optional[float] = None, rate: Optional[float] = None) -> Iterator[Frame]:
        """A frame now, then one of each poll in which an input of those names moved; without names any input.

        For `timeout` seconds in all or for ever. `rate` is how often to poll, a second; as often as the link can without
        one. The frames have what moved since the frame before. Raises LinkError.
        """
        return _until_none(self._watch(names, timeout, rate).frame)

    def _watch(self, names: Tuple[str, ...], timeout: Optional[float], rate: Optional[float]) -> _qorvio._Watch:
        return _qorvio._Watch(self._session, names, timeout, _period(rate))

    def sample(
        self, *names: str, count: Optional[int] = None, time: Optional[float] = None, rate: Optional[float] = None
    ) -> Sampling:
        """Polls inputs `count` times, or for `time` seconds, into arrays of numpy: `sampling.state`, `sampling.time`.

        `rate` is how often, a second; as often as the link can without one. Without names every input of the signals
        file. Raises UsageError when it has no end, and LinkError, with nothing kept.
        """
        if not count and not time:
            raise UsageError("a sampling needs a count or a time")
        return Sampling(_qorvio._Sampling(self._session, names, count or 0, time or 0, _period(rate)), self.inputs)

    def __repr__(self) -> str:
        if self.closed:
            return f"<qorvio.Board {self.url}, closed>"
        try:
            return repr(self._session.frame(False))
        except Error as error:
            return f"<qorvio.Board {self.url}: {error}>"

    def _repr_html_(self) -> Optional[str]:
        return None if self.closed else self._session.frame(False)._repr_html_()


def _until_none(call: Callable[[], Optional[T]]) -> Iterator[T]:
    while (found := call()) is not None:
        yield found


def _period(rate: Optional[float]) -> float:
    if rate is None:
        return 0
    if not 0 < rate < float("inf"):
        raise UsageError(f"a rate is more than 0 a second: {rate}")
    return 1 / rate


def open(
    cable: Optional[Any] = None,
    signals: Union[str, "os.PathLike[str]", None] = None,
    *,
    core: str = "",
    remember: bool = False,
) -> Board:
    """Opens a board on a cable: a URL such as "sim:", "rbb:HOST:PORT" or "openocd:HOST:PORT", or a `qorvio.sim` board.

    `signals` is the path of a signals file; without one there are the whole ports of one core, `async_in_data` and so on.
    Where they are not given, cable and signals are those of the environment: QORVIO_CABLE, QORVIO_SIGNALS. `core` is the
    core, "0.1.0", of signals whose file names none; the first one without it. With `remember` the outputs are remembered
    where the command line does, from run to run. Raises UsageError and LinkError.
    """
    if cable is None:
        cable = os.environ.get("QORVIO_CABLE", "")
        if not cable:
            raise UsageError("no cable: give one, or set QORVIO_CABLE")
    path = os.fspath(signals) if signals is not None else os.environ.get("QORVIO_SIGNALS", "")
    if hasattr(cable, "_open"):
        session: _qorvio._Session = cable._open(path, core)
        return Board(session)
    return Board(_qorvio._Session(os.fspath(cable), path, core, remember))
