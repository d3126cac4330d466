"""Kills `partnerkit process` at random moments and at the operations that a crash could come between, makes the
disk fail under it, and checks each time that a plain second run leaves every order stored exactly once or still in the
file, and every packed carton in exactly one stored notice.

    run.sh [long]                     the model class in full, the others by a sample: 25 minutes on two cores
    run.sh --class CLASS [long]       one class in full: ten minutes
    run.sh short                      a small sample of every class, for the tests
    run.sh repeat SCENARIO STRIKE...  one round, its workspace kept
    run.sh failures [NAME...]         the other failures only: locks, vanished files, several programs

A STRIKE is at:SECONDS (SIGKILL from outside) or ACTION:KIND:N[:ERRNO] as kill_shim.cpp tells; several strike one run
after the other. Violations are printed with the command that repeats them, and their workspaces kept.
"""

import argparse
import collections
import concurrent.futures
import dataclasses
import errno
import os
import pathlib
import random
import re
import shutil
import signal
import statistics
import sys
import tempfile
import threading
import time
from dataclasses import dataclass

import failures
import notices
import order_samples
import orders
import x12_orders
import x12_samples
from workspace import HarnessError, Program, Scenario, trace_of

# The order file's own operations, told from the store's by the name of the file: what settling and its recovery do.
SETTLING = ("po.csv", "orders.edi", "orders.tmp", "FA_PO_", "inbox", "backup", "outbox")
# The same of a notice: its files, their drafts, and the folder.
NOTICE_FILES = ("asn", "stock", ".asn", ".stock", "outbox")

# Behind a write, a truncation or a sync the disk is as it is before the next operation.
EVERY = {"rename": ("kill-before", "kill-after"), "unlink": ("kill-before", "kill-after"),
         "commit": ("kill-before", "kill-after"), "write": ("kill-before", "kill-half"), "truncate": ("kill-before",),
         "sync": ("kill-before",)}
# A fault that passes, which a run may try to go on behind, then one that stays.
PASSING = ((errno.EIO, "fail-once"), (errno.ENOSPC, "fail-once"))
FAULTS = {"write": (*PASSING, (errno.ENOSPC, "fail-on")), "sync": PASSING, "truncate": ((errno.EIO, "fail-once"),),
          "rename": (*PASSING, (errno.EACCES, "fail-on")), "unlink": ((errno.EACCES, "fail-on"),)}

# The same finding is told this often; the rest is counted.
TOLD = 3
# Kills leave the page cache be, so a memory disk tests as much as a real one, sooner.
MEMORY_DISK = "/dev/shm"


TRADES = {order_samples.OrderClass: orders.Trade, x12_samples.X12Class: x12_orders.X12Trade,
          notices.NoticeClass: notices.NoticeTrade}


class Round:
    def __init__(self, group, scenario, strikes):
        self.group = group
        self.scenario = scenario
        self.strikes = strikes

    def text(self):
        return " ".join([self.scenario.name, *self.strikes])


@dataclass(frozen=True)
class Extent:
    """How many rounds of each sort; None is all there are."""
    random: int
    large: int | None      # at the large file's operations
    small: int | None      # at those of the small files
    settling: int | None
    faults: int | None
    failures: bool = True


FULL = Extent(300, None, None, None, None)
SAMPLE = Extent(40, 40, 250, 250, 120)
# The same with every fault: for the first class of each syntax, and ship notices.
FAULTS_SAMPLE = dataclasses.replace(SAMPLE, faults=None)
SHORT = Extent(25, 0, 50, 50, 60)
GLANCE = Extent(0, 0, 25, 25, 20, failures=False)
X12_GLANCE = Extent(0, 0, 16, 12, 25, failures=False)
NOTICE_GLANCE = Extent(8, 0, 16, 12, 40)

# large: what a partner sends on a busy day. small: every kind of order, few enough to strike at each operation.
# emptied: all orders post, and the file goes when it is empty.
SCENARIOS = {
    "large": {"count": 500, "products": 8, "stores": 5},
    "small": {},
    "emptied": {"count": 4, "plain": True, "options": "#%DELETEONEMPTY"},
}


class Torture:
    """One class under torture."""

    settling = SETTLING
    small = ("small", "emptied")
    # What the shim has to see of a large run.
    kinds = ("rename", "unlink", "sync", "truncate", "commit")

    def __init__(self, options, root, order_class):
        self.options = options
        self.root = root
        self.name = order_class.name
        self.trade = TRADES[type(order_class)](order_class)
        self.verdict = self.trade.verdict
        self.kept_under = pathlib.Path(os.environ["PARTNERKIT_BUILD"]) / "torture"
        self.program = Program(os.environ["PARTNERKIT_PROGRAM"], os.environ["PARTNERKIT_BUILD"])
        self.rng = random.Random(options.seed)
        self.lock = threading.Lock()
        self.counts = collections.Counter()
        self.found = 0
        self.alike = collections.Counter()
        self.prepared = {}

    def scenario(self, name):
        if name not in self.prepared:
            file = self.trade.make_file(**SCENARIOS[name])
            self.prepared[name] = Scenario(self.program, self.root, name, file)
        return self.prepared[name]

    # --- One round

    def process(self, scenario, folder, **how):
        return self.program.process(folder, **how)

    def strike(self, scenario, folder, strike):
        if strike.startswith("at:"):
            return self.process(scenario, folder, until=float(strike[3:]))
        return self.process(scenario, folder, strike=strike.replace(":", " "))

    def run(self, a_round, keep=False):
        """Gives whether the last strike killed."""
        folder = a_round.scenario.copy(self.root)
        found = []
        struck = []
        for strike in a_round.strikes:
            struck.append(self.strike(a_round.scenario, folder, strike))
            found += self.verdict.struck_violations(a_round.scenario, folder, struck)
        killed = struck[-1].status == -signal.SIGKILL
        last = self.process(a_round.scenario, folder)
        found += self.verdict.violations(a_round.scenario, folder, self.program, last, earlier=struck)
        self.close(f"repeat {a_round.text()}", folder, found, keep)
        with self.lock:
            fails = any(strike.startswith("fail") for strike in a_round.strikes)
            if killed or fails:
                self.counts[a_round.group] += 1
            elif a_round.group != "random kills":
                self.counts["strikes that came too late"] += 1
        return killed

    def close(self, text, folder, found, keep=False):
        """`text` is what repeats the round."""
        with self.lock:
            self.found += bool(found)
            # Numbers and names aside, alike findings are one.
            alike = re.sub(r"[0-9]+", "#", "\n".join(found))
            self.alike[alike] += bool(found)
            told = keep or (found and self.alike[alike] <= TOLD)
            if told:
                print(f"{'VIOLATION: ' if found else ''}./pk torture --class {self.name} {text}", *found, sep="\n  ")
                print(f"  workspace: {self.kept_under / folder.name}", flush=True)
        if told:
            shutil.move(folder, self.kept_under / folder.name)
        else:
            shutil.rmtree(folder)

    def run_all(self, about, rounds):
        began = time.monotonic()
        if rounds:
            print(f"{about}: {len(rounds)} rounds", flush=True)
        with concurrent.futures.ThreadPoolExecutor(self.options.jobs) as pool:
            for number, _ in enumerate(pool.map(self.run, rounds), 1):
                if number % 100 == 0:
                    print(f"  {number} of {len(rounds)} rounds, {time.monotonic() - began:.0f} s", flush=True)

    # --- Kills at random moments

    def random_kills(self, count):
        """Spread evenly over the run time, which is measured as the rounds will run: several at once."""
        large = self.scenario("large")
        with concurrent.futures.ThreadPoolExecutor(self.options.jobs) as pool:
            span = statistics.median(pool.map(self.plain_run, [large] * (2 * self.options.jobs)))
            moments = [span * (index + self.rng.random()) / count for index in range(count)]
            self.rng.shuffle(moments)
            print(f"{count} kills at random moments of a run of {span:.2f} s", flush=True)
            list(pool.map(self.kill_about, moments))

    def plain_run(self, scenario):
        folder = scenario.copy(self.root)
        began = time.monotonic()
        last = self.process(scenario, folder)
        took = time.monotonic() - began
        self.close(f"repeat {scenario.name} at:1000", folder, self.verdict.violations(scenario, folder, self.program, last))
        return took

    def kill_about(self, moment):
        # A run on an idle moment of the machine may end before its kill comes.
        for _ in range(20):
            if self.run(Round("random kills", self.scenario("large"), [f"at:{moment:.4f}"])):
                return
            moment *= 0.9
        raise HarnessError("the runs end before they can be killed")

    # --- Kills and faults at operations

    def traced(self, scenario, first=None):
        """The operations of a plain run, after one that `first` has struck."""
        folder = scenario.copy(self.root)
        if first:
            self.strike(scenario, folder, first)
        _, operations = trace_of(lambda trace: self.process(scenario, folder, trace=trace), folder / "trace")
        shutil.rmtree(folder)
        return operations

    def numbered(self, operations):
        seen = collections.Counter()
        for kind, name in operations:
            seen[kind] += 1
            yield kind, seen[kind], name

    def operation_kills(self, scenario, kinds, needed=()):
        """A round for each operation of these kinds: before, behind, and a write in its middle."""
        rounds = []
        operations = list(self.numbered(self.traced(scenario)))
        missing = set(needed or kinds) - {kind for kind, _, _ in operations}
        if missing:
            # A library linked in is out of the shim's reach.
            raise HarnessError(f"the shim sees no {', '.join(sorted(missing))}")
        for kind, number, _ in operations:
            if kind in kinds:
                rounds += [Round("operation kills", scenario, [f"{action}:{kind}:{number}"]) for action in EVERY[kind]]
        return rounds

    def settling_kills(self, scenario, count):
        """Kills round the operations on order file and backup, each followed by a kill in the recovery from it."""
        firsts = [f"{action}:{kind}:{number}" for kind, number, name in self.numbered(self.traced(scenario))
                  if name.startswith(self.settling) for action in EVERY[kind]]
        rounds = []
        for first in self.sample(firsts, count):
            rounds.append(Round("operation kills", scenario, [first]))
            rounds += [Round("kills in a recovery", scenario, [first, f"kill-before:{then}:{at}"])
                       for then, at, where in self.numbered(self.traced(scenario, first))
                       if where.startswith(self.settling)]
        return rounds

    def faults(self, scenario):
        """Every operation fails, and with a full disk all that follow."""
        return [Round("injected faults", scenario, [f"{action}:{kind}:{number}:{cause}"])
                for kind, number, _ in self.numbered(self.traced(scenario)) if kind in FAULTS
                for cause, action in FAULTS[kind]]

    # --- The forms

    def all_sorts(self, extent, slow):
        """`slow`: failures that only waiting shows, too."""
        kills = self.options.kills or extent.random
        if kills:
            self.random_kills(kills)
        if extent.large != 0:
            rounds = self.operation_kills(self.scenario("large"), self.kinds)
            self.run_all("renames, deletions, syncs and commits", self.sample(rounds, extent.large))
        both = [self.scenario(name) for name in self.small]
        for about, count, rounds in (
                ("every operation", extent.small, lambda each: self.operation_kills(each, EVERY, self.kinds)),
                ("settling and its recovery", extent.settling,
                 lambda each: self.settling_kills(each, extent.settling and 1 + extent.settling // 10)),
                ("faults", extent.faults, self.faults)):
            self.run_all(about, self.sample([found for each in both for found in rounds(each)], count))
        if extent.failures:
            self.other_failures(slow)

    def sample(self, rounds, count):
        return rounds if count is None else self.rng.sample(rounds, min(count, len(rounds)))

    def other_failures(self, slow, names=()):
        for name, folder, found in failures.run(self.program, self.trade, self.root, slow, names):
            self.counts["other failures"] += 1
            self.close(f"failures '{name}'", folder, found)

    def repeat(self):
        scenario, *strikes = self.options.what
        if scenario not in ("large", *self.small) or not strikes:
            raise HarnessError(f"repeat wants a scenario (large, {', '.join(self.small)}) and its strikes")
        self.run(Round("rounds", self.scenario(scenario), strikes), keep=True)

    def total(self):
        counted = [f"{count} {group}" for group, count in self.counts.items()]
        for alike, count in self.alike.most_common():
            if alike:
                print(f"{count} times: {alike.splitlines()[0]}")
        return ", ".join([*counted, f"{self.found} violations"])


class NoticeTorture(Torture):
    """The ship notices' class."""

    settling = NOTICE_FILES
    small = ("small", "single")
    kinds = ("unlink", "sync", "commit")

    def scenario(self, name):
        if name not in self.prepared:
            self.prepared[name] = notices.NoticeScenario(self.program, self.root, name, **notices.SCENARIOS[name])
        return self.prepared[name]

    def process(self, scenario, folder, **how):
        return self.program.process(folder, name=scenario.output, **how)

    def other_failures(self, slow, names=()):
        for name, folder, found in notices.run(self.program, self.scenario("large"), self.root, names):
            self.counts["other failures"] += 1
            self.close(f"failures '{name}'", folder, found)


def default_folder():
    roomy = os.access(MEMORY_DISK, os.W_OK) and shutil.disk_usage(MEMORY_DISK).free > 2**28
    return MEMORY_DISK if roomy else tempfile.gettempdir()


def without_library(name):
    return name.rpartition(".")[2]


def main():
    parser = argparse.ArgumentParser(description=__doc__, formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("form", nargs="?", default="long", choices=("long", "short", "failures", "repeat"))
    parser.add_argument("what", nargs="*", help="for repeat: SCENARIO STRIKE...; for failures: names")
    every_class = [*order_samples.order_classes(), *x12_samples.x12_classes(), notices.NoticeClass()]
    parser.add_argument("--class", dest="named", metavar="CLASS", type=without_library, choices=[each.name for each in every_class],
                        help="the class; for repeat and failures the model class if none is named")
    parser.add_argument("--seed", type=int, default=1, help="of the random moments and samples, %(default)s")
    parser.add_argument("--kills", type=int, help="how many random kills")
    parser.add_argument("--jobs", type=int, default=os.cpu_count(), help="rounds at once")
    parser.add_argument("--folder", default=default_folder(), help="where the workspaces lie meanwhile, %(default)s")
    options = parser.parse_args()
    classes = [each for each in every_class if options.named in (None, each.name)]
    if options.form in ("repeat", "failures"):
        del classes[1:]
    found = 0
    syntaxes = set()
    for order_class in classes:
        root = pathlib.Path(tempfile.mkdtemp(prefix="partnerkit-torture-", dir=options.folder))
        compiles = isinstance(order_class, notices.NoticeClass)
        torture = (NoticeTorture if compiles else Torture)(options, root, order_class)
        model = order_class is classes[0]
        sample = SAMPLE if type(order_class) in syntaxes else FAULTS_SAMPLE
        syntaxes.add(type(order_class))
        began = time.monotonic()
        try:
            if options.form == "repeat":
                torture.repeat()
            elif options.form == "failures":
                torture.other_failures(True, options.what)
            elif options.form == "long":
                torture.all_sorts(FULL if model else sample, slow=model)
            else:
                glance = NOTICE_GLANCE if compiles else GLANCE if torture.trade.backs_up else X12_GLANCE
                torture.all_sorts(SHORT if model and not compiles else glance, slow=False)
        except HarnessError as error:
            print(f"torture: {order_class.name}: {error}", file=sys.stderr)
            return 2
        finally:
            shutil.rmtree(root, ignore_errors=True)
        print(f"{order_class.name}, {time.monotonic() - began:.0f} s: {torture.total()}", flush=True)
        found += torture.found
    return 1 if found else 0


if __name__ == "__main__":
    sys.exit(main())
