"""Samplings as arrays, files, tables and pictures."""

import numpy
import pytest

import qorvio


def test_arrays_hold_a_value_a_poll(lab):
    lab.write(leds=0xF5, gain=-1.5)
    r = lab.sample(count=1000)
    assert len(r) == len(r.time) == 1000 and (numpy.diff(r.time) >= 0).all() and r.missed.sum() == 0
    assert (r.leds.dtype, r.state.dtype, r.gain.dtype, r.count.dtype) == ("u1", "u1", "f8", "<u2")
    assert (r.leds == 0xF5).all() and (r.state == 5).all() and (r.gain == -1.5).all() and (r.temp == 75).all()
    assert r.rose("leds").tolist() == [True] + 999 * [False] and not r.fell("leds").any()
    assert (numpy.diff(r.count.astype(int)) > 0).any()
    with pytest.raises(qorvio.UnknownSignal, match="not one of the inputs that were sampled"):
        r.go


def test_arrays_of_odd_and_wide_inputs(tmp_path):
    signals = tmp_path / "odd.toml"
    rows = (("five", "39:0", "hex"), ("below", "19:0", "signed"), ("wide", "71:0", "hex"))
    signals.write_text(
        "".join(
            f'[[signal]]\nname = "{name}"\nport = "async_in"\nbits = "{bits}"\nradix = "{radix}"\n'
            for name, bits, radix in rows
        )
    )
    board = qorvio.sim.board().device(1).core(async_out=72, async_in=72)
    with qorvio.open(board, signals=signals) as odd:
        odd.async_out_data.value = 0xAB12345FFFFE + (0x77 << 64)
        r = odd.sample(time=0.01, rate=1000)
    assert set(r.five) == {0x12345FFFFE}
    assert set(r.below) == {-2} and r.wide.shape == (len(r), 9) and r.wide.dtype == "u1"
    assert set(r.to_pandas().wide) == {0xAB12345FFFFE + (0x77 << 64)}


def test_a_dump_is_what_the_command_line_records(lab, tmp_path):
    lab.write(leds=5)
    r = lab.sample("leds", "state", count=3)
    r.to_vcd(tmp_path / "r.vcd")
    text = r.to_vcd()
    assert text == (tmp_path / "r.vcd").read_text()
    assert "$var wire 8 ! leds $end" in text and "b00000101 !" in text and '1"' in text
    with pytest.raises(qorvio.LinkError):
        r.to_vcd(tmp_path / "missing" / "r.vcd")


def test_tables_and_pictures(lab):
    lab.write(leds=5)
    r = lab.sample("state", "gain", count=5)
    frame = r.to_pandas()
    assert frame.state.tolist() == 5 * ["RUN"] and frame.index.name == "time" and frame.gain.tolist() == 5 * [0.0]
    assert repr(r) == "<qorvio.Sampling of 5 polls: state, gain>"
    pytest.importorskip("matplotlib")
    assert r._repr_png_().startswith(b"\x89PNG") and [axes.get_ylabel() for axes in r.plot().axes] == ["state", "gain dB"]
