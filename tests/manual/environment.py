"""An environment for commands of documents: a separate agent, the programs of the build tree, and stand-ins."""

import os
import pathlib
import subprocess
import tempfile
import unittest

from pages import ROOT

STAND_INS = ROOT / "tests" / "packaging" / "stand-ins" / "stand-in"
HERE = pathlib.Path(__file__).resolve().parent


class Environment:
    """@param build     the build tree, or an installation
    @param stand_ins  commands to replace by stand-ins"""

    def __init__(self, build, stand_ins=()):
        place = tempfile.TemporaryDirectory()
        unittest.addModuleCleanup(place.cleanup)
        self.build = build
        self.directory = pathlib.Path(place.name)
        self.data_directory = self.directory / "data"
        self.log = self.directory / "ostrel.log"
        for name in ("data", "bin", "stand-in/fail", "stand-in/sfcb/stage"):
            (self.directory / name).mkdir(parents=True)
        (self.directory / "stand-in/sfcb/stage/default.reg").write_text("[Default]\n#\n", encoding="utf-8")
        for name in stand_ins:
            (self.directory / "bin" / name).symlink_to(STAND_INS)
        self.environment = {
            **os.environ, "BUILD": str(build), "OSTREL_CONFIG": str(self.directory / "agent.toml"), "no_proxy": "*",
            "STAND_IN": str(self.directory / "stand-in"), "LEASE_WARRANTY_LOCK": str(self.directory / "lock"),
            "PYTHONDONTWRITEBYTECODE": "1",
            "PYTHONPATH": str(HERE / "stand-ins"),
            "PATH": f"{self.directory / 'bin'}:{build / 'bin'}:{build / 'sbin'}:{os.environ['PATH']}"}
        self.configure(f'[directories]\ndata = "{self.data_directory}"\n')

    def configure(self, text):
        (self.directory / "agent.toml").write_text(text, encoding="utf-8")

    def libraries(self):
        name = "libLeaseAndWarrantyProvider.so"
        places = [self.build / "lib", *(path.parent for path in (self.build / "lib").glob(f"**/cmpi/{name}"))]
        return next(place for place in places if (place / name).exists())

    def placed(self, text, **replaced):
        """Replaces the directories of an installation in a text by those of this run."""
        places = {"/tmp": self.directory,
                  "/usr/share/lease-warranty-provider": self.build / "share" / "lease-warranty-provider",
                  "/usr/lib/x86_64-linux-gnu/cmpi": self.libraries(), "/var/log": self.directory,
                  "/var/lib/ostrel": self.data_directory, "/srv/ostrel": self.data_directory,
                  **replaced}
        for place, here in places.items():
            text = text.replace(place, str(here))
        return text

    def run(self, *command):
        return subprocess.run([str(word) for word in command], cwd=self.directory, env=self.environment, text=True,
                              stdout=subprocess.PIPE, stderr=subprocess.STDOUT)

    def shell(self, text, **replaced):
        """Returns the output of shell commands, which must succeed."""
        ended = self.run("bash", "-eu", "-o", "pipefail", "-c", self.placed(text, **replaced))
        if ended.returncode != 0:
            raise AssertionError(f"status {ended.returncode} of\n{text}\nwith the output\n{ended.stdout}")
        return ended.stdout

    def cimhost(self, *arguments):
        """Returns the output of cimhost, which must succeed."""
        ended = self.run("cimhost", *arguments)
        if ended.returncode != 0:
            raise AssertionError(f"{arguments} ended with {ended.returncode}: {ended.stdout}")
        return ended.stdout

    def data(self, name):
        """Returns the lines of a data file."""
        return (self.data_directory / name).read_text(encoding="utf-8").splitlines()

    def write_data(self, name, text):
        """Removes the file's saved copies, from which the gate would restore it."""
        for copy in self.data_directory.glob(f"{name}.saved*"):
            copy.unlink()
        (self.data_directory / name).write_text(text, encoding="utf-8")
