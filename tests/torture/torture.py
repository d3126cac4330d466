"""Kills `partnerkit process` at random moments and at the operations that a crash could come between, makes the
disk fail under it, and checks each time that a plain second run leaves every order stored exactly once or still in the
file.

    run.sh [long]                     everything: a quarter of an hour on two idle cores
    run.sh short                      a sample, for the tests
    run.sh repeat SCENARIO STRIKE...  one round, its workspace kept
    run.sh failures [NAME...]         the other failures only: locks, vanished files, several programs

A STRIKE is at:SECONDS (SIGKILL from outside) or ACTION:KIND:N[:ERRNO] as kill_shim.cpp tells; several strike one run
after the other. Violations are printed with the command that repeats them, and their workspaces kept.
"""

import argparse
import collections
import concurrent.futures
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

import failures
import orders
import verdict
from workspace import HarnessError, Program, Scenario, trace_of

# The order file's own operations, told from the store's by the name of the file: what settling and its recovery do.
SETTLING = ("po.csv", "orders.csv", "orders.tmp", "inbox", "backup")

# Behind a write, a truncation or a sync the disk is as it is before the next operation.
EVERY = {"rename": ("kill-before", "kill-after"), "unlink": ("kill-before", "kill-after"),
         "commit": ("kill-before", "kill-after"), "write": ("kill-before", "kill-half"), "truncate": ("kill-before",),
         "sync": ("kill-before",)}
FAULTS = {"write": ((errno.EIO, "fail-once"), (errno.ENOSPC, "fail-on")), "sync": ((errno.EIO, "fail-once"),),
          "truncate": ((errno.EIO, "fail-once"),), "rename": ((errno.EACCES, "fail-on"),),
          "unlink": ((errno.EACCES, "fail-on"),)}

# The same finding is told this often; the rest is counted.
TOLD = 3
# Kills leave the page cache be, so a memory disk tests as much as a real one, sooner.
MEMORY_DISK = "/dev/shm"


class Round:
    def __init__(self, group, scenario, strikes):
        self.group = group
        self.scenario = scenario
        self.strikes = strikes

    def text(self):
        return " ".join([self.scenario.name, *self.strikes])


class Torture:
    def __init__(self, options, root):
        self.options = options
        self.root = root
        self.kept_under = pathlib.Path(os.environ["PARTNERKIT_BUILD"]) / "torture"
        self.program = Program(os.environ["PARTNERKIT_PROGRAM"], os.environ["PARTNERKIT_BUILD"], options.prog_id)
        self.rng = random.Random(options.seed)
        self.lock = threading.Lock()
        self.counts = collections.Counter()
        self.found = 0
        self.alike = collections.Counter()
        # large: what a partner sends on a busy day. small: every kind of order, few enough to strike at each operation.
        # emptied: all orders post, and the file goes when it is empty.
        self.scenarios = {
            "large": self.scenario("large", orders.make_file(500, 8, 5)),
            "small": self.scenario("small", orders.make_file(25, 2, 2)),
            "emptied": self.scenario("emptied", orders.make_file(4, 2, 2, plain=True, options="#%DELETEONEMPTY")),
        }

    def scenario(self, name, file):
        return Scenario(self.program, self.root, name, file)

    # --- One round

    def strike(self, folder, strike):
        if strike.startswith("at:"):
            return self.program.process_until(folder, float(strike[3:]))
        return self.program.process(folder, strike=strike.replace(":", " "))

    def run(self, a_round, keep=False):
        """Gives whether the last strike killed."""
        folder = a_round.scenario.copy(self.root)
        found = []
        killed = False
        for strike in a_round.strikes:
            ended = self.strike(folder, strike)
            killed = ended.status == -signal.SIGKILL
            found += verdict.struck_violations(ended, killed)
        last = self.program.process(folder)
        found += verdict.violations(a_round.scenario, folder, self.program, last,
                                    settled_once=len(a_round.strikes) < 2)
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
                print(f"{'VIOLATION: ' if found else ''}./pk torture {text}", *found, sep="\n  ")
                print(f"  workspace: {self.kept_under / folder.name}", flush=True)
        if told:
            shutil.move(folder, self.kept_under / folder.name)
        else:
            shutil.rmtree(folder)

    def run_all(self, rounds):
        began = time.monotonic()
        with concurrent.futures.ThreadPoolExecutor(self.options.jobs) as pool:
            for number, _ in enumerate(pool.map(self.run, rounds), 1):
                if number % 100 == 0:
                    print(f"  {number} of {len(rounds)} rounds, {time.monotonic() - began:.0f} s", flush=True)

    # --- Kills at random moments

    def random_kills(self, count):
        """Spread evenly over the run time, which is measured as the rounds will run: several at once."""
        large = self.scenarios["large"]
        with concurrent.futures.ThreadPoolExecutor(self.options.jobs) as pool:
            span = statistics.median(pool.map(self.plain_run, [large] * (2 * self.options.jobs)))
            moments = [span * (index + self.rng.random()) / count for index in range(count)]
            self.rng.shuffle(moments)
            print(f"{count} kills at random moments of a run of {span:.2f} s", flush=True)
            list(pool.map(self.kill_about, moments))

    def plain_run(self, scenario):
        folder = scenario.copy(self.root)
        began = time.monotonic()
        last = self.program.process(folder)
        took = time.monotonic() - began
        self.close(f"repeat {scenario.name} at:1000", folder, verdict.violations(scenario, folder, self.program, last))
        return took

    def kill_about(self, moment):
        # A run on an idle moment of the machine may end before its kill comes.
        for _ in range(20):
            if self.run(Round("random kills", self.scenarios["large"], [f"at:{moment:.4f}"])):
                return
            moment *= 0.9
        raise HarnessError("the runs end before they can be killed")

    # --- Kills and faults at operations

    def traced(self, scenario, first=None):
        """The operations of a plain run, after one that `first` has struck."""
        folder = scenario.copy(self.root)
        if first:
            self.strike(folder, first)
        _, operations = trace_of(self.program, folder, folder / "trace")
        shutil.rmtree(folder)
        return operations

    def numbered(self, operations):
        seen = collections.Counter()
        for kind, name in operations:
            seen[kind] += 1
            yield kind, seen[kind], name

    def operation_kills(self, scenario, kinds):
        """A round for each operation of these kinds: before, behind, and a write in its middle."""
        rounds = []
        operations = list(self.numbered(self.traced(scenario)))
        missing = set(kinds) - {kind for kind, _, _ in operations}
        if missing:
            # A library linked in is out of the shim's reach.
            raise HarnessError(f"the shim sees no {', '.join(sorted(missing))}")
        for kind, number, _ in operations:
            if kind in kinds:
                rounds += [Round("operation kills", scenario, [f"{action}:{kind}:{number}"]) for action in EVERY[kind]]
        return rounds

    def settling_kills(self, scenario):
        """Kills round the operations on order file and backup, each followed by a kill in the recovery from it."""
        rounds = []
        for kind, number, name in self.numbered(self.traced(scenario)):
            if not name.startswith(SETTLING):
                continue
            for action in EVERY[kind]:
                first = f"{action}:{kind}:{number}"
                rounds.append(Round("operation kills", scenario, [first]))
                rounds += [Round("kills in a recovery", scenario, [first, f"kill-before:{then}:{at}"])
                           for then, at, where in self.numbered(self.traced(scenario, first))
                           if where.startswith(SETTLING)]
        return rounds

    def faults(self, scenario):
        """Every operation fails, and with a full disk all that follow."""
        return [Round("injected faults", scenario, [f"{action}:{kind}:{number}:{cause}"])
                for kind, number, _ in self.numbered(self.traced(scenario)) if kind in FAULTS
                for cause, action in FAULTS[kind]]

    # --- The forms

    def long(self):
        self.random_kills(self.options.kills or 300)
        large, small, emptied = (self.scenarios[name] for name in ("large", "small", "emptied"))
        for about, rounds in (
                ("the large file's renames, deletions, syncs and commits",
                 self.operation_kills(large, ("rename", "unlink", "sync", "truncate", "commit"))),
                ("every operation of the small file", self.operation_kills(small, EVERY)),
                ("every operation of the emptied file", self.operation_kills(emptied, EVERY)),
                ("settling and its recovery", self.settling_kills(small) + self.settling_kills(emptied)),
                ("faults", self.faults(small) + self.faults(emptied))):
            print(f"{about}: {len(rounds)} rounds", flush=True)
            self.run_all(rounds)
        self.other_failures(slow=True)

    def short(self):
        self.random_kills(self.options.kills or 25)
        small, emptied = self.scenarios["small"], self.scenarios["emptied"]
        rounds = (self.sample(self.operation_kills(small, EVERY), 50) +
                  self.sample(self.settling_kills(small) + self.settling_kills(emptied), 50) +
                  self.sample(self.faults(small), 30))
        self.run_all(rounds)
        self.other_failures(slow=False)

    def sample(self, rounds, count):
        return self.rng.sample(rounds, min(count, len(rounds)))

    def other_failures(self, slow):
        for name, folder, found in failures.run(self.program, self.root, slow, self.options.what):
            self.counts["other failures"] += 1
            self.close(f"failures '{name}'", folder, found)

    def repeat(self):
        scenario, *strikes = self.options.what
        if scenario not in self.scenarios or not strikes:
            raise HarnessError(f"repeat wants a scenario ({', '.join(self.scenarios)}) and its strikes")
        self.run(Round("rounds", self.scenarios[scenario], strikes), keep=True)

    def total(self):
        counted = [f"{count} {group}" for group, count in self.counts.items()]
        for alike, count in self.alike.most_common():
            if alike:
                print(f"{count} times: {alike.splitlines()[0]}")
        return ", ".join([*counted, f"{self.found} violations"])


def default_folder():
    roomy = os.access(MEMORY_DISK, os.W_OK) and shutil.disk_usage(MEMORY_DISK).free > 2**28
    return MEMORY_DISK if roomy else tempfile.gettempdir()


def main():
    parser = argparse.ArgumentParser(description=__doc__, formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("form", nargs="?", default="long", choices=("long", "short", "failures", "repeat"))
    parser.add_argument("what", nargs="*", help="for repeat: SCENARIO STRIKE...; for failures: names")
    parser.add_argument("--class", dest="prog_id", default="PartnerKit.clsMGB850csv", help="the class, %(default)s")
    parser.add_argument("--seed", type=int, default=1, help="of the random moments and samples, %(default)s")
    parser.add_argument("--kills", type=int, help="how many random kills")
    parser.add_argument("--jobs", type=int, default=os.cpu_count(), help="rounds at once")
    parser.add_argument("--folder", default=default_folder(), help="where the workspaces lie meanwhile, %(default)s")
    options = parser.parse_args()
    root = pathlib.Path(tempfile.mkdtemp(prefix="partnerkit-torture-", dir=options.folder))
    try:
        torture = Torture(options, root)
        if options.form == "failures":
            torture.other_failures(slow=True)
        else:
            getattr(torture, options.form)()
    except HarnessError as error:
        print(f"torture: {error}", file=sys.stderr)
        return 2
    finally:
        shutil.rmtree(root, ignore_errors=True)
    print(torture.total())
    return 1 if torture.found else 0


if __name__ == "__main__":
    sys.exit(main())
