#!/bin/sh
# Kills the program again and again; `torture.py --help` tells more. PARTNERKIT_PROGRAM is the program, PARTNERKIT_BUILD
# the folder that takes what the harness builds and the workspaces of violations.
set -eu
cd "$(dirname "$0")"
: "${PARTNERKIT_PROGRAM:?is the path of the program}"
: "${PARTNERKIT_BUILD:?is the build folder}"
PYTHONDONTWRITEBYTECODE=1 PYTHONPATH=../../tools exec python3 torture.py "$@"
