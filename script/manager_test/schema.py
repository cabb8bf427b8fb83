"""Reads the classes from the MOF files."""

import dataclasses
import re

STRING = re.compile(r'"(?:[^"\\]|\\.)*"')
CLASS = re.compile(r"class\s+(\w+)\s*\{(.*?)\};", re.S)
PROPERTY = re.compile(r"\[([^\]]*)\]\s*(\w+)\s+(REF\s+)?(\w+)\s*;")
DATETIME = re.compile(r"\d{4}(0[1-9]|1[0-2])(0[1-9]|[12]\d|3[01])([01]\d|2[0-3])[0-5]\d[0-5]\d\.\d{6}[+-]\d{3}")


@dataclasses.dataclass(frozen=True)
class Property:
    name: str
    type: str
    is_key: bool
    is_writable: bool
    reference_class: str = ""

    def permits(self, value):
        """Returns whether a value has the property's type."""
        if self.type.startswith("uint"):
            return value.isdigit() and int(value) < 2 ** int(self.type[4:])
        if self.type == "reference":
            return getattr(value, "class_name", "") == self.reference_class
        return {"string": lambda: isinstance(value, str), "boolean": lambda: value.lower() in ("true", "false"),
                "datetime": lambda: DATETIME.fullmatch(value) is not None}[self.type]()


@dataclasses.dataclass(frozen=True)
class Class:
    name: str
    properties: dict
    is_association: bool

    @property
    def keys(self):
        return [each.name for each in self.properties.values() if each.is_key]

    @property
    def writable(self):
        return [each for each in self.properties.values() if each.is_writable]


def read_properties(body):
    for qualifiers, type_name, reference, name in PROPERTY.findall(body):
        words = re.findall(r"\w+", qualifiers)
        yield Property(name, "reference" if reference else type_name, "Key" in words, "Write" in words,
                       type_name if reference else "")


def read_classes(directory):
    """Returns the classes of a directory's MOF files by name; empty if there are none."""
    classes = {}
    for file in sorted(directory.glob("VELKO_*.mof")):
        text = STRING.sub('""', file.read_text("utf-8"))
        for name, body in CLASS.findall(text):
            properties = {each.name: each for each in read_properties(body)}
            classes[name] = Class(name, properties, any(each.reference_class for each in properties.values()))
    return classes
