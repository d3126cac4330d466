"""What has to hold once a plain run has followed the run that was struck."""

import json
import signal
import sqlite3

import told
from kinds import KEPT
from told import DATABASE
from workspace import BACKUP, EARLIER_BACKUP, ORDER_FILE


def violations(scenario, folder, program, last, *, earlier=()):
    """`last` is the plain run, `earlier` are the runs before it."""
    found = run_violations(last)
    if last.status not in (0, 1):
        return found
    found += store_violations(folder, scenario.file.expected_store())
    found += file_violations(scenario, folder)
    found += written_violations(scenario, folder, [*earlier, last])
    found += leftovers(scenario, folder)
    found += log_violations(folder, program)
    found += told.violations(folder, [*earlier, last])
    return found


def run_violations(last, foreseen=("nothing to list",)):
    if last.status not in (0, 1):
        return [f"the plain run ends with status {last.status}: {last.err.strip()}"]
    said = [line for line in last.err.splitlines() if line.strip() and not any(words in line for words in foreseen)]
    return [f"the plain run says {said}"] if said else []


def store_violations(folder, expected):
    connection = sqlite3.connect(folder / DATABASE)
    try:
        sound = connection.execute("PRAGMA integrity_check").fetchone()[0]
        if sound != "ok":
            return [f"the database is damaged: {sound}"]
        return orders_violations(connection, expected)
    finally:
        connection.close()


def orders_violations(connection, expected):
    found = []
    stored = {}
    for key, number, status in connection.execute("SELECT OrderId, PONo, Status FROM tbOrder").fetchall():
        if number in stored:
            found.append(f"{number} is stored twice")
        if number not in expected:
            found.append(f"{number} is stored and should not be")
        if status != expected.get(number, (0,))[0]:
            found.append(f"{number} is stored with Status {status}")
        stored[number] = key
    for number, (_, *parts) in expected.items():
        if number not in stored:
            found.append(f"{number} is not stored")
        elif parts_of(connection, stored[number]) != parts:
            found.append(f"{number} is stored with other lines, locations or location lines")
    for table, part in (("tbOrderLine", 0), ("tbOrderLocn", 1), ("tbOrderLocnLine", 2)):
        count = connection.execute(f"SELECT COUNT(*) FROM {table}").fetchone()[0]
        wanted = sum(len(parts[part]) for _, *parts in expected.values())
        if count != wanted:
            found.append(f"{table} holds {count} records instead of {wanted}")
    return found


def parts_of(connection, key):
    return [
        sorted(connection.execute("SELECT ProductNo, Quantity, Cost FROM tbOrderLine WHERE OrderId=?", [key])),
        sorted(connection.execute("SELECT BuyingLocn, ShipToLocn FROM tbOrderLocn WHERE OrderId=?", [key])),
        sorted(connection.execute(
            "SELECT c.BuyingLocn, l.ProductNo, q.Quantity, q.AllocateQty FROM tbOrderLocnLine q"
            " JOIN tbOrderLine l ON l.LineId=q.LineId AND l.OrderId=q.OrderId AND l.ProductNo=q.ProductNo"
            " JOIN tbOrderLocn c ON c.LocnId=q.LocnId AND c.OrderId=q.OrderId AND c.BuyingLocn=q.BuyingLocn"
            " WHERE q.OrderId=?", [key]))]


def read(path):
    return path.read_bytes() if path.exists() else b""


def file_violations(scenario, folder):
    content = read(folder / ORDER_FILE)
    kept = scenario.file.kept()
    if content == kept:
        return []
    present = set(content.splitlines(True))
    lost = [order.number for order in scenario.file.orders
            if order.fate == KEPT and not present.issuperset(order.texts)]
    left = [order.number for order in scenario.file.orders
            if order.fate != KEPT and not present.isdisjoint(order.texts)]
    return [f"the order file is not what it should be: {len(content)} bytes instead of {len(kept)};"
            f" lost {lost[:5]}, still there {left[:5]}"]


def whole(text):
    return text if text.endswith(b"\n") else text + b"\r\n"


def left_violations(file, path, _last, _runs):
    return [] if read(path) == file.kept() else [f"{path.name} is not what should be left of it"]


def together_violations(_scenario, _folder):
    """Of the files that several programs write to."""
    return []


def written_violations(scenario, folder, _runs):
    """What has to hold of the files beside the order file; the last of the runs was a plain one."""
    return backup_violations(scenario, folder) if scenario.backup else []


def backup_violations(scenario, folder):
    content = read(folder / BACKUP)
    if not content.startswith(EARLIER_BACKUP):
        return ["the backup has lost what it held before"]
    texts = content[len(EARLIER_BACKUP):].splitlines(True)
    owners = scenario.file.owners()
    if any(text not in owners or whole(text) != text for text in texts):
        return ["the backup holds a broken or foreign line"]
    if len(set(texts)) != len(texts):
        return ["the backup holds a line twice"]
    strays = {owners[text].number for text in texts if not owners[text].is_stored()}
    if strays:
        return [f"the backup holds orders that were never posted: {sorted(strays)[:5]}"]
    present = set(texts)
    lacking = [order.number for order in scenario.file.posted() if not present.issuperset(map(whole, order.texts))]
    return [f"the backup lacks lines of {lacking[:5]}"] if lacking else []


def new_files(scenario, folder):
    def names(top):
        return {str(path.relative_to(top)) for path in top.rglob("*") if path.is_file()}

    return names(folder) - names(scenario.prepared)


def leftovers(scenario, folder):
    strange = new_files(scenario, folder)
    # A draft of a killed program goes with the next rewrite; the runs behind it may have had nothing to settle.
    strange = {name for name in strange if ".partnerkit-" not in name}
    return [f"left over: {sorted(strange)}"] if strange else []


def log_violations(folder, program):
    ended = program.run(folder, "log")
    try:
        log = json.loads(ended.out)
    except ValueError:
        return [f"the log cannot be read: status {ended.status}: {ended.err.strip()}"]
    records = log["log"] if isinstance(log, dict) else log
    completed = [record["Message"] for record in records if "import completed" in record["Message"]]
    return [] if len(set(completed)) == len(completed) else ["the log has an order completed twice"]


def struck_violations(_scenario, _folder, struck):
    """What has to hold of the last of these runs, which was struck."""
    ended = struck[-1]
    if ended.status not in (0, 1, 2, -signal.SIGKILL):
        return [f"the struck run ends with status {ended.status}: {ended.err.strip()[-500:]}"]
    return []
