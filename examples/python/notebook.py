"""A notebook, cell by cell: what a board does while its outputs change."""

# %%
import pathlib

import qorvio

here = pathlib.Path(__file__).parent
board = qorvio.open("sim:", signals=here / "lab.toml")
board  # the table of its inputs

# %%
board.write(leds=0x35, gain=-1.5)
frame = board.read()
print(frame.state.name, frame.temp, frame.temp.unit, frame.rose("leds"))
frame  # the same as a table, with what moved

# %%
recording = board.sample("count", "state", count=200)
print(len(recording), "polls,", recording.state.max(), "is the highest state")
recording  # a plot

# %%
recording.to_pandas().describe()

# %%
board.close()
