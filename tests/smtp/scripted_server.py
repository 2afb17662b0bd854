#!/usr/bin/env python3
"""An SMTP server on 127.0.0.1 that misbehaves on purpose: it plays one conversation of a
transcript file, read as the head of tests/data/smtp/conversations.txt tells. Prints "PORT <n>",
then each line from the client as a JSON string, and "END" once it is over."""

import json
import socket
import sys
import time

path, name = sys.argv[1:]
with open(path, encoding="utf-8") as transcript:
    script = transcript.read().split(f"\n== {name}\n")[1].split("\n== ")[0].split("\n")
pieces = next((int(line[7:]) for line in script if line.startswith("pieces ")), 0)
listener = socket.create_server(("127.0.0.1", 0))
port = listener.getsockname()[1]
if "not listening" in script:
    listener.close()
    print(f"PORT {port}\nEND", flush=True)
    sys.exit()
print(f"PORT {port}", flush=True)
listener.settimeout(30)
connection = listener.accept()[0]
connection.settimeout(30)
client = connection.makefile("rb")
at = 0
while True:
    out, hang_up = b"", False
    while at < len(script) and not script[at].startswith("C:"):
        out += script[at][3:].encode() + b"\r\n" if script[at].startswith("S:") else b""
        hang_up = hang_up or script[at] == "hang up"
        at += 1
    step = pieces or max(len(out), 1)
    for start in range(0, len(out), step):
        connection.sendall(out[start:start + step])
        time.sleep(0.02 if pieces else 0)
    try:
        line = b"" if hang_up else client.readline()
    except OSError:  # the client reset the connection
        line = b""
    if not line:
        break
    print(json.dumps(line.decode("utf-8", "backslashreplace").removesuffix("\r\n")), flush=True)
    at += 1
connection.close()
print("END", flush=True)
