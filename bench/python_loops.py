"""The loops of python_loops.cpp in Python: python_loops.py CASE COUNT SIGNALS prints seconds."""

import sys
import time

import qorvio


def value(board, count):
    for _ in range(count):
        board.leds.value


def frame(board, count):
    for _ in range(count):
        each = board.read()
        each.leds + each.state + each.irq


def sample(board, count):
    board.sample("leds", "state", count=count)


def write(board, count):
    for i in range(count):
        board.leds.value = i & 0xFF


def write_two(board, count):
    for i in range(count):
        board.write(leds=i & 0xFF, go=i & 1)


def wait_for(board, count):
    condition = board.leds == 0
    for _ in range(count):
        board.wait_for(condition, timeout=1)


case, count, signals = sys.argv[1:]
loop = {each.__name__: each for each in (value, frame, sample, write, write_two, wait_for)}[case.replace(" ", "_")]
with qorvio.open("sim:", signals=signals) as bench:
    begin = time.perf_counter()
    loop(bench, int(count))
    print(time.perf_counter() - begin)
