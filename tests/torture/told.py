"""What runs have told, held against the log and the store: a report may name no other row's messages, and what was
logged is in the log for good."""

import contextlib
import re
import sqlite3

DATABASE = "partnerkit.db"


def violations(folder, runs, *, stored="SELECT OrderId, PONo FROM tbOrder", column=0):
    """Of the runs that came as far as their report. `column` of a row holds its order's number, as does `stored` by the
    id that a row's result is."""
    found, givers = [], {}
    with contextlib.closing(sqlite3.connect(folder / DATABASE)) as connection:
        log = dict(connection.execute("SELECT LogId, Message FROM tbLog"))
        numbers = dict(connection.execute(stored))
    for run, ended in enumerate(runs):
        try:
            report = ended.report()
        except ValueError:
            continue
        messages = {record["LogId"]: record["Message"] for record in report["log"]}
        found += row_violations(report, messages, numbers, column)
        if len(report["results"]) < len(report["rows"]) and "not tried" not in ended.err:
            found.append("rows were passed over without a word")
        twice = [key for key in messages if givers.setdefault(key, run) != run]
        if twice or len(messages) < len(report["log"]):
            found.append(f"log ids were given twice: {twice[:5]}")
        foreign = [key for key, message in messages.items() if log.get(key, message) != message]
        if foreign:
            found.append(f"the log has other messages under the ids {foreign[:5]}")
        lost = [key for key in messages if key not in log]
        if lost and "could not be stored" not in ended.err:
            found.append(f"log records are lost: {lost[:5]}")
    return found


def row_violations(report, messages, numbers, column):
    """Of the rows tried, which are the first ones."""
    found = []
    names = [row[column] for row in report["rows"]]
    # Some have a release behind the number.
    known = {name.split()[0] for name in names}
    if [result["row"] for result in report["results"]] != list(range(len(report["results"]))):
        found.append("the results are not those of the first rows")
    for result in report["results"]:
        own = names[result["row"]]
        told = [messages.get(key, "no message") for key in result["errorLog"] or ()]
        others = known - {own.split()[0]}
        wrong = [text for text in told if text == "no message" or not others.isdisjoint(re.findall(r"\w+", text))]
        if wrong:
            found.append(f"the row of {own} is told by {wrong[0]!r}")
        done = any("completed." in text for text in told)
        if done and numbers.get(result["result"]) != own:
            found.append(f"{own} is told to be posted, and {numbers.get(result['result'])} is stored under that id")
    return found
