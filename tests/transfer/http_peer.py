# A real HTTP server for the tests on 127.0.0.1, serving the files of ROOT.
# usage: http_peer.py ROOT   Prints the port once it listens. A missing file
# gets a 404 with a plain-text body.
import os, sys
from http.server import BaseHTTPRequestHandler, ThreadingHTTPServer

root = sys.argv[1]

class Handler(BaseHTTPRequestHandler):
    def do_GET(self):
        path = os.path.join(root, self.path.split("?")[0].lstrip("/"))
        status, body = 200, b""
        if os.path.isfile(path):
            with open(path, "rb") as f:
                body = f.read()
        else:
            status, body = 404, b"No such file here\n"
        self.send_response(status)
        self.send_header("Content-Type", "text/plain")
        self.send_header("Content-Length", str(len(body)))
        self.end_headers()
        self.wfile.write(body)

    def log_message(self, *args):
        pass

server = ThreadingHTTPServer(("127.0.0.1", 0), Handler)
print(server.server_address[1], flush=True)
server.serve_forever()
