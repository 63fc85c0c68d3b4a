#!/usr/bin/env python3
"""The other side of the parser benchmark: what a script author would use.

Usage: python_side.py csv|xml FILE
Prints "<cpu seconds> <megabytes> <items>" like bench_parsers.
"""
import csv
import os
import sys
import time


def main():
    mode, path = sys.argv[1], sys.argv[2]
    megabytes = os.path.getsize(path) / (1024.0 * 1024.0)
    if mode == "csv":
        start = time.process_time()
        with open(path, newline="", encoding="utf-8") as f:
            rows = list(csv.DictReader(f))
        seconds = time.process_time() - start
        items = len(rows)
    else:
        import xmltodict
        with open(path, "rb") as f:
            data = f.read()
        start = time.process_time()
        result = xmltodict.parse(data)
        seconds = time.process_time() - start
        items = len(result)
    print("%.3f %.1f %d" % (seconds, megabytes, items))
    sys.stdout.flush()
    os._exit(0)  # the results are left to the operating system on both sides


if __name__ == "__main__":
    main()
