#!/usr/bin/python3
"""Loopback stand-in for wd.php for the benchmarks.

usage: reply_server.py DATA_DIR PORT_FILE

GETLASTDATE answers "OK 0"; GETDATA sends DATA_DIR/<file>.body (records and the
final "OK" line) with a Content-Length, by sendfile. Connections are kept open.
"""
import os
import socket
import socketserver
import sys
import urllib.parse

DATA_DIR = sys.argv[1]


class Handler(socketserver.BaseRequestHandler):
    def handle(self):
        sock = self.request
        sock.setsockopt(socket.IPPROTO_TCP, socket.TCP_NODELAY, 1)
        buf = b""
        while True:
            while b"\r\n\r\n" not in buf:
                chunk = sock.recv(65536)
                if not chunk:
                    return
                buf += chunk
            head, buf = buf.split(b"\r\n\r\n", 1)
            target = head.split(b"\r\n", 1)[0].split(b" ")[1].decode()
            query = urllib.parse.parse_qs(urllib.parse.urlsplit(target).query)
            cmd = query.get("cmd", [""])[0]
            if cmd == "GETDATA":
                path = os.path.join(DATA_DIR, os.path.basename(query["file"][0]) + ".body")
                size = os.path.getsize(path)
                sock.sendall(b"HTTP/1.1 200 OK\r\nContent-Type: text/plain\r\n"
                             b"Content-Length: %d\r\n\r\n" % size)
                with open(path, "rb") as body:
                    sock.sendfile(body)
            else:
                body = b"OK 0\r\n"
                sock.sendall(b"HTTP/1.1 200 OK\r\nContent-Length: %d\r\n\r\n" % len(body) + body)


class Server(socketserver.ThreadingTCPServer):
    daemon_threads = True
    allow_reuse_address = True


with Server(("127.0.0.1", 0), Handler) as server:
    with open(sys.argv[2] + ".tmp", "w") as f:
        f.write(str(server.server_address[1]))
    os.rename(sys.argv[2] + ".tmp", sys.argv[2])
    server.serve_forever()
