"""QorVIO: watch and drive signals inside a running FPGA over JTAG, by name.

    with qorvio.open("sim:", signals="lab.toml") as board:
        board.leds.value = 0x35
        board.write(leds=0x35, go=qorvio.pulse())
        frame = board.wait_for((board.state == "RUN") & board.irq.rises, timeout=1)

Times are in seconds, rates are per second, bit 0 is the lowest. Signals are read and written by `.value`; nothing else
makes an exchange with the board but the methods of Board.
"""

from typing import Any, Iterable, Tuple

from qorvio import sim
from qorvio._qorvio import Condition, Frame, Pulse, Signal
from qorvio.board import Board, Core, Edge, Names, open
from qorvio.errors import Error, LinkError, Timeout, UnknownSignal, UsageError
from qorvio.sampling import Sampling
from qorvio.values import Enumeration, Quantity


def pulse(width: int = 1, at: int = 0) -> Pulse:
    """For `Board.write`: a synchronous output of one bit is 1 for `width` design clocks, from clock `at` of 16 on."""
    return Pulse(width, at)


def train(values: Iterable[Any]) -> Tuple[Any, ...]:
    """For `Board.write`: up to 16 values of a synchronous output, one a design clock; the last one stays."""
    return tuple(values)


__all__ = [
    "Board",
    "Condition",
    "Core",
    "Edge",
    "Enumeration",
    "Error",
    "Frame",
    "LinkError",
    "Names",
    "Pulse",
    "Quantity",
    "Sampling",
    "Signal",
    "Timeout",
    "UnknownSignal",
    "UsageError",
    "open",
    "pulse",
    "sim",
    "train",
]
