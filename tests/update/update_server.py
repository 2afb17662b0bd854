#!/usr/bin/env python3
"""Serves the folder given over HTTP on 127.0.0.1 for the software update tests, and misbehaves
on purpose on a few paths:

  /hang/...      reads the request and never answers
  /cut/NAME      announces NAME's length, sends half of it and closes the connection
  /nolength/NAME sends NAME without a Content-Length, ending it by closing the connection
  /named/NAME    sends NAME with a Content-Disposition that suggests "Pelmo-2.0.deb"
  /moved/NAME    redirects to /NAME on the same host
  /away/NAME     redirects to http://localhost:PORT/NAME, another host over plain HTTP

Prints "PORT <n>" once listening, then "GET <path>" for each request; stops when its standard
input closes, or after a minute so that a test that dies never leaves it behind.
"""

import functools
import http.server
import os
import sys
import threading
import time


class Handler(http.server.SimpleHTTPRequestHandler):
    protocol_version = "HTTP/1.1"

    def log_message(self, *args):
        pass

    def send_file(self, name, length=True, disposition=None, cut=False):
        with open(os.path.join(self.directory, name), "rb") as f:
            body = f.read()
        self.send_response(200)
        self.send_header("Content-Type", "application/octet-stream")
        if length:
            self.send_header("Content-Length", str(len(body)))
        if disposition:
            self.send_header("Content-Disposition", disposition)
        self.end_headers()
        self.wfile.write(body[: len(body) // 2] if cut else body)
        self.wfile.flush()
        self.close_connection = True

    def redirect(self, location):
        self.send_response(302)
        self.send_header("Location", location)
        self.send_header("Content-Length", "0")
        self.end_headers()

    def do_GET(self):
        print(f"GET {self.path}", flush=True)
        parts = self.path.split("/")
        if parts[1] == "hang":
            time.sleep(30)
        elif parts[1] == "cut":
            self.send_file(parts[2], cut=True)
        elif parts[1] == "nolength":
            self.protocol_version = "HTTP/1.0"
            self.send_file(parts[2], length=False)
        elif parts[1] == "named":
            self.send_file(parts[2], disposition='attachment; filename="../Pelmo-2.0.deb"')
        elif parts[1] == "moved":
            self.redirect("/" + parts[2])
        elif parts[1] == "away":
            self.redirect(f"http://localhost:{self.server.server_address[1]}/{parts[2]}")
        else:
            super().do_GET()


server = http.server.ThreadingHTTPServer(
    ("127.0.0.1", 0), functools.partial(Handler, directory=sys.argv[1]))
server.daemon_threads = True
print(f"PORT {server.server_address[1]}", flush=True)
threading.Thread(target=server.serve_forever, daemon=True).start()
threading.Timer(60, lambda: os._exit(0)).start()
sys.stdin.read()
os._exit(0)
