"""Sends requests with wbemcli, and parses the XML responses that wbemcli -dx prints."""

import dataclasses
import re
import subprocess
import xml.etree.ElementTree as xml

# wbemcli copies argument values into its XML request without escaping, and ends them at a comma or quotation mark.
ESCAPES = {ord(character): f"&#{ord(character)};" for character in '&<>",\\'}
RESPONSE = re.compile(r"^From server: (<\?xml.*?</CIM>)", re.S | re.M)
ERROR = re.compile(r"^\* wbemcli: (?:Cim: \((\d+)\) )?(.*)", re.M)
OBJECTS = ("INSTANCENAME", "OBJECTPATH", "VALUE.NAMEDINSTANCE", "VALUE.OBJECTWITHPATH", "INSTANCE")


class Interrupted(Exception):
    """Raised before the next request after a signal."""


def assigned(values):
    """Returns names and values in the form of wbemcli's arguments."""
    return ",".join(f"{name}={value}" if isinstance(value, Path) else f'{name}="{value.translate(ESCAPES)}"'
                    for name, value in values.items())


@dataclasses.dataclass(frozen=True)
class Path:
    """An object path. The keys are sorted pairs of name and value; the value of a reference is a path."""
    class_name: str
    keys: tuple

    @staticmethod
    def of(class_name, **keys):
        return Path(class_name, tuple(sorted(keys.items())))

    @staticmethod
    def read(element):
        return Path.of(element.get("CLASSNAME"),
                       **{key.get("NAME"): read_value(key) for key in element.findall("KEYBINDING")})

    def replaced(self, **keys):
        return Path.of(self.class_name, **{**dict(self.keys), **keys})

    def __str__(self):
        return f"{self.class_name}.{assigned(dict(self.keys))}"

    __repr__ = __str__


@dataclasses.dataclass(frozen=True)
class Instance:
    """An instance's values, without nulls, and types by property name. The path is None if the response has none."""
    path: Path
    class_name: str
    values: dict
    types: dict

    @staticmethod
    def read(element, path):
        properties = {each.get("NAME"): each for each in element if each.tag.startswith("PROPERTY")}
        values = {name: read_value(each) for name, each in properties.items()}
        return Instance(path, element.get("CLASSNAME"),
                        {name: value for name, value in values.items() if value is not None},
                        {name: each.get("TYPE", "reference") for name, each in properties.items()})


def read_value(element):
    """Returns the value of a property or key: a string, a path or None."""
    reference = element.find(".//INSTANCENAME")
    if reference is not None:
        return Path.read(reference)
    value = next((each.text or "" for each in element if each.tag in ("VALUE", "KEYVALUE")), None)
    return value.lower() if value and element.get("TYPE") == "boolean" else value


def read_object(element):
    if element.tag == "INSTANCE":
        return Instance.read(element, None)
    path = Path.read(next(element.iter("INSTANCENAME")))
    instance = element.find("INSTANCE")
    return path if instance is None else Instance.read(instance, path)


@dataclasses.dataclass
class Response:
    """The code is 0, a CIM status, or -1 for another error; printed is the number of objects that wbemcli prints."""
    request: str
    code: int = 0
    message: str = ""
    printed: int = 0
    objects: list = dataclasses.field(default_factory=list)
    namespaces: set = dataclasses.field(default_factory=set)
    class_element: xml.Element = None

    @property
    def paths(self):
        return [each if isinstance(each, Path) else each.path for each in self.objects]

    def read(self, document):
        for element in xml.fromstring(document).findall(".//IRETURNVALUE/*"):
            if element.tag in OBJECTS:
                self.objects.append(read_object(element))
            elif element.tag == "CLASS":
                self.class_element = element
            self.namespaces |= {"/".join(each.get("NAME") for each in path)
                                for path in element.iter("LOCALNAMESPACEPATH")}


class Client:
    """@param no_verify   accepts any certificate of the server
    @param time_limit  seconds for a request"""

    def __init__(self, url, namespace, no_verify, time_limit):
        self.url = url
        self.namespace = namespace
        self.options = ["-noverify"] if no_verify else []
        self.time_limit = time_limit
        self.is_interrupted = False

    def interrupt(self):
        """Ends the test before its next request."""
        self.is_interrupted = True

    def send(self, operation, target, *arguments, namespace=None, **options):
        """Sends one request; the options are those of wbemcli: ac, arc, ar, arr."""
        if self.is_interrupted:
            raise Interrupted("interrupted by a signal.")
        namespace = namespace or self.namespace
        words = [operation, *(word for name, value in options.items() for word in (f"-{name}", value))]
        response = Response(" ".join([*words, str(target), *arguments]))
        try:
            # In its own session, wbemcli does not receive the terminal's signals: requests are not aborted.
            ended = subprocess.run(
                ["wbemcli", "-dx", *self.options, *words, f"{self.url}/{namespace}:{target}", *arguments],
                stdin=subprocess.DEVNULL, capture_output=True, encoding="utf-8", errors="replace",
                timeout=self.time_limit, start_new_session=True)
            error = ERROR.search(ended.stderr)
            documents = RESPONSE.findall(ended.stderr)
            if error:
                response.code, response.message = int(error[1] or -1), error[2]
            elif ended.returncode != 0:
                response.code, response.message = -1, f"wbemcli ended with status {ended.returncode}."
            elif documents:  # A creation requests the class first.
                response.read(documents[-1])
            response.printed = len(re.findall(rf"^\S*{re.escape(namespace)}:\w+\.", ended.stdout, re.M | re.I))
        except subprocess.TimeoutExpired:
            response.code, response.message = -1, f"No response within {self.time_limit} seconds."
        except xml.ParseError as failure:
            response.code, response.message = -1, f"The response is not XML: {failure}."
        return response

    def failure_to_connect(self):
        """Returns the error message if the connection fails, or an empty string."""
        response = self.send("ein", "VELKO_OstrelAgent")
        return response.message if response.code < 0 else ""

    def get(self, path):
        return self.send("gi", path)

    def create(self, class_name, **values):
        """Creates an instance; wbemcli requires a path, but sends only the values."""
        return self.send("ci", Path.of(class_name, InstanceID="new"), assigned(values))

    def modify(self, path, **values):
        return self.send("mi", path, assigned(values))
