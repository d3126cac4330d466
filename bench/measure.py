#!/usr/bin/env python3
"""Times the program against bare yardsticks on this machine and prints their ratios, for the model class and the slowest
of the others.

Each ratio is taken in one go: the two sides run in turn, the median of each counts. Other work on the machine distorts the
figures; --cpu compares processor time instead of elapsed time, which suffers less but leaves out the waiting for the disk.
Exit status: 0 all ratios within their targets, 1 one is over, 2 the measuring could not be done.
"""
import argparse
import json
import os
import pathlib
import shutil
import signal
import statistics
import subprocess
import sys
import tempfile
import time

import generate_orders
import order_samples

PROGRAM = pathlib.Path(os.environ["PARTNERKIT_PROGRAM"]).resolve()
BUILD = pathlib.Path(os.environ["PARTNERKIT_BUILD"]).resolve()
BENCH = BUILD / "bench"

# Bytes of disk for each byte of the large file (the file, two copies, its backup), and for each order posted (several
# databases of 5 KB an order and more).
LARGE_FILE_COPIES = 5
BYTES_PER_ORDER = 60_000

MODEL, SLOWEST = "clsMGB850csv", "clsColesEIDCPOcsv"

FULL = {"runs": 3, "bytes": 150_000_000, "orders": 2_000, "many": 20_000}
SURVEY = {"runs": 3, "bytes": 15_000_000, "orders": 500, "many": 1_500}
QUICK = {"runs": 1, "bytes": 3_000_000, "orders": 60, "many": 200}


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
        inbox = self.workspace / "inbox" / "orders.csv"
        shutil.copy(file, inbox)
        os.sync()
        return inbox

    # One run of each side. Seconds, elapsed or of the processor.

    def rows(self):
        # The peak is at least this script's own, which the system carries over to what it starts.
        _, elapsed, busy, memory = run(PROGRAM, "--workspace", self.workspace, "rows", "1", self.large)
        self.memory = max(getattr(self, "memory", 0), memory)
        return busy if self.cpu else elapsed

    def tokenise(self):
        _, elapsed, busy, _ = run(BENCH / "tokenise", self.large)
        return busy if self.cpu else elapsed

    def process(self, file):
        inbox = self.fresh(file)
        _, elapsed, busy, _ = run(PROGRAM, "--workspace", self.workspace, "process", "1", inbox)
        if inbox.stat().st_size != 0:
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
        self.compare("Term, every order to the backup : rows", lambda: self.settle("all"), self.rows, 1.5)
        self.compare("Term, every order but one kept : rows", lambda: self.settle("one"), self.rows, 1.5)


def check_space(sizes):
    wanted = sizes["bytes"] * LARGE_FILE_COPIES + sizes["many"] * BYTES_PER_ORDER
    free = shutil.disk_usage(BUILD).free
    if free < wanted:
        raise Failure(f"{BUILD}: {wanted // 1_000_000} MB of free disk are needed, there are {free // 1_000_000}")


def main():
    parser = argparse.ArgumentParser(prog="./pk bench", description=__doc__,
                                     formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("--quick", action="store_true", help="small sizes, once each: shows that it runs, not how fast")
    parser.add_argument("--class", dest="named", help="one class instead, or all, these at a smaller size")
    parser.add_argument("--cpu", action="store_true", help="compare processor time")
    parser.add_argument("--runs", type=int, help="how often each side runs (%d)" % FULL["runs"])
    options = parser.parse_args()
    sizes = dict(QUICK if options.quick else SURVEY if options.named == "all" else FULL)
    classes = order_samples.order_classes() if options.named == "all" else \
        [order_samples.order_class(name) for name in ([options.named] if options.named else [MODEL, SLOWEST])]
    if options.runs:
        sizes["runs"] = options.runs
    signal.signal(signal.SIGTERM, lambda *_: sys.exit(2))  # so that the files go
    load, cores = os.getloadavg()[0], os.cpu_count() or 1
    if load > cores / 4:
        print(f"bench: {load:.1f} processes keep the {cores} processors of this machine busy; the figures suffer",
              file=sys.stderr)
    over = False
    try:
        check_space(sizes)
        for of_class in classes:
            with tempfile.TemporaryDirectory(prefix="bench-", dir=BUILD) as folder:
                bench = Bench(pathlib.Path(folder), of_class, sizes, options.cpu)
                bench.prepare()
                bench.measure()
            over |= bench.over
    except (Failure, OSError) as failure:
        print(f"bench: {failure}", file=sys.stderr)
        return 2
    # Small sizes measure the start of the programs, so nothing is over then.
    return 1 if over and not options.quick else 0


if __name__ == "__main__":
    sys.exit(main())
