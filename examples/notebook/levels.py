#!/usr/bin/python3
"""Levels over time: levels.py CAPTURE PICTURE."""

import os
import shlex
import sys

import matplotlib
matplotlib.use("Agg")  # the picture goes into a file
import pandas

capture, picture = sys.argv[1:]

# A table of rows in three lines.
command = f"ventrik-decode --format csv --select '/Serving Cell Measurements' {shlex.quote(capture)}"
rows = pandas.read_csv(os.popen(command), parse_dates=["time"], low_memory=False)
levels = rows[rows.unit == "dBm"].pivot_table(index="time", columns="name", values="number").ffill()

axes = levels[["Measured RSRP", "Measured RSSI"]].plot(figsize=(10, 4), drawstyle="steps-post")
axes.set_ylabel("dBm")
axes.figure.savefig(picture, bbox_inches="tight")
print(levels["Measured RSRP"].describe()[["count", "mean", "min", "max"]].round(2).to_string())
