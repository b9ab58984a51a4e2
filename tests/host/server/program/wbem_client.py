"""A WBEM client in the standard library alone: CIM operations over HTTP."""
import base64
import http.client
import itertools
import ssl

from cim_requests import document, element, intrinsic_call, path_element, value_element
from cim_responses import (children_of, demand, read_error, read_intrinsic, read_out_parameter,
                           response_element)


class HttpError(Exception):
    """The answer had a status other than 200."""

    def __init__(self, status, headers, body):
        super().__init__(f"HTTP {status} {headers.get('CIMError')}")
        self.status = status
        self.headers = headers
        self.body = body


class Client:
    """One kept connection. Not for several threads."""

    def __init__(self, port, user=None, tls=None, host="127.0.0.1", timeout=10):
        make = http.client.HTTPConnection if tls is None else http.client.HTTPSConnection
        context = {} if tls is None else {"context": tls}
        self.connection = make(host, port, timeout=timeout, **context)
        self.headers = {"Content-Type": 'application/xml; charset="utf-8"', "CIMOperation": "MethodCall"}
        if user is not None:
            self.headers["Authorization"] = "Basic " + base64.b64encode(user.encode()).decode()
        self.numbers = itertools.count(1001)
        self.bodies = []

    def __enter__(self):
        return self

    def __exit__(self, *unused):
        self.close()

    def close(self):
        self.connection.close()

    def post(self, body, headers=None, method="POST", chunked=False):
        """Sends a body and gives that of the response 200; other statuses raise HttpError."""
        self.connection.request(method, "/cimom", body, {**self.headers, **(headers or {})},
                                encode_chunked=chunked)
        response = self.connection.getresponse()
        content = response.read()
        demand(response.headers.get_all("Content-Length") == [str(len(content))], "no Content-Length")
        if response.status != 200:
            raise HttpError(response.status, response.headers, content)
        demand(response.headers["Content-Type"] == 'application/xml; charset="utf-8"', "Content-Type")
        demand(response.headers["CIMOperation"] == "MethodResponse", "CIMOperation")
        self.bodies.append(content)
        return content

    def call(self, name, namespace="root/cimv2", **parameters):
        """An intrinsic operation."""
        number = str(next(self.numbers))
        body = document(number, intrinsic_call(name, namespace, parameters))
        content = self.post(body, {"CIMMethod": name, "CIMObject": namespace})
        return read_intrinsic(response_element(content, number, "IMETHODRESPONSE", name), name)

    def returned(self, name, namespace="root/cimv2", **parameters):
        return self.call(name, namespace, **parameters).returned

    def invoke(self, path, method, **parameters):
        """A method of the class or instance, which has a namespace: the value that it returns, and
        what comes out."""
        number = str(next(self.numbers))
        values = [element("PARAMVALUE", value_element(value), NAME=name)
                  for name, value in parameters.items()]
        call = element("METHODCALL", path_element(path), *values, NAME=method)
        headers = {"CIMMethod": method, "CIMObject": f"{path.namespace}:{path.class_name}"}
        content = self.post(document(number, call), headers)
        response = response_element(content, number, "METHODRESPONSE", method)
        children = children_of(response, "ERROR", "RETURNVALUE", "PARAMVALUE")
        if children and children[0].tag == "ERROR":
            read_error(children[0])
        returned = read_out_parameter(children.pop(0)) if children and children[0].tag == "RETURNVALUE" else None
        return returned, {each.get("NAME"): read_out_parameter(each) for each in children}

    def pulled(self, opening, pulling, count, namespace="root/cimv2", **parameters):
        """Opens an enumeration and pulls to its end: the objects, `count` at most at a time."""
        answer = self.call(opening, namespace, MaxObjectCount=count, **parameters)
        while True:
            demand(len(answer.returned) <= count, "more than was asked for")
            yield from answer.returned
            end = answer.parameters.get("EndOfSequence")
            demand(end in ("TRUE", "FALSE", True, False), f"EndOfSequence {end}")
            if end in ("TRUE", True):
                return
            context = answer.parameters.get("EnumerationContext")
            demand(context, "no EnumerationContext")
            answer = self.call(pulling, namespace, EnumerationContext=context, MaxObjectCount=count)


def tls_context(certificate):
    """Trusts that certificate only."""
    return ssl.create_default_context(cafile=certificate)
