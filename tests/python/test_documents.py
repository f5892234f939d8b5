"""The examples, and every line of Python in the documents, as they stand; and their types."""

import re
import runpy
import subprocess
import sys

import pytest

import qorvio
from conftest import LAB, ROOT, TOOL

BLOCKS = [
    pytest.param(block, id=f"{path.name}-{number}")
    for path in (ROOT / "README.md", ROOT / "docs" / "python.md")
    for number, block in enumerate(re.findall(r"```python\n(.*?)```", path.read_text(), re.DOTALL))
]


@pytest.mark.parametrize("block", BLOCKS)
def test_documents_say_what_works(block, monkeypatch, lab):
    monkeypatch.chdir(LAB.parent)
    # A watch without an end would go on as it stands, and the edges for five seconds.
    block = re.sub(r"^( +for .*?: )\.\.\.", r"\1break", block, flags=re.MULTILINE)
    scope = {"__name__": "block"}
    exec(compile(block, "block", "exec"), scope)
    if "r" in scope:
        r = scope["r"]
        assert len(r.time) == len(r.state) == len(r.temp) == len(r.to_pandas()) == 100_000 and r.to_vcd().endswith("\n")
    for name, test in list(scope.items()):
        if name.startswith("test_"):
            test(lab)


def test_the_notebook_runs():
    scope = runpy.run_path(str(LAB.parent / "notebook.py"))
    assert scope["frame"].state.name == "RUN" and scope["board"].closed


def test_the_bench_test_passes(pytester):
    options = ["--qorvio-cable", "sim:", "--qorvio-signals", str(LAB)]
    done = pytester.runpytest_subprocess(*options, str(LAB.parent / "bench_test.py"))
    done.assert_outcomes(passed=5)


def test_types_are_complete(tmp_path):
    made = subprocess.run([TOOL, "signals", "stubs", LAB], capture_output=True, text=True, check=True)
    (tmp_path / "lab.pyi").write_text(made.stdout)
    (tmp_path / "use.py").write_text(
        "import qorvio\nimport lab\n\ndef use(board: lab.Board) -> None:\n"
        "    reveal_type(board.state.value)\n    reveal_type(board.read().temp.unit)\n"
        "    board.write(leds=1, go=qorvio.pulse())\n    board.wait_for((board.state == 'RUN') & board.irq.rises)\n"
        "    board.leds.valeu\n"
    )
    package = ROOT / "bindings" / "python"
    options = ["--strict", "--config-file", str(package / "pyproject.toml"), f"--cache-dir={tmp_path}"]
    environment = {"MYPYPATH": f"{package}:{tmp_path}", "PATH": "/usr/bin"}
    done = subprocess.run(
        [sys.executable, "-m", "mypy", *options, str(package / "qorvio"), str(tmp_path / "use.py")],
        capture_output=True, text=True, env=environment,
    )
    found = re.findall(r"(?:error|note): (.*)", done.stdout)
    assert found == [
        'Revealed type is "lab.State"',
        'Revealed type is "builtins.str"',
        '"Signal[int]" has no attribute "valeu"; maybe "value"?  [attr-defined]',
    ], done.stdout + done.stderr


def test_help_reads_well():
    for name in qorvio.__all__:
        assert getattr(qorvio, name).__doc__ and "pybind" not in getattr(qorvio, name).__doc__
