#!/usr/bin/python3
"""Decodes captures on many workers and loads their rows into ClickHouse.

    fleet.py --workers 2 CAPTURE|DIRECTORY...
    fleet.py --scheduler tcp://HOST:8786 CAPTURE|DIRECTORY...

Each capture is one task. A worker that dies has its task done again by another one; a capture that
is loaded again replaces its rows. A damaged capture is a line in the table `captures`, no failure.
"""

import argparse
import http.client
import json
import os
import pathlib
import re
import subprocess
import sys
import time
import urllib.parse

BLOCK = 1 << 20


def ask(server, query, body=None):
    """What the engine answers to a query, with the rows that go into it."""
    host, port = server.rsplit(":", 1)
    connection = http.client.HTTPConnection(host, int(port), timeout=600)
    path = "/?" + urllib.parse.urlencode(
        {"query": query, "input_format_skip_unknown_fields": 1} if body is not None else {})
    connection.request("POST", path, query.encode() if body is None else body,
                       {} if body is None else {"Transfer-Encoding": "chunked"},
                       encode_chunked=body is not None)
    answer = connection.getresponse()
    text = answer.read().decode()
    connection.close()
    if answer.status != 200:
        raise RuntimeError(text.strip().splitlines()[0])
    return text


def blocks(stream, load, closing):
    """The rows with their load, in large blocks; what closes the capture is put aside."""
    first = b'{"capture":'  # of a row; within texts quotes are escaped
    start = b'{"load":%d,"capture":' % load
    rest = b""
    while chunk := stream.read(BLOCK):
        rest += chunk
        last = rest.rfind(b"\n", 0, -1) + 1  # the last line may be the closing one
        if last:
            yield rest[:last].replace(first, start)
            rest = rest[last:]
    if rest.endswith(b"\n") and b',"path":' not in rest:
        closing.append(rest.replace(first, start))


def load_capture(capture, server, decoder):
    """One task: decodes a capture and loads it; gives its closing row."""
    load = time.time_ns()
    closing = []
    with subprocess.Popen([decoder, "--format", "rows", capture], stdout=subprocess.PIPE,
                          stderr=subprocess.DEVNULL) as program:
        try:
            ask(server, "INSERT INTO rows FORMAT JSONEachRow",
                blocks(program.stdout, load, closing))
        finally:
            program.kill()
    if not closing:
        raise RuntimeError(f"{capture}: the decoder ended before its closing row")
    # From now on these rows count, and those of former loads do not.
    ask(server, "INSERT INTO captures FORMAT JSONEachRow", iter(closing))
    return json.loads(closing[0])


def captures_in(names):
    for name in names:
        path = pathlib.Path(name)
        if path.is_dir():
            yield from sorted(str(file.resolve()) for file in path.rglob("*")
                              if file.is_file() and not file.name.startswith("."))
        else:
            yield str(path.resolve())


def main():
    line = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    line.add_argument("captures", nargs="+", metavar="CAPTURE|DIRECTORY")
    line.add_argument("--workers", type=int, default=os.cpu_count(), help="of this machine")
    line.add_argument("--scheduler", help="of a cluster that runs already")
    line.add_argument("--clickhouse", default="localhost:8123", metavar="HOST:PORT")
    line.add_argument("--decoder", default="ventrik-decode", help="ventrik-decode, on the workers")
    options = line.parse_args()

    from distributed import Client, LocalCluster, as_completed

    tables = (pathlib.Path(__file__).parent / "tables.sql").read_text()
    for statement in re.sub("--.*", "", tables).split(";"):
        if statement.strip():
            ask(options.clickhouse, statement)
    captures = list(captures_in(options.captures))
    started = time.monotonic()
    totals = {"records": 0, "rows": 0, "bytes": 0}
    bad = 0
    cluster = None if options.scheduler else LocalCluster(
        n_workers=options.workers, threads_per_worker=1, dashboard_address=None)
    with Client(options.scheduler or cluster) as client:
        tasks = client.map(load_capture, captures, server=options.clickhouse,
                           decoder=options.decoder, retries=2, pure=False)
        for done, task in enumerate(as_completed(tasks), 1):
            if sys.stderr.isatty():
                print(f"\r{done} of {len(captures)} captures", end="", file=sys.stderr)
            if task.status != "finished":
                bad += 1
                print(f"fleet: {task.exception()}", file=sys.stderr)
                continue
            closing = task.result()
            for name in totals:
                totals[name] += closing[name]
    if cluster:
        cluster.close()
    seconds = time.monotonic() - started
    print(f"{len(captures)} captures, {totals['records']} records of {totals['bytes']} bytes, "
          f"{totals['rows']} rows in {seconds:.1f} s: {totals['records'] / seconds:.0f} records/s")
    return 1 if bad else 0


if __name__ == "__main__":
    sys.exit(main())
