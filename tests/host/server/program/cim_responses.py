"""Responses as a strict client reads them: what some client could misread raises Malformed."""
import datetime
import re
import xml.etree.ElementTree as ElementTree

from cim_requests import Instance, Path


class CimError(Exception):
    """The answer was an ERROR."""

    def __init__(self, code, description):
        super().__init__(f"{code}: {description}")
        self.code = code
        self.description = description


class Malformed(Exception):
    """The answer is none that the client understands."""


class Answer:
    """What stood in IRETURNVALUE (None: there was none), and what came out beside it."""

    def __init__(self, returned, parameters):
        self.returned = returned
        self.parameters = parameters


RANGES = {f"{sign}int{bits}": (0 if sign == "u" else -2 ** (bits - 1),
                               2 ** (bits if sign == "u" else bits - 1) - 1)
          for sign in "us" for bits in (8, 16, 32, 64)}
OTHER_TYPES = ("string", "boolean", "char16", "datetime", "real32", "real64")
BLANKS = re.compile(r"\s*\Z")
DATETIME = re.compile(r"(\d{14})\.(\d{6})([+-])(\d{3})\Z")
INTERVAL = re.compile(r"(\d{8})(\d{2})(\d{2})(\d{2})\.(\d{6}):000\Z")


def demand(condition, what):
    if not condition:
        raise Malformed(what)


def children_of(parent, *names):
    """The children, which have one of the names; there is no text between them."""
    demand(not parent.text or BLANKS.match(parent.text), f"text in {parent.tag}")
    for child in parent:
        demand(child.tag in names, f"{child.tag} in {parent.tag}")
        demand(not child.tail or BLANKS.match(child.tail), f"text after {child.tag}")
    return list(parent)


def only_child(parent, *names):
    children = children_of(parent, *names)
    demand(len(children) == 1, f"{len(children)} children of {parent.tag}")
    return children[0]


def attributes_of(node, required, optional=""):
    given = set(node.attrib)
    demand(set(required.split()) <= given <= set((required + " " + optional).split()),
           f"attributes {sorted(given)} of {node.tag}")
    return node.attrib


def datetime_value(text):
    """An instant, or an interval."""
    if found := DATETIME.match(text):
        offset = datetime.timedelta(minutes=int(found[3] + found[4]))
        fields = datetime.datetime.strptime(found[1], "%Y%m%d%H%M%S")
        return fields.replace(microsecond=int(found[2]), tzinfo=datetime.timezone(offset))
    found = INTERVAL.match(text)
    demand(found, f"datetime {text!r}")
    days, hours, minutes, seconds, micros = map(int, found.groups())
    return datetime.timedelta(days, seconds, micros, 0, minutes, hours)


def typed_value(text, kind):
    text = text or ""
    if kind in RANGES:
        demand(re.match(r"-?(0|[1-9]\d*)\Z", text), f"{kind} {text!r}")
        low, high = RANGES[kind]
        demand(low <= int(text) <= high, f"{kind} {text}")
        return int(text)
    if kind == "boolean":
        demand(text.lower() in ("true", "false"), f"boolean {text!r}")
        return text.lower() == "true"
    if kind in ("real32", "real64"):
        return float(text)
    if kind == "datetime":
        return datetime_value(text)
    demand(kind in ("string", "char16"), f"type {kind}")
    demand(kind == "string" or len(text) == 1, f"char16 {text!r}")
    return text


def plain_value(node, kind):
    """A VALUE or VALUE.ARRAY."""
    if node.tag == "VALUE":
        demand(len(node) == 0 and not node.attrib, "VALUE with parts")
        return typed_value(node.text, kind)
    demand(node.tag == "VALUE.ARRAY", node.tag)
    return [typed_value(each.text, kind) for each in children_of(node, "VALUE")]


def key_value(node):
    part = only_child(node, "KEYVALUE", "VALUE.REFERENCE")
    if part.tag == "VALUE.REFERENCE":
        return read_path(only_child(part, "INSTANCEPATH", "LOCALINSTANCEPATH", "INSTANCENAME"))
    kind = attributes_of(part, "VALUETYPE", "TYPE")["VALUETYPE"]
    demand(kind in ("string", "boolean", "numeric"), f"VALUETYPE {kind}")
    if kind == "numeric":
        return int(part.text)
    return part.text.lower() == "true" if kind == "boolean" else part.text or ""


def read_namespace(node):
    return "/".join(attributes_of(each, "NAME")["NAME"] for each in children_of(node, "NAMESPACE"))


def read_path(node):
    if node.tag == "CLASSNAME":
        return Path(attributes_of(node, "NAME")["NAME"])
    if node.tag == "INSTANCENAME":
        keys = {attributes_of(each, "NAME")["NAME"]: key_value(each)
                for each in children_of(node, "KEYBINDING")}
        return Path(attributes_of(node, "CLASSNAME")["CLASSNAME"], keys)
    if node.tag == "OBJECTPATH":
        return read_path(only_child(node, "INSTANCEPATH", "CLASSPATH"))
    place, named = children_of(node, "NAMESPACEPATH", "LOCALNAMESPACEPATH", "INSTANCENAME", "CLASSNAME")
    path = read_path(named)
    if place.tag == "NAMESPACEPATH":
        host, place = children_of(place, "HOST", "LOCALNAMESPACEPATH")
        demand(host.text, "empty HOST")
        path.host = host.text
    path.namespace = read_namespace(place)
    return path


PROPERTY_TAGS = ("PROPERTY", "PROPERTY.ARRAY", "PROPERTY.REFERENCE")


def read_property(node):
    """Name, type and value; None: there is none."""
    node_children = [each for each in node if each.tag != "QUALIFIER"]
    origin = "CLASSORIGIN PROPAGATED"
    if node.tag == "PROPERTY.REFERENCE":
        attributes_of(node, "NAME", "REFERENCECLASS " + origin)
        return node.get("NAME"), "reference", read_path(node_children[0][0]) if node_children else None
    attributes_of(node, "NAME TYPE", "ARRAYSIZE EmbeddedObject " + origin)
    kind = node.get("TYPE")
    demand(kind in RANGES or kind in OTHER_TYPES, f"type {kind}")
    return node.get("NAME"), kind, plain_value(node_children[0], kind) if node_children else None


def read_instance(node, path=None):
    properties = {}
    types = {}
    for each in children_of(node, "QUALIFIER", *PROPERTY_TAGS):
        name, kind, value = read_property(each)
        demand(name not in properties, f"{name} twice")
        properties[name] = value
        types[name] = kind
    return Instance(attributes_of(node, "CLASSNAME")["CLASSNAME"], properties, types, path)


def read_qualifiers(node):
    return {each.get("NAME"): plain_value(each[0], each.get("TYPE")) if len(each) else None
            for each in node if each.tag == "QUALIFIER"}


def read_class(node, path=None):
    """A class as a dictionary."""
    attributes_of(node, "NAME", "SUPERCLASS")
    order = [each.tag for each in children_of(node, "QUALIFIER", "METHOD", *PROPERTY_TAGS)]
    ranks = [("QUALIFIER", "PROPERTY", "METHOD").index(tag.split(".")[0]) for tag in order]
    demand(ranks == sorted(ranks), f"order {order}")
    return {"name": node.get("NAME"), "superclass": node.get("SUPERCLASS"), "path": path,
            "qualifiers": read_qualifiers(node),
            "properties": {each.get("NAME"): read_qualifiers(each) for each in node
                           if each.tag in PROPERTY_TAGS},
            "types": {each.get("NAME"): each.get("TYPE", "reference") for each in node
                      if each.tag in PROPERTY_TAGS},
            "methods": {each.get("NAME"): each for each in node if each.tag == "METHOD"}}


def read_object(node):
    """An element of IRETURNVALUE."""
    if node.tag == "CLASS":
        return read_class(node)
    if node.tag == "INSTANCE":
        return read_instance(node)
    if node.tag in ("VALUE.NAMEDINSTANCE", "VALUE.OBJECTWITHPATH", "VALUE.INSTANCEWITHPATH"):
        path, described = children_of(node, "INSTANCENAME", "INSTANCEPATH", "CLASSPATH", "INSTANCE", "CLASS")
        read = read_class if described.tag == "CLASS" else read_instance
        return read(described, read_path(path))
    if node.tag == "VALUE":
        return node.text or ""
    if node.tag == "VALUE.ARRAY":
        return plain_value(node, "string")
    if node.tag == "VALUE.REFERENCE":
        return read_path(only_child(node, "INSTANCEPATH", "LOCALINSTANCEPATH", "INSTANCENAME"))
    if node.tag == "QUALIFIER.DECLARATION":
        return node
    return read_path(node)


# The kinds of elements that each operation returns.
RETURNED = {
    "GetInstance": "INSTANCE", "EnumerateInstances": "VALUE.NAMEDINSTANCE",
    "EnumerateInstanceNames": "INSTANCENAME", "CreateInstance": "INSTANCENAME",
    "Associators": "VALUE.OBJECTWITHPATH", "References": "VALUE.OBJECTWITHPATH",
    "AssociatorNames": "OBJECTPATH", "ReferenceNames": "OBJECTPATH",
    "GetClass": "CLASS", "EnumerateClasses": "CLASS", "EnumerateClassNames": "CLASSNAME",
    "GetProperty": "VALUE VALUE.ARRAY VALUE.REFERENCE",
    "GetQualifier": "QUALIFIER.DECLARATION", "EnumerateQualifiers": "QUALIFIER.DECLARATION",
    "ExecQuery": "VALUE.OBJECT VALUE.OBJECTWITHPATH",
    "OpenEnumerateInstances": "VALUE.INSTANCEWITHPATH",
    "OpenReferenceInstances": "VALUE.INSTANCEWITHPATH",
    "OpenAssociatorInstances": "VALUE.INSTANCEWITHPATH",
    "PullInstancesWithPath": "VALUE.INSTANCEWITHPATH",
    "OpenEnumerateInstancePaths": "INSTANCEPATH", "OpenReferenceInstancePaths": "INSTANCEPATH",
    "OpenAssociatorInstancePaths": "INSTANCEPATH", "PullInstancePaths": "INSTANCEPATH",
    "EnumerationCount": "VALUE",
}


def read_error(node):
    attributes_of(node, "CODE DESCRIPTION")
    demand(len(node) == 0 and node.get("DESCRIPTION"), "ERROR with children or without DESCRIPTION")
    raise CimError(int(node.get("CODE")), node.get("DESCRIPTION"))


def read_out_parameter(node):
    kind = node.get("PARAMTYPE", "string")
    if len(node) == 0:
        return None
    if node[0].tag == "VALUE.REFERENCE":
        return read_path(node[0][0])
    return plain_value(node[0], kind)


def response_element(body, message_id, kind, name):
    """The IMETHODRESPONSE or METHODRESPONSE of a response to that message."""
    demand(body.startswith(b'<?xml version="1.0" encoding="utf-8"?>'), "no XML declaration first")
    root = ElementTree.fromstring(body)
    demand(root.tag == "CIM", root.tag)
    attributes_of(root, "CIMVERSION DTDVERSION")
    message = only_child(root, "MESSAGE")
    attributes_of(message, "ID PROTOCOLVERSION")
    demand(message.get("ID") == message_id, f"answer to {message.get('ID')}, not to {message_id}")
    response = only_child(only_child(message, "SIMPLERSP"), kind)
    demand(attributes_of(response, "NAME")["NAME"] == name, f"answer of {response.get('NAME')}")
    return response


def read_intrinsic(response, name):
    children = children_of(response, "ERROR", "IRETURNVALUE", "PARAMVALUE")
    if children and children[0].tag == "ERROR":
        demand(len(children) == 1, "more than an ERROR")
        read_error(children[0])
    returned = None
    if children and children[0].tag == "IRETURNVALUE":
        demand(name in RETURNED, f"IRETURNVALUE of {name}")
        returned = [read_object(each) for each in children_of(children.pop(0), *RETURNED[name].split())]
    elif name in RETURNED:
        raise Malformed(f"no IRETURNVALUE of {name}")
    return Answer(returned, {each.get("NAME"): read_out_parameter(each) for each in children})
