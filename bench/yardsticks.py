"""The frame of the measuring: running the two sides of a comparison, and the table of their ratios."""
import json
import os
import pathlib
import shutil
import statistics
import subprocess
import tempfile
import time

import generate_orders

PROGRAM = pathlib.Path(os.environ["PARTNERKIT_PROGRAM"]).resolve()
BUILD = pathlib.Path(os.environ["PARTNERKIT_BUILD"]).resolve()
BENCH = BUILD / "bench"


class Failure(Exception):
    pass


def run(*command):
    """Runs a command to its end. Gives its output, elapsed seconds, processor seconds and peak memory in bytes."""
    with tempfile.TemporaryFile() as out, tempfile.TemporaryFile() as err:
        start = time.perf_counter()
        child = subprocess.Popen([str(part) for part in command], stdout=out, stderr=err)
        _, status, usage = os.wait4(child.pid, 0)
        seconds = time.perf_counter() - start
        child.returncode = os.waitstatus_to_exitcode(status)
        out.seek(0)
        err.seek(0)
        if child.returncode != 0:
            raise Failure(f"{' '.join(map(str, command))}: exit status {child.returncode}\n{err.read().decode()}")
        return out.read().decode(), seconds, usage.ru_utime + usage.ru_stime, usage.ru_maxrss * 1024


class Bench:
    def __init__(self, folder, of_class, sizes, cpu):
        self.folder = folder
        self.of_class = of_class
        self.sizes = sizes
        self.cpu = cpu
        self.over = False
        self.workspace = folder / "workspace"
        self.store = self.workspace / "partnerkit.db"
        self.supplier = generate_orders.Supplier(1)

    def prepare(self):
        generate_orders.write_masters(self.folder, self.of_class, self.supplier)
        run(PROGRAM, "new", self.workspace)
        shutil.copy(self.folder / "orders.map", self.workspace / "maps")
        run(PROGRAM, "--workspace", self.workspace, "data", "load", self.folder / "records.json")
        shutil.copy(self.store, self.folder / "empty.db")
        self.large = self.orders("large.csv", size=self.sizes["bytes"])
        self.few = self.orders("few.csv", count=self.sizes["orders"])
        self.many = self.orders("many.csv", count=self.sizes["many"])

    def orders(self, name, **length):
        path = self.folder / name
        generate_orders.write_orders(path, self.of_class, self.supplier, **length)
        return path

    def fresh(self, file):
        """The workspace as it was at first, and a copy of the order file for it to work off."""
        for left in [*self.workspace.glob("partnerkit.db*"), *self.workspace.glob("backup/*")]:
            left.unlink()
        shutil.copy(self.folder / "empty.db", self.store)
        inbox = self.workspace / "inbox" / f"orders{file.suffix}"
        shutil.copy(file, inbox)
        os.sync()
        return inbox

    def emptied(self, inbox):
        return inbox.stat().st_size == 0

    # One run of each side. Seconds, elapsed or of the processor.

    def rows(self):
        # The peak is at least this script's own, which the system carries over to what it starts.
        _, elapsed, busy, memory = run(PROGRAM, "--workspace", self.workspace, "rows", "1", self.large)
        self.memory = max(getattr(self, "memory", 0), memory)
        return busy if self.cpu else elapsed

    def rows_and_copy(self):
        """Lists the file, and copies it to the disk proper, as Term must with every line before the old file may go."""
        copy = self.folder / "copy"
        copy.unlink(missing_ok=True)
        os.sync()
        _, elapsed, busy, _ = run("dd", f"if={self.large}", f"of={copy}", "bs=1M", "conv=fsync", "status=none")
        copy.unlink()
        return self.rows() + (busy if self.cpu else elapsed)

    def tokenise(self):
        _, elapsed, busy, _ = run(BENCH / "tokenise", self.large)
        return busy if self.cpu else elapsed

    def process(self, file):
        inbox = self.fresh(file)
        _, elapsed, busy, _ = run(PROGRAM, "--workspace", self.workspace, "process", "1", inbox)
        if not self.emptied(inbox):
            raise Failure("not every order was posted")
        return busy if self.cpu else elapsed

    def process_few(self):
        seconds = self.process(self.few)
        if not (self.folder / "full.db").exists():
            shutil.copy(self.store, self.folder / "full.db")
        return seconds

    def process_many(self):
        return self.process(self.many) / self.sizes["many"]

    def process_few_each(self):
        return self.process(self.few) / self.sizes["orders"]

    def bare_insert(self):
        self.fresh(self.few)
        out, _, _, _ = run(BENCH / "bare_insert", self.folder / "full.db", self.store)
        return json.loads(out)["busy" if self.cpu else "seconds"]

    def settle(self, which):
        inbox = self.fresh(self.large)
        out, _, _, _ = run(BENCH / "settle", which, self.of_class.prog_id, self.workspace, inbox)
        left = inbox.stat().st_size
        if (left == 0) != (which == "all"):
            raise Failure(f"settling left {left} bytes")
        return json.loads(out)["busy" if self.cpu else "seconds"]

    # The table.

    def print_line(self, name, ours, bare, target, ratio=None):
        """`ours` and `bare` are texts."""
        verdict = "" if ratio is None else "ok" if ratio <= target else "over"
        self.over |= verdict == "over"
        shown = "ratio" if ratio is None else f"{ratio:.2f}"
        limit = "target" if ratio is None else f"{target:.2f}"
        print(f"{name:<44}{ours:>12}{bare:>12}{shown:>8}{limit:>8}  {verdict}".rstrip(), flush=True)

    def compare(self, name, ours, bare, target, unit="s"):
        factor = {"s": 1, "us": 1e6}[unit]
        times = [(ours(), bare()) for _ in range(self.sizes["runs"])]
        our_time, bare_time = (statistics.median(side) for side in zip(*times))
        digits = 3 if unit == "s" else 0
        self.print_line(name, *(f"{seconds * factor:.{digits}f} {unit}" for seconds in (our_time, bare_time)), target,
                        our_time / bare_time)

    def measure(self):
        megabytes = self.sizes["bytes"] // 1_000_000
        few, many = self.sizes["orders"], self.sizes["many"]
        self.print_line(self.of_class.name, "ours", "bare", None)
        self.compare(f"rows of {megabytes} MB : tokeniser", self.rows, self.tokenise, 1.6)
        self.print_line("  its memory : 60 MB", f"{self.memory / 1e6:.1f} MB", "60.0 MB", 1.0, self.memory / 60e6)
        self.compare(f"process of {few} orders : bare inserts", self.process_few, self.bare_insert, 2.0)
        self.compare(f"an order of {many} : of {few}", self.process_many, self.process_few_each, 1.15, "us")
        self.compare("Term, all to the backup : rows and copy", lambda: self.settle("all"), self.rows_and_copy, 1.5)
        self.compare("Term, all but one kept : rows and copy", lambda: self.settle("one"), self.rows_and_copy, 1.5)
