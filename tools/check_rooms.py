"""Holds the sources against tools/rooms.txt: what each room includes, and how many files it has."""

import pathlib
import re
import sys

ROOT = pathlib.Path(__file__).resolve().parent.parent
SOURCES = ROOT / "src"
TABLE = ROOT / "tools" / "rooms.txt"
MOST_FILES = 25
INCLUDE = re.compile(r'\s*#\s*include\s+"([^"]+)"')


def read_table():
    """Each room with all that stands below it."""
    below = {}
    for number, line in enumerate(TABLE.read_text().splitlines(), 1):
        room, colon, rooms = line.partition("#")[0].partition(":")
        if not room.strip():
            continue
        unknown = [name for name in rooms.split() if name not in below]
        if not colon or unknown:
            sys.exit(f"{TABLE.name}:{number}: {'no such room above: ' + unknown[0] if unknown else 'no colon'}")
        direct = rooms.split()
        below[room.strip()] = set(direct).union(*(below[name] for name in direct))
    return below


def room_of(path, rooms):
    """The deepest room that holds a path below src/."""
    for folder in pathlib.PurePosixPath(path).parents:
        if str(folder) in rooms:
            return str(folder)
    return None


def faults_of(file, below):
    name = file.relative_to(SOURCES).as_posix()
    room = room_of(name, below)
    if room is None:
        yield f"src/{name}:1: stands in no room of tools/{TABLE.name}"
        return
    for number, line in enumerate(file.read_text().splitlines(), 1):
        found = INCLUDE.match(line)
        if not found or found[1].startswith("partnerkit/"):
            continue
        other = room_of(found[1], below)
        if other is None or not (SOURCES / found[1]).is_file():
            yield f"src/{name}:{number}: includes {found[1]}, which is not below src/"
        elif other != room and other not in below[room]:
            yield f"src/{name}:{number}: {room} may not include {other} ({found[1]})"


def main():
    below = read_table()
    files = [file for file in sorted(SOURCES.rglob("*")) if file.suffix in (".h", ".cpp")]
    faults = [fault for file in files for fault in faults_of(file, below)]
    for header in sorted((ROOT / "include").rglob("*.h")):
        for number, line in enumerate(header.read_text().splitlines(), 1):
            found = INCLUDE.match(line)
            if found and not found[1].startswith("partnerkit/"):
                faults.append(f"{header.relative_to(ROOT)}:{number}: a public header includes {found[1]}")
    for folder in sorted({file.parent for file in files}):
        count = sum(file.parent == folder for file in files)
        if count > MOST_FILES:
            faults.append(f"{folder.relative_to(ROOT)}: {count} files; a room of more than {MOST_FILES} has rooms inside it")
    print("\n".join(faults) if faults else f"rooms: {len(files)} files in {len(below)} rooms include only what stands below them")
    return 1 if faults else 0


if __name__ == "__main__":
    sys.exit(main())
