"""A bench test: pytest --qorvio-cable sim: --qorvio-signals lab.toml bench_test.py"""

import pytest

import qorvio


@pytest.mark.parametrize("code, state", [(0, "IDLE"), (1, "ARMED"), (5, "RUN")])
def test_state_follows_the_leds(board, code, state):
    board.leds.value = code
    assert board.wait_for(board.state == state, timeout=1).state == state


def test_go_raises_one_interrupt(board):
    board.write(go=qorvio.pulse(width=2, at=3))
    frame = board.wait_for(board.irq.falls, timeout=1)
    assert frame.rose("irq") and frame.irq == 0


def test_gain_is_in_decibels(board):
    board.gain.value = -1.5
    assert board.gain.value == -1.5 and board.gain.unit == "dB"
