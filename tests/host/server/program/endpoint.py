"""The built cmpihost-serve in a process of its own."""
import os
import pathlib
import re
import signal
import socket
import subprocess
import tempfile


class Endpoint:
    """Serves the fixture host on a free port of 127.0.0.1 until the end of a with block, where it has
    to end by itself, with status 0 and nothing on stderr but where it listened and the lines that
    `expected` allows."""

    def __init__(self, program, *options, log="none", expected=lambda line: False):
        self.program = pathlib.Path(program)
        self.options = ("--log", log, *options)
        self.expected = expected

    def __enter__(self):
        self.folder = tempfile.TemporaryDirectory()
        self.errors = open(os.path.join(self.folder.name, "stderr"), "w+", encoding="utf-8")
        address = os.path.join(self.folder.name, "notify")
        with socket.socket(socket.AF_UNIX, socket.SOCK_DGRAM) as notifications:
            notifications.bind(address)
            notifications.settimeout(10)
            environment = dict(os.environ, TZ="UTC0", NOTIFY_SOCKET=address,
                               LD_LIBRARY_PATH=str(self.program.parent.parent / "fixture-host"))
            self.process = subprocess.Popen(
                [self.program, "--listen", "127.0.0.1:0", *self.options],
                env=environment, stdin=subprocess.DEVNULL, stderr=self.errors)
            try:
                while b"READY=1" not in notifications.recv(4096):
                    pass
            except TimeoutError:
                self.process.kill()
                self.process.wait()
                raise AssertionError("the endpoint does not serve: " + self.written()) from None
        self.port = int(re.search(r"listening on https?://127.0.0.1:(\d+)\n", self.written())[1])
        return self

    def __exit__(self, kind, value, trace):
        self.process.send_signal(signal.SIGTERM)
        try:
            status = self.process.wait(15)
        except subprocess.TimeoutExpired:
            self.process.kill()
            status = f"none 15 seconds after SIGTERM, {self.process.wait()}"
        written = self.written()
        self.errors.close()
        self.folder.cleanup()
        if kind is None:
            assert status == 0, f"exit status {status}: {written}"
            unexpected = [line for line in written.splitlines()
                          if "listening on " not in line and not self.expected(line)]
            assert not unexpected, unexpected

    def written(self):
        """What it wrote to stderr so far."""
        self.errors.flush()
        with open(self.errors.name, encoding="utf-8") as file:
            return file.read()

    def threads(self):
        return len(os.listdir(f"/proc/{self.process.pid}/task"))

    def descriptors(self):
        return len(os.listdir(f"/proc/{self.process.pid}/fd"))

    def resident(self, at="VmRSS"):
        """Its resident memory in kilobytes; at="VmHWM": the most that it ever had."""
        with open(f"/proc/{self.process.pid}/status", encoding="ascii") as file:
            return next(int(line.split()[1]) for line in file if line.startswith(at + ":"))
