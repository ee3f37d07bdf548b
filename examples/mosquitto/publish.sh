#!/usr/bin/env bash
# Publishes rows from standard input, each value under its path: publish.sh HOST PORT. The broker
# retains the last one; a value that goes away is retained no more.
set -euo pipefail
jq --unbuffered -r 'select(.path) | [.path, .text // ""] | @tsv' |
    while IFS=$'\t' read -r path text; do
        # What a subscriber would take for a pattern is none.
        topic="ventrik$(tr '+#' '__' <<< "$path")"
        if [ -n "$text" ]; then
            mosquitto_pub -h "$1" -p "$2" -r -t "$topic" -m "$text"
        else
            mosquitto_pub -h "$1" -p "$2" -r -t "$topic" -n
        fi
    done
