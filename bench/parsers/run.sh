#!/bin/sh
# Parses a generated CSV file (200 MB) and XML file (50 MB) with the module's
# code and, in the same run, with python3's csv.DictReader and xmltodict, and
# prints MB/s and the ratio. Times are processor seconds (user and system),
# the best of RUNS rounds that take turns, each run twice in a row.
# "records built, no parsing" times making the typed result's maps and texts
# alone (see bench_parsers.cpp): a bound on the first ratio.
# Environment: LOOMKIT_BUILD_DIR (build), CSV_MB (200), XML_MB (50), RUNS (2),
# PYTHON (Debian's /usr/bin/python3, the one its python3-xmltodict is for,
# rather than whatever python3 comes first on the path).
set -e
cd "$(dirname "$0")/../.."
BUILD=${LOOMKIT_BUILD_DIR:-build}
CSV_MB=${CSV_MB:-200}
XML_MB=${XML_MB:-50}
RUNS=${RUNS:-2}
DATA="$BUILD/bench-data"

PYTHON=${PYTHON:-/usr/bin/python3}
[ -x "$PYTHON" ] || PYTHON=python3
"$PYTHON" -c "import xmltodict" 2>/dev/null || ./scripts/setup-debian.sh
[ -f "$BUILD/CMakeCache.txt" ] || cmake -S . -B "$BUILD" -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo >/dev/null
cmake --build "$BUILD" --target bench_parsers >/dev/null
mkdir -p "$DATA"
CSV="$DATA/parsers-$CSV_MB.csv"
XML="$DATA/parsers-$XML_MB.xml"
[ -s "$CSV" ] || "$PYTHON" bench/parsers/generate.py csv "$CSV" "$CSV_MB"
[ -s "$XML" ] || "$PYTHON" bench/parsers/generate.py xml "$XML" "$XML_MB"

# better <line> <line>: of two results "seconds megabytes items user system",
# the one with the smaller time (an empty or broken one never wins).
better() {
    printf '%s\n%s\n' "$1" "$2" | awk 'NF == 5' | sort -n | head -n 1
}

# pair <command...>: runs the command twice in a row and prints the better run.
pair() {
    first=$("$@")
    second=$("$@")
    better "$first" "$second"
}

report() { # name ours theirs
    echo "$2 $3" | awk -v name="$1" '{
        ours = $2 / $1; theirs = $7 / $6
        printf "%-34s module %6.1f MB/s (%.2f s: %.2f user %.2f sys)   ", name, ours, $1, $4, $5
        printf "python %6.1f MB/s (%.2f s: %.2f user %.2f sys)   ratio %.2fx\n", theirs, $6, $9, $10, ours / theirs
    }'
}

BENCH="$BUILD/bench/bench_parsers"
PYTHON_SIDE=bench/parsers/python_side.py
# Rounds of every run in turn, each run twice in a row, the best kept. Most
# of the system time is the kernel handing out fresh pages for the results,
# and on this shared virtual machine that costs more when the run before was
# small (pages just freed by a run of the same size come back cheaper than
# pages the host has taken back meanwhile); so every run is timed after one
# of its own kind, and both sides meet the machine in the same spells.
csv_auto="" csv_text="" csv_build="" csv_python="" xml_ours="" xml_python=""
round=0
while [ $round -lt "$RUNS" ]; do
    line=$(pair "$BENCH" csv "$CSV"); csv_auto=$(better "$csv_auto" "$line")
    line=$(pair "$PYTHON" "$PYTHON_SIDE" csv "$CSV"); csv_python=$(better "$csv_python" "$line")
    line=$(pair "$BENCH" csv-text "$CSV"); csv_text=$(better "$csv_text" "$line")
    line=$(pair "$BENCH" csv-build "$CSV"); csv_build=$(better "$csv_build" "$line")
    line=$(pair "$BENCH" xml "$XML"); xml_ours=$(better "$xml_ours" "$line")
    line=$(pair "$PYTHON" "$PYTHON_SIDE" xml "$XML"); xml_python=$(better "$xml_python" "$line")
    round=$((round + 1))
done

echo "CSV $CSV_MB MB, $(echo "$csv_auto" | cut -d' ' -f3) records; XML $XML_MB MB"
report "CSV typed (auto) vs csv.DictReader" "$csv_auto" "$csv_python"
report "CSV as text vs csv.DictReader" "$csv_text" "$csv_python"
# The records alone, built without reading: the most any parser that
# returns maps of variants could gain on python.
report "CSV records built, no parsing" "$csv_build" "$csv_python"
report "XML to map vs xmltodict" "$xml_ours" "$xml_python"
