#!/usr/bin/env bash
# Loads one capture as fleet.py does: load-one.sh CAPTURE [HOST:PORT]. For schedulers that run a
# command for each capture. Done again, it replaces what it loaded before.
set -euo pipefail
capture=$(realpath "$1")
server=http://${2:-localhost:8123}
load=$(date +%s%N)
closing=$(mktemp)
trap 'rm -f "$closing"' EXIT
# Rows have a path; what has none closes the capture.
"${VENTRIK_DECODE:-ventrik-decode}" --format rows "$capture" 2>/dev/null |
    awk -v load="$load" -v closing="$closing" '
        { row = "{\"load\":" load "," substr($0, 2) }
        /,"path":/ { print row; next }
        { print row > closing }' |
    curl -sSf -H 'Transfer-Encoding: chunked' --data-binary @- \
        "$server/?query=INSERT%20INTO%20rows%20FORMAT%20JSONEachRow"
test "$(wc -l < "$closing")" = 1 # else the decoder did not come to the end
curl -sSf --data-binary @"$closing" \
    "$server/?query=INSERT%20INTO%20captures%20FORMAT%20JSONEachRow"
