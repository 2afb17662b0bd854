#!/usr/bin/env python3
"""Serves a folder over HTTP on 127.0.0.1 for the message-source tests.

Prints "port <n>" once listening; stops when its standard input closes or after --lifetime
seconds, whichever comes first, so a test that dies never leaves it behind.
"""

import argparse
import functools
import http.server
import os
import sys
import threading


class QuietHandler(http.server.SimpleHTTPRequestHandler):
    def log_message(self, *args):
        pass


def main():
    parser = argparse.ArgumentParser(description=__doc__)
    parser.add_argument("root")
    parser.add_argument("--lifetime", type=float, default=60.0)
    args = parser.parse_args()
    handler = functools.partial(QuietHandler, directory=args.root)
    server = http.server.ThreadingHTTPServer(("127.0.0.1", 0), handler)
    print(f"port {server.server_address[1]}", flush=True)
    threading.Thread(target=server.serve_forever, daemon=True).start()
    threading.Timer(args.lifetime, lambda: os._exit(0)).start()
    sys.stdin.read()
    os._exit(0)


if __name__ == "__main__":
    main()
