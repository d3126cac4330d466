"""What has to hold of X12 orders once a plain run has followed the runs that were struck."""

import re
import signal

import told
import verdict
from kinds import CARRIED_OUT, KEPT
from workspace import ORDER_FILE

ARCHIVE = "maps/archive/" + ORDER_FILE.rpartition("/")[2]
# By a run that lists nothing, and of a product that an order has twice.
SAID = ("nothing to list", "This key is already associated with an element of this collection",
        "the error before this one came up")
# A whole interchange with one acknowledgement.
ACKNOWLEDGEMENT = re.compile(
    r"ISA\*00\* {10}\*00\* {10}\*ZZ\*.{15}\*ZZ\*.{15}\*\d{6}\*\d{4}\*U\*\d{5}\*(?P<interchange>\d{9})\*0\*P\*>\r\n"
    r"GS\*FA\*[^*\r]*\*[^*\r]*\*\d{6}\*\d{4}\*(?P<group>\d+)\*X\*\w+\r\n"
    r"ST\*997\*0001\r\nAK1\*PO\*(?P<answers>\d+)\r\nAK9\*A\*(?P<count>\d+)\*(?P=count)\*(?P=count)\r\nSE\*4\*0001\r\n"
    r"GE\*1\*(?P=group)\r\nIEA\*1\*(?P=interchange)\r\n")


def struck_violations(scenario, folder, struck):
    return verdict.struck_violations(scenario, folder, struck) + archive_violations(scenario, folder, struck)


def violations(scenario, folder, program, last, *, earlier=()):
    found = verdict.run_violations(last, SAID)
    if last.status in (0, 1):
        runs = [*earlier, last]
        found += verdict.store_violations(folder, scenario.file.expected_store())
        found += left_violations(scenario.file, folder / ORDER_FILE, last, len(runs))
        found += written_violations(scenario, folder, runs)
        found += leftovers(scenario, folder, earlier)
        found += verdict.log_violations(folder, program)
        found += told.violations(folder, runs)
    return found


def left_violations(file, path, last, runs):
    report = last.report()
    messages = [record["Message"] for record in report["log"]]

    def stays(order):
        if order.fate == CARRIED_OUT:
            return any(order.number in message and file.trade.stays_with in message for message in messages)
        return order.fate == KEPT

    content = path.read_bytes() if path.exists() else None
    wanted = file.left({row[2] for row in report["rows"]}, stays)
    if content == wanted:
        return []
    if content is None or wanted is None:
        return [f"the order file is {'gone' if content is None else 'there'} and should not be"]
    if file.trade.bare_ends and re.fullmatch(b"(~\r\n){0,%d}" % runs, content[len(wanted):]) \
            and content.startswith(wanted):
        return []
    lost = [order.number for order in file.orders if stays(order) and "\r\n".join(order.texts).encode() not in
            content.replace(b"~\r\n", b"\r\n")]
    left = [order.number for order in file.orders if not stays(order) and order.texts[1].encode() in content]
    return [f"the order file is not what it should be: {len(content)} bytes instead of {len(wanted)};"
            f" lost {lost[:5]}, still there {left[:5]}"]


def written_violations(scenario, folder, runs):
    """Of the files beside the order file; the last of the runs was a plain one."""
    last = runs[-1]
    # Where the archive's own operations fail, the run goes on without.
    needed = last.order_file or any(run.status == -signal.SIGKILL for run in runs)
    return (acknowledgement_violations(scenario, folder, max(len(runs), 2))
            + archive_violations(scenario, folder, runs, needed))


def together_violations(scenario, folder):
    return acknowledgement_violations(scenario, folder, 2)


def acknowledgement_violations(scenario, folder, runs):
    found, told, numbers = [], {}, []
    for path in sorted((folder / "outbox").iterdir()):
        text = path.read_bytes().decode("latin-1")
        acknowledgements = list(ACKNOWLEDGEMENT.finditer(text))
        if not acknowledgements or "".join(each[0] for each in acknowledgements) != text:
            found.append(f"outbox/{path.name} is not whole")
        for each in acknowledgements:
            told.setdefault(each["answers"], []).append(int(each["count"]))
            numbers += [each["interchange"], "group " + each["group"]]
    if len(set(numbers)) != len(numbers):
        found.append("two acknowledgements have the same number")
    groups = {group.number: sum(order.texts[0][3:6] in scenario.file.trade.order_class.typical
                                for order in group.transactions) for group in scenario.file.groups()}
    for number, count in groups.items():
        counts = told.pop(number, [])
        if not 1 <= len(counts) <= runs or set(counts) != {count}:
            found.append(f"group {number} is acknowledged with {counts} instead of {count}")
    return found + [f"{number} is acknowledged and should not be" for number in told]


def archive_violations(scenario, folder, runs, needed=False):
    """The archive has the file as the first of these runs found it, and nothing that none of them found."""
    path = folder / ARCHIVE
    if not path.exists():
        return ["nothing was archived"] if needed and scenario.file.trade.archives else []
    if not scenario.file.trade.archives:
        return ["the file was archived"]
    copies = [copy.read_bytes() for copy in [path, *path.parent.glob(path.name + ".[0-9]*")]]
    found = [run.order_file for run in runs if run.order_file]
    if any(copy not in found for copy in copies):
        return ["the archive has a file that never came"]
    return [] if not found or any(copy.startswith(found[0]) for copy in copies) else ["the archive has lost the file as it came"]


def leftovers(scenario, folder, earlier):
    foreseen = {ARCHIVE}
    gone = not (folder / ORDER_FILE).exists()
    if gone and (earlier or scenario.file.trade.leaves_temporary):
        # A run that was killed between the deletion of the order file and that of the temporary file leaves it, too.
        foreseen.add("inbox/orders.tmp")
    strange = [name for name in verdict.new_files(scenario, folder)
               if name not in foreseen and ".partnerkit-" not in name
               and not re.fullmatch(rf"outbox/FA_PO_\d+_0603081015\.TXT|{re.escape(ARCHIVE)}\.\d+", name)]
    return [f"left over: {strange}"] if strange else []
