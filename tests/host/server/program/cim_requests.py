"""CIM objects, and requests as a client writes them."""
import xml.etree.ElementTree as ElementTree


class ClassName(str):
    """The name of a class, where a parameter takes one."""


class Path:
    """An instance, or (without keys) a class."""

    def __init__(self, class_name, keys=None, namespace=None, host=None):
        self.class_name = class_name
        self.keys = keys
        self.namespace = namespace
        self.host = host

    def identity(self):
        keys = [(name.lower(), value.identity() if isinstance(value, Path) else value)
                for name, value in (self.keys or {}).items()]
        return self.class_name.lower(), tuple(sorted(keys))

    def __repr__(self):
        return f"{self.namespace}:{self.class_name}{self.keys}"


class Instance:
    def __init__(self, class_name, properties, types=None, path=None):
        self.class_name = class_name
        self.properties = properties
        self.types = types or {}
        self.path = path


def element(name, *children, text=None, **attributes):
    made = ElementTree.Element(name, attributes)
    made.text = text
    made.extend(children)
    return made


def text_of(value):
    return ("TRUE" if value else "FALSE") if isinstance(value, bool) else str(value)


def namespace_element(namespace):
    return element("LOCALNAMESPACEPATH",
                   *(element("NAMESPACE", NAME=part) for part in namespace.split("/")))


def key_element(name, value):
    if isinstance(value, Path):
        return element("KEYBINDING", element("VALUE.REFERENCE", path_element(value)), NAME=name)
    kind = ("boolean" if isinstance(value, bool) else
            "numeric" if isinstance(value, (int, float)) else "string")
    return element("KEYBINDING", element("KEYVALUE", text=text_of(value), VALUETYPE=kind), NAME=name)


def instance_name(path):
    return element("INSTANCENAME", *(key_element(*key) for key in path.keys.items()),
                   CLASSNAME=path.class_name)


def path_element(path):
    """With its namespace where it has one."""
    named = element("CLASSNAME", NAME=path.class_name) if path.keys is None else instance_name(path)
    if path.namespace is None:
        return named
    kind = "CLASS" if path.keys is None else "INSTANCE"
    local = namespace_element(path.namespace)
    if path.host is None:
        return element(f"LOCAL{kind}PATH", local, named)
    place = element("NAMESPACEPATH", element("HOST", text=path.host), local)
    return element(f"{kind}PATH", place, named)


def instance_element(instance):
    properties = []
    for name, value in instance.properties.items():
        kind = instance.types.get(name, "string")
        if isinstance(value, list):
            properties.append(element("PROPERTY.ARRAY", value_element(value), NAME=name, TYPE=kind))
        elif isinstance(value, Path):
            properties.append(element("PROPERTY.REFERENCE", value_element(value), NAME=name))
        else:
            properties.append(element("PROPERTY", *([] if value is None else [value_element(value)]),
                                      NAME=name, TYPE=kind))
    return element("INSTANCE", *properties, CLASSNAME=instance.class_name)


def value_element(value):
    if isinstance(value, list):
        return element("VALUE.ARRAY", *(value_element(each) for each in value))
    if isinstance(value, Path):
        return element("VALUE.REFERENCE", path_element(value))
    return element("VALUE", text=text_of(value))


def parameter_element(name, value):
    """An IPARAMVALUE."""
    if value is None:
        return element("IPARAMVALUE", NAME=name)
    if isinstance(value, ClassName):
        content = element("CLASSNAME", NAME=value)
    elif isinstance(value, Path):
        content = path_element(Path(value.class_name, value.keys))
    elif isinstance(value, Instance) and value.path is not None:
        content = element("VALUE.NAMEDINSTANCE", instance_name(value.path), instance_element(value))
    elif isinstance(value, Instance):
        content = instance_element(value)
    else:
        content = value_element(value)
    return element("IPARAMVALUE", content, NAME=name)


def document(message_id, call):
    message = element("MESSAGE", element("SIMPLEREQ", call), ID=message_id, PROTOCOLVERSION="1.0")
    root = element("CIM", message, CIMVERSION="2.0", DTDVERSION="2.0")
    return ElementTree.tostring(root, encoding="utf-8", xml_declaration=True)


def intrinsic_call(name, namespace, parameters):
    return element("IMETHODCALL", namespace_element(namespace),
                   *(parameter_element(*each) for each in parameters.items()), NAME=name)
