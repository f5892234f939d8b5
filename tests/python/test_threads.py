"""Threads, signals, processes and the collector of garbage against a board that is at work."""

import subprocess
import sys
import threading

import pytest

import qorvio
from conftest import LAB

NEVER = "leds == FF"


def run_beside(work, while_it_runs):
    """Runs `work` in another thread, and returns what it raised or returned."""
    outcome = []

    def run():
        try:
            outcome.append(work())
        except BaseException as error:
            outcome.append(error)

    thread = threading.Thread(target=run)
    thread.start()
    while_it_runs(thread)
    thread.join()
    return outcome[0]


@pytest.mark.parametrize(
    "work",
    [
        lambda board: board.wait_for(NEVER),
        lambda board: board.sample("leds", time=3600),
        lambda board: next(board.edges("leds")),
    ],
    ids=["wait_for", "sample", "edges"],
)
def test_other_threads_have_their_turns_and_can_end_it(lab, work):
    def meanwhile(thread):
        counter = 0
        for _ in range(20):  # of the GIL, and of the board
            counter += lab.read().gain == 0
        assert counter == 20 and thread.is_alive()
        lab.close()

    assert isinstance(run_beside(lambda: work(lab), meanwhile), (qorvio.Error, qorvio.Sampling))


def test_a_write_of_another_thread_ends_a_wait(lab):
    frame = run_beside(lambda: lab.wait_for(NEVER), lambda _: lab.write(leds=0xFF))
    assert frame.leds == 0xFF


def test_two_boards_are_at_work_side_by_side(lab):
    with qorvio.open("sim:", signals=LAB) as other:
        waiting = run_beside(lambda: lab.wait_for(NEVER), lambda _: (other.wait_for("count > 0"), lab.close()))
    assert isinstance(waiting, qorvio.Error)


@pytest.mark.parametrize(
    "work",
    [
        "board.wait_for(board.leds == 255)",
        "board.sample('leds', time=3600)",
        "list(board.watch('leds', rate=0.001))",
        "list(board.edges('leds'))",
    ],
)
def test_ctrl_c_is_heard_while_the_engine_works(work):
    program = f"""
import signal, time
def interrupt():
    main = threading.main_thread().ident
    while not sys._current_frames()[main].f_code.co_filename.endswith("board.py"):
        time.sleep(0.01)
    os.kill(os.getpid(), signal.SIGINT)
try:
    threading.Thread(target=interrupt).start()
    {work}
except KeyboardInterrupt:
    print("heard", board.read().leds)
"""
    assert run(program).stdout == "heard 0\n"


def run(program):
    start = f"import gc, os, sys, threading, qorvio\nboard = qorvio.open('sim:', signals={str(LAB)!r})\n"
    done = subprocess.run([sys.executable, "-c", start + program], capture_output=True, text=True, timeout=300)
    assert done.returncode == 0 and "Fatal" not in done.stderr, done.stderr
    return done


@pytest.mark.parametrize(
    "program, printed",
    [
        # a daemon thread waits while the interpreter ends
        ("threading.Thread(target=board.wait_for, args=('leds == FF',), daemon=True).start(); board.read()", ""),
        ("sys.modules['keep'] = board, board.leds, board.watch()", ""),
        # the parent's board is not the child's, and lives on after the child has ended
        (
            """
child = os.fork()
if child == 0:
    try:
        board.read()
    except qorvio.UsageError as error:
        print(error, flush=True)
    board.close()
    sys.exit(0)
os.waitpid(child, 0)
print(board.leds.value)""",
            "the board was opened by the parent of this process\n0\n",
        ),
        # nobody holds the board any more but its watch
        (
            """
frames = board.watch()
del board
gc.collect()
print(next(frames).leds, len(list(zip(range(0), frames))))
del frames
gc.collect()""",
            "0 0\n",
        ),
    ],
    ids=["daemon", "kept", "fork", "collected"],
)
def test_an_interpreter_ends_quietly(program, printed):
    assert run(program).stdout == printed
