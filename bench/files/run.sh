#!/bin/sh
# Measures the folder and file operations of the module against the tools a
# user would pick instead: find, cp and a Python line loop. Data is made under the build
# folder and not kept. Usage: bench/files/run.sh [build-dir]
set -e
cd "$(dirname "$0")/../.."
BUILD=${1:-build}
cmake --build "$BUILD" --target bench_files -j2 >/dev/null
TOOL="$BUILD/bench/bench_files"
DATA="$BUILD/bench-files"
rm -rf "$DATA"
mkdir -p "$DATA/tree"

# A tree of 200 folders with 100 files each, of varied sizes (about 100 MB),
# and one text file of 2 million lines.
python3 - "$DATA" <<'PY'
import os, random, sys
root = sys.argv[1]
random.seed(7)
for d in range(200):
    folder = os.path.join(root, "tree", "d%03d" % (d // 20), "s%03d" % d)
    os.makedirs(folder, exist_ok=True)
    for f in range(100):
        with open(os.path.join(folder, "f%03d.bin" % f), "wb") as out:
            out.write(os.urandom(random.choice((100, 1000, 4000, 10000))))
with open(os.path.join(root, "lines.txt"), "w") as out:
    for i in range(2000000):
        out.write("line %d with some text, %s\n" % (i, "x" * (i % 40)))
PY
sync

now() { date +%s.%N; }
elapsed() { echo "$2 - $1" | bc -l; }
ratio() { echo "scale=2; $1 / $2" | bc -l; }

report() { # name module-seconds tool-seconds amount unit
    printf "%-28s module %8.3f s  tool %8.3f s  %10.1f %s  ratio module/tool %s\n" \
        "$1" "$2" "$3" "$(echo "$4 / $2" | bc -l)" "$5" "$(ratio "$2" "$3")"
}

# Warm the page cache so both sides read from memory.
cat "$DATA/lines.txt" >/dev/null; find "$DATA/tree" -type f -exec cat {} + >/dev/null

set -- $("$TOOL" size "$DATA/tree"); m=$1; total=$2
t0=$(now); find "$DATA/tree" -type f -printf '%s\n' | awk '{s+=$1} END {print s}' >/dev/null; t1=$(now)
report "size (20000 files)" "$m" "$(elapsed "$t0" "$t1")" 20000 "files/s"

set -- $("$TOOL" list "$DATA/tree"); m=$1
t0=$(now); find "$DATA/tree" -type f >/dev/null; t1=$(now)
report "fileNames recursive" "$m" "$(elapsed "$t0" "$t1")" 20000 "files/s"

set -- $("$TOOL" copy "$DATA/tree" "$DATA/copy-module"); m=$1
t0=$(now); cp -r "$DATA/tree" "$DATA/copy-tool"; t1=$(now)
report "copyFile folder tree" "$m" "$(elapsed "$t0" "$t1")" "$(echo "$total / 1048576" | bc -l)" "MB/s"

set -- $("$TOOL" lines "$DATA/lines.txt"); m=$1; bytes=$2
# The tool side decodes each line too: a Python loop over the text file.
t0=$(now); python3 -c 'import sys
n = 0
for line in open(sys.argv[1], encoding="utf-8"): n += 1' "$DATA/lines.txt"; t1=$(now)
report "File.readLine (2M lines)" "$m" "$(elapsed "$t0" "$t1")" "$(echo "$bytes / 1048576" | bc -l)" "MB/s"

set -- $("$TOOL" write "$DATA/lines.txt" "$DATA/written.txt"); m=$1; bytes=$2
t0=$(now); cp "$DATA/lines.txt" "$DATA/copied.txt"; t1=$(now)
report "writeFile from a stream" "$m" "$(elapsed "$t0" "$t1")" "$(echo "$bytes / 1048576" | bc -l)" "MB/s"
cmp "$DATA/lines.txt" "$DATA/written.txt"

rm -rf "$DATA"
