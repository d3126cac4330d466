"""Failures other than a kill, each followed by a plain run that has to carry on: full and read-only disks, locks, order
files that vanish, are replaced or grow while they are worked on, several programs at once."""

import contextlib
import fcntl
import functools
import os
import resource
import shutil
import signal
import sqlite3
import subprocess
import tempfile
import threading

import told
import verdict
from workspace import BACKUP, ORDER_FILE, Scenario

NOBODY = 65534
COMMITS_OF_START = 1  # the log's ids


class Case:
    """One failure in a workspace of its own."""

    def __init__(self, program, scenario, root):
        self.program = program
        self.scenario = scenario
        self.trade = scenario.file.trade
        self.root = root
        self.folder = scenario.copy(root)
        self.found = []

    def expect(self, ended, status, text=""):
        """`text` is wanted on standard error or in the run's log."""
        log = ""
        with contextlib.suppress(ValueError):
            log = "\n".join(record["Message"] for record in ended.report().get("log", []))
        if ended.status not in (status if isinstance(status, tuple) else (status,)):
            self.found.append(f"status {ended.status} instead of {status}: {ended.err.strip()[-300:]} {log[-300:]}")
        if text not in ended.err + log:
            self.found.append(f"nowhere {text!r} but {ended.err.strip()[-300:]!r}, log {log[-300:]!r}")

    def unchanged(self):
        if (self.folder / ORDER_FILE).read_bytes() != self.scenario.file.content():
            self.found.append("the order file has changed")

    def carry_on(self, **how):
        last = self.program.process(self.folder)
        self.found += self.trade.verdict.violations(self.scenario, self.folder, self.program, last, **how)

    def stopped(self):
        """A run that has posted a few orders."""
        return self.program.process_stopped(
            self.folder, f"stop-after commit {COMMITS_OF_START + self.scenario.file.commits_of_listing() + 3}")


# --- Locks

def second_on_same_file(case):
    first = case.stopped()
    case.expect(case.program.process(case.folder), 1, "Error opening file " + ORDER_FILE)
    case.unchanged()
    case.expect(case.program.carry_on(first), 1)
    case.carry_on()


def second_on_same_backup(case):
    first = case.stopped()
    case.expect(case.program.process(case.folder), 1, f"Backupfile {BACKUP} could not be opened.")
    case.unchanged()
    case.expect(case.program.carry_on(first), 1)
    case.carry_on()


def file_held_by_another(case):
    with open(case.folder / ORDER_FILE, "rb") as held:
        fcntl.flock(held, fcntl.LOCK_EX)
        case.expect(case.program.process(case.folder), 1, "Error opening file " + ORDER_FILE)
    case.unchanged()
    case.carry_on()


@contextlib.contextmanager
def locked_database(case):
    connection = sqlite3.connect(case.folder / verdict.DATABASE, isolation_level=None, check_same_thread=False)
    connection.execute("BEGIN EXCLUSIVE")
    try:
        yield connection
    finally:
        if connection.in_transaction:
            connection.execute("ROLLBACK")
        connection.close()


def database_locked_for_a_second(case):
    with locked_database(case) as connection:
        release = threading.Timer(1.0, lambda: connection.execute("ROLLBACK"))
        release.start()
        case.expect(case.program.process(case.folder), 1)
        release.join()
    case.carry_on()


def database_locked_throughout(case):
    with locked_database(case):
        case.expect(case.program.process(case.folder), (1, 2), "locked")
    case.unchanged()
    case.carry_on()


# --- The order file, while it is worked on

def file_moved_away_and_back(case):
    run = case.stopped()
    away = case.root / "away.edi"
    shutil.move(case.folder / ORDER_FILE, away)
    case.expect(case.program.carry_on(run), 1, "was taken away or replaced")
    take_kept(case)
    shutil.move(away, case.folder / ORDER_FILE)
    case.carry_on()


def take_kept(case):
    """What was kept of a file that was taken away lies beside its place, for a person to look at."""
    kept = case.folder / (ORDER_FILE + ".kept")
    if kept.exists():
        kept.unlink()
    else:
        case.found.append("what was kept of the order file is not beside it")


def file_moved_away_over_a_run(case):
    run = case.stopped()
    away = case.root / "away2.edi"
    shutil.move(case.folder / ORDER_FILE, away)
    case.expect(case.program.carry_on(run), 1, "was taken away or replaced")
    take_kept(case)
    case.expect(case.program.process(case.folder), 1, f"File {ORDER_FILE} does not exist.")
    shutil.move(away, case.folder / ORDER_FILE)
    case.carry_on()


def other_file(case):
    return case.trade.make_file(3, plain=True, first_number=46000000, seed=2)


def file_replaced(case):
    run = case.stopped()
    new = other_file(case)
    draft = case.folder / "inbox" / "new.edi"
    draft.write_bytes(new.content())
    os.replace(draft, case.folder / ORDER_FILE)
    case.expect(case.program.carry_on(run), 1, "was taken away or replaced")
    if (case.folder / ORDER_FILE).read_bytes() != new.content():
        case.found.append("the new file has been touched")
    last = case.program.process(case.folder)
    case.expect(last, 0)
    # What was kept of the old file lies beside the new one; what was posted is in the store for good.
    case.scenario.file = case.scenario.file.followed_by(new)
    case.found += verdict.store_violations(case.folder, case.scenario.file.expected_store())
    case.found += case.trade.verdict.written_violations(case.scenario, case.folder, [last])


def file_grows(case):
    run = case.stopped()
    new = other_file(case)
    with open(case.folder / ORDER_FILE, "ab") as grown:
        grown.write(b"\r\n" + new.content())
    case.scenario.file = case.scenario.file.followed_by(new)
    case.expect(case.program.carry_on(run), 1)
    present = (case.folder / ORDER_FILE).read_bytes()
    if any(text not in present for order in new.orders for text in order.segments()):
        case.found.append("the lines that came during the run are not all in the file")
    case.carry_on()


# --- The disk

def limited(size):
    def limit():
        resource.setrlimit(resource.RLIMIT_FSIZE, (size, size))
    return limit


def files_may_not_grow(case):
    """A limit on the size of any one file, from none to one that is nearly enough."""
    database = (case.folder / verdict.DATABASE).stat().st_size
    struck = []
    for size in (0, 100, 4096, 20000, database + 8192, database + 65536):
        # Python ignores SIGXFSZ and hands that down.
        struck.append(case.program.process(case.folder, preexec_fn=limited(size), restore_signals=False))
        case.expect(struck[-1], (1, 2))
    case.carry_on(earlier=struck)


def disk_full(case):
    """A real file system too small for the run. None for those who may not mount."""
    for spare in (0, 16, 64, 200):
        place = tempfile.mkdtemp(dir=case.root)
        size = sum(path.stat().st_blocks for path in case.folder.rglob("*")) // 2 + 16 + spare
        if subprocess.run(["mount", "-t", "tmpfs", "-o", f"size={size}k", "torture", place], capture_output=True,
                          check=False).returncode != 0:
            return
        try:
            shutil.copytree(case.folder, place, dirs_exist_ok=True)
            case.expect(case.program.process(place), (1, 2))
            subprocess.run(["mount", "-o", "remount,size=100m", place], check=True)
            full = Case(case.program, case.scenario, case.root)
            shutil.rmtree(full.folder)
            shutil.copytree(place, full.folder)
        finally:
            subprocess.run(["umount", place], check=True)
        full.carry_on()
        case.found += full.found
        shutil.rmtree(full.folder)
    case.carry_on()


def read_only(*names):
    def run(case):
        """As a user whom the permissions bind."""
        who = {}
        if os.getuid() == 0:
            who = {"user": NOBODY, "group": NOBODY, "extra_groups": []}
            for path in [case.folder, *case.folder.rglob("*")]:
                os.chown(path, NOBODY, NOBODY)
        modes = {name: (case.folder / name).stat().st_mode for name in names}
        for name in names:
            (case.folder / name).chmod(0o555 if (case.folder / name).is_dir() else 0o444)
        ended = case.program.process(case.folder, **who)
        case.expect(ended, (1, 2))
        if len(ended.err.strip().splitlines()) > 2:
            case.found.append(f"more than a line or two of errors: {ended.err!r}")
        for name, mode in modes.items():
            (case.folder / name).chmod(mode)
        case.carry_on()
    return run


def map_is_a_folder(case):
    path = case.folder / "maps" / "orders.map"
    content = path.read_bytes()
    path.unlink()
    path.mkdir()
    case.expect(case.program.process(case.folder), 1, "maps/orders.map")
    case.unchanged()
    path.rmdir()
    path.write_bytes(content)
    case.carry_on()


def file_is_a_folder(case):
    path = case.folder / ORDER_FILE
    content = path.read_bytes()
    path.unlink()
    path.mkdir()
    case.expect(case.program.process(case.folder), 1, ORDER_FILE)
    path.rmdir()
    path.write_bytes(content)
    case.carry_on()


# --- Several programs on one store

FILES = 4


def several_programs(case, kill_after=None):
    # The first shows every kind; the others are plain, with numbers of their own.
    files = [case.scenario.file] + [case.trade.make_file(100, 4, first_number=45000000 + 1000 * index, plain=True)
                                    for index in range(1, FILES)]
    for index, file in enumerate(files):
        (case.folder / f"inbox/{index}.edi").write_bytes(file.content())

    def all_at_once():
        runs = [case.program.start(case.folder, "process", str(index + 1), f"inbox/{index}.edi")
                for index in range(FILES)]
        timers = [threading.Timer(kill_after * (index + 1) / FILES, run.kill) for index, run in enumerate(runs)
                  ] if kill_after else []
        for timer in timers:
            timer.start()
        # Drained together: a run that waits for its reader would hold up the others.
        ended = [None] * FILES
        readers = [threading.Thread(target=lambda at=index: ended.__setitem__(at, case.program.finish(runs[at])))
                   for index in range(FILES)]
        for thread in readers:
            thread.start()
        for thread in readers + timers:
            thread.join()
        return ended

    runs = all_at_once()
    every = [*runs]
    for ended in runs:
        case.expect(ended, (0, 1, -signal.SIGKILL) if kill_after else (0, 1))
    if kill_after:
        kill_after = None
        runs = all_at_once()
        for ended in runs:
            case.expect(ended, (0, 1))
        every += runs
    case.found += told.violations(case.folder, every)
    of_class = case.trade.verdict
    for index, (file, last) in enumerate(zip(files, runs)):
        case.found += of_class.left_violations(file, case.folder / f"inbox/{index}.edi", last, 2)
    case.scenario.file = functools.reduce(lambda first, second: first.followed_by(second), files)
    case.found += verdict.store_violations(case.folder, case.scenario.file.expected_store())
    case.found += of_class.together_violations(case.scenario, case.folder)
    case.found += verdict.log_violations(case.folder, case.program)


def several_programs_killed(case):
    several_programs(case, kill_after=0.4)


# name, what it does, takes long, how its scenario is made
CASES = (
    ("a second program on the same file", second_on_same_file, False, {"backup": ""}),
    ("a second program on the same backup", second_on_same_backup, False, {}),
    ("order file held by another program", file_held_by_another, False, {}),
    ("database locked for a second", database_locked_for_a_second, False, {}),
    ("database locked throughout", database_locked_throughout, True, {}),
    ("order file moved away and back", file_moved_away_and_back, False, {}),
    ("order file moved away over a run", file_moved_away_over_a_run, False, {}),
    ("order file replaced", file_replaced, False, {}),
    ("order file grows", file_grows, False, {}),
    ("no file may grow", files_may_not_grow, False, {}),
    ("disk full", disk_full, False, {}),
    ("read-only inbox", read_only("inbox"), False, {}),
    ("read-only backup folder", read_only("backup"), False, {}),
    ("read-only backup", read_only(BACKUP), False, {}),
    ("read-only order file", read_only(ORDER_FILE, "inbox"), False, {}),
    ("read-only outbox", read_only("outbox"), False, {}),
    ("read-only database", read_only(verdict.DATABASE), False, {}),
    ("read-only workspace", read_only("."), False, {}),
    ("map file is a folder", map_is_a_folder, False, {}),
    ("order file is a folder", file_is_a_folder, False, {}),
    ("four programs on one store", several_programs, False, {"backup": "", "documents": FILES}),
    ("four programs killed on one store", several_programs_killed, False, {"backup": "", "documents": FILES}),
)


# Of classes that have backups and maps, and of those that acknowledge.
BACKED_UP = ("a second program on the same backup", "read-only backup folder", "read-only backup", "map file is a folder")
ACKNOWLEDGED = ("read-only outbox",)


def run(program, trade, root, slow, names=()):
    """Yields each case's name, its workspace and what was found; of all cases, or those of these names."""
    root = root / "failures"
    root.mkdir()
    # For the user of the read-only cases.
    root.parent.chmod(0o755)
    root.chmod(0o755)
    for number, (name, act, takes_long, how) in enumerate(CASES):
        others = ACKNOWLEDGED if trade.backs_up else BACKED_UP
        if (takes_long and not slow) or (names and name not in names) or name in others:
            continue
        size = {"count": 100, "products": 4} if "documents" in how else {"count": 3 if takes_long else None}
        file = trade.make_file(**size, seed=number)
        case = Case(program, Scenario(program, root, f"failure{number}", file, **how), root)
        case.folder.chmod(0o755)
        act(case)
        yield name, case.folder, case.found
