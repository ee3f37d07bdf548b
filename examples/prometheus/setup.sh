#!/usr/bin/env bash
# What this example needs beside Ventrik.
set -euo pipefail
sudo=$([ "$(id -u)" = 0 ] || echo sudo)
DEBIAN_FRONTEND=noninteractive $sudo apt-get install -y --no-install-recommends \
    prometheus prometheus-node-exporter
