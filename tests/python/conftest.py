import os
import pathlib
import re
import subprocess

import pytest

import qorvio

ROOT = pathlib.Path(__file__).parents[2]
TOOL = pathlib.Path(os.environ["QORVIO_TOOL"])
os.environ["PATH"] = f"{TOOL.parent}:{os.environ['PATH']}"
LAB = ROOT / "examples" / "python" / "lab.toml"

pytest_plugins = ["pytester"]


@pytest.fixture
def lab():
    with qorvio.open("sim:", signals=LAB) as board:
        yield board


@pytest.fixture
def simulator():
    """The port of a remote_bitbang server with the demo board."""
    command = [TOOL, "simulate", "--port", "0"]
    with subprocess.Popen(command, stdout=subprocess.PIPE, text=True) as server:
        yield int(re.search(r":(\d+)", server.stdout.readline())[1])
        server.terminate()
