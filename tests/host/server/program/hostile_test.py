"""Clients that do harm, beside a good one: hostile_test.py PROGRAM PROVIDERS VALIDATOR [--no-memory]

The good client gets each answer within a second, and in the end the endpoint holds what it held
before and ends by itself. --no-memory: resident memory may grow."""
import concurrent.futures
import contextlib
import os
import resource
import signal
import socket
import struct
import subprocess
import sys
import threading
import time
import unittest
import xml.etree.ElementTree as ElementTree

from cim_requests import ClassName, Instance, Path, document, element, intrinsic_call, namespace_element
from cim_requests import path_element, value_element
from endpoint import Endpoint
from validation import complaints_about
from wbem_client import Client, HttpError

PROGRAM, PROVIDERS, VALIDATOR = sys.argv[1:4]
MEMORY_COUNTS = "--no-memory" not in sys.argv
THING = Path("TEST_Thing", {"Name": "first"})
PART = ClassName("TEST_Part")
ADDRESS = "127.0.0.1"


def calls():
    """One of each kind of request that has parts of its own."""
    def call(name, **parameters):
        return intrinsic_call(name, "root/test", parameters)
    made = Instance("TEST_Thing", {"Name": "first", "List": [1, 2], "Part": Path("TEST_Part", {"Id": "wheel"})},
                    {"List": "uint16"})
    changed = Instance("TEST_Thing", {"Text": "new"}, path=THING)
    reference = Path("TEST_Link", {"Whole": Path("TEST_Thing", {"Name": "first"}, "root/test", "host"),
                                   "Part": Path("TEST_Part", {"Id": "wheel"}, "root/test")})
    return [
        call("EnumerateInstances", ClassName=PART, DeepInheritance=True, PropertyList=["Id", "Name"]),
        call("GetInstance", InstanceName=THING, LocalOnly=False),
        call("GetInstance", InstanceName=reference),
        call("Associators", ObjectName=THING, AssocClass=ClassName("TEST_Link"), Role="Whole"),
        call("References", ObjectName=ClassName("TEST_Thing")),
        call("GetClass", ClassName=PART, IncludeQualifiers=True),
        call("GetProperty", InstanceName=THING, PropertyName="Text"),
        call("SetProperty", InstanceName=THING, PropertyName="Text", NewValue="new"),
        call("CreateInstance", NewInstance=made),
        call("ModifyInstance", ModifiedInstance=changed, PropertyList=["Text"]),
        call("DeleteInstance", InstanceName=Path("TEST_Thing", {"Name": "none"})),
        call("ExecQuery", QueryLanguage="DMTF:CQL", Query="SELECT"),
        call("OpenEnumerateInstances", ClassName=PART, OperationTimeout=1, MaxObjectCount=1),
        call("PullInstancesWithPath", EnumerationContext="none", MaxObjectCount=1),
        call("CloseEnumeration", EnumerationContext="none"),
        element("METHODCALL", path_element(Path("TEST_Thing", {"Name": "first"}, "root/test")),
                element("PARAMVALUE", value_element(2), NAME="A", PARAMTYPE="uint32"), NAME="Sum"),
        element("METHODCALL", element("LOCALCLASSPATH", namespace_element("root/test"),
                                      element("CLASSNAME", NAME="TEST_Thing")), NAME="Sum"),
    ]


def without_each_part(text):
    """The document without one element, or without one attribute, for each of them."""
    size = len(list(ElementTree.fromstring(text).iter()))
    for index in range(size):
        root = ElementTree.fromstring(text)
        node = list(root.iter())[index]
        for name in list(node.attrib):
            value = node.attrib.pop(name)
            yield f"{node.tag} without {name}", ElementTree.tostring(root)
            node.set(name, value)
        for parent in root.iter():
            if node in list(parent):
                parent.remove(node)
                yield f"without {node.tag}", ElementTree.tostring(root)
                break


def http_request(body, path="/cimom"):
    head = (f"POST {path} HTTP/1.1\r\nHost: 127.0.0.1\r\nContent-Type: application/xml\r\nCIMOperation: MethodCall\r\n"
            f"CIMMethod: EnumerateInstanceNames\r\nCIMObject: root/test\r\nContent-Length: {len(body)}\r\n\r\n")
    return head.encode() + body


NAMES = http_request(document("1", intrinsic_call("EnumerateInstanceNames", "root/test", {"ClassName": PART})))


class GoodClient:
    """Asks all the time on a connection of its own, or on another one where the endpoint gave that one
    to somebody else; remembers how long it waited for the answer that took longest."""

    def __init__(self, port):
        self.client = Client(port, timeout=20)
        self.longest = 0.0
        self.answers = 0
        self.failure = None
        self.ended = threading.Event()
        self.ask()
        self.thread = threading.Thread(target=self.run)

    def ask(self):
        begin = time.monotonic()
        paths = None
        while paths is None:
            try:
                paths = self.client.returned("EnumerateInstanceNames", "root/test", ClassName=PART)
            except ConnectionError:
                self.client.close()
                if time.monotonic() > begin + 5:
                    raise
        self.longest = max(self.longest, time.monotonic() - begin)
        self.answers += 1
        assert len(paths) == 2, paths

    def run(self):
        try:
            while not self.ended.wait(0.01):
                self.ask()
        except Exception as failure:  # pylint: disable=broad-except
            self.failure = failure

    def __enter__(self):
        self.thread.start()
        return self

    def __exit__(self, *unused):
        self.ended.set()
        self.thread.join()
        self.client.close()


class LongMessages(unittest.TestCase):
    @unittest.skipUnless(MEMORY_COUNTS, "memory does not count")
    def test_do_not_take_memory_all_at_once(self):
        part = "<A " + " ".join(letter + '=""' for letter in "abcdefghijklmnop") + "/>"
        request = http_request(("<CIM>" + 9990 * part + "</CIM>").encode())

        def ask(number):
            source = (f"127.0.0.{2 + number % 4}", 0)
            with socket.create_connection((ADDRESS, endpoint.port), 10, source) as connection:
                for _ in range(3):
                    connection.sendall(request)
                    self.assertTrue(connection.recv(4096).startswith(b"HTTP/1.1 400 "))

        with Endpoint(PROGRAM, "--registration", PROVIDERS, "--schema", PROVIDERS) as endpoint:
            with concurrent.futures.ThreadPoolExecutor(64) as pool:
                list(pool.map(ask, range(64)))
            # A tree of each at once would take 500 MB.
            self.assertLess(endpoint.resident(at="VmHWM"), 300_000)


class Hostile(unittest.TestCase):
    @classmethod
    def setUpClass(cls):
        cls.endpoint = cls.enterClassContext(
            Endpoint(PROGRAM, "--registration", PROVIDERS, "--schema", PROVIDERS,
                     expected=lambda line: "caught: path of TEST_Thing without key Name" in line))
        cls.idle_threads = cls.endpoint.threads()

    def setUp(self):
        # What is loaded and allocated once, is there.
        for number in range(16):
            self.connect(100 + number).sendall(NAMES)
        self.doCleanups()
        with Client(self.endpoint.port) as client:
            for _ in range(50):
                client.returned("EnumerateInstances", "root/test", ClassName=PART)
        self.await_state(lambda: self.endpoint.threads() == self.idle_threads)
        before = self.settled_state()
        resident = self.endpoint.resident()
        self.addCleanup(self.assert_as_before, before, resident)
        good = self.enterContext(GoodClient(self.endpoint.port))
        self.addCleanup(self.assert_served, good)

    def await_state(self, holds):
        deadline = time.monotonic() + 5
        while not holds() and time.monotonic() < deadline:
            time.sleep(0.01)

    def assert_served(self, good):
        time.sleep(0.05)
        self.assertIsNone(good.failure)
        self.assertLess(good.longest, 1)
        self.assertGreater(good.answers, 2)

    def state(self):
        return self.endpoint.descriptors(), self.endpoint.threads()

    def settled_state(self):
        """The state once it has held for a tenth of a second: sockets are closed after their threads ended."""
        state, since = self.state(), time.monotonic()
        deadline = since + 5
        while time.monotonic() < min(since + 0.1, deadline):
            time.sleep(0.01)
            if self.state() != state:
                state, since = self.state(), time.monotonic()
        return state

    def assert_as_before(self, before, resident):
        self.await_state(lambda: self.state() == before)
        self.assertEqual(self.state(), before)
        if MEMORY_COUNTS:
            self.assertLess(self.endpoint.resident(), resident + 6144)

    def connect(self, source=2):
        """A connection from another address of this host."""
        connection = socket.create_connection((ADDRESS, self.endpoint.port), 10, (f"127.0.0.{source}", 0))
        self.addCleanup(connection.close)
        return connection

    def test_any_part_of_a_request_may_be_missing(self):
        bodies = set()
        with Client(self.endpoint.port) as client:
            for call in calls():
                whole = document("4711", call)
                for what, body in without_each_part(whole):
                    with self.subTest(call=call.get("NAME"), what=what):
                        headers = {"CIMMethod": call.get("NAME"), "CIMObject": "root/test"}
                        try:
                            content = client.post(body, headers)
                            bodies.add(content)
                            self.assertIn(b' ID="4711" ', content)
                        except HttpError as error:
                            self.assertIn(error.status, (400, 501))
                            self.assertTrue(error.headers["CIMError"])
        self.assertGreater(len(bodies), 10)
        self.assertEqual(complaints_about(bodies, VALIDATOR), "")

    def test_clients_leave_at_every_byte(self):
        reset = struct.pack("ii", 1, 0)
        for count in range(len(NAMES) + 1):
            with socket.create_connection((ADDRESS, self.endpoint.port), 10, ("127.0.0.2", 0)) as connection:
                if count % 2:
                    connection.setsockopt(socket.SOL_SOCKET, socket.SO_LINGER, reset)
                # Whoever comes before the last ones are seen to be gone may be turned away.
                with contextlib.suppress(ConnectionError):
                    connection.sendall(NAMES[:count])

    def test_clients_that_do_not_read_hold_nobody_up(self):
        for _ in range(16):
            connection = self.connect()
            connection.setblocking(False)
            with contextlib.suppress(BlockingIOError, ConnectionError):
                for _ in range(2000):
                    connection.send(NAMES)
        time.sleep(0.3)

    def test_stopped_clients_hold_nobody_up(self):
        script = f"""
import threading
from wbem_client import Client
def ask():
    client = Client({self.endpoint.port})
    while True:
        client.call("EnumerateClassNames", "root/test")
for _ in range(8):
    threading.Thread(target=ask).start()
print("asking", flush=True)
"""
        with subprocess.Popen([sys.executable, "-B", "-c", script], cwd=os.path.dirname(os.path.abspath(__file__)),
                              stdout=subprocess.PIPE) as client:
            client.stdout.readline()
            for _ in range(10):
                time.sleep(0.02)
                client.send_signal(signal.SIGSTOP)
                time.sleep(0.02)
                client.send_signal(signal.SIGCONT)
            client.send_signal(signal.SIGSTOP)
            time.sleep(0.2)
            client.kill()

    def test_a_thousand_connections_are_too_many(self):
        soft, hard = resource.getrlimit(resource.RLIMIT_NOFILE)
        resource.setrlimit(resource.RLIMIT_NOFILE, (min(4096, hard), hard))
        self.addCleanup(resource.setrlimit, resource.RLIMIT_NOFILE, (soft, hard))
        connections = [self.connect(2 + number % 200) for number in range(1000)]
        served = 0
        for connection in connections:
            with contextlib.suppress(ConnectionError):
                connection.sendall(NAMES)
        for connection in connections:
            connection.settimeout(0.001 if served else 5)
            with contextlib.suppress(ConnectionError, TimeoutError):
                served += connection.recv(100).startswith(b"HTTP/1.1 200 ")
        self.assertGreater(served, 0)
        self.assertLess(self.endpoint.threads(), 64 + 32)


if __name__ == "__main__":
    unittest.main(argv=sys.argv[:1])
