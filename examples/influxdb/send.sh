#!/usr/bin/env bash
# Sends points from standard input as they come: send.sh HOST:PORT DATABASE.
set -euo pipefail
url="http://$1/write?db=$2"
points=""
flush()
{
    [ -z "$points" ] || printf '%s' "$points" | curl -sSf --data-binary @- "$url"
    points=""
}
while true; do
    if IFS= read -r -t 1 point; then
        points+="$point"$'\n'
        [ "${#points}" -lt 65536 ] || flush
    elif [ $? -gt 128 ]; then
        flush # nothing has come for a second
    else
        break
    fi
done
flush
