#!/usr/bin/env python3
"""check_help.py PROGRAM DOC: every verb and option that PROGRAM's help shows must stand in DOC, and every option in DOC
must be one of the program's."""

import re
import subprocess
import sys

HEADING = re.compile(r"^(\w[\w ]*):\s*$")
VERB = re.compile(r"^  ?(\S+)(?:  |$)")
OPTION = re.compile(r"(?<![\w-])--[a-z][a-z0-9-]*")


def help_text(program, verbs):
    run = subprocess.run([program, *verbs, "--help"], capture_output=True, text=True, timeout=30)
    if run.returncode != 0:
        sys.exit(f"check_help: `{' '.join(['partnerkit', *verbs, '--help'])}` ended with {run.returncode}: {run.stderr}")
    return run.stdout


def listed_verbs(text):
    section = ""
    for line in text.splitlines():
        if heading := HEADING.match(line):
            section = heading[1].lower()
        elif section in ("subcommands", "commands", "verbs") and (verb := VERB.match(line)):
            yield verb[1]


def walk(program, verbs=()):
    """Yields each verb, as a tuple of its words, with its help text; the program's own is ()."""
    text = help_text(program, verbs)
    yield verbs, text
    for verb in listed_verbs(text):
        yield from walk(program, (*verbs, verb))


def main():
    program, doc_path = sys.argv[1:]
    try:
        with open(doc_path, encoding="utf-8") as file:
            doc = file.read()
    except OSError as error:
        sys.exit(f"check_help: {error}")

    helps = dict(walk(program))
    if len(helps) < 2:
        sys.exit("check_help: the program's help lists no verb")
    known = {option for text in helps.values() for option in OPTION.findall(text)}
    documented = set(OPTION.findall(doc))

    faults = [f"`{' '.join(verb)}` is not in {doc_path}"
              for verb in helps if verb and not re.search(rf"`(partnerkit )?{re.escape(' '.join(verb))}\b", doc)]
    faults += [f"{option} is not in {doc_path}" for option in sorted(known - documented)]
    faults += [f"{doc_path} tells of {option}, which no help shows" for option in sorted(documented - known)]
    for fault in faults:
        print(f"check_help: {fault}", file=sys.stderr)
    if faults:
        sys.exit(1)
    print(f"help: {len(helps) - 1} verbs and {len(known)} options stand in {doc_path}")


main()
