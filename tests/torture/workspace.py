"""The program under torture, its workspaces, and how a run is struck."""

import json
import os
import pathlib
import re
import shutil
import signal
import subprocess
import tempfile
import threading
import time

HERE = pathlib.Path(__file__).parent
TIME_LIMIT = 300  # seconds; a run that takes longer hangs
NOW = "2006-03-08T10:15:00"
ORDER_FILE = "inbox/orders.edi"
BACKUP = "backup/po.csv"
EARLIER_BACKUP = b"an order of last week,1\r\nan order of last week,2\r\n"


class HarnessError(Exception):
    """The harness itself cannot go on."""


class Ended:
    """What a run left: its status, below 0 when a signal ended it, and what it said."""

    order_file = None  # as the run found it

    def __init__(self, status, out, err):
        self.status = status
        self.out = out
        self.err = err.decode(errors="replace")

    def report(self):
        return json.loads(self.out)

    def posted(self):
        """The numbers of the orders that the run posted, with faults or without."""
        told = (re.match("PO (.+) import completed", record["Message"]) for record in self.report()["log"])
        return {match[1] for match in told if match}


class Program:
    def __init__(self, path, build):
        self.path = os.path.abspath(path)
        self.shim = self._build_shim(pathlib.Path(build) / "torture")

    @staticmethod
    def _build_shim(folder):
        folder.mkdir(parents=True, exist_ok=True)
        shim = folder / "kill_shim.so"
        source = HERE / "kill_shim.cpp"
        if shim.exists() and shim.stat().st_mtime > source.stat().st_mtime:
            return str(shim.absolute())
        compilers = [name for name in (os.environ.get("CXX"), "g++", "clang++", "c++") if name and shutil.which(name)]
        if not compilers:
            raise HarnessError("no C++ compiler to build kill_shim.cpp with")
        draft = folder / f"kill_shim.{os.getpid()}"
        subprocess.run([compilers[0], "-std=c++20", "-O1", "-Wall", "-Wextra", "-shared", "-fPIC", "-o", draft, source,
                        "-ldl"], check=True)
        os.replace(draft, shim)
        return str(shim.absolute())

    def environment(self, strike, trace):
        environment = {name: value for name, value in os.environ.items() if not name.startswith("PARTNERKIT_")}
        if strike or trace:
            environment["LD_PRELOAD"] = self.shim
            # AddressSanitizer wants to be the first library, and is content to be the second.
            environment["ASAN_OPTIONS"] = environment.get("ASAN_OPTIONS", "") + ":verify_asan_link_order=0"
        if strike:
            environment["PARTNERKIT_STRIKE"] = strike
        if trace:
            environment["PARTNERKIT_STRIKE_TRACE"] = str(trace)
        return environment

    def start(self, folder, *arguments, strike=None, trace=None, **how):
        return subprocess.Popen([self.path, "--json", "--now", NOW, *arguments], cwd=folder, stdin=subprocess.DEVNULL,
                                stdout=subprocess.PIPE, stderr=subprocess.PIPE,
                                env=self.environment(strike, trace), **how)

    def finish(self, process):
        try:
            out, err = process.communicate(timeout=TIME_LIMIT)
        except subprocess.TimeoutExpired:
            process.kill()
            process.communicate()
            return Ended("hangs", b"", b"")
        return Ended(process.returncode, out, err)

    def run(self, folder, *arguments, **how):
        return self.finish(self.start(folder, *arguments, **how))

    def process(self, folder, *, until=None, name=ORDER_FILE, **how):
        """`until`: the run is killed so many seconds after its start, unless it has ended by then."""
        path = pathlib.Path(folder) / name
        order_file = path.read_bytes() if path.is_file() else None
        process = self.start(folder, "process", "1", name, **how)
        timer = threading.Timer(until or 0, process.kill)
        if until is not None:
            timer.start()
        ended = self.finish(process)
        timer.cancel()
        ended.order_file = order_file
        return ended

    def process_stopped(self, folder, strike, document="1", name=ORDER_FILE):
        """Starts a run and waits until the strike has stopped it."""
        process = self.start(folder, "process", document, name, strike=strike)
        deadline = time.monotonic() + TIME_LIMIT
        while time.monotonic() < deadline:
            # WNOWAIT leaves the status of an ended run to `finish`.
            found = os.waitid(os.P_PID, process.pid, os.WSTOPPED | os.WEXITED | os.WNOHANG | os.WNOWAIT)
            if found is not None:
                if found.si_code != os.CLD_STOPPED:
                    raise HarnessError(f"the run ended before it was stopped: {self.finish(process).err}")
                return process
            time.sleep(0.002)
        raise HarnessError("the run was never stopped")

    def carry_on(self, process):
        process.send_signal(signal.SIGCONT)
        return self.finish(process)


class Scenario:
    """A prepared workspace and the order file that lies in it. Paths are relative: the runs start in the workspace."""

    def __init__(self, program, root, name, file, **how):
        self.name = name
        self.file = file
        self.backup = how.get("backup", BACKUP)
        self.prepared = pathlib.Path(root) / f"prepared-{name}"
        must(program.run(root, "new", str(self.prepared)))
        (self.prepared / "records.json").write_text(file.trade.records(file, **how))
        must(program.run(self.prepared, "data", "load", "records.json"))
        (self.prepared / "records.json").unlink()
        (self.prepared / "maps" / "orders.map").write_text("\n".join(file.trade.order_class.columns))
        (self.prepared / ORDER_FILE).write_bytes(file.content())
        (self.prepared / BACKUP).write_bytes(EARLIER_BACKUP)

    def copy(self, root):
        folder = pathlib.Path(tempfile.mkdtemp(prefix=f"{self.name}-", dir=root))
        shutil.copytree(self.prepared, folder, dirs_exist_ok=True)
        return folder


def must(ended):
    if ended.status != 0:
        raise HarnessError(f"the workspace cannot be prepared: status {ended.status}: {ended.err}")


def trace_of(process, trace):
    """The operations of the run that `process(trace)` makes, each as (kind, name of the file)."""
    trace.unlink(missing_ok=True)
    ended = process(trace)
    operations = [tuple(line.rstrip("\n").split(" ", 1)) for line in trace.read_text().splitlines(True)]
    trace.unlink()
    return ended, operations
