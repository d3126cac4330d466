"""Prints what part of the C++ in src, include and tests the tests are, in lines that are neither blank nor comment."""

import pathlib
import sys

ROOT = pathlib.Path(__file__).resolve().parent.parent


def lines_of(folder):
    count = 0
    for file in (ROOT / folder).rglob("*"):
        if file.suffix in (".cpp", ".h"):
            lines = (line.strip() for line in file.read_text().splitlines())
            count += sum(bool(line) and not line.startswith("//") for line in lines)
    return count


def main():
    tests, code = lines_of("tests"), lines_of("src") + lines_of("include")
    print(f"tests: {tests} lines beside {code} of code, {100 * tests / (tests + code):.0f} % of all; a quarter to a third is the aim")


if __name__ == "__main__":
    sys.exit(main())
