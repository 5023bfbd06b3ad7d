# An FTP server over TLS for the tests: Debian's pyftpdlib with its TLS handler
# (python3-openssl) on 127.0.0.1.
# usage: ftps_peer.py MODE ROOT USER PASSWORD CERT KEY
#   MODE implicit  TLS from the first byte (ftps://)
#        explicit  AUTH TLS first, then TLS required on control and data (ftpes://)
#        plain     no TLS offered at all (AUTH is refused)
# Prints the port once it listens. Every command is logged to stderr as
# "CMD <line>" (the password as ****), every data connection as "DATA TLS" or
# "DATA PLAIN", a failed handshake as "SSL handshake failed.".
import logging
import sys

from pyftpdlib.authorizers import DummyAuthorizer
from pyftpdlib.handlers import FTPHandler, TLS_DTPHandler, TLS_FTPHandler
from pyftpdlib.servers import FTPServer

mode, root, user, password, cert, key = sys.argv[1:7]
logging.basicConfig(stream=sys.stderr, level=logging.INFO, format="%(message)s")


def log(text):
    sys.stderr.write(text + "\n")
    sys.stderr.flush()


class LoggedCommands:
    def pre_process_command(self, line, cmd, arg):
        log("CMD " + ("PASS ****" if cmd == "PASS" else line))
        super().pre_process_command(line, cmd, arg)

    def on_file_sent(self, file):
        log("SENT " + file)

    def on_file_received(self, file):
        log("RECEIVED " + file)


class CheckedDTP(TLS_DTPHandler):
    def readable(self):
        # A client that opens the data connection before its RETR or STOR
        # (curl does) starts the handshake at once; pyftpdlib would take the
        # not yet used channel for a closed one.
        if self._ssl_accepting or self._ssl_want_read:
            return True
        return super().readable()

    def handle_ssl_established(self):
        log("DATA TLS")
        super().handle_ssl_established()


class ExplicitHandler(LoggedCommands, TLS_FTPHandler):
    tls_control_required = True
    tls_data_required = True
    dtp_handler = CheckedDTP


class ImplicitHandler(ExplicitHandler):
    def handle(self):
        # The greeting waits for the handshake.
        self.secure_connection(self.ssl_context)

    def handle_ssl_established(self):
        TLS_FTPHandler.handle(self)


class PlainHandler(LoggedCommands, FTPHandler):
    pass


handler = {"implicit": ImplicitHandler, "explicit": ExplicitHandler, "plain": PlainHandler}[mode]
if mode != "plain":
    handler.certfile = cert
    handler.keyfile = key
authorizer = DummyAuthorizer()
authorizer.add_user(user, password, root, perm="elradfmwMT")
handler.authorizer = authorizer
handler.auth_failed_timeout = 0
handler.use_sendfile = False
server = FTPServer(("127.0.0.1", 0), handler)
print(server.address[1], flush=True)
server.serve_forever()
