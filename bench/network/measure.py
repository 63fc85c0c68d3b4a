#!/usr/bin/env python3
"""Runs a command and prints its wall time in seconds and its peak resident
memory in MiB: "<seconds> <peak MiB>". The command's own output goes to
stderr so that only the figures are on stdout."""
import resource
import subprocess
import sys
import time

start = time.monotonic()
result = subprocess.run(sys.argv[1:], stdout=sys.stderr)
elapsed = time.monotonic() - start
peak_kib = resource.getrusage(resource.RUSAGE_CHILDREN).ru_maxrss
if result.returncode != 0:
    sys.exit(result.returncode)
print("%.3f %.1f" % (elapsed, peak_kib / 1024.0))
