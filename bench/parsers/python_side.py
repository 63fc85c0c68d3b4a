#!/usr/bin/env python3
"""The other side of the parser benchmark: what a script author would use.

Usage: python_side.py csv|xml FILE
Prints "<cpu seconds> <megabytes> <items> <user> <system>" like bench_parsers.
"""
import csv
import os
import resource
import sys


def cpu_time():
    usage = resource.getrusage(resource.RUSAGE_SELF)
    return usage.ru_utime, usage.ru_stime


def main():
    mode, path = sys.argv[1], sys.argv[2]
    megabytes = os.path.getsize(path) / (1024.0 * 1024.0)
    if mode == "csv":
        start = cpu_time()
        with open(path, newline="", encoding="utf-8") as f:
            rows = list(csv.DictReader(f))
        end = cpu_time()
        items = len(rows)
    else:
        import xmltodict
        with open(path, "rb") as f:
            data = f.read()
        start = cpu_time()
        result = xmltodict.parse(data)
        end = cpu_time()
        items = len(result)
    user, system = end[0] - start[0], end[1] - start[1]
    print("%.3f %.1f %d %.3f %.3f" % (user + system, megabytes, items, user, system))
    sys.stdout.flush()
    os._exit(0)  # the results are left to the operating system on both sides


if __name__ == "__main__":
    main()
