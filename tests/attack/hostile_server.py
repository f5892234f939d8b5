"""Servers that misbehave: hostile_server.py KIND MODE serves on a loopback port, which it prints first.

KIND is bitbang (remote_bitbang: 'R' asks for TDO) or tcl (an OpenOCD server: commands and replies end with 0x1A).
"""
import os
import socket
import struct
import sys
import time

END = b"\x1a"


def flood(client, block):
    while True:
        client.sendall(block)


def trickle(client, block):
    """A byte now and then, for ever."""
    while True:
        for i in range(len(block)):
            client.sendall(block[i:i + 1])
            time.sleep(0.3)


def reset(client, _):
    """Ends the connection with RST in the middle of an exchange."""
    client.recv(16)
    client.setsockopt(socket.SOL_SOCKET, socket.SO_LINGER, struct.pack("ii", 1, 0))
    client.close()


def swallow(client, _):
    while client.recv(65536):
        pass


def replies(answer):
    """Answers each command, or each question of a bitbang client."""
    def serve(client, _):
        while data := client.recv(65536):
            client.sendall(answer * max(1, data.count(END) + data.count(b"R")))
    return serve


# What a mode does with a connection, and the block that it sends.
MODES = {
    "bitbang": {
        "silence": (swallow, b""),
        "trickle": (trickle, b"0"),
        "flood": (flood, b"1" * 65536),
        "garbage": (flood, os.urandom(65536)),
        "letters": (replies(b"x"), b""),
        "too-many": (replies(b"0101"), b""),
        "zeros": (replies(b"0"), b""),
        "ones": (replies(b"1"), b""),
        "reset": (reset, b""),
    },
    "tcl": {
        "silence": (swallow, b""),
        "trickle": (trickle, b"0 "),
        "flood": (flood, b"deadbeef " * 8192),
        "garbage": (flood, os.urandom(65536)),
        "empty": (replies(END), b""),
        "words": (replies(b"no such thing" + END), b""),
        "controls": (replies(b"\x1b[2J\x1b]0;owned\x07\r\n" + END), b""),
        "too-many": (replies(b"0 " * 100000 + END), b""),
        "early": (replies(END * 50), b""),
        "reset": (reset, b""),
    },
}


def main():
    serve, block = MODES[sys.argv[1]][sys.argv[2]]
    with socket.create_server(("127.0.0.1", 0)) as server:
        print(server.getsockname()[1], flush=True)
        while True:
            client, _ = server.accept()
            try:
                serve(client, block)
            except OSError:
                pass
            client.close()


if __name__ == "__main__":
    main()
