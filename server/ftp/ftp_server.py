"""FTP for the reference service: one account per user, each confined to the
user's own folder under the data root. Run with Debian's /usr/bin/python3
(python3-pyftpdlib).

usage: ftp_server.py --data DIR [--port N] [--auth-delay SECONDS]
                     [--address ADDRESS] [--passive-ports FIRST-LAST]
                     [--masquerade ADDRESS]

Prints the port once it listens. Accounts are read from DIR/users.json at
every log-in, so users added while the server runs can log in at once.

The client names remote files by the web folder of its configuration file
followed by the user folder ("/wd/ann/site1.dat") or by the web folder alone
for files of its application and data folders ("/wd/site1.dat"). Those
prefixes, and the user folder alone ("/ann"), stand for the user's own folder,
which is also what a plain FTP client sees as "/". (A folder of the user's own
named like the web folder or the user is therefore hidden behind the alias.)
"""
import argparse
import hashlib
import hmac
import json
import logging
import os
import signal
import sys

from pyftpdlib.authorizers import AuthenticationFailed
from pyftpdlib.filesystems import AbstractedFS
from pyftpdlib.handlers import FTPHandler
from pyftpdlib.servers import FTPServer

PERMISSIONS = "elradfmwMT"


def read_json(path):
    try:
        with open(path, encoding="utf-8") as f:
            data = json.load(f)
    except FileNotFoundError:
        return {}
    return data if isinstance(data, dict) else {}


def password_matches(password, stored):
    """Checks a password against "pbkdf2-sha256$ROUNDS$SALT$HASH"."""
    try:
        scheme, rounds, salt, expected = stored.split("$")
        rounds = int(rounds)
    except (AttributeError, ValueError):
        return False
    if scheme != "pbkdf2-sha256" or rounds < 1:
        return False
    got = hashlib.pbkdf2_hmac("sha256", password.encode("utf-8", "surrogateescape"),
                              salt.encode("ascii"), rounds).hex()
    return hmac.compare_digest(got, expected)


class Accounts:
    """pyftpdlib's authorizer interface over the service's users file."""

    def __init__(self, root):
        self.root = os.path.realpath(root)

    def users(self):
        return read_json(os.path.join(self.root, "users.json"))

    def web_folder(self):
        folder = str(read_json(os.path.join(self.root, "site.json")).get("web_folder", "/wd"))
        folder = folder.replace("\\", "/").strip("/")
        return "/" + folder if folder else ""

    def home(self, username):
        return os.path.join(self.root, "users", username)

    def validate_authentication(self, username, password, handler):
        account = self.users().get(username)
        stored = account.get("ftp_password_hash") if isinstance(account, dict) else None
        if "/" in username or username.startswith(".") or not password_matches(password, stored):
            raise AuthenticationFailed("Authentication failed.")
        os.makedirs(self.home(username), exist_ok=True)

    def get_home_dir(self, username):
        return self.home(username)

    def impersonate_user(self, username, password):
        pass

    def terminate_impersonation(self, username):
        pass

    def has_user(self, username):
        return username in self.users()

    def has_perm(self, username, perm, path=None):
        if perm not in PERMISSIONS:
            return False
        if path is None:
            return True
        home = os.path.realpath(self.home(username))
        real = os.path.realpath(path)
        return real == home or real.startswith(home + os.sep)

    def get_perms(self, username):
        return PERMISSIONS

    def get_msg_login(self, username):
        return "Welcome to the Quorvel reference service."

    def get_msg_quit(self, username):
        return "Goodbye."


class UserFolderFS(AbstractedFS):
    """The user's folder as "/", also reached through the client's prefixes."""

    accounts = None

    def ftpnorm(self, ftppath):
        path = super().ftpnorm(ftppath)
        user = getattr(self.cmd_channel, "username", None) or ""
        web = self.accounts.web_folder()
        for prefix in (web + "/" + user, web, "/" + user):
            if prefix != "/" and (path == prefix or path.startswith(prefix + "/")):
                return "/" + path[len(prefix):].lstrip("/")
        return path


def stop(*_):
    raise SystemExit(0)


def main():
    parser = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    parser.add_argument("--data", required=True)
    parser.add_argument("--port", type=int, default=0)
    parser.add_argument("--auth-delay", type=float, default=2.0,
                        help="seconds before a failed log-in is answered")
    parser.add_argument("--address", default="127.0.0.1",
                        help="address to listen on (default 127.0.0.1; 0.0.0.0 for all)")
    parser.add_argument("--passive-ports", help="range for passive data connections, as FIRST-LAST")
    parser.add_argument("--masquerade", help="public address to announce behind NAT")
    args = parser.parse_args()

    logging.basicConfig(level=logging.INFO, stream=sys.stderr,
                        format="[%(asctime)s] %(message)s")
    accounts = Accounts(args.data)
    UserFolderFS.accounts = accounts
    handler = FTPHandler
    handler.authorizer = accounts
    handler.abstracted_fs = UserFolderFS
    handler.auth_failed_timeout = args.auth_delay
    handler.banner = "Quorvel reference service ready."
    handler.permit_foreign_addresses = False
    if args.passive_ports:
        first, last = (int(p) for p in args.passive_ports.split("-"))
        handler.passive_ports = range(first, last + 1)
    if args.masquerade:
        handler.masquerade_address = args.masquerade
    server = FTPServer((args.address, args.port), handler)
    signal.signal(signal.SIGTERM, stop)
    print(server.address[1], flush=True)
    try:
        server.serve_forever()
    except (KeyboardInterrupt, SystemExit):
        pass
    finally:
        server.close_all()


if __name__ == "__main__":
    main()
