#!/usr/bin/env python3
"""An SMTP server that misbehaves on purpose, on 127.0.0.1.

--mode drop-in-data: greets and answers normally, then closes the connection in the middle of
                     the message text.
--mode silent:       accepts the connection and never says a word.

Prints "PORT <n>" once listening; stops when its standard input closes or after --lifetime
seconds.
"""

import argparse
import os
import selectors
import socket
import sys
import time


def serve(connection, mode):
    if mode == "silent":
        return
    replies = {b"EHLO": b"250-localhost\r\n250 8BITMIME\r\n", b"HELO": b"250 localhost\r\n",
               b"MAIL": b"250 OK\r\n", b"RCPT": b"250 OK\r\n", b"DATA": b"354 go ahead\r\n"}
    connection.sendall(b"220 localhost ESMTP\r\n")
    pending = b""
    in_data = False
    while True:
        chunk = connection.recv(65536)
        if not chunk:
            return
        if in_data:
            connection.close()  # the message has started to arrive: drop it half-way
            return
        pending += chunk
        while b"\r\n" in pending:
            line, pending = pending.split(b"\r\n", 1)
            verb = line[:4].upper()
            connection.sendall(replies.get(verb, b"250 OK\r\n"))
            if verb == b"DATA":
                in_data = True


def main():
    parser = argparse.ArgumentParser(description=__doc__)
    parser.add_argument("--mode", choices=["drop-in-data", "silent"], required=True)
    parser.add_argument("--lifetime", type=float, default=60.0)
    args = parser.parse_args()
    listener = socket.socket()
    listener.bind(("127.0.0.1", 0))
    listener.listen(8)
    print(f"PORT {listener.getsockname()[1]}", flush=True)
    selector = selectors.DefaultSelector()
    selector.register(listener, selectors.EVENT_READ)
    selector.register(sys.stdin, selectors.EVENT_READ)
    held = []
    deadline = time.monotonic() + args.lifetime
    while time.monotonic() < deadline:
        for key, _ in selector.select(timeout=0.5):
            if key.fileobj is sys.stdin:
                if not os.read(sys.stdin.fileno(), 4096):
                    return
            else:
                connection, _ = listener.accept()
                held.append(connection)  # a silent server keeps its connections open
                serve(connection, args.mode)


if __name__ == "__main__":
    main()
