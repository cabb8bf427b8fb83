"""Stands for an object manager with the gate registered: cimhost answers each request, as SFCB would send it.

Answers CIM-XML over HTTP, as far as the clients in the documents need it; and, in the module pywbem of stand-ins/, the
calls that a Python client makes.
"""

import http.server
import json
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
    @param environment  of cimhost"""

    def __init__(self, build, environment):
        data = build / "share" / "lease-warranty-provider"
        self.command = [str(build / "bin" / "cimhost"), "--as", "sfcb", "--format", "json", "--registration",
                        str(data / "gate"), "--registration", str(data / "OstrelComputerSystemProvider.reg")]
        self.environment = environment
        self.asked = []  # the operations, in their order

    def ask(self, command, *arguments):
        self.asked.append(command)
        ended = subprocess.run([*self.command, command, *arguments], stdout=subprocess.PIPE, stderr=subprocess.PIPE,
                               text=True, env=self.environment)
        if ended.returncode != 0:
            code = re.match(r"cimhost: error (\d+) \(\w+\): (.*)", ended.stderr, re.S)
            raise CimError(code[1] if code else "1", code[2] if code else ended.stderr)
        return json.loads(ended.stdout) if ended.stdout else None


# --- what comes in -------------------------------------------------------------------------------------------------


def path_of(element):
    """The text of an INSTANCENAME's path."""
    keys = [f'{key.get("NAME")}={quoted(key.findtext("KEYVALUE") or "")}' for key in element.findall("KEYBINDING")]
    return element.get("CLASSNAME") + ("." + ",".join(keys) if keys else "")


def values_of(element):
    """The values of an INSTANCE, as cimhost takes them."""
    return [f'{each.get("NAME")}={each.findtext("VALUE") or ""}' for each in element.findall("PROPERTY")
            if each.find("VALUE") is not None]


def parameters_of(call):
    found = {}
    for parameter in call.findall("IPARAMVALUE"):
        child = parameter[0] if len(parameter) else None
        if child is None or child.tag == "VALUE":
            continue
        name = {"CLASSNAME": lambda: child.get("NAME"), "INSTANCENAME": lambda: path_of(child)}
        found[parameter.get("NAME")] = name.get(child.tag, lambda: child)()
    return found


# --- what goes out -------------------------------------------------------------------------------------------------


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
        one = xml.SubElement(element, "PROPERTY", NAME=each["name"], TYPE=each["type"])
        if each["key"]:
            xml.SubElement(xml.SubElement(one, "QUALIFIER", NAME="Key", TYPE="boolean"), "VALUE").text = "TRUE"


def named_element(instance, parent):
    element = xml.SubElement(parent, "VALUE.NAMEDINSTANCE")
    name_element(instance["path"], element)
    instance_element(instance, element)


def answer(manager, operation, given, value):
    """Does one operation, and puts what it returns into an element."""
    if operation == "GetClass":
        for listed in manager.ask("classes"):
            if listed["class"] == given["ClassName"]:
                class_element(listed, value)
    elif operation in ("EnumerateInstanceNames", "EnumerateInstances"):
        names = operation == "EnumerateInstanceNames"
        for each in manager.ask("ein" if names else "ei", given["ClassName"]):
            (name_element if names else named_element)(each, value)
    elif operation == "GetInstance":
        instance_element(manager.ask("gi", given["InstanceName"]), value)
    elif operation == "CreateInstance":
        new = given["NewInstance"]
        name_element(manager.ask("ci", new.get("CLASSNAME"), *values_of(new)), value)
    elif operation == "ModifyInstance":
        modified = given["ModifiedInstance"]
        manager.ask("mi", path_of(modified.find("INSTANCENAME")), *values_of(modified.find("INSTANCE")))
    elif operation == "DeleteInstance":
        manager.ask("di", given["InstanceName"])
    else:
        raise CimError("7", f"{operation} is not done here")


def message(manager, request):
    call = xml.fromstring(request).find(".//IMETHODCALL")
    operation = call.get("NAME")
    cim = xml.Element("CIM", CIMVERSION="2.0", DTDVERSION="2.0")
    simple = xml.SubElement(xml.SubElement(cim, "MESSAGE", ID="4711", PROTOCOLVERSION="1.0"), "SIMPLERSP")
    response = xml.SubElement(simple, "IMETHODRESPONSE", NAME=operation)
    value = xml.Element("IRETURNVALUE")
    try:
        answer(manager, operation, parameters_of(call), value)
        if len(value) or not operation.startswith(("Modify", "Delete")):
            response.append(value)
    except CimError as error:
        xml.SubElement(response, "ERROR", CODE=error.code, DESCRIPTION=str(error))
    # Elements that begin and end at once are too much for wbemcli.
    return b'<?xml version="1.0" encoding="utf-8"?>\n' + xml.tostring(cim, short_empty_elements=False)


class Server:
    """Listens at a free port of the loopback interface until it is left."""

    def __init__(self, manager):
        class Handler(http.server.BaseHTTPRequestHandler):
            def do_POST(self):  # noqa: N802, the name is the library's
                body = message(manager, self.rfile.read(int(self.headers["Content-Length"])))
                self.send_response(200)
                for name, text in (("Content-Type", "application/xml"), ("CIMOperation", "MethodResponse"),
                                   ("Content-Length", str(len(body)))):
                    self.send_header(name, text)
                self.end_headers()
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
