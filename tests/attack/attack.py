"""Attacks on the command line: hostile servers, long and killed recordings, missing standard descriptors.
usage: attack.py BIN [--valgrind], BIN the folder of the built programs. Nothing may crash, hang, grow without limit,
run a program or send control characters to the terminal; nor err in its memory, says valgrind or a sanitizer.
"""
import contextlib
import itertools
import json
import os
import pathlib
import resource
import shutil
import signal
import socket
import subprocess
import sys
import tempfile
import threading
import time

from hostile_server import MODES

HERE = pathlib.Path(__file__).resolve().parent
BIN = pathlib.Path(sys.argv[1]).resolve()
VALGRIND = ["valgrind", "-q", "--error-exitcode=99", "--leak-check=full"] if "--valgrind" in sys.argv else []
QORVIO = [*VALGRIND, str(BIN / "qorvio")]
HANGS = 180 if VALGRIND else 60  # seconds: whoever takes so long waits without end
LARGEST = 600 * 1024             # KiB of memory; sanitizers take some 200 of them
SCRATCH = pathlib.Path(tempfile.mkdtemp())
results = []


def check(name, failure):
    """Counts one attack; `failure` says what was wrong, or is empty."""
    results.append(failure)
    if failure:
        print(f"FAILED  {name}: {failure}", flush=True)


def run(*arguments, cwd=SCRATCH, **options):
    environment = {**os.environ, "HOME": str(SCRATCH), "XDG_STATE_HOME": str(SCRATCH / "state")}
    environment.update(options.pop("env", {}))
    return subprocess.run([*QORVIO, *arguments], cwd=cwd, env=environment, capture_output=True, timeout=HANGS,
                          stdin=subprocess.DEVNULL, **options)


def misbehaviour(attempt, statuses):
    """What is wrong with a run: a crash, a hang, memory, an odd exit status, control characters, no message."""
    try:
        done = attempt()
    except subprocess.TimeoutExpired:
        return f"still running after {HANGS} s"
    text = done.stderr.decode(errors="replace")
    if b"Sanitizer" in done.stderr or b"runtime error" in done.stderr or done.returncode < 0:
        return f"crashed ({done.returncode}): {text[:400]}"
    if done.returncode not in statuses:
        return f"exit status {done.returncode}: {text[:200]}"
    if any(c < 32 and c != 10 or c == 127 for c in done.stderr + done.stdout):
        return f"control characters reach the terminal: {text[:200]!r}"
    if done.returncode != 0 and not text.startswith("qorvio: "):
        return f"no message: {text[:200]!r}"
    if not VALGRIND and resource.getrusage(resource.RUSAGE_CHILDREN).ru_maxrss > LARGEST:
        return f"took {resource.getrusage(resource.RUSAGE_CHILDREN).ru_maxrss} KiB"
    return ""


def attack_by_servers():
    for kind, modes in MODES.items():
        for mode in modes:
            server = subprocess.Popen([sys.executable, HERE / "hostile_server.py", kind, mode],
                                      stdout=subprocess.PIPE, stderr=subprocess.DEVNULL)
            port = server.stdout.readline().decode().strip()
            prefix = {"bitbang": "rbb", "tcl": "openocd"}[kind]
            url = f"{prefix}:127.0.0.1:{port}?timeout=1"
            for command in (["scan"], ["read"], ["doctor"]):
                # A chain of nothing but ones or zeros may be scanned in vain, never with values.
                check(f"{kind} {mode} {command[0]}", misbehaviour(lambda: run("--cable", url, *command), (1, 2)))
            server.kill()
            server.wait()


def turning(board, trickles):
    """A server that passes a board on until it is to turn: then it is silent, or sends a byte now and then. Returns its
    port, the event of turning, and what it has been sent."""
    turned, sent = threading.Event(), bytearray()
    server = socket.create_server(("127.0.0.1", 0))

    def serve():
        client, _ = server.accept()
        link = socket.create_connection(board)
        threading.Thread(target=answer, args=(client, link), daemon=True).start()
        while (data := client.recv(65536)) and not turned.is_set():
            sent.extend(data)
            link.sendall(data)
        link.close()

    def answer(client, link):
        with contextlib.suppress(OSError):
            while (data := link.recv(65536)) and not turned.is_set():
                client.sendall(data)
            while trickles:
                client.sendall(b"0")
                time.sleep(0.2)
    threading.Thread(target=serve, daemon=True).start()
    return server.getsockname()[1], turned, sent


@contextlib.contextmanager
def simulated():
    """The address of a simulated board."""
    board = subprocess.Popen([*QORVIO, "--json", "simulate"], stdout=subprocess.PIPE, stderr=subprocess.DEVNULL)
    yield "127.0.0.1", json.loads(board.stdout.readline())["port"]
    board.terminate()
    board.wait()


def catches(number, pid):
    status = pathlib.Path(f"/proc/{pid}/status").read_text()
    return int(status.split("SigCgt:")[1].split()[0], 16) >> (number - 1) & 1


def attack_by_servers_that_turn():
    """A server that falls silent while a command goes on: Ctrl-C ends the wait, though its own time is an hour."""
    with simulated() as board:
        for command, number, trickles in itertools.product(
                ("record --for 1h --out turned.csv", "wait async_in_data==77 --timeout 1h", "watch", "events",
                 "press async_out_data[0] --for 1s"), (signal.SIGINT, signal.SIGTERM), (False, True)):
            check(f"{command}, {number.name}, {'a byte now and then' if trickles else 'silence'}",
                  failure_to_stop(command.split(), number, turning(board, trickles)))


def failure_to_stop(command, number, server):
    port, turned, _ = server
    host = subprocess.Popen([*QORVIO, "--cable", f"rbb:127.0.0.1:{port}?timeout=3600", *command],
                            cwd=SCRATCH, env={**os.environ, "XDG_STATE_HOME": str(SCRATCH / "state")},
                            stdout=subprocess.DEVNULL, stderr=subprocess.PIPE, stdin=subprocess.DEVNULL)
    deadline = time.monotonic() + HANGS
    while not catches(number, host.pid) and time.monotonic() < deadline:
        time.sleep(0.02)
    time.sleep(0.3)
    turned.set()
    time.sleep(0.7)  # it waits by now
    host.send_signal(number)
    try:
        text = host.communicate(timeout=HANGS)[1].decode(errors="replace")
    except subprocess.TimeoutExpired:
        host.kill()
        host.wait()
        return f"still running after {HANGS} s"
    # Of a program in valgrind it cannot be seen whether it catches signals already.
    ends = (0, 1, 128 + number, -number if VALGRIND else 0)
    return "" if host.returncode in ends else f"status {host.returncode}: {text[:200]}"


def attack_by_recordings():
    path = SCRATCH / "times.vcd"
    path.write_text("$timescale 1ns $end\n$var wire 1 ! a $end\n$enddefinitions $end\n" +
                    "".join(f"#{i}\n{i % 2}!\n" for i in range(100000)))
    check("render many times", misbehaviour(lambda: run("render", str(path), str(SCRATCH / "times.svg")), (0, 1, 2)))


def attack_by_kill():
    """kill -9 of recordings: what is a second old is in the file."""
    for ending in ("vcd", "csv", "jsonl"):
        path = SCRATCH / f"killed.{ending}"
        host = subprocess.Popen([*QORVIO, "--cable", "sim:", "--quiet", "record", "--for", "1h", "--rate", "50", "--out", str(path)],
                                stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL)
        deadline = time.monotonic() + HANGS
        while (not path.exists() or path.stat().st_size == 0) and time.monotonic() < deadline:
            time.sleep(0.1)
        host.send_signal(signal.SIGKILL)
        host.wait()
        check(f"a killed recording {ending}", "" if path.exists() and path.stat().st_size else "it is empty")


def attack_by_descriptors():
    """Without standard descriptors nothing that is printed reaches the wires of a board."""
    with simulated() as board:
        for closed in itertools.chain.from_iterable(itertools.combinations((0, 1, 2), n) for n in (1, 2, 3)):
            port, _, sent = turning(board, False)
            redirect = " ".join(f"{fd}>&-" if fd else "0<&-" for fd in closed)
            try:
                done = subprocess.run(["sh", "-c", f'exec "$@" {redirect}', "sh", *QORVIO, "--cable",
                                       f"rbb:127.0.0.1:{port}", "watch", "--frames", "2"], timeout=HANGS,
                                      stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL)
                failure = "" if done.returncode == 0 else f"exit status {done.returncode}"
            except subprocess.TimeoutExpired:
                failure = "hangs"
            others = bytes(sent).translate(None, b"01234567RrstuBbQ")
            check(f"descriptors {closed} closed", failure or (f"sent {others[:60]!r} to the board" if others else ""))


def main():
    try:
        attacks = [attack_by_servers, attack_by_servers_that_turn, attack_by_recordings, attack_by_kill]
        if not VALGRIND:  # which opens files of its own in the place of what is closed
            attacks.append(attack_by_descriptors)
        for attack in attacks:
            before, begin = len(results), time.monotonic()
            attack()
            print(f"{attack.__name__}: {len(results) - before} in {time.monotonic() - begin:.0f} s", flush=True)
    finally:
        shutil.rmtree(SCRATCH)
    failed = sum(1 for failure in results if failure)
    print(f"{len(results) - failed} passed, {failed} failed")
    return 1 if failed else 0


if __name__ == "__main__":
    sys.exit(main())
