"""A client of another make against the built endpoint: client_test.py PROGRAM PROVIDERS VALIDATOR

PROVIDERS is the folder of the providers of other makers. All responses go through the program
VALIDATOR in the end."""
import datetime
import pathlib
import subprocess
import sys
import tempfile
import unittest

import cim_requests
from cim_requests import ClassName, Instance, Path
from cim_responses import CimError
from endpoint import Endpoint
from validation import complaints_about
from wbem_client import Client, HttpError, tls_context

PROGRAM, PROVIDERS, VALIDATOR = sys.argv[1:]
OS = ClassName("KORVA_OperatingSystem")
KEYS = {"CSCreationClassName": "KORVA_ComputerSystem", "CSName": "fixture.example",
        "CreationClassName": "KORVA_OperatingSystem", "Name": "Fixture Linux"}
SYSTEM = Path("KORVA_OperatingSystem", KEYS)
COMPUTER = Path("KORVA_ComputerSystem",
                {"CreationClassName": "KORVA_ComputerSystem", "Name": "fixture.example"})
bodies = set()


class ClientTest(unittest.TestCase):
    """Cases that share an endpoint with the options; each has a connection of its own."""
    options = ()

    @classmethod
    def setUpClass(cls):
        cls.endpoint = cls.enterClassContext(Endpoint(PROGRAM, *cls.options))

    def setUp(self):
        self.client = self.enterContext(Client(self.endpoint.port))

    def tearDown(self):
        bodies.update(self.client.bodies)

    def assert_code(self, code, name, namespace="root/cimv2", **parameters):
        with self.assertRaises(CimError) as caught:
            self.client.call(name, namespace, **parameters)
        self.assertEqual(caught.exception.code, code, caught.exception)

    def assert_http(self, status, word, *arguments, **options):
        with self.assertRaises(HttpError) as caught:
            self.post(*arguments, **options)
        self.assertEqual(caught.exception.status, status)
        self.assertEqual(caught.exception.headers["CIMError"], word)
        return caught.exception.headers

    def post(self, body, headers=None, **options):
        return self.client.post(body, {"CIMMethod": "EnumerateInstanceNames",
                                       "CIMObject": "root/cimv2", **(headers or {})}, **options)

    def enumeration(self, number="1"):
        return cim_requests.document(number, cim_requests.intrinsic_call(
            "EnumerateInstanceNames", "root/cimv2", {"ClassName": OS}))


class Instances(ClientTest):
    def test_many_requests_share_a_connection(self):
        self.client.call("EnumerateInstanceNames", ClassName=OS)
        socket = self.client.connection.sock
        for _ in range(300):
            (path,) = self.client.returned("EnumerateInstanceNames", ClassName=OS)
            self.assertEqual(path.identity(), SYSTEM.identity())
        self.assertIs(self.client.connection.sock, socket)

    def test_values_have_their_types(self):
        (system,) = self.client.returned("EnumerateInstances", ClassName=OS)
        expected = {"OSType": 36, "Version": "12.5", "Description": "", "Distributed": False,
                    "OperationalStatus": [2, 11], "TotalVisibleMemorySize": 16777216,
                    "LastBootUpTime": datetime.datetime(2023, 11, 14, 22, 13, 20,
                                                        tzinfo=datetime.timezone.utc)}
        self.assertEqual({name: system.properties[name] for name in expected}, expected)
        self.assertEqual(system.types["TotalVisibleMemorySize"], "uint64")
        self.assertEqual(system.path.identity(), SYSTEM.identity())

    def test_defaults_are_those_of_clients_that_leave_parameters_out(self):
        (system,) = self.client.returned("EnumerateInstances", ClassName=OS)
        (instance,) = self.client.returned("GetInstance", InstanceName=SYSTEM)
        (local,) = self.client.returned("GetInstance", InstanceName=SYSTEM, LocalOnly=True,
                                        IncludeQualifiers=True, IncludeClassOrigin=True)
        self.assertEqual(instance.properties, system.properties)
        self.assertEqual(local.properties, system.properties)
        self.assertEqual(system.properties["Name"], "Fixture Linux")

    def test_property_lists_say_what_comes(self):
        def names(properties):
            (instance,) = self.client.returned("GetInstance", InstanceName=SYSTEM, PropertyList=properties)
            return sorted(instance.properties)
        self.assertEqual(names(["OSTYPE", "Version", "version", "Nothing"]), ["OSType", "Version"])
        self.assertLessEqual(set(names([])), set(KEYS))
        self.assertIn("HealthState", names(None))

    def test_a_parent_finds_its_subclasses(self):
        for parent in ("CIM_OperatingSystem", "cim_enabledlogicalelement", "CIM_ManagedElement"):
            paths = self.client.returned("EnumerateInstanceNames", ClassName=ClassName(parent))
            self.assertIn(SYSTEM.identity(), [path.identity() for path in paths], parent)

    def test_keys_compare_as_clients_spell_them(self):
        shuffled = Path("korva_operatingsystem", {name.upper(): KEYS[name] for name in reversed(KEYS)})
        (instance,) = self.client.returned("GetInstance", InstanceName=shuffled)
        self.assertEqual(instance.class_name, "KORVA_OperatingSystem")

    def test_each_failure_has_its_code(self):
        nothing = ClassName("KORVA_Nothing")
        rows = [
            (3, "EnumerateInstances", "root/nowhere", {"ClassName": OS}),
            (5, "EnumerateInstances", "root/cimv2", {"ClassName": nothing}),
            (5, "EnumerateInstanceNames", "root/cimv2", {"ClassName": nothing}),
            (5, "GetInstance", "root/cimv2", {"InstanceName": Path("KORVA_Nothing", KEYS)}),
            (6, "GetInstance", "root/cimv2", {"InstanceName": Path(OS, {**KEYS, "Name": "Other"})}),
            (4, "GetInstance", "root/cimv2", {"InstanceName": Path(OS, {"Name": "Other"})}),
            (4, "GetInstance", "root/cimv2", {"InstanceName": Path(OS, {**KEYS, "More": "Other"})}),
            (4, "GetInstance", "root/cimv2", {}),
            (4, "EnumerateInstances", "root/cimv2", {"ClassName": OS, "Unknown": "x"}),
            (4, "EnumerateInstances", "root/cimv2", {"ClassName": OS, "DeepInheritance": "maybe"}),
            (6, "GetClass", "root/cimv2", {"ClassName": nothing}),
            (5, "EnumerateClasses", "root/cimv2", {"ClassName": nothing}),
            (4, "AssociatorNames", "root/cimv2", {"ObjectName": Path("KORVA_Nothing", KEYS)}),
            (12, "GetProperty", "root/cimv2", {"InstanceName": SYSTEM, "PropertyName": "Nothing"}),
            (7, "ReinitialiseEverything", "root/cimv2", {}),
            (7, "DeleteInstance", "root/cimv2", {"InstanceName": SYSTEM}),
            (7, "DeleteClass", "root/cimv2", {"ClassName": OS}),
        ]
        for code, name, namespace, parameters in rows:
            with self.subTest(name=name, parameters=parameters):
                self.assert_code(code, name, namespace, **parameters)

    def test_a_property_comes_by_itself(self):
        self.assertEqual(self.client.returned("GetProperty", InstanceName=SYSTEM, PropertyName="osType"), ["36"])

    def test_methods_that_nobody_serves_are_unavailable_and_others_unknown(self):
        for method, code in (("Reboot", 16), ("Nonsense", 17)):
            with self.assertRaises(CimError) as caught:
                self.client.invoke(Path(OS, KEYS, "root/cimv2"), method)
            self.assertEqual(caught.exception.code, code, method)


class Associations(ClientTest):
    def names(self, operation, source, **parameters):
        return [path.class_name for path in
                self.client.returned(operation, ObjectName=source, **parameters)]

    def test_each_association_is_followed_without_a_name(self):
        self.assertCountEqual(self.names("AssociatorNames", SYSTEM),
                              ["KORVA_ComputerSystem", "KORVA_OperatingSystemCapabilities"])
        self.assertCountEqual(self.names("ReferenceNames", SYSTEM),
                              ["KORVA_InstalledOS", "KORVA_RunningOS", "KORVA_OSElementCapabilities"])
        self.assertEqual(self.names("AssociatorNames", COMPUTER), ["KORVA_OperatingSystem"])

    def test_filters_choose(self):
        rows = [
            ({"AssocClass": ClassName("CIM_InstalledOS")}, ["KORVA_ComputerSystem"]),
            ({"ResultClass": ClassName("CIM_Capabilities")}, ["KORVA_OperatingSystemCapabilities"]),
            ({"Role": "antecedent"}, ["KORVA_ComputerSystem"]),
            ({"Role": "Dependent"}, []),
            ({"ResultRole": "Capabilities"}, ["KORVA_OperatingSystemCapabilities"]),
        ]
        for filters, expected in rows:
            with self.subTest(filters=filters):
                self.assertEqual(self.names("AssociatorNames", SYSTEM, **filters), expected)

    def test_references_lead_from_one_end_to_the_other(self):
        (running,) = self.client.returned("References", ObjectName=SYSTEM,
                                          ResultClass=ClassName("KORVA_RunningOS"))
        self.assertEqual(running.properties["Antecedent"].identity(), SYSTEM.identity())
        computer = running.properties["Dependent"]
        self.assertEqual((computer.namespace, computer.identity()), ("root/cimv2", COMPUTER.identity()))
        (system,) = self.client.returned("Associators", ObjectName=computer,
                                         AssocClass=ClassName("KORVA_RunningOS"))
        self.assertEqual(system.path.identity(), SYSTEM.identity())
        (again,) = self.client.returned("GetInstance", InstanceName=running.path)
        self.assertEqual(again.properties["Dependent"].identity(), COMPUTER.identity())


class Classes(ClientTest):
    def test_a_class_tells_its_values(self):
        (system,) = self.client.returned("GetClass", ClassName=OS, LocalOnly=False)
        self.assertEqual((system["name"], system["superclass"]), (OS, "CIM_OperatingSystem"))
        self.assertIs(system["properties"]["Name"]["Key"], True)
        values = system["properties"]["OSType"]
        self.assertEqual(len(values["ValueMap"]), len(values["Values"]))
        self.assertEqual(system["types"]["OSType"], "uint16")

    def test_qualifiers_can_be_left_out(self):
        (system,) = self.client.returned("GetClass", ClassName=OS, IncludeQualifiers=False,
                                         PropertyList=["Name"])
        self.assertEqual((system["qualifiers"], system["properties"]), ({}, {"Name": {}}))

    def test_class_names_are_enumerated(self):
        names = [path.class_name for path in self.client.returned("EnumerateClassNames", DeepInheritance=True)]
        self.assertIn("KORVA_RunningOS", names)
        classes = self.client.returned("EnumerateClasses", DeepInheritance=True, LocalOnly=False)
        self.assertEqual([each["name"] for each in classes], names)

    def test_qualifiers_are_declared(self):
        declarations = self.client.returned("EnumerateQualifiers")
        (key,) = self.client.returned("GetQualifier", QualifierName="key")
        self.assertIn(key.get("NAME"), [each.get("NAME") for each in declarations])
        self.assert_code(6, "GetQualifier", QualifierName="Nothing")


class Pulling(ClientTest):
    def test_an_enumeration_is_pulled_to_its_end(self):
        rows = [
            ("OpenEnumerateInstances", "PullInstancesWithPath", {"ClassName": ClassName("CIM_ManagedElement")}),
            ("OpenEnumerateInstancePaths", "PullInstancePaths", {"ClassName": ClassName("CIM_ManagedElement")}),
            ("OpenAssociatorInstances", "PullInstancesWithPath", {"InstanceName": SYSTEM}),
            ("OpenAssociatorInstancePaths", "PullInstancePaths", {"InstanceName": SYSTEM}),
            ("OpenReferenceInstances", "PullInstancesWithPath", {"InstanceName": SYSTEM}),
            ("OpenReferenceInstancePaths", "PullInstancePaths", {"InstanceName": SYSTEM}),
        ]
        for opening, pulling, parameters in rows:
            for count in (1, 2, 1000):
                with self.subTest(opening=opening, count=count):
                    objects = list(self.client.pulled(opening, pulling, count, **parameters))
                    paths = [each if isinstance(each, Path) else each.path for each in objects]
                    self.assertGreater(len(paths), 1)
                    self.assertEqual(len({path.identity() for path in paths}), len(paths))
                    self.assertEqual({path.namespace for path in paths}, {"root/cimv2"})

    def test_nothing_comes_with_the_opening_by_default(self):
        answer = self.client.call("OpenEnumerateInstances", ClassName=OS)
        self.assertEqual(answer.returned, [])
        context = answer.parameters["EnumerationContext"]
        last = self.client.call("PullInstancesWithPath", EnumerationContext=context, MaxObjectCount=5)
        self.assertEqual(len(last.returned), 1)
        self.assertIn(last.parameters["EndOfSequence"], ("TRUE", True))
        self.assert_code(21, "PullInstancesWithPath", EnumerationContext=context, MaxObjectCount=5)

    def test_a_closed_context_is_unknown(self):
        context = self.client.call("OpenEnumerateInstancePaths",
                                   ClassName=OS).parameters["EnumerationContext"]
        self.client.call("CloseEnumeration", EnumerationContext=context)
        self.assert_code(21, "CloseEnumeration", EnumerationContext=context)
        self.assert_code(21, "PullInstancePaths", EnumerationContext=context, MaxObjectCount=1)
        self.assert_code(21, "PullInstancePaths", EnumerationContext="guess", MaxObjectCount=1)

    def test_what_is_not_served_is_refused(self):
        self.assert_code(25, "OpenEnumerateInstances", ClassName=OS, FilterQueryLanguage="DMTF:FQL",
                         FilterQuery="OSType = 36")
        self.assert_code(26, "OpenEnumerateInstances", ClassName=OS, ContinueOnError=True)
        self.assert_code(5, "OpenEnumerateInstances", ClassName=ClassName("KORVA_Nothing"))
        self.assert_code(3, "OpenEnumerateInstances", "root/nowhere", ClassName=OS)


class Discovery(ClientTest):
    def test_the_interop_namespace_is_found_by_trying_names(self):
        found = None
        for name in ("interop", "root/interop", "root/PG_Interop"):
            try:
                paths = self.client.returned("EnumerateInstanceNames", name,
                                             ClassName=ClassName("CIM_Namespace"))
                found = name
                break
            except CimError as error:
                self.assertEqual(error.code, 3)
        self.assertEqual(found, "root/interop")
        self.assertCountEqual([path.keys["Name"] for path in paths], ["root/cimv2", "root/interop"])

    def test_there_is_one_object_manager(self):
        (manager,) = self.client.returned("EnumerateInstances", "root/interop",
                                          ClassName=ClassName("CIM_ObjectManager"))
        self.assertIs(manager.properties["GatherStatisticalData"], False)
        self.assertTrue(manager.properties["ElementName"])
        (again,) = self.client.returned("GetInstance", "root/interop", InstanceName=manager.path)
        self.assertEqual(again.properties["Name"], manager.properties["Name"])


class ForeignProviders(ClientTest):
    options = ("--registration", PROVIDERS, "--schema", PROVIDERS)

    def test_what_is_created_can_be_changed_and_deleted(self):
        name = "<&\"'> ] ]]> \u00e4\u20ac\U0001f600"
        path = Path("TEST_Thing", {"Name": name})
        thing = Instance("TEST_Thing", {"Name": name, "Text": " two  blanks "})
        (created,) = self.client.returned("CreateInstance", "root/test", NewInstance=thing)
        self.assertEqual(created.identity(), path.identity())
        self.assert_code(11, "CreateInstance", "root/test", NewInstance=thing)
        (found,) = self.client.returned("GetInstance", "root/test", InstanceName=path)
        self.assertEqual(found.properties["Text"], " two  blanks ")
        changed = Instance("TEST_Thing", {"Text": "new"}, path=path)
        self.assertIsNone(self.client.call("ModifyInstance", "root/test", ModifiedInstance=changed).returned)
        self.assertIsNone(self.client.call("DeleteInstance", "root/test", InstanceName=path).returned)
        self.assert_code(6, "DeleteInstance", "root/test", InstanceName=path)

    def test_methods_return_values_and_give_others(self):
        thing = Path("TEST_Thing", namespace="root/test")
        self.assertEqual(self.client.invoke(thing, "Sum", A=2, B=3), (2, {"Total": 5}))
        first = Path("TEST_Thing", {"Name": "first"}, "root/test")
        self.assertEqual(self.client.invoke(first, "Describe"), ("one of the things", {}))

    def test_queries_reach_the_provider(self):
        self.assert_code(14, "ExecQuery", "root/test", QueryLanguage="WQL", Query="SELECT * FROM TEST_Thing")


class Messages(ClientTest):
    def test_bodies_come_in_pieces(self):
        body = self.enumeration("of pieces")
        pieces = [body[at:at + 7] for at in range(0, len(body), 7)]
        content = self.post(iter(pieces), {"Transfer-Encoding": "chunked"}, chunked=True)
        self.assertIn(b'ID="of pieces"', content)
        self.assertIn(b"<INSTANCENAME", content)

    def test_the_connection_outlives_what_is_refused(self):
        self.post(self.enumeration())
        socket = self.client.connection.sock
        self.assert_http(400, "request-not-well-formed", b"<CIM")
        self.assert_http(400, "request-not-valid", b"<CIM/>")
        self.assert_http(400, "unsupported-operation", self.enumeration(), {"CIMOperation": "Other"})
        self.assert_http(400, "header-mismatch", self.enumeration(), {"CIMMethod": "GetInstance"})
        self.post(self.enumeration())
        self.assertIs(self.client.connection.sock, socket)

    def test_only_post_is_served(self):
        self.post(self.enumeration())
        man = {"Man": "http://www.dmtf.org/cim/mapping/http/v1.0; ns=73", "73-CIMOperation": "MethodCall"}
        for method, headers in (("M-POST", man), ("GET", {}), ("PUT", {}), ("OPTIONS", {})):
            with self.assertRaises(HttpError) as caught:
                self.post(self.enumeration(), headers, method=method)
            self.assertIn(caught.exception.status, (405, 501), method)
        self.post(self.enumeration())

    def test_identifiers_come_back_as_they_were(self):
        for identifier in ("", "4711", "<&\">'", "\u00e4\u20ac", "x" * 1000):
            call = cim_requests.intrinsic_call("EnumerateInstanceNames", "root/cimv2", {"ClassName": OS})
            content = self.post(cim_requests.document(identifier, call))
            message = cim_requests.ElementTree.fromstring(content)[0]
            self.assertEqual(message.get("ID"), identifier)

    def test_browsers_are_refused(self):
        for headers in ({"Origin": "http://127.0.0.1"}, {"Host": "rebound.example"}):
            with self.assertRaises(HttpError) as caught:
                self.post(self.enumeration(), headers)
            self.assertIn(caught.exception.status, (400, 403, 421), headers)


class Access(unittest.TestCase):
    """Over TLS with users: any address may be served then."""

    @classmethod
    def setUpClass(cls):
        folder = pathlib.Path(cls.enterClassContext(tempfile.TemporaryDirectory()))
        cls.certificate = folder / "certificate.pem"
        key, users = folder / "key.pem", folder / "users"
        subprocess.run(["openssl", "req", "-x509", "-newkey", "ec", "-pkeyopt", "ec_paramgen_curve:P-256",
                        "-nodes", "-days", "2", "-subj", "/CN=localhost", "-addext",
                        "subjectAltName=IP:127.0.0.1", "-keyout", key, "-out", cls.certificate],
                       check=True, stderr=subprocess.DEVNULL)
        password = subprocess.run(["openssl", "passwd", "-6", "-stdin"], input="open: sesame",
                                  capture_output=True, text=True, check=True)
        users.write_text(f"ali:{password.stdout}", encoding="utf-8")
        for file in (key, users):
            file.chmod(0o600)
        cls.endpoint = cls.enterClassContext(
            Endpoint(PROGRAM, "--tls-cert", cls.certificate, "--tls-key", key, "--users", users,
                     log="failures", expected=lambda line: "127.0.0.1" in line))

    def client(self, user=None):
        tls = tls_context(self.certificate)
        return self.enterContext(Client(self.endpoint.port, user, tls))

    def test_the_right_password_opens(self):
        client = self.client("ali:open: sesame")
        for _ in range(3):
            self.assertEqual(len(client.returned("EnumerateInstanceNames", ClassName=OS)), 1)
        bodies.update(client.bodies)

    def test_others_are_told_how_to_identify(self):
        for user in (None, "ali:wrong", "baba:open: sesame"):
            with self.assertRaises(HttpError) as caught, self.client(user) as client:
                client.call("EnumerateInstanceNames", ClassName=OS)
            self.assertEqual(caught.exception.status, 401)
            self.assertTrue(caught.exception.headers["WWW-Authenticate"].startswith('Basic realm="'))
            self.assertEqual(caught.exception.body, b"")

    def test_without_tls_there_is_no_answer(self):
        with self.assertRaises(Exception), Client(self.endpoint.port, "ali:open: sesame") as client:
            client.call("EnumerateInstanceNames", ClassName=OS)


if __name__ == "__main__":
    result = unittest.main(argv=sys.argv[:1], exit=False).result
    complaints = complaints_about(bodies, VALIDATOR)
    print(f"{len(bodies)} different responses, complaints: {complaints or 'none'}")
    sys.exit(0 if result.wasSuccessful() and bodies and not complaints else 1)
