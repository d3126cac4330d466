#!/bin/sh
# Measures the program against bare yardsticks; `measure.py --help` tells more. PARTNERKIT_PROGRAM is the program,
# PARTNERKIT_BUILD the folder whose bench/ holds the built yardsticks and whose disk the measuring goes to.
set -eu
cd "$(dirname "$0")"
: "${PARTNERKIT_PROGRAM:?is the path of the program}"
: "${PARTNERKIT_BUILD:?is the build folder}"
PYTHONDONTWRITEBYTECODE=1 PYTHONPATH=../tools exec python3 measure.py "$@"
