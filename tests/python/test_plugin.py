"""The pytest plugin, in runs of pytest of its own."""

import pytest

from conftest import LAB

TESTS = """
    import pytest

    def test_gives(board):
        board.write(leds=5, gain=-1.5, go=1)

    def test_finds_them_put_back(board):
        assert board.outputs.leds.value == 0 and board.irq.value == 0 and not board.read().moved("leds")

    def test_fails(board):
        board.leds.value = 0xA5
        board.leds.value = 0x5A
        board.wait_for(board.leds == 0x5A)
        assert False
"""


@pytest.mark.parametrize("cable", ["sim:", "rbb:127.0.0.1:PORT"])
def test_outputs_are_put_back_and_failures_recorded(pytester, cable, simulator):
    pytester.makepyfile(TESTS)
    cable = cable.replace("PORT", str(simulator))
    done = pytester.runpytest_subprocess("--qorvio-cable", cable, "--qorvio-signals", LAB, "--qorvio-record", "failed")
    done.assert_outcomes(passed=2, failed=1)
    done.stdout.fnmatch_lines(["*qorvio recording*", "*failed/*test_fails.vcd*"])
    (dump,) = (pytester.path / "failed").iterdir()
    assert "b01011010 " in dump.read_text()


def test_a_board_that_the_doctor_refuses_is_not_used(pytester, monkeypatch):
    pytester.makepyfile(TESTS)
    done = pytester.runpytest_subprocess("--qorvio-cable", "rbb:127.0.0.1:1")
    done.assert_outcomes(errors=3)
    done.stdout.fnmatch_lines(["*qorvio doctor has found something wrong:*"])
    monkeypatch.setenv("PATH", "/nowhere")
    done = pytester.runpytest_subprocess("--qorvio-cable", "sim:", "--qorvio-signals", LAB, "-k", "gives")
    done.assert_outcomes(passed=1, deselected=2, warnings=1)
    done.stdout.fnmatch_lines(["*the board is used without qorvio doctor*"])
