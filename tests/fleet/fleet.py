"""A machine for the fleet tools: an agent with temporary data, and cimhost with the gate or the bare provider."""

import json
import pathlib
import subprocess
import sys

sys.path.insert(0, str(pathlib.Path(__file__).resolve().parent.parent / "manual"))

from environment import Environment

ROOT = pathlib.Path(__file__).resolve().parent.parent.parent
PROVIDERS = {"gate": "LeaseAndWarrantyGate.reg", "bare": "LeaseAndWarrantyProvider.reg"}
THIS_COMPUTER = "/system/computer"
LEASE = {"Lessor": "ACME Leasing Co", "BaseTermCommencementDate": "20250131000000.000000+060", "LeaseTerm": "37",
         "BaseRent": "1250.00 EUR"}
WARRANTY = {"Warrantor": "Acme Service", "WarrantyStartDate": "20260115000000.000000+000", "WarrantyDuration": "24"}
ASSET = {"AssetNumber": "A-4711", "PrimaryOwnerName": "Jo Example", "PrimaryOwnerDepartment": "Sales",
         "SystemLocation": "Building 3", "PurchaseDate": "20260115000000.000000+060"}


class Fleet(Environment):
    """@param provider  "gate" or "bare"; None for the one that cimhost uses by default"""

    def __init__(self, build, provider=None):
        super().__init__(build)
        if provider:
            data = build / "share" / "lease-warranty-provider"
            self.environment["CIMHOST_REGISTRATION"] = ":".join(
                str(next(data.rglob(name))) for name in (PROVIDERS[provider], "OstrelComputerSystemProvider.reg"))

    def create(self, class_name, identifier, values):
        path = f'{class_name}.InstanceID="{identifier}"'
        self.cimhost("ci", path)
        if values:
            self.cimhost("mi", path, *(f"{name}={value}" for name, value in values.items()))

    def fill(self):
        """Stores a lease, a warranty and asset data. Returns the machine."""
        self.create("VELKO_Lease", THIS_COMPUTER, LEASE)
        self.create("VELKO_Warranty", THIS_COMPUTER, WARRANTY)
        self.cimhost("mi", self.cimhost("ein", "VELKO_AssetIDDetails").strip(),
                     *(f"{name}={value}" for name, value in ASSET.items()))
        return self

    def program(self, *command):
        """Runs a command. Returns the finished process, with standard output and standard error separate."""
        return subprocess.run([str(word) for word in command], cwd=self.directory, env=self.environment, text=True,
                              stdout=subprocess.PIPE, stderr=subprocess.PIPE, check=False)

    def succeed(self, *command):
        ended = self.program(*command)
        if ended.returncode != 0:
            raise AssertionError(f"{command} ended with {ended.returncode}: {ended.stdout}{ended.stderr}")
        return ended.stdout

    def export(self):
        return json.loads(self.succeed("lease-warranty-export"))

    def replace_cimhost(self, script):
        """Replaces cimhost by a shell script, in which $cimhost is the real program."""
        program = self.directory / "bin" / "cimhost"
        program.write_text(f"#!/bin/sh\ncimhost='{self.build / 'bin' / 'cimhost'}'\n{script}\n", encoding="utf-8")
        program.chmod(0o755)
