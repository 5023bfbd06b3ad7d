# A real FTP server for the tests: Debian's pyftpdlib on 127.0.0.1.
# usage: ftp_peer.py ROOT USER PASSWORD [PORT]   (port 0 or none: any free one)
# Prints the port once it listens. Failed log-ins are answered at once.
import sys
from pyftpdlib.authorizers import DummyAuthorizer
from pyftpdlib.handlers import FTPHandler
from pyftpdlib.servers import FTPServer

root, user, password = sys.argv[1:4]
port = int(sys.argv[4]) if len(sys.argv) > 4 else 0
authorizer = DummyAuthorizer()
authorizer.add_user(user, password, root, perm="elradfmwMT")
FTPHandler.authorizer = authorizer
FTPHandler.auth_failed_timeout = 0
server = FTPServer(("127.0.0.1", port), FTPHandler)
print(server.address[1], flush=True)
server.serve_forever()
