#!/usr/bin/env python3
"""An SMTP server on 127.0.0.1 that misbehaves on purpose: with --mode drop-in-data it answers
well, then closes the connection once the message text starts; with --mode silent it never says
a word. Prints "PORT <n>" once listening; stops when its standard input closes or after
--lifetime seconds."""

import argparse
import os
import selectors
import socket
import sys
import time

REPLIES = {b"EHLO": b"250-localhost\r\n250 8BITMIME\r\n", b"DATA": b"354 go ahead\r\n"}


def serve(connection):
    connection.sendall(b"220 localhost ESMTP\r\n")
    pending, in_data = b"", False
    while True:
        chunk = connection.recv(65536)
        if not chunk or in_data:  # once the message has started to arrive, drop it half-way
            connection.close()
            return
        pending += chunk
        while b"\r\n" in pending:
            line, pending = pending.split(b"\r\n", 1)
            connection.sendall(REPLIES.get(line[:4].upper(), b"250 OK\r\n"))
            in_data = in_data or line[:4].upper() == b"DATA"


def main():
    parser = argparse.ArgumentParser(description=__doc__)
    parser.add_argument("--mode", choices=["drop-in-data", "silent"], required=True)
    parser.add_argument("--lifetime", type=float, default=60.0)
    args = parser.parse_args()
    listener = socket.create_server(("127.0.0.1", 0))
    print(f"PORT {listener.getsockname()[1]}", flush=True)
    selector = selectors.DefaultSelector()
    selector.register(listener, selectors.EVENT_READ)
    selector.register(sys.stdin, selectors.EVENT_READ)
    held = []  # a silent server keeps its connections open
    deadline = time.monotonic() + args.lifetime
    while time.monotonic() < deadline:
        for key, _ in selector.select(timeout=0.5):
            if key.fileobj is sys.stdin:
                if not os.read(sys.stdin.fileno(), 4096):
                    return
                continue
            held.append(listener.accept()[0])
            if args.mode == "drop-in-data":
                serve(held[-1])


if __name__ == "__main__":
    main()
