"""Property lists through another reader and writer.

dump FILE             prints what the file holds, one JSON line
write xml|binary FILE writes a document of every kind
"""

import datetime
import json
import plistlib
import sys

DOCUMENT = {
    "Text": "tab\there\nline \u00e9\u20ac\U0001f600 <&>",
    "Numbers": [0, -1, 2**63 - 1, 2**64 - 1, -(2**63), 300, 70000],
    "Reals": [0.1, -1.5, float("inf")],
    "Flags": [True, False],
    "Date": datetime.datetime(2026, 11, 16, 6, 10, 28),
    "Early": datetime.datetime(1969, 12, 31, 23, 59, 59),
    "Data": bytes(range(100)),
    "Empty": [{}, [], "", b""],
    "\u00e9": "key",
}


def plain(value):
    if isinstance(value, bytes):
        return {"data": value.hex()}
    if isinstance(value, datetime.datetime):
        return {"date": value.isoformat()}
    if isinstance(value, list):
        return [plain(each) for each in value]
    if isinstance(value, dict):
        return {key: plain(each) for key, each in value.items()}
    return value


def dump(path):
    with open(path, "rb") as file:
        print(json.dumps(plain(plistlib.load(file))))


def write(form, path):
    document = dict(DOCUMENT)
    if form == "binary":
        document["Return"] = "a\r\nb\rc"  # the other side's XML writer turns these into newlines
    kind = plistlib.FMT_BINARY if form == "binary" else plistlib.FMT_XML
    with open(path, "wb") as file:
        plistlib.dump(document, file, fmt=kind, sort_keys=False)


if __name__ == "__main__":
    {"dump": dump, "write": write}[sys.argv[1]](*sys.argv[2:])
