#!/usr/bin/env python3
"""Serves the folder given over HTTP on 127.0.0.1 for the message-source tests.

Prints "PORT <n>" once listening; stops when its standard input closes, or after a minute so
that a test that dies never leaves it behind.
"""

import functools
import http.server
import os
import sys
import threading


class QuietHandler(http.server.SimpleHTTPRequestHandler):
    def log_message(self, *args):
        pass


server = http.server.ThreadingHTTPServer(
    ("127.0.0.1", 0), functools.partial(QuietHandler, directory=sys.argv[1]))
print(f"PORT {server.server_address[1]}", flush=True)
threading.Thread(target=server.serve_forever, daemon=True).start()
threading.Timer(60, lambda: os._exit(0)).start()
sys.stdin.read()
os._exit(0)
