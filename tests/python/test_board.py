"""Signals, frames, conditions and failures, on simulated boards."""

import subprocess

import pytest

import qorvio
from conftest import LAB, TOOL


@pytest.mark.parametrize(
    "name, given, value",
    [
        ("leds", 0x35, 0x35),
        ("leds[3:0]", "0xA", 0xA),
        ("leds", b"\x81", 0x81),
        ("gain", -1.5, -1.5),
        ("gain", "3.5 dB", 3.5),
        ("gain", -4, -4.0),
    ],
)
def test_an_output_comes_back_as_the_input_of_its_name(lab, name, given, value):
    lab[name].value = given
    assert lab[name].value == value == lab.read()[name] == lab.outputs[name].value == lab[name].given


def test_values_have_their_enumeration_sign_and_unit(lab):
    lab.write({"leds[7:4]": 0xF}, gain=lab.gain.value, go=qorvio.pulse(2, at=3))
    lab.write(leds=5)
    frame = lab.wait_for("state == RUN", timeout=60)
    assert frame.state is lab.state.enum.RUN and frame.state == "RUN" and frame.state.name == "RUN"
    assert frame.temp.unit == lab.temp.unit == "degC" and isinstance(frame.temp, float)
    assert (frame.rose("irq"), frame.fell("irq"), frame.sync_rose("irq"), frame.moved("temp[0]")) == (1, 1, 1, 0)
    lab.leds.value = 3
    assert (lab.state.value, lab.state.value.name) == (3, "0x3")
    with pytest.raises(ValueError, match="no value of state, whose values are ARMED, IDLE, RUN: STOP"):
        lab.state.value == "STOP"


def test_reading_a_value_takes_no_activity(lab):
    lab.leds.value = 1
    assert lab.leds.value == 1 and "leds   0x01    ↑" in repr(lab)
    assert lab.read().rose("leds") and not lab.read().rose("leds")


def test_wide_values_are_whole_numbers(tmp_path):
    signals = tmp_path / "wide.toml"
    signals.write_text(
        "".join(
            f'[[signal]]\nname = "{name}"\nport = "async_{way}"\nbits = "{bits}"\nradix = "{radix}"\n'
            for way in ("in", "out")
            for name, bits, radix in (("wide", "69:0", "hex"), ("below", "139:70", "signed"), ("word", "63:0", "signed"))
        )
    )
    board = qorvio.sim.board().device(1).core(async_out=140, async_in=140)
    with qorvio.open(board, signals=signals) as wide:
        for number in (0, 1, 2**69 + 5, 2**70 - 1):
            wide.wide.value = number
            assert wide.wide.value == number == int.from_bytes(wide.wide.to_bytes(), "little")
            wide.outputs.below.value = wide.wide.array
            assert (wide.below.array == wide.wide.array).all()
        for number in (-(2**69), -1, 2**69 - 1):
            wide.below.value = number
            assert wide.below.value == number == wide.read().below
        wide.word.value = -(2**63)
        assert wide.word.value == -(2**63)
        for bad in (2**70, -(2**69) - 1):
            with pytest.raises(qorvio.UsageError, match="below has 70 bits, too few"):
                wide.below.value = bad


def test_a_value_needs_an_exchange_with_its_own_core_only(lab):
    one = -lab.count.value + lab.count.value  # the counter counts on in each exchange
    each = -lab.read().count + lab.read().count
    assert 0 < one < each


def test_cores_have_their_own_signals(lab):
    assert list(lab.cores) == ["0.1.0", "1.1.0"] and lab.cores["1.1.0"].version == (6, 1)
    assert list(lab.cores["1.1.0"].inputs) == ["count", "async_in_data", "sync_in_data"]
    assert lab.cores["1.1.0"].async_in_data.value <= lab.count.value < 2**16
    assert "leds" in dir(lab) and "count" not in dir(lab.cores["0.1.0"])
    with pytest.raises(qorvio.UsageError, match="not a signal of core 1.1.0, but of 0.1.0: leds"):
        lab.cores["1.1.0"].leds


WRONG = [
    (lambda board: board.leads, qorvio.UnknownSignal, r"no input of that name \(did you mean leds\?\): leads"),
    (lambda board: board.write(god=1), qorvio.UnknownSignal, r"no output of that name \(did you mean go\?\): god"),
    (lambda board: board.read().stat, qorvio.UnknownSignal, r"did you mean state\?"),
    (lambda board: board.write(leds=0x100), qorvio.UsageError, "leds has 8 bits, too few for the value: 256"),
    (lambda board: setattr(board.irq, "value", 1), qorvio.UsageError, "an input cannot be written: irq"),
    (lambda board: setattr(board, "leds", 1), qorvio.UsageError, "a signal is given a value by .value"),
    (lambda board: setattr(board.leds, "value", None), TypeError, "neither a number, a text nor bytes, for leds: None"),
    (lambda board: board.go.pulse(at=15), qorvio.UsageError, "a pulse must begin and end within 16 steps"),
    (lambda board: bool(board.state == 5), TypeError, "use .value"),
    (lambda board: bool(board.irq), TypeError, "use .value"),
    (lambda board: 1 < board.leds < 5, TypeError, "use .value"),
    (lambda board: board.state == "STOP", qorvio.UsageError, "not a value for state"),
    (lambda board: board.wait_for(board.go), qorvio.UsageError, "an output cannot be read: go|no input"),
    (lambda board: board.wait_for(5), TypeError, "not a condition: 5"),
    (lambda board: board.wait_for("state = RUN"), qorvio.UsageError, "column 7"),
    (lambda board: board.sample("state"), qorvio.UsageError, "needs a count or a time"),
    (lambda board: qorvio.open("nothing:"), qorvio.UsageError, "is of the unknown kind"),
    (lambda board: qorvio.open("rbb:127.0.0.1:1"), OSError, "cannot be reached"),
    (lambda board: qorvio.open("sim:", signals="missing.toml"), ValueError, "missing.toml"),
    (lambda board: qorvio.sim.board().core(async_in=1), qorvio.UsageError, "device"),
]


@pytest.mark.parametrize("use, kind, message", WRONG, ids=[message[:40] for _, _, message in WRONG])
def test_wrong_use_says_what_is_wrong(lab, use, kind, message):
    with pytest.raises(kind, match=message):
        use(lab)


@pytest.mark.parametrize(
    "condition, holds",
    [
        (lambda board: board.state == "RUN", True),
        (lambda board: (board.state != 5) | (board.temp >= 15), True),
        (lambda board: (board.leds >= 0x35) & (board.leds <= 0x35) & ~(board.leds < 0x35), True),
        (lambda board: board.leds & ~board.irq, True),
        (lambda board: board.irq.moves | board.leds.falls, False),
        (lambda board: board.irq | board.condition("temp < 10 degC"), False),
    ],
)
def test_conditions_are_made_of_signals(lab, condition, holds):
    lab.leds.value = 0x35
    lab.read()
    if holds:
        assert lab.wait_for(condition(lab), timeout=60).leds == 0x35
        return
    with pytest.raises(qorvio.Timeout, match=r"not within 0 s: .*; .*irq is 0x0") as timeout:
        lab.wait_for(condition(lab), timeout=0)
    assert isinstance(timeout.value, TimeoutError)


def test_conditions_of_two_boards_cannot_be_mixed(lab):
    with qorvio.open("sim:") as other, pytest.raises(qorvio.UsageError, match="a condition of another board"):
        lab.wait_for(other.async_in_data == 0)


def test_edges_and_watch_report_what_moved(lab):
    lab.write(leds=1, go="1")
    edges = lab.edges("leds", "irq", timeout=60)
    assert [next(edges)[1:], next(edges)[1:]] == [("leds", True, False), ("irq", True, False)]
    frames = lab.watch("leds", rate=1e6)
    assert next(frames).leds == 1
    lab.leds.value = 2
    frame = next(frames)
    assert (frame.leds, frame.rose("leds"), frame.fell("leds[0]")) == (2, True, True)
    assert list(lab.edges("irq", timeout=0)) == [] == list(lab.watch(timeout=0))


def test_a_train_plays_and_its_last_step_stays(lab):
    lab.read()
    lab.go.train("0011000000000000")
    assert lab.wait_for(lab.irq.rises, timeout=60).irq == 0
    lab.write(go=qorvio.train([0, 1]))
    assert lab.irq.value == 1 and lab.go.toggle() is False and lab.irq.value == 0


def test_a_design_in_python_runs_once_a_clock():
    seen, faults = [], []

    def design(ports):
        seen.append(ports)
        ports.async_in = ~ports.async_out
        if ports.async_out == 3:
            ports.glitch_async_in(7)
        if faults:
            faults.pop()()

    description = qorvio.sim.board().device(0x0A5F1093).core(async_out=8, async_in=8, design=design)
    with qorvio.open(description) as board:
        board.async_out_data.value = 3
        frame = board.read()
        assert frame.async_in_data == 0xFC and frame.rose("async_in_data[7]")
        with pytest.raises(qorvio.UsageError, match="in its own clock only"):
            seen[0].async_in
        for fault, kind in ((lambda: 1 / 0, ZeroDivisionError), (board.read, qorvio.UsageError), (board.close, qorvio.UsageError)):
            faults.append(fault)
            with pytest.raises(kind):
                board.read()
            assert board.read().async_in_data == 0xFC


def test_tables_are_those_of_the_command_line(lab):
    command = [TOOL, "--cable", "sim:", "--signals", LAB, "read"]
    printed = subprocess.run(command, capture_output=True, text=True, check=True).stdout

    def without_count(text):  # which counts design clocks
        return [line.split() for line in text.splitlines() if not line.startswith("count")]

    assert without_count(repr(lab)) == without_count(printed)
    assert "<td>gain</td><td>0 dB</td>" in lab.read()._repr_html_()


def test_a_closed_board_says_so(lab):
    frames, signal = lab.watch(), lab.leds
    next(frames)
    lab.close()
    lab.close()
    for use in (lambda: next(frames), lambda: signal.value, lab.read):
        with pytest.raises(qorvio.UsageError, match="the board is closed"):
            use()
    assert repr(lab) == "<qorvio.Board sim:, closed>"
