"""What a poll costs from Python beside the same loop in C++: python_bench.py BUILD. Prints a table, and writes
BUILD/python.json.

Instructions are those of the process, of so many turns more, by callgrind (or perf stat where it may count): they do not
depend on how busy the machine is. Times are the best of several runs that take turns."""

import json
import os
import pathlib
import re
import shutil
import subprocess
import sys
import tempfile

ROOT = pathlib.Path(__file__).parents[1]
CASES = {  # what it is to reach in instructions, Python over C++
    "value": 1.04,
    "frame": 1.18,
    "sample": 1.004,
    "write": 1.06,
    "write two": 1.25,
    "wait_for": None,
}
TURNS, ROUNDS, TIMED_TURNS = 300, 5, 20000
SIGNALS = """
core = "0.1.0"
[[signal]]
name = "leds"
port = "async_out"
bits = "7:0"
[[signal]]
name = "leds"
port = "async_in"
bits = "7:0"
[[signal]]
name = "state"
port = "async_in"
bits = "2:0"
[[signal]]
name = "go"
port = "sync_out"
bits = 0
[[signal]]
name = "irq"
port = "sync_in"
bits = 0
"""


def counter():
    perf = ["perf", "stat", "-x,", "-e", "instructions:u"]
    if shutil.which("perf") and subprocess.run([*perf, "true"], capture_output=True).stderr[:1].isdigit():
        return perf, r"^(\d+),"
    return ["valgrind", "--tool=callgrind", "--callgrind-out-file=/dev/null"], r"Collected : (\d+)"


def main(build):
    commands = {
        "C++": [str(build / "bin" / "python_loops")],
        "Python": [sys.executable, str(ROOT / "bench" / "python_loops.py")],
    }
    tool, pattern = counter()
    environment = {**os.environ, "PYTHONPATH": str(build / "python"), "PYTHONHASHSEED": "0", "PYTHONMALLOC": "pymalloc"}

    def run(words):
        return subprocess.run(words, capture_output=True, text=True, check=True, env=environment)

    with tempfile.NamedTemporaryFile("w", suffix=".toml") as signals:
        signals.write(SIGNALS)
        signals.flush()

        def instructions(command, case):
            totals = []
            for turns in (TURNS, 3 * TURNS):
                counted = run([*tool, *command, case, str(turns), signals.name])
                totals.append(int(re.search(pattern, counted.stderr, re.MULTILINE)[1]))
            return (totals[1] - totals[0]) / (2 * TURNS)

        results = {}
        print(f"{'':10} {'instructions a turn':>28}  {'microseconds a turn':>22}")
        print(f"{'LOOP':10} {'C++':>10} {'Python':>10} {'RATIO':>6}  {'C++':>7} {'Python':>7} {'RATIO':>6}  TO REACH")
        for case, goal in CASES.items():
            counts = {name: instructions(command, case) for name, command in commands.items()}
            times = {name: float("inf") for name in commands}
            for _ in range(ROUNDS):
                for name, command in commands.items():
                    seconds = float(run([*command, case, str(TIMED_TURNS), signals.name]).stdout)
                    times[name] = min(times[name], 1e6 * seconds / TIMED_TURNS)
            ratios = [figures["Python"] / figures["C++"] for figures in (counts, times)]
            results[case] = {"instructions": counts, "microseconds": times, "goal": goal}
            print(
                f"{case:10} {counts['C++']:10.0f} {counts['Python']:10.0f} {ratios[0]:6.3f}  {times['C++']:7.2f} "
                f"{times['Python']:7.2f} {ratios[1]:6.3f}  {goal or ''}",
                flush=True,
            )
    (build / "python.json").write_text(json.dumps(results, indent=2))


main(pathlib.Path(sys.argv[1]).resolve())
