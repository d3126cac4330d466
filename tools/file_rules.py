"""What tests/data/file_rules.txt says of a class's files: the set of its words."""

import pathlib

TABLE = pathlib.Path(__file__).resolve().parent.parent / "tests" / "data" / "file_rules.txt"


def _read():
    lines = (line.partition("#")[0].split() for line in TABLE.read_text().splitlines())
    return {name: frozenset(words) for name, *words in filter(None, lines)}


_RULES = _read()


def rules_of(class_name):
    return _RULES.get(class_name, frozenset())
