"""Stand-in for the module pywbem as far as the documents use it. Performs the requests with cimhost-lab."""

import os
import pathlib
import sys

sys.path.insert(0, str(pathlib.Path(__file__).resolve().parent.parent))

from object_manager import Manager, text_of  # noqa: E402


class Uint32(int):
    pass


class CIMInstance(dict):
    def __init__(self, classname, properties=None, path=None):
        super().__init__(properties or {})
        self.classname = classname
        self.path = path


class WBEMConnection:
    def __init__(self, url, creds=None, default_namespace="root/cimv2"):
        assert url.startswith("http") and len(creds) == 2 and default_namespace == "root/cimv2"
        self.manager = Manager(pathlib.Path(os.environ["BUILD"]), dict(os.environ))

    @staticmethod
    def instance(answer):
        values = {name: value["value"] for name, value in answer["properties"].items()}
        return CIMInstance(answer["path"]["class"], values, answer["path"]["uri"])

    @staticmethod
    def values(instance, names):
        return [f"{name}={text_of(instance[name])}" for name in names if instance[name] is not None]

    # Names and parameters are those of pywbem.
    def CreateInstance(self, NewInstance):  # noqa: N802, N803
        return self.manager.ask("ci", NewInstance.classname, *self.values(NewInstance, NewInstance))["uri"]

    def GetInstance(self, InstanceName):  # noqa: N802, N803
        return self.instance(self.manager.ask("gi", InstanceName))

    def ModifyInstance(self, ModifiedInstance, PropertyList=None):  # noqa: N802, N803
        self.manager.ask("mi", ModifiedInstance.path, *self.values(ModifiedInstance, PropertyList or ModifiedInstance))

    def EnumerateInstances(self, ClassName):  # noqa: N802, N803
        return [self.instance(each) for each in self.manager.ask("ei", ClassName)]

    def DeleteInstance(self, InstanceName):  # noqa: N802, N803
        self.manager.ask("di", InstanceName)
