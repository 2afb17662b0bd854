#!/usr/bin/env python3
"""An SMTP server on 127.0.0.1 that misbehaves on purpose: with --mode drop-in-data it drops the
connection once the message text starts; with --mode silent it never says a word. Prints
"PORT <n>" once listening; stops when its input closes or after --lifetime seconds."""

import argparse, os, socket, sys, threading, time

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
    listener.settimeout(0.5)
    print(f"PORT {listener.getsockname()[1]}", flush=True)
    # It stops when its standard input closes.
    threading.Thread(target=lambda: (sys.stdin.read(), os._exit(0)), daemon=True).start()
    held = []  # a silent server keeps its connections open
    deadline = time.monotonic() + args.lifetime
    while time.monotonic() < deadline:
        try:
            held.append(listener.accept()[0])
        except socket.timeout:
            continue
        if args.mode == "drop-in-data":
            serve(held[-1])

if __name__ == "__main__":
    main()
