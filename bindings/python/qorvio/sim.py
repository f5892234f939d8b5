"""Simulated boards, for tests without hardware.

    def invert(ports):  # once a design clock
        ports.async_in = ~ports.async_out

    board = qorvio.sim.board().device(0x0A5F1093).core(async_out=8, async_in=8, design=invert)
    with qorvio.open(board) as bench: ...
"""

from typing import Callable, Optional, Union

from qorvio import _qorvio
from qorvio._qorvio import Ports
from qorvio.errors import UsageError

Design = Union[str, Callable[[Ports], object]]


class Board:
    """The description of a board. Each `qorvio.open` of it powers up a board of its own; designs are shared."""

    def __init__(self) -> None:
        self._chain = _qorvio._Chain()
        self._free = 0

    def device(self, idcode: int = 0, *, name: str = "fpga", ir_length: int = 6) -> "Board":
        """Adds a device; the first one is nearest to TDO. Without an IDCODE it has none. `ir_length` is in bits."""
        self._chain.device(idcode, name, ir_length)
        self._free = 0
        return self

    def core(
        self,
        *,
        async_out: int = 0,
        sync_out: int = 0,
        async_in: int = 0,
        sync_in: int = 0,
        design: Design = "loopback",
        user_chain: int = 1,
        index: Optional[int] = None,
    ) -> "Board":
        """Adds a VIO core with ports of so many bits to the device added last, at the next free index.

        `design` is "loopback", "counter", "toggle" or "idle", or is called once a design clock with the Ports of the
        core. What it raises comes out of the call of the board that ran the clock; the board can be used afterwards.
        """
        index = self._free if index is None else index
        self._chain.core(user_chain, index, async_out, sync_out, async_in, sync_in, design)
        self._free = index + 1
        return self

    def tcks_per_clock(self, tcks: int) -> "Board":
        """The design clock ticks once in so many of the TCKs of Run-Test/Idle and of answers; with 0 it is stopped."""
        self._chain.tcks_per_clock(tcks)
        return self

    def _open(self, signals: str, core: str) -> "_qorvio._Session":
        return self._chain.open(signals, core)


def board() -> Board:
    """A board without devices."""
    return Board()


__all__ = ["Board", "Design", "Ports", "UsageError", "board"]
