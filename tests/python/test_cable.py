"""The demo board by the names of its signals, on whatever board QORVIO_TEST_CABLE leads to."""

import os

import qorvio
from conftest import LAB


def test_the_demo_board_does_what_it_is_told():
    with qorvio.open(os.environ.get("QORVIO_TEST_CABLE", "sim:"), signals=LAB) as board:
        board.write(leds=0, gain=0, go=0)
        board.read()
        for leds, state in ((0x35, "RUN"), (0xF9, "ARMED"), (0x00, "IDLE")):
            board.write(leds=leds, gain=-1.5)
            frame = board.wait_for((board.state == state) & (board.gain == -1.5), timeout=60)
            assert frame.leds == leds == board.leds.value and frame.moved("leds")
        board.go.train("0011000000000000")
        frame = board.wait_for(board.irq.falls, timeout=60)
        assert frame.rose("irq") and frame.sync_rose("irq") and frame.irq == 0
        edges = board.edges("state", timeout=60)
        board.leds.value = 5
        assert next(edges)[1:] == ("state", True, False)
        r = board.sample("state", "count", count=100)
        assert (r.state == 5).all() and len(set(r["count"])) > 1
