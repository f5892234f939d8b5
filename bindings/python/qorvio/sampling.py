"""Recordings in memory."""

import functools
import tempfile
from typing import TYPE_CHECKING, Any, List, Mapping, Optional

from qorvio import _qorvio

if TYPE_CHECKING:
    import numpy
    import pandas

_ROSE, _FELL = 1, 2


class Sampling:
    """Polls of inputs, as arrays of numpy with one element a poll: `sampling.time`, `sampling.state`.

    An input is an array of integers of 1, 2, 4 or 8 bytes; with a scale of floats, in its unit; of more than 64 bits of
    uint8, in rows of bytes, lowest first. They are views where they can be: not to be written.
    """

    def __init__(self, data: _qorvio._Sampling, signals: Any) -> None:
        self._data = data
        self._names = data.names()
        self._signals = {name: signals[name] for name in self._names}
        self._places = {name: i for i, name in enumerate(self._names)}

    @functools.cached_property
    def time(self) -> "numpy.ndarray[Any, Any]":
        """Seconds since the sampling began, of each poll."""
        import numpy

        return numpy.multiply(numpy.frombuffer(self._data.nanoseconds(), numpy.int64), 1e-9)

    @property
    def missed(self) -> "numpy.ndarray[Any, Any]":
        """How many polls the rate asked for, and the link was too slow for, before each poll."""
        import numpy

        return numpy.frombuffer(self._data.missed(), numpy.uint64)

    def __getattr__(self, name: str) -> "numpy.ndarray[Any, Any]":
        if name.startswith("_"):
            raise AttributeError(name)
        values = self[name]
        self.__dict__[name] = values
        return values

    def __getitem__(self, name: str) -> "numpy.ndarray[Any, Any]":
        import numpy

        place, signal = self._place(name), self._signals[name]
        each = self._data.bytes_each(place)
        values = numpy.frombuffer(self._data.values(place), numpy.uint8)
        if each > 8:
            return values.reshape(-1, each)
        integers = _integers(values.reshape(-1, each), signal.width if self._data.is_signed(place) else 0)
        return numpy.multiply(integers, signal.scale) if signal.scale else integers

    def rose(self, name: str) -> "numpy.ndarray[Any, Any]":
        """Of each poll, whether any bit of the input rose since the poll before."""
        return _has(self._moves(name), _ROSE)

    def fell(self, name: str) -> "numpy.ndarray[Any, Any]":
        """Of each poll, whether any bit of the input fell since the poll before."""
        return _has(self._moves(name), _FELL)

    def _moves(self, name: str) -> "numpy.ndarray[Any, Any]":
        import numpy

        return numpy.frombuffer(self._data.moves(self._place(name)), numpy.uint8)

    def _place(self, name: str) -> int:
        if name in self._places:
            return self._places[name]
        from qorvio.errors import UnknownSignal

        raise UnknownSignal(f"not one of the inputs that were sampled, {', '.join(self._names)}: {name}")

    def to_vcd(self, path: Optional[str] = None) -> Optional[str]:
        """Writes a value change dump, as `qorvio record` does; without a path its text is returned. Raises LinkError."""
        if path is not None:
            self._data.save(str(path))
            return None
        with tempfile.NamedTemporaryFile("r", suffix=".vcd", encoding="utf-8") as file:
            self._data.save(file.name)
            return file.read()

    def to_pandas(self) -> "pandas.DataFrame":
        """A row a poll, by time in seconds; a column an input, enumerations as categories. Needs pandas."""
        import pandas

        columns = {name: self._column(name) for name in self._names}
        return pandas.DataFrame(columns, index=pandas.Index(self.time, name="time"))

    def _column(self, name: str) -> Any:
        import pandas

        values, enum = self[name], self._signals[name].enum
        if values.ndim > 1:
            return [int.from_bytes(row.tobytes(), "little") for row in values]
        if enum is None:
            return values
        numbers = sorted({*(int(each) for each in enum), *(int(each) for each in values)})
        codes = pandas.Categorical(values, categories=numbers)
        return codes.rename_categories([enum(each).name for each in numbers])

    def plot(self) -> Any:
        """A figure of matplotlib: an axis an input, over the time in seconds. Needs matplotlib."""
        from matplotlib.figure import Figure

        names = [name for name in self._names if self[name].ndim == 1]
        figure = Figure(figsize=(8, 1 + len(names)), layout="constrained")
        for axes, name in zip(figure.subplots(len(names), sharex=True, squeeze=False)[:, 0], names):
            axes.step(self.time, self[name], where="post")
            axes.set_ylabel(f"{name} {self._signals[name].unit}".strip(), rotation="horizontal", ha="right")
        figure.supxlabel("time (s)")
        return figure

    def __len__(self) -> int:
        return len(self.missed)

    def __dir__(self) -> List[str]:
        return [*super().__dir__(), *self._names]

    def __repr__(self) -> str:
        return f"<qorvio.Sampling of {len(self)} polls: {', '.join(self._names)}>"

    def _repr_png_(self) -> Optional[bytes]:
        try:
            figure = self.plot()
        except ImportError:
            return None
        import io

        image = io.BytesIO()
        figure.savefig(image, format="png")
        return image.getvalue()


def _has(moves: "numpy.ndarray[Any, Any]", flag: int) -> "numpy.ndarray[Any, Any]":
    import numpy

    return numpy.not_equal(numpy.bitwise_and(moves, flag), 0)


def _integers(rows: "numpy.ndarray[Any, Any]", signed_width: int) -> "numpy.ndarray[Any, Any]":
    """Rows of bytes as numbers; with a width, whose top bit is a sign."""
    import numpy

    each = rows.shape[1]
    size = 1 << (each - 1).bit_length()
    if size != each:
        rows = numpy.pad(rows, ((0, 0), (0, size - each)))
    if not signed_width:
        return rows.reshape(-1).view(f"<u{size}")
    spare = 8 * size - signed_width
    return (rows.reshape(-1).view(f"<i{size}") << spare) >> spare
