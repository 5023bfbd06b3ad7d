# A real FTP server for the tests: Debian's pyftpdlib on 127.0.0.1, with faults
# a test can script.
# usage: ftp_peer.py ROOT USER PASSWORD [PORT [FAULTS]]   (port 0: any free one)
# Prints the port once it listens. Failed log-ins are answered at once. Every
# command received is logged to stderr as "CMD <line>" (the password as ****).
#
# FAULTS is a JSON list; each fault acts on occurrence `nth` (1 = the first,
# counted over the whole run) of command `at`, and on `count` occurrences from
# there (default 1; 0 = every one):
#   {"at": "RETR", "reply": "451 Local error"}   answer this instead of acting
#                                  (a 421 reply also closes the connection)
#   {"at": "SIZE", "stall": true}  never answer
#   {"at": "RETR", "cut_after": N, "then": "426"|"226"|"kill"}
#                                  send N bytes of the file, then abort the data
#                                  connection with 426, end it as if complete
#                                  (226), or kill the whole server
#   {"at": "RETR", "stall_after": N}  send N bytes, then nothing more
#   {"at": "RETR", "resize_after": N, "size": M}
#                                  send N bytes, then cut or extend the file on
#                                  disk to M bytes and go on reading it
#   {"at": "PASV", "pasv_host": "127,0,0,2"}
#                                  name another host in the 227 reply
#   {"idle_close": SECONDS}        close a control connection idle that long
#                                  (with "421 Control connection timed out.")
import json
import os
import re
import sys

from pyftpdlib.authorizers import DummyAuthorizer
from pyftpdlib.handlers import DTPHandler, FTPHandler
from pyftpdlib.servers import FTPServer

root, user, password = sys.argv[1:4]
port = int(sys.argv[4]) if len(sys.argv) > 4 else 0
faults = json.loads(sys.argv[5]) if len(sys.argv) > 5 else []
seen = {}


def log(text):
    sys.stderr.write(text + "\n")
    sys.stderr.flush()


def fault_for(cmd):
    """The fault that applies to this occurrence of cmd, if any."""
    seen[cmd] = seen.get(cmd, 0) + 1
    for fault in faults:
        if fault.get("at") != cmd:
            continue
        first = fault.get("nth", 1)
        count = fault.get("count", 1)
        if seen[cmd] >= first and (count == 0 or seen[cmd] < first + count):
            return fault
    return None


class ScriptedProducer(object):
    """Reads the file like pyftpdlib's own producer, with a fault at a byte."""

    def __init__(self, handler, fd, path, fault):
        self.handler, self.fd, self.path, self.fault = handler, fd, path, fault
        self.limit = next((fault[k] for k in ("cut_after", "stall_after", "resize_after")
                           if k in fault), None)
        self.sent = 0

    def more(self):
        if self.limit is not None and self.sent >= self.limit:
            self.limit = None
            if not self.at_limit():
                return b""
        wanted = 65536 if self.limit is None else min(65536, self.limit - self.sent)
        data = self.fd.read(wanted)
        self.sent += len(data)
        return data

    def at_limit(self):
        """Acts at the byte; false when the transfer ends here."""
        fault = self.fault
        if "cut_after" in fault:
            then = fault.get("then", "426")
            if then == "kill":
                log("KILLED")
                os._exit(3)
            if then == "426":
                channel = self.handler.data_channel
                channel._resp = ("426 Connection closed; transfer aborted.", log)
                channel.close()
            return False
        if "resize_after" in fault:
            os.truncate(self.path, fault["size"])
        return True


class ScriptedDTP(DTPHandler):
    def initiate_send(self):
        stall_at = getattr(self.cmd_channel, "stall_at", None)
        if stall_at is not None and self.get_transmitted_bytes() >= stall_at:
            # Nothing more goes out; the client has to give up on its own.
            self.modify_ioloop_events(self.ioloop.READ)
            return
        DTPHandler.initiate_send(self)


class ScriptedHandler(FTPHandler):
    dtp_handler = ScriptedDTP
    use_sendfile = False
    fault = None
    stall_at = None

    def pre_process_command(self, line, cmd, arg):
        log("CMD " + ("PASS ****" if cmd == "PASS" else line))
        fault = fault_for(cmd)
        if fault is not None and "reply" in fault:
            self.respond(fault["reply"])
            if fault["reply"].startswith("421"):
                self.close_when_done()
            return
        if fault is not None and fault.get("stall"):
            return
        self.fault = fault
        FTPHandler.pre_process_command(self, line, cmd, arg)

    def respond(self, resp, *args, **kwargs):
        host = (self.fault or {}).get("pasv_host")
        if host and resp.startswith("227"):
            resp = re.sub(r"\(\d+,\d+,\d+,\d+,", "(" + host + ",", resp)
        FTPHandler.respond(self, resp, *args, **kwargs)

    def ftp_RETR(self, file):
        fault = self.fault
        self.stall_at = fault.get("stall_after") if fault else None
        if fault is None:
            return FTPHandler.ftp_RETR(self, file)
        try:
            fd = self.run_as_current_user(self.fs.open, file, "rb")
        except EnvironmentError as err:
            self.respond("550 %s." % err.strerror)
            return
        producer = ScriptedProducer(self, fd, file, fault)
        self.push_dtp_data(producer, isproducer=True, file=fd, cmd="RETR")
        return file


authorizer = DummyAuthorizer()
authorizer.add_user(user, password, root, perm="elradfmwMT")
ScriptedHandler.authorizer = authorizer
ScriptedHandler.auth_failed_timeout = 0
for fault in faults:
    if "idle_close" in fault:
        ScriptedHandler.timeout = fault["idle_close"]
server = FTPServer(("127.0.0.1", port), ScriptedHandler)
print(server.address[1], flush=True)
server.serve_forever()
