"""A stand-in for an object manager: cimhost-lab performs each request, with the gate or without it, as SFCB would.

Implements CIM-XML over HTTP as far as the documents' clients need it. The module stand-ins/pywbem
calls it for the documents' Python client.
"""

import contextlib
import http.server
import json
import os
import re
import subprocess
import threading
import urllib.parse
import xml.etree.ElementTree as xml


class CimError(Exception):
    def __init__(self, code, text):
        super().__init__(text)
        self.code = code


def quoted(text):
    return '"' + text.replace("\\", "\\\\").replace('"', '\\"') + '"'


class Manager:
    """@param build      directory with bin/ and share/
    @param environment  of cimhost-lab
    @param provider     "gate", or "bare" for the provider without it"""

    def __init__(self, build, environment, provider="gate"):
        data = build / "share" / "lease-warranty-provider"
        registration = {"gate": "gate/LeaseAndWarrantyGate.reg", "bare": "LeaseAndWarrantyProvider.reg"}[provider]
        name = "libLeaseAndWarrantyGate.so"
        libraries = next(path.parent for path in sorted((build / "lib").glob(f"**/{name}")))
        program = os.environ.get("CIMHOST_LAB", build / "bin" / "cimhost-lab")  # an installation has none
        self.command = [str(program), "--as", "sfcb", "--format", "json", "--schema", str(data / "velko.mof"),
                        "--library-path", str(libraries), "--registration", str(data / registration),
                        "--registration", str(data / "OstrelComputerSystemProvider.reg")]
        self.environment = environment
        self.asked = []  # the operations, in their order

    def ask(self, command, *arguments):
        self.asked.append(command)
        ended = subprocess.run([*self.command, command, *arguments], stdout=subprocess.PIPE, stderr=subprocess.PIPE,
                               text=True, env=self.environment)
        if ended.returncode != 0:
            code = re.match(r"cimhost-lab: error (\d+) \(\w+\): (.*)", ended.stderr, re.S)
            wrong_usage = "4" if ended.returncode == 2 else "1"
            raise CimError(code[1] if code else wrong_usage, code[2] if code else ended.stderr)
        return json.loads(ended.stdout) if ended.stdout else None


# --- requests ------------------------------------------------------------------------------------------------------


def path_of(element):
    """Returns the WBEM URI of an INSTANCENAME."""
    keys = []
    for key in element.findall("KEYBINDING"):
        reference = key.find(".//INSTANCENAME")
        value = key.findtext("KEYVALUE") or "" if reference is None else path_of(reference)
        keys.append(f'{key.get("NAME")}={quoted(value)}')
    return element.get("CLASSNAME") + ("." + ",".join(keys) if keys else "")


def values_of(element):
    """Returns the values of an INSTANCE as arguments of cimhost-lab."""
    return [f'{each.get("NAME")}={each.findtext("VALUE") or ""}' for each in element.findall("PROPERTY")
            if each.find("VALUE") is not None]


def namespace_of(call):
    return "/".join(each.get("NAME") for each in call.findall("LOCALNAMESPACEPATH/NAMESPACE"))


def parameters_of(call):
    """Returns the parameters by name; names of classes and instances as URIs with the namespace."""
    uri = namespace_of(call) + ":"
    read = {"CLASSNAME": lambda child: uri + child.get("NAME"), "INSTANCENAME": lambda child: uri + path_of(child),
            "VALUE": lambda child: child.text or "", "VALUE.ARRAY": lambda child: [each.text for each in child]}
    return {parameter.get("NAME"): read.get(parameter[0].tag, lambda child: child)(parameter[0])
            for parameter in call.findall("IPARAMVALUE") if len(parameter)}


def options_of(given):
    """Returns the options of cimhost for the parameters of a request."""
    options = [f"--property={name}" for name in given.get("PropertyList", [])]
    for parameter, option in (("AssocClass", "assoc-class"), ("ResultClass", "result-class"), ("Role", "role"),
                              ("ResultRole", "result-role")):
        if parameter in given:
            options.append(f'--{option}={given[parameter].rpartition(":")[2]}')
    return options


# --- responses -----------------------------------------------------------------------------------------------------


def text_of(value):
    return ("true" if value else "false") if isinstance(value, bool) else str(value)


def name_element(path, parent):
    name = xml.SubElement(parent, "INSTANCENAME", CLASSNAME=path["class"])
    for key, value in path["keys"].items():
        binding = xml.SubElement(name, "KEYBINDING", NAME=key)
        if isinstance(value["value"], dict):
            name_element(value["value"], xml.SubElement(binding, "VALUE.REFERENCE"))
        else:
            xml.SubElement(binding, "KEYVALUE", VALUETYPE="string").text = text_of(value["value"])


def instance_element(instance, parent):
    element = xml.SubElement(parent, "INSTANCE", CLASSNAME=instance["path"]["class"])
    for name, value in instance["properties"].items():
        if isinstance(value["value"], dict):
            reference = xml.SubElement(element, "PROPERTY.REFERENCE", NAME=name)
            name_element(value["value"], xml.SubElement(reference, "VALUE.REFERENCE"))
            continue
        one = xml.SubElement(element, "PROPERTY", NAME=name, TYPE=value["type"])
        if value["value"] is not None:
            xml.SubElement(one, "VALUE").text = text_of(value["value"])


def class_element(listed, parent):
    element = xml.SubElement(parent, "CLASS", NAME=listed["class"])
    for each in listed["properties"]:
        if each["type"] == "reference":
            one = xml.SubElement(element, "PROPERTY.REFERENCE", NAME=each["name"],
                                 REFERENCECLASS=each["referenceClass"])
        else:
            one = xml.SubElement(element, "PROPERTY", NAME=each["name"], TYPE=each["type"])
        for qualifier in ["Key"] * each["key"] + ["Write"] * each["writable"]:
            xml.SubElement(xml.SubElement(one, "QUALIFIER", NAME=qualifier, TYPE="boolean"), "VALUE").text = "TRUE"


def named_element(instance, parent):
    element = xml.SubElement(parent, "VALUE.NAMEDINSTANCE")
    name_element(instance["path"], element)
    instance_element(instance, element)


def located_element(path, parent):
    element = xml.SubElement(parent, "INSTANCEPATH")
    place = xml.SubElement(element, "NAMESPACEPATH")
    xml.SubElement(place, "HOST").text = "localhost"
    names = xml.SubElement(place, "LOCALNAMESPACEPATH")
    for name in path["namespace"].split("/"):
        xml.SubElement(names, "NAMESPACE", NAME=name)
    name_element(path, element)


def object_path_element(path, parent):
    located_element(path, xml.SubElement(parent, "OBJECTPATH"))


def object_element(instance, parent):
    element = xml.SubElement(parent, "VALUE.OBJECTWITHPATH")
    located_element(instance["path"], element)
    instance_element(instance, element)


# Operations that list objects: cimhost's command, the parameter for its argument, the element of an object.
LISTINGS = {"EnumerateInstances": ("ei", "ClassName", named_element),
            "EnumerateInstanceNames": ("ein", "ClassName", name_element),
            "Associators": ("ai", "ObjectName", object_element),
            "AssociatorNames": ("ain", "ObjectName", object_path_element),
            "References": ("ri", "ObjectName", object_element),
            "ReferenceNames": ("rin", "ObjectName", object_path_element)}


def answer(manager, namespace, operation, given, value):
    """Performs an operation and adds the results to an element."""
    if operation == "GetClass":
        listed = [each for each in manager.ask("classes") if f'{namespace}:{each["class"]}' == given["ClassName"]]
        if not listed:
            raise CimError("6", "There is no such class.")
        class_element(listed[0], value)
    elif operation in LISTINGS:
        command, start, element = LISTINGS[operation]
        for each in manager.ask(command, given[start], *options_of(given)):
            element(each, value)
    elif operation == "GetInstance":
        instance_element(manager.ask("gi", given["InstanceName"], *options_of(given)), value)
    elif operation == "CreateInstance":
        new = given["NewInstance"]
        name_element(manager.ask("ci", f'{namespace}:{new.get("CLASSNAME")}', *values_of(new)), value)
    elif operation == "ModifyInstance":
        modified = given["ModifiedInstance"]
        manager.ask("mi", f'{namespace}:{path_of(modified.find("INSTANCENAME"))}',
                    *values_of(modified.find("INSTANCE")))
    elif operation == "DeleteInstance":
        manager.ask("di", given["InstanceName"])
    else:
        raise CimError("7", f"{operation} is not implemented")


def message(manager, request):
    call = xml.fromstring(request).find(".//IMETHODCALL")
    operation = call.get("NAME")
    cim = xml.Element("CIM", CIMVERSION="2.0", DTDVERSION="2.0")
    simple = xml.SubElement(xml.SubElement(cim, "MESSAGE", ID="4711", PROTOCOLVERSION="1.0"), "SIMPLERSP")
    response = xml.SubElement(simple, "IMETHODRESPONSE", NAME=operation)
    value = xml.Element("IRETURNVALUE")
    try:
        answer(manager, namespace_of(call), operation, parameters_of(call), value)
        if len(value) or not operation.startswith(("Modify", "Delete")):
            response.append(value)
    except CimError as error:
        xml.SubElement(response, "ERROR", CODE=error.code, DESCRIPTION=str(error))
    # wbemcli supports neither empty-element tags nor character references.
    text = xml.tostring(cim, encoding="unicode", short_empty_elements=False)
    return ('<?xml version="1.0" encoding="utf-8"?>\n' + text).encode()


class Server:
    """A context manager that listens on a free port of the loopback interface."""

    def __init__(self, manager):
        class Handler(http.server.BaseHTTPRequestHandler):
            def do_POST(self):  # noqa: N802, the name is the library's
                body = message(manager, self.rfile.read(int(self.headers["Content-Length"])))
                self.send_response(200)
                for name, text in (("Content-Type", "application/xml"), ("CIMOperation", "MethodResponse"),
                                   ("Content-Length", str(len(body)))):
                    self.send_header(name, text)
                self.end_headers()
                with contextlib.suppress(BrokenPipeError):  # The client may have left.
                    self.wfile.write(body)

            def log_message(self, *_):
                pass

        self.server = http.server.HTTPServer(("127.0.0.1", 0), Handler)
        self.url = urllib.parse.urlunsplit(("http", f"localhost:{self.server.server_port}", "", "", ""))

    def __enter__(self):
        self.thread = threading.Thread(target=self.server.serve_forever)
        self.thread.start()
        return self

    def __exit__(self, *_):
        self.server.shutdown()
        self.thread.join()
        self.server.server_close()
