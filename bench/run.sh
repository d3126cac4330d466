#!/bin/sh
# Measures the program against bare yardsticks; `measure.py --help` tells more. PARTNERKIT_PROGRAM is the program,
# PARTNERKIT_BUILD the folder whose bench/ holds the built yardsticks and whose disk the measuring goes to.
set -eu
cd "$(dirname "$0")"
: "${PARTNERKIT_PROGRAM:?is the path of the program}"
: "${PARTNERKIT_BUILD:?is the build folder}"
# A public X12 parser to be held against; without it that line is left out.
node=$PARTNERKIT_BUILD/node
[ -d "$node/node_modules/node-x12" ] || ! command -v npm >/dev/null || {
  mkdir -p "$node" && npm install --prefix "$node" --no-audit --no-fund node-x12@1.7.1 >"$node/log" 2>&1 || true
}
export NODE_PATH="$node/node_modules"
PYTHONDONTWRITEBYTECODE=1 PYTHONPATH=../tools exec python3 measure.py "$@"
