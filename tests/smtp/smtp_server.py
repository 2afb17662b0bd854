#!/usr/bin/env python3
"""A real SMTP server for tests, aiosmtpd on 127.0.0.1. Prints "PORT <n>" once it accepts
connections, then a JSON line per accepted message: mail_from, mail_options, rcpt_tos and data
(base64). Stops when its standard input closes or after --lifetime seconds."""

import argparse
import asyncio
import base64
import hmac
import json
import logging
import os
import secrets
import ssl
import sys

from aiosmtpd.smtp import SMTP, AuthResult, LoginPassword, auth_mechanism, syntax


class Handler:
    def __init__(self, args):
        self.user, self.password = args.user.encode(), args.password.encode()
        self.refused_recipients = set(args.refuse_recipient)
        self.refused_senders = set(args.refuse_sender)
        # ADDRESS=K: the first K tries of that address are answered 451, as a greylisting or
        # busy server does.
        self.deferrals = {}
        for deferral in args.defer_recipient:
            address, _, times = deferral.rpartition("=")
            self.deferrals[address] = int(times)

    async def handle_MAIL(self, server, session, envelope, address, mail_options):
        if address in self.refused_senders:
            return f"553 5.7.1 <{address}>: Sender address rejected"
        envelope.mail_from = address
        envelope.mail_options.extend(mail_options)
        return "250 2.1.0 OK"

    async def handle_RCPT(self, server, session, envelope, address, rcpt_options):
        if address in self.refused_recipients:
            return f"550 5.1.1 <{address}>: Recipient address rejected"
        if self.deferrals.get(address, 0) > 0:
            self.deferrals[address] -= 1
            return f"451 4.7.1 <{address}>: Try again later"
        envelope.rcpt_tos.append(address)
        return "250 2.1.5 OK"

    async def handle_DATA(self, server, session, envelope):
        record = {"mail_from": envelope.mail_from, "mail_options": envelope.mail_options,
                  "rcpt_tos": envelope.rcpt_tos,
                  "data": base64.b64encode(envelope.original_content).decode("ascii")}
        print(json.dumps(record), flush=True)
        return "250 2.0.0 Message accepted"

    # RFC 2195: the client answers "user SP hex(HMAC-MD5(password, challenge))".
    @auth_mechanism("CRAM-MD5")
    async def auth_CRAM_MD5(self, server, args):
        challenge = f"<{secrets.token_hex(8)}@localhost>".encode("ascii")
        response = await server.challenge_auth(challenge)
        if not isinstance(response, bytes):
            return AuthResult(success=False, handled=True)
        user, _, digest = response.rpartition(b" ")
        expected = hmac.new(self.password, challenge, "md5").hexdigest().encode("ascii")
        return AuthResult(success=user == self.user and hmac.compare_digest(digest, expected),
                          handled=False)

    def authenticate(self, server, session, envelope, mechanism, auth_data):
        ok = (isinstance(auth_data, LoginPassword) and auth_data.login == self.user
              and hmac.compare_digest(auth_data.password, self.password))
        return AuthResult(success=ok, handled=False)


class SlowDataSMTP(SMTP):
    """Waits --data-delay seconds before answering DATA, so that a test can stop the client
    while a copy is under way and before any of its text was sent."""

    data_delay = 0.0

    @syntax("DATA")
    async def smtp_DATA(self, arg):
        await asyncio.sleep(self.data_delay)
        await super().smtp_DATA(arg)


if __name__ == "__main__":
    parser = argparse.ArgumentParser(description=__doc__)
    parser.add_argument("--tls", choices=["none", "starttls", "implicit"], default="none")
    parser.add_argument("--require-starttls", action="store_true")
    parser.add_argument("--cert")  # PEM files of the server's certificate and key, for TLS
    parser.add_argument("--key")
    parser.add_argument("--user", default="user")
    parser.add_argument("--password", default="secret")
    parser.add_argument("--refuse-recipient", action="append", default=[])
    parser.add_argument("--refuse-sender", action="append", default=[])
    parser.add_argument("--defer-recipient", action="append", default=[],
                        help="ADDRESS=K: answer 451 to the first K RCPT TO of ADDRESS")
    parser.add_argument("--size", type=int, default=10 * 1024 * 1024)
    parser.add_argument("--lifetime", type=float, default=60.0)
    parser.add_argument("--data-delay", type=float, default=0.0,
                        help="seconds to wait before answering DATA")
    args = parser.parse_args()
    logging.getLogger("mail.log").setLevel(logging.CRITICAL)
    handler = Handler(args)
    SlowDataSMTP.data_delay = args.data_delay
    context = ssl.create_default_context(ssl.Purpose.CLIENT_AUTH)
    if args.tls != "none":
        context.load_cert_chain(args.cert, args.key)
    starttls = context if args.tls == "starttls" else None
    loop = asyncio.new_event_loop()

    def new_session():
        # With STARTTLS, AUTH is announced only once TLS is up, as real servers do.
        return SlowDataSMTP(handler, hostname="localhost", tls_context=starttls,
                    require_starttls=args.require_starttls, auth_require_tls=starttls is not None,
                    authenticator=handler.authenticate, data_size_limit=args.size, loop=loop)

    server = loop.run_until_complete(loop.create_server(
        new_session, "127.0.0.1", 0, ssl=context if args.tls == "implicit" else None))
    print(f"PORT {server.sockets[0].getsockname()[1]}", flush=True)

    def on_stdin():
        if not os.read(sys.stdin.fileno(), 4096):
            loop.stop()

    loop.add_reader(sys.stdin.fileno(), on_stdin)
    loop.call_later(args.lifetime, loop.stop)
    loop.run_forever()
    server.close()

