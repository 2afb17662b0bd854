#!/usr/bin/env python3
"""A TCP relay on 127.0.0.1 that holds every chunk DELAY ms in each direction, like a server
that far away, and counts the client's waits: the server's replies that reach it, each one a
round trip the client had to sit out. Prints "PORT <n>" once it listens, then on standard
input's end or after --lifetime seconds "WAITS <n> SESSIONS <n>".
Usage: delay-relay.py TARGET-PORT [--delay MS] [--lifetime S]"""

import argparse
import asyncio
import os
import sys

counts = {"waits": 0, "sessions": 0}


async def pipe(reader, writer, delay, count):
    queue = asyncio.Queue()

    async def deliver():
        while True:
            due, data = await queue.get()
            await asyncio.sleep(max(0.0, due - asyncio.get_running_loop().time()))
            if data is None:
                writer.close()
                return
            writer.write(data)
            if count:
                counts["waits"] += 1

    sender = asyncio.create_task(deliver())
    while True:
        data = await reader.read(65536)
        await queue.put((asyncio.get_running_loop().time() + delay, data or None))
        if not data:
            break
    await sender


async def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("target", type=int)
    parser.add_argument("--delay", type=float, default=10.0)
    parser.add_argument("--lifetime", type=float, default=600.0)
    args = parser.parse_args()
    delay = args.delay / 1000

    async def relay(client_reader, client_writer):
        counts["sessions"] += 1
        server_reader, server_writer = await asyncio.open_connection("127.0.0.1", args.target)
        await asyncio.gather(pipe(client_reader, server_writer, delay, False),
                             pipe(server_reader, client_writer, delay, True),
                             return_exceptions=True)

    server = await asyncio.start_server(relay, "127.0.0.1", 0)
    print(f"PORT {server.sockets[0].getsockname()[1]}", flush=True)
    loop = asyncio.get_running_loop()
    stdin_closed = loop.run_in_executor(None, sys.stdin.read)
    await asyncio.wait([asyncio.ensure_future(stdin_closed)], timeout=args.lifetime)
    print(f"WAITS {counts['waits']} SESSIONS {counts['sessions']}", flush=True)
    # Connections still open are simply dropped.
    os._exit(0)


asyncio.run(main())
