"""A board as a resource of labgrid, with a driver, and one output bit as a digital output.

    targets:
      main:
        resources:
          QorvioBoard: {url: "rbb:127.0.0.1:5555", signals: lab.toml}
        drivers:
          QorvioDriver: {}
          QorvioDigitalOutputDriver: {signal: go_level}
    imports: [qorvio.labgrid]

An exporter offers a server on its host, which is reached through labgrid's ssh forwarding, as NetworkQorvioBoard.
Written for labgrid 24 and later; 0.4.1 is what it is tested with.
"""

import os
from typing import Any, Optional

import attr
from labgrid.driver import Driver
from labgrid.factory import target_factory
from labgrid.protocol import DigitalOutputProtocol
from labgrid.resource.common import NetworkResource, Resource
from labgrid.step import step
from labgrid.util.proxy import proxymanager

from qorvio.board import Board, open


@target_factory.reg_resource
@attr.s(eq=False)
class QorvioBoard(Resource):  # type: ignore[misc]
    """A board on a cable of this host: its URL, and the path of its signals file."""

    url: str = attr.ib(validator=attr.validators.instance_of(str))
    signals: str = attr.ib(default="", validator=attr.validators.instance_of(str))


@target_factory.reg_resource
@attr.s(eq=False)
class NetworkQorvioBoard(NetworkResource):  # type: ignore[misc]
    """A board at a server on another host: a remote_bitbang server, "rbb", or an OpenOCD server, "openocd".

    `options` are what follows the port in the cable's URL, such as "?board=board.toml".
    """

    port: int = attr.ib(kw_only=True, validator=attr.validators.instance_of(int))
    scheme: str = attr.ib(default="rbb", kw_only=True, validator=attr.validators.in_(["rbb", "openocd"]))
    options: str = attr.ib(default="", kw_only=True, validator=attr.validators.instance_of(str))
    signals: str = attr.ib(default="", kw_only=True, validator=attr.validators.instance_of(str))

    @property
    def url(self) -> str:
        """Of the port on this host that labgrid forwards, where it has to."""
        host, port = proxymanager.get_host_and_port(self)
        return f"{self.scheme}:{host}:{port}{self.options}"


@target_factory.reg_driver
@attr.s(eq=False)
class QorvioDriver(Driver):  # type: ignore[misc]
    """Opens the board while it is active: `driver.board` is a qorvio.Board. A relative signals file is the environment's."""

    bindings = {"resource": {QorvioBoard, NetworkQorvioBoard}}

    def __attrs_post_init__(self) -> None:
        super().__attrs_post_init__()
        self.board: Optional[Board] = None

    def on_activate(self) -> None:
        self.board = open(self.resource.url, signals=self._signals() or None)

    def on_deactivate(self) -> None:
        if self.board is not None:
            self.board.close()
        self.board = None

    def _signals(self) -> str:
        path: str = self.resource.signals
        if path and self.target.env and not os.path.isabs(path):
            path = self.target.env.config.resolve_path(path)
        return path


@target_factory.reg_driver
@attr.s(eq=False)
class QorvioDigitalOutputDriver(Driver, DigitalOutputProtocol):  # type: ignore[misc]
    """An output of one bit, named by `signal`, as a digital output: a reset or a power switch of the target."""

    bindings = {"driver": QorvioDriver}
    signal: str = attr.ib(validator=attr.validators.instance_of(str))

    @property
    def _output(self) -> Any:
        return self.driver.board.outputs[self.signal]

    @Driver.check_active
    @step(args=["status"])
    def set(self, status: bool) -> None:
        """Drives it."""
        self._output.value = bool(status)

    @Driver.check_active
    @step(result=True)
    def get(self) -> bool:
        """What it was given last. Raises UsageError where that is not known."""
        return bool(self._output.value)
