"""The resource and the drivers for labgrid, through its own fixture `target`."""

import pytest

from conftest import LAB

pytest.importorskip("labgrid")


RESOURCES = {
    "local": "QorvioBoard: {url: 'sim:', signals: lab.toml}",
    "network": "NetworkQorvioBoard: {host: 127.0.0.1, port: PORT, signals: lab.toml}",
}


@pytest.mark.parametrize("resource", RESOURCES.values(), ids=RESOURCES.keys())
def test_a_target_drives_its_board(pytester, resource, simulator):
    (pytester.path / "lab.toml").write_text(LAB.read_text())
    (pytester.path / "env.yaml").write_text(
        "imports: [qorvio.labgrid]\n"
        "targets:\n  main:\n    resources:\n"
        f"      {resource.replace('PORT', str(simulator))}\n"
        "    drivers:\n      QorvioDriver: {}\n      QorvioDigitalOutputDriver: {signal: 'leds[0]'}\n"
    )
    pytester.makepyfile(
        """
        def test_it(target):
            driver = target.get_driver("QorvioDriver")
            output = target.get_driver("DigitalOutputProtocol")
            output.set(True)
            assert output.get() is True and driver.board.leds.value == 1
            output.set(False)
            assert output.get() is False and driver.board.state.value.name == "IDLE"
            board = driver.board
            target.deactivate(driver)
            assert board.closed
        """
    )
    done = pytester.runpytest_subprocess("-q", "--lg-env", "env.yaml")
    done.assert_outcomes(passed=1)
