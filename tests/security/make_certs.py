# Certificates for the TLS tests, made fresh in a folder:
#   ca.pem                the test's private CA (what --ca-file adds)
#   good.pem/.key         signed by it, for localhost and 127.0.0.1
#   expired.pem/.key      signed by it, for localhost, ran out a year ago
#   wrong_name.pem/.key   signed by it, for other.example only
#   stranger.pem/.key     for localhost, signed by a CA nobody trusts
#   not_a_cert.pem        text without a certificate
# usage: make_certs.py FOLDER
import datetime
import ipaddress
import os
import sys

from cryptography import x509
from cryptography.hazmat.primitives import hashes, serialization
from cryptography.hazmat.primitives.asymmetric import ec
from cryptography.x509.oid import NameOID

folder = sys.argv[1]
now = datetime.datetime.now(datetime.timezone.utc)
day = datetime.timedelta(days=1)


def key():
    return ec.generate_private_key(ec.SECP256R1())


def name(text):
    return x509.Name([x509.NameAttribute(NameOID.COMMON_NAME, text)])


def save(stem, cert, private_key=None):
    with open(os.path.join(folder, stem + ".pem"), "wb") as out:
        out.write(cert.public_bytes(serialization.Encoding.PEM))
    if private_key is not None:
        with open(os.path.join(folder, stem + ".key"), "wb") as out:
            out.write(private_key.private_bytes(serialization.Encoding.PEM,
                                                serialization.PrivateFormat.PKCS8,
                                                serialization.NoEncryption()))


def make_ca(common_name):
    ca_key = key()
    cert = (x509.CertificateBuilder().subject_name(name(common_name)).issuer_name(name(common_name))
            .public_key(ca_key.public_key()).serial_number(x509.random_serial_number())
            .not_valid_before(now - 2 * day).not_valid_after(now + 3650 * day)
            .add_extension(x509.BasicConstraints(ca=True, path_length=None), critical=True)
            .add_extension(x509.KeyUsage(digital_signature=True, content_commitment=False,
                                         key_encipherment=False, data_encipherment=False,
                                         key_agreement=False, key_cert_sign=True, crl_sign=True,
                                         encipher_only=False, decipher_only=False), critical=True)
            .add_extension(x509.SubjectKeyIdentifier.from_public_key(ca_key.public_key()),
                           critical=False)
            .sign(ca_key, hashes.SHA256()))
    return cert, ca_key


def make_leaf(stem, ca, ca_key, dns, ips, start, end):
    leaf_key = key()
    names = [x509.DNSName(d) for d in dns] + [x509.IPAddress(ipaddress.ip_address(i)) for i in ips]
    cert = (x509.CertificateBuilder().subject_name(name(dns[0])).issuer_name(ca.subject)
            .public_key(leaf_key.public_key()).serial_number(x509.random_serial_number())
            .not_valid_before(start).not_valid_after(end)
            .add_extension(x509.SubjectAlternativeName(names), critical=False)
            .add_extension(x509.BasicConstraints(ca=False, path_length=None), critical=True)
            .add_extension(x509.ExtendedKeyUsage([x509.oid.ExtendedKeyUsageOID.SERVER_AUTH]),
                           critical=False)
            .add_extension(x509.AuthorityKeyIdentifier.from_issuer_public_key(ca_key.public_key()),
                           critical=False)
            .sign(ca_key, hashes.SHA256()))
    save(stem, cert, leaf_key)


ca, ca_key = make_ca("Quorvel Test CA")
save("ca", ca)
make_leaf("good", ca, ca_key, ["localhost"], ["127.0.0.1"], now - day, now + 365 * day)
make_leaf("expired", ca, ca_key, ["localhost"], ["127.0.0.1"], now - 730 * day, now - 365 * day)
make_leaf("wrong_name", ca, ca_key, ["other.example"], [], now - day, now + 365 * day)
stranger_ca, stranger_key = make_ca("Nobody's CA")
make_leaf("stranger", stranger_ca, stranger_key, ["localhost"], ["127.0.0.1"], now - day,
          now + 365 * day)
with open(os.path.join(folder, "not_a_cert.pem"), "w") as out:
    out.write("this is no certificate\n")
