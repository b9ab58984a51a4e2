"""The built endpoint as a service: service_test.py PROGRAM"""
import contextlib
import os
import pathlib
import re
import shutil
import signal
import socket
import ssl
import subprocess
import sys
import tempfile
import threading
import time
import unittest

from cim_requests import ClassName
from endpoint import Endpoint
from wbem_client import Client, HttpError, tls_context

PROGRAM = sys.argv[1]
PEMS = pathlib.Path(__file__).parent / "tls"
OS = ClassName("KORVA_OperatingSystem")
# joe's password is secret, ann's is pass:word.
JOE = "joe:$5$rounds=1000$saltsalt$eKLZU9t9OoPWrqOQsoTIKG0aYkZ5rGOoOQhiIvoSWX2\n"
ANN = ("ann:$6$rounds=1000$saltsalt$kF2jhmjjaYMFwyvHjGPaaYIXzg6he1ejETHRovgPV.NWWVvadW85."
       "fyrVpYCuxrzvLPelwDHs8BD4NdLZSR1E0\n")


def asks(port, **options):
    """The names of operating systems that a new connection is given: one."""
    with Client(port, **options) as client:
        return len(client.returned("EnumerateInstanceNames", ClassName=OS))


def soon(condition):
    """Whether it comes true within ten seconds."""
    end = time.monotonic() + 10
    while not condition():
        if time.monotonic() > end:
            return False
        time.sleep(0.01)
    return True


def run(*arguments, **options):
    return subprocess.run([PROGRAM, *arguments], capture_output=True, text=True, timeout=20,
                          stdin=subprocess.DEVNULL, check=False, **options)


class ServiceTest(unittest.TestCase):
    def setUp(self):
        self.folder = pathlib.Path(self.enterContext(tempfile.TemporaryDirectory()))

    def write(self, name, text, mode=0o600):
        path = self.folder / name
        path.write_text(text, encoding="utf-8")
        path.chmod(mode)
        return str(path)

    def take_identity(self, name):
        """Puts a certificate and its key where the endpoint is told that they are."""
        for kind in ("pem", "key"):
            self.write(f"tls.{kind}", (PEMS / f"{name}.{kind}").read_text(encoding="ascii"))
        return "--tls-cert", str(self.folder / "tls.pem"), "--tls-key", str(self.folder / "tls.key")

    def serving(self, *options):
        """An endpoint that may say anything."""
        return self.enterContext(Endpoint(PROGRAM, *options, expected=lambda line: True))

    def reload(self, endpoint, expected):
        endpoint.process.send_signal(signal.SIGHUP)
        self.assertTrue(soon(lambda: expected in endpoint.written()), endpoint.written())


class Refusals(ServiceTest):
    def test_what_is_not_safe_or_cannot_be_used_is_refused_with_a_reason(self):
        key = self.write("readable.key", (PEMS / "one.key").read_text(encoding="ascii"), 0o644)
        users = self.write("users", JOE)
        tls = self.take_identity("one")
        taken = self.enterContext(socket.create_server(("127.0.0.1", 0)))
        port = taken.getsockname()[1]
        unsafe = " can be reached from other hosts: this takes TLS (--tls-cert, --tls-key) and --users"
        for status, complaint, *arguments in (
                (2, "0.0.0.0:0" + unsafe, "--listen", "0.0.0.0:0"),
                (2, "[::]:0" + unsafe, "--listen", "[::]:0"),
                (2, "0.0.0.0:0" + unsafe, "--listen", "0.0.0.0:0", *tls),
                (2, "0.0.0.0:0" + unsafe, "--listen", "0.0.0.0:0", "--users", users),
                (2, "0.0.0.0:0 can be reached from other hosts: plain: is for loopback addresses",
                 "--listen", "plain:0.0.0.0:0", "--users", users, *tls),
                (2, f"{users}, {tls[3]}: HTTP does not start: GnuTLS failed to setup x509 "
                 "certificate/key: Base64 decoding error. Failed to initialize TLS support.",
                 "--listen", "127.0.0.1:0", "--tls-cert", users, *tls[2:]),
                (2, "'vm' is no numeric address, nor localhost", "--listen", "vm:5988"),
                (2, f"{key}: everybody may use this file; chmod o= takes that away",
                 "--tls-cert", tls[1], "--tls-key", key),
                (2, "/nonexistent: No such file or directory", "--users", "/nonexistent"),
                (1, f"cannot listen on 127.0.0.1:{port}: Address already in use",
                 "--listen", f"127.0.0.1:{port}"),
                (3, f"{self.folder}: there are no registrations of providers",
                 "--registration", str(self.folder)),
        ):
            ended = run(*arguments)
            self.assertEqual((ended.returncode, ended.stdout, ended.stderr),
                             (status, "", f"cmpihost-serve: {complaint}\n"))

    def test_classes_that_cannot_be_read_have_a_status(self):
        self.assertEqual(run("--schema", "/nonexistent").returncode, 3)

    def test_a_certificate_without_its_key_is_refused(self):
        self.take_identity("one")
        shutil.copy(PEMS / "two.key", self.folder / "tls.key")
        ended = run("--listen", "127.0.0.1:0", "--tls-cert", str(self.folder / "tls.pem"),
                    "--tls-key", str(self.folder / "tls.key"))
        self.assertIn(ended.returncode, (1, 2))
        self.assertNotEqual(ended.stderr, "")


class Signals(ServiceTest):
    def test_requests_that_run_are_answered_before_the_end(self):
        endpoint = self.serving("--users", self.write("users", JOE))
        told = []

        def ask_wrongly():
            for _ in range(3):
                try:
                    asks(endpoint.port, user="joe:wrong")
                except HttpError as error:
                    told.append(error.status)

        # The third answer would take a second.
        asking = threading.Thread(target=ask_wrongly)
        asking.start()
        self.assertTrue(soon(lambda: endpoint.written().count("wrong name or password") == 3))
        begin = time.monotonic()
        endpoint.process.send_signal(signal.SIGTERM)
        self.assertEqual(endpoint.process.wait(5), 0)
        self.assertLess(time.monotonic() - begin, 0.7)
        asking.join()
        self.assertEqual(told, [401, 401, 401])

    def test_idle_connections_do_not_hold_up_the_end(self):
        endpoint = self.serving()
        with Client(endpoint.port) as client:
            client.returned("EnumerateInstanceNames", ClassName=OS)
            begin = time.monotonic()
            endpoint.process.send_signal(signal.SIGINT)
            self.assertEqual(endpoint.process.wait(5), 0)
            self.assertLess(time.monotonic() - begin, 2)

    def test_users_are_read_again_and_a_wrong_file_keeps_them(self):
        endpoint = self.serving("--users", self.write("users", JOE))
        self.assertEqual(asks(endpoint.port, user="joe:secret"), 1)
        self.write("users", "nonsense\n")
        self.reload(endpoint, "kept users: ")
        self.assertEqual(asks(endpoint.port, user="joe:secret"), 1)
        self.write("users", ANN)
        self.reload(endpoint, "read again: users")
        self.assertEqual(asks(endpoint.port, user="ann:pass:word"), 1)
        with self.assertRaisesRegex(HttpError, "401"):
            asks(endpoint.port, user="joe:secret")

    def test_the_certificate_is_read_again_and_a_wrong_one_keeps_the_old(self):
        one, two = (tls_context(PEMS / f"{name}.pem") for name in ("one", "two"))
        endpoint = self.serving(*self.take_identity("one"))
        self.assertEqual(asks(endpoint.port, tls=one), 1)
        with self.assertRaises(ssl.SSLCertVerificationError):
            asks(endpoint.port, tls=two)
        shutil.copy(PEMS / "two.key", self.folder / "tls.key")
        self.reload(endpoint, "kept certificate and key: ")
        self.assertEqual(asks(endpoint.port, tls=one), 1)
        self.take_identity("two")
        self.reload(endpoint, "read again: certificate and key")
        self.assertEqual(asks(endpoint.port, tls=two), 1)
        with self.assertRaises(ssl.SSLCertVerificationError):
            asks(endpoint.port, tls=one)

    def test_counters_go_to_the_log(self):
        endpoint = self.serving()
        asks(endpoint.port)
        # One refusal by what is asked for, one before that is known, and a request that never was one.
        for request in (b"GET / HTTP/1.1\r\nHost: h\r\n\r\n", b"POST / HTTP/1.1\r\n\r\n", b"POST / HTTP/1.1\r\nHost: h"):
            with socket.create_connection(("127.0.0.1", endpoint.port), 10) as client:
                client.sendall(request)
                client.shutdown(socket.SHUT_WR)
                while client.recv(4096):
                    pass
        endpoint.process.send_signal(signal.SIGUSR1)
        self.assertTrue(soon(lambda: re.search(
            r"counters: operations 1, failed 0, requests refused 2, connections cut 1, busy \d+us, up \d+us, "
            r"log lines lost 0\n", endpoint.written())), endpoint.written())


class Addresses(ServiceTest):
    def test_a_socket_in_the_file_system_is_served_and_taken_away(self):
        path = self.folder / "socket"
        endpoint = Endpoint(PROGRAM, "--listen", f"unix:{path}")
        with endpoint, socket.socket(socket.AF_UNIX) as client:
            client.connect(str(path))
            client.sendall(b"GET / HTTP/1.1\r\nHost: localhost\r\n\r\n")
            self.assertIn(b"405", client.recv(4096))
        self.assertFalse(path.exists())

    def test_a_plain_address_speaks_no_tls_beside_others(self):
        with socket.create_server(("127.0.0.1", 0)) as free:
            port = free.getsockname()[1]
        endpoint = self.serving("--listen", f"plain:127.0.0.1:{port}", *self.take_identity("one"))
        self.assertEqual(asks(port), 1)
        self.assertEqual(asks(endpoint.port, tls=tls_context(PEMS / "one.pem")), 1)

    @contextlib.contextmanager
    def activated(self, listener, *options):
        """The endpoint with a socket that was passed on, and what it tells the service manager."""
        address = str(self.folder / "notify")
        manager = self.enterContext(socket.socket(socket.AF_UNIX, socket.SOCK_DGRAM))
        manager.bind(address)
        manager.settimeout(10)
        script = f'exec 3<&{listener.fileno()}; LISTEN_FDS=1 LISTEN_PID=$$ exec "$0" "$@"'
        with subprocess.Popen(["/bin/sh", "-c", script, PROGRAM, *options],
                              env=dict(os.environ, NOTIFY_SOCKET=address), pass_fds=[listener.fileno()],
                              stderr=subprocess.PIPE, text=True) as process:
            try:
                yield process, manager
            finally:
                process.kill()

    def test_sockets_are_taken_from_a_service_manager_which_is_told_of_all(self):
        listener = self.enterContext(socket.create_server(("127.0.0.1", 0)))
        port = listener.getsockname()[1]
        with self.activated(listener) as (process, manager):
            self.assertEqual(manager.recv(99), b"READY=1")
            self.assertEqual(asks(port), 1)
            process.send_signal(signal.SIGHUP)
            self.assertRegex(manager.recv(99), rb"^RELOADING=1\nMONOTONIC_USEC=\d+$")
            self.assertEqual(manager.recv(99), b"READY=1")
            process.send_signal(signal.SIGTERM)
            self.assertEqual(manager.recv(99), b"STOPPING=1")
            self.assertEqual(process.wait(5), 0)
            self.assertEqual(process.stderr.read(),
                             f"cmpihost-serve: listening on http://127.0.0.1:{port}\n")

    def test_a_socket_that_is_not_safe_is_refused(self):
        listener = socket.socket()
        self.addCleanup(listener.close)
        # Bound, so that it has the address; never listened on.
        listener.bind(("127.0.0.1", 0))
        with self.activated(listener) as (process, _):
            self.assertEqual(process.wait(5), 2)
            self.assertEqual(process.stderr.read(), "cmpihost-serve: descriptor 3, which was passed "
                             "on, is no listening stream socket\n")

    def test_the_sockets_of_another_process_are_left_alone(self):
        ended = run("--listen", "nowhere", env=dict(os.environ, LISTEN_FDS="1", LISTEN_PID="1"))
        self.assertEqual(ended.stderr,
                         "cmpihost-serve: 'nowhere' is not ADDRESS:PORT (a port up to 65535) or unix:PATH\n")


class CommandOfTheHost(ServiceTest):
    def test_serve_becomes_the_program_beside_it(self):
        host = pathlib.Path(PROGRAM).parent / "cmpihost"
        ended = subprocess.run([host, "serve", "--listen", "nowhere"], capture_output=True, text=True,
                               timeout=20, check=False)
        self.assertEqual((ended.returncode, ended.stderr),
                         (2, "cmpihost-serve: 'nowhere' is not ADDRESS:PORT (a port up to 65535) or unix:PATH\n"))


if __name__ == "__main__":
    unittest.main(argv=sys.argv[:1])
