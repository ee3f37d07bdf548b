#!/usr/bin/env bash
# What this example needs beside ventrik-decode.
set -euo pipefail
sudo=$([ "$(id -u)" = 0 ] || echo sudo)
DEBIAN_FRONTEND=noninteractive $sudo apt-get install -y --no-install-recommends \
    python3-matplotlib python3-pandas
