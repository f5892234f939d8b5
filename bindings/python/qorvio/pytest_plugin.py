"""Tests on a board: the fixture `board`, and the options --qorvio-cable, --qorvio-signals and --qorvio-record."""

import pathlib
import re
import shutil
import subprocess
import threading
import time
import warnings
from typing import Any, Dict, Iterator, List, Optional

import pytest

from qorvio import _qorvio
from qorvio.board import Board, open
from qorvio.errors import LinkError

_RECORDED = 500  # polls a second, for --qorvio-record


def pytest_addoption(parser: pytest.Parser) -> None:
    group = parser.getgroup("qorvio", "a board with QorVIO cores")
    group.addoption("--qorvio-cable", metavar="URL", help="the board's cable; QORVIO_CABLE without it")
    group.addoption("--qorvio-signals", metavar="FILE", help="names for its bits; QORVIO_SIGNALS without it")
    group.addoption(
        "--qorvio-record", metavar="FOLDER", help="keep what inputs did in each test that fails, as a value change dump"
    )


@pytest.fixture(scope="session")
def qorvio_board(request: pytest.FixtureRequest) -> Iterator[Board]:
    """The board of all tests: `qorvio doctor` has found nothing wrong with it."""
    cable = request.config.getoption("--qorvio-cable")
    signals = request.config.getoption("--qorvio-signals")
    _run_doctor(cable, signals)
    with open(cable, signals=signals) as board:
        yield board


@pytest.fixture
def board(request: pytest.FixtureRequest, qorvio_board: Board) -> Iterator[Board]:
    """The board, whose outputs are put back after the test. Where it is not known what they were, it counts as 0."""
    outputs = [qorvio_board.outputs[name] for name in qorvio_board.outputs]
    before = {each.name: each.given for each in outputs}
    qorvio_board.read()  # what moved before the test is not its activity
    recorder = _Recorder(qorvio_board) if request.config.getoption("--qorvio-record") else None
    yield qorvio_board
    if recorder:
        request.node.stash[_recording] = recorder.end()
    changed = {each.name: before[each.name] or 0 for each in outputs if each.given != before[each.name]}
    if changed:
        qorvio_board.write(changed)


_recording: "pytest.StashKey[_qorvio._Sampling]" = pytest.StashKey()
_failed: "pytest.StashKey[pytest.TestReport]" = pytest.StashKey()


@pytest.hookimpl(hookwrapper=True)
def pytest_runtest_makereport(item: pytest.Item, call: Any) -> Iterator[None]:
    outcome: Any = yield
    report: pytest.TestReport = outcome.get_result()
    if report.when == "call" and report.failed:
        item.stash[_failed] = report
    if report.when == "teardown" and _failed in item.stash and _recording in item.stash:
        path = _path_of(item)
        item.stash[_recording].save(str(path))
        item.stash[_failed].sections.append(("qorvio recording", str(path)))


def _path_of(item: pytest.Item) -> pathlib.Path:
    folder = pathlib.Path(item.config.getoption("--qorvio-record"))
    folder.mkdir(parents=True, exist_ok=True)
    return folder / (re.sub(r"[^\w.-]+", "_", item.nodeid) + ".vcd")


class _Recorder:
    """Keeps the frames in which inputs move, in a thread of its own."""

    def __init__(self, board: Board) -> None:
        self._session = board._session
        self._begin = time.monotonic()
        self._watch = _qorvio._Watch(self._session, (), None, 1 / _RECORDED)
        self._times: List[float] = []
        self._frames: List[Any] = []
        self._add()  # what was before the test
        self._thread = threading.Thread(target=self._run, daemon=True)
        self._thread.start()

    def _add(self) -> bool:
        frame = self._watch.frame()
        if frame is not None:
            self._times.append(self._watch.elapsed())
            self._frames.append(frame)
        return frame is not None

    def _run(self) -> None:
        try:
            while self._add():
                pass
        except LinkError:  # the test has heard of it, or the next one will
            pass

    def end(self) -> _qorvio._Sampling:
        self._watch.end()
        self._thread.join()
        self._times.append(time.monotonic() - self._begin)
        self._frames.append(self._session.frame(False))
        return _qorvio._Sampling.of_frames(self._session, self._times, self._frames)


def _run_doctor(cable: Optional[str], signals: Optional[str]) -> None:
    command = _command_line()
    if command is None:
        warnings.warn(pytest.PytestWarning("no qorvio command is found: the board is used without qorvio doctor"))
        return
    options: Dict[str, Optional[str]] = {"--cable": cable, "--signals": signals}
    words = [word for option, value in options.items() if value for word in (option, value)]
    done = subprocess.run([command, *words, "doctor"], capture_output=True, text=True)
    if done.returncode != 0:
        raise LinkError(f"qorvio doctor has found something wrong:\n{done.stdout}{done.stderr}")


def _command_line() -> Optional[str]:
    """The one that comes with the package, or is installed."""
    mine = pathlib.Path(__file__).parent / "bin" / "qorvio"
    return str(mine) if mine.exists() else shutil.which("qorvio")
