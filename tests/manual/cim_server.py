"""Runs cimhost serve as tests need it, and sends it requests."""

import http.client
import re
import signal
import socket
import ssl
import subprocess
import urllib.parse
import xml.etree.ElementTree as xml

from environment import Environment

HEADERS = {"Content-Type": 'application/xml; charset="utf-8"', "CIMOperation": "MethodCall"}


def call(operation, parameters="", namespace="root/cimv2"):
    """Returns the body of a request."""
    names = "".join(f'<NAMESPACE NAME="{name}"/>' for name in namespace.split("/"))
    return ('<?xml version="1.0" encoding="utf-8"?><CIM CIMVERSION="2.0" DTDVERSION="2.0">'
            '<MESSAGE ID="1" PROTOCOLVERSION="1.0"><SIMPLEREQ>'
            f'<IMETHODCALL NAME="{operation}"><LOCALNAMESPACEPATH>{names}</LOCALNAMESPACEPATH>{parameters}'
            '</IMETHODCALL></SIMPLEREQ></MESSAGE></CIM>')


def class_parameter(name):
    return f'<IPARAMVALUE NAME="ClassName"><CLASSNAME NAME="{name}"/></IPARAMVALUE>'


def name_of(class_name, identifier):
    return (f'<INSTANCENAME CLASSNAME="{class_name}"><KEYBINDING NAME="InstanceID"><KEYVALUE VALUETYPE="string">'
            f'{identifier}</KEYVALUE></KEYBINDING></INSTANCENAME>')


def value_parameter(parameter, value):
    return f'<IPARAMVALUE NAME="{parameter}"><VALUE>{value}</VALUE></IPARAMVALUE>'


def path_parameter(parameter, class_name, identifier):
    return f'<IPARAMVALUE NAME="{parameter}">{name_of(class_name, identifier)}</IPARAMVALUE>'


def lease_parameter(parameter, identifier, **strings):
    """Returns a new lease, or a modified one, with properties that are strings."""
    properties = "".join(f'<PROPERTY NAME="{name}" TYPE="string"><VALUE>{value}</VALUE></PROPERTY>'
                         for name, value in {"InstanceID": identifier, **strings}.items())
    lease = f'<INSTANCE CLASSNAME="VELKO_Lease">{properties}</INSTANCE>'
    if parameter == "ModifiedInstance":
        lease = f'<VALUE.NAMEDINSTANCE>{name_of("VELKO_Lease", identifier)}{lease}</VALUE.NAMEDINSTANCE>'
    return f'<IPARAMVALUE NAME="{parameter}">{lease}</IPARAMVALUE>'


def headers_for(operation, namespace="root/cimv2", **changed):
    """Returns the headers of a request; a header that is None is left out."""
    headers = {**HEADERS, "CIMMethod": operation, "CIMObject": urllib.parse.quote(namespace, safe=""),
               **{name.replace("_", "-"): value for name, value in changed.items()}}
    return {name: value for name, value in headers.items() if value is not None}


class Client:
    """Sends requests to a server, whose certificate it does not check."""

    def __init__(self, host, port, tls=False):
        self.host, self.port, self.tls = host, port, tls
        self.context = ssl.create_default_context()
        self.context.check_hostname = False
        self.context.verify_mode = ssl.CERT_NONE

    def connection(self):
        if self.tls:
            return http.client.HTTPSConnection(self.host, self.port, timeout=30, context=self.context)
        return http.client.HTTPConnection(self.host, self.port, timeout=30)

    def send(self, body, headers, method="POST", connection=None):
        """Returns status, headers and body of the response."""
        used = connection or self.connection()
        used.request(method, "/cimom", body.encode() if isinstance(body, str) else body, headers)
        response = used.getresponse()
        content = response.read()
        if connection is None:
            used.close()
        return response.status, response.headers, content

    def ask(self, operation, parameters="", namespace="root/cimv2", connection=None, **changed):
        """Returns the element IMETHODRESPONSE of an operation."""
        status, _, content = self.send(call(operation, parameters, namespace),
                                       headers_for(operation, namespace, **changed), connection=connection)
        assert status == 200, (status, content)
        return xml.fromstring(content).find("MESSAGE/SIMPLERSP/IMETHODRESPONSE")


class CimServer(Client):
    """A server with the gate, or with other providers, until it is left.

    @param environment  with the agent and the programs
    @param options       of cimhost serve, besides the address
    @param provider      options that name other schemas and registrations"""

    def __init__(self, environment, *options, tls=False, provider=()):
        data = environment.build / "share" / "lease-warranty-provider"
        provider = provider or ("--schema", data / "velko.mof", "--library-path", environment.libraries(),
                                "--registration", data / "gate" / "LeaseAndWarrantyGate.reg",
                                "--registration", data / "OstrelComputerSystemProvider.reg")
        listen = ("--listen-tls" if tls else "--listen", "127.0.0.1:0")
        self.log = environment.directory / "serve.log"
        self.command = [str(word) for word in ("cimhost", *provider, "serve", *listen, *options)]
        self.environment = environment.environment
        super().__init__("127.0.0.1", None, tls)

    def __enter__(self):
        with open(self.log, "ab") as log:
            self.process = subprocess.Popen(self.command, env=self.environment, stdout=subprocess.PIPE, stderr=log,
                                            text=True)
        for line in self.process.stdout:
            found = re.search(r"listening on (https?://127\.0\.0\.1:(\d+))", line)
            if found:
                self.url, self.port = found[1], int(found[2])
                return self
        raise AssertionError(f"{self.command} ended with {self.process.wait()}: {self.log.read_text()}")

    def __exit__(self, *_):
        status = self.stop() if self.process.poll() is None else self.process.returncode
        self.process.stdout.close()
        assert status == 0, f"the server ended with {status}: {self.log.read_text()}"

    def stop(self):
        """Returns the exit status."""
        self.process.send_signal(signal.SIGTERM)
        return self.process.wait(60)

    def raw(self, data):
        """Sends bytes and returns all that the server answers until it closes the connection or stays silent."""
        with socket.create_connection(("127.0.0.1", self.port), timeout=30) as client:
            client.sendall(data)
            return read_all(client)


def read_all(client):
    received = b""
    while True:
        try:
            part = client.recv(65536)
        except ConnectionResetError:
            part = b""
        if not part:
            return received
        received += part


class Machine(Environment):
    """With a number of leases.

    @param build  the build tree, or an installation"""

    def __init__(self, build, leases=1):
        super().__init__(build)
        self.cimhost("ci", 'VELKO_Lease.InstanceID="L0"')
        _, _, *fields = self.data("Lease.dat")
        records = "".join("\n".join([f"L{number}", *fields, ""]) for number in range(leases))
        self.write_data("Lease.dat", f"{leases}\n{records}")

    def serve(self, *options, **more):
        return CimServer(self, "--no-authentication", *options, **more)

    def configured(self, toml):
        file = self.directory / "cimhost.toml"
        file.write_text(toml, encoding="utf-8")
        return self.serve("--configuration", file)

    def certificate(self, name):
        """Makes a certificate with its key; returns their files."""
        files = self.directory / "certificate.pem", self.directory / "key.pem"
        subprocess.run(["openssl", "req", "-x509", "-newkey", "ec", "-pkeyopt", "ec_paramgen_curve:P-256", "-nodes",
                        "-days", "2", "-subj", f"/CN={name}", "-out", files[0], "-keyout", files[1]],
                       check=True, capture_output=True)
        return files
