#!/bin/sh
# Parses a generated CSV file (200 MB) and XML file (50 MB) with the module's
# code and, in the same run, with python3's csv.DictReader and xmltodict, and
# prints MB/s and the ratio. Times are processor seconds, best of RUNS.
# "records built, no parsing" times making the typed result's maps and texts
# alone (see bench_parsers.cpp): a bound on the first ratio.
# Environment: LOOMKIT_BUILD_DIR (build), CSV_MB (200), XML_MB (50), RUNS (3).
set -e
cd "$(dirname "$0")/../.."
BUILD=${LOOMKIT_BUILD_DIR:-build}
CSV_MB=${CSV_MB:-200}
XML_MB=${XML_MB:-50}
RUNS=${RUNS:-3}
DATA="$BUILD/bench-data"

python3 -c "import xmltodict" 2>/dev/null || ./scripts/setup-debian.sh
[ -f "$BUILD/CMakeCache.txt" ] || cmake -S . -B "$BUILD" -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo >/dev/null
cmake --build "$BUILD" --target bench_parsers >/dev/null
mkdir -p "$DATA"
CSV="$DATA/parsers-$CSV_MB.csv"
XML="$DATA/parsers-$XML_MB.xml"
[ -s "$CSV" ] || python3 bench/parsers/generate.py csv "$CSV" "$CSV_MB"
[ -s "$XML" ] || python3 bench/parsers/generate.py xml "$XML" "$XML_MB"

# best <command...>: the smallest time of RUNS runs, as "seconds megabytes items".
best() {
    i=0
    result=""
    while [ $i -lt "$RUNS" ]; do
        line=$("$@")
        result=$(printf '%s\n%s\n' "$result" "$line" | awk 'NF == 3' | sort -n | head -n 1)
        i=$((i + 1))
    done
    echo "$result"
}

report() { # name ours theirs
    echo "$2 $3" | awk -v name="$1" '{
        ours = $2 / $1; theirs = $5 / $4
        printf "%-34s module %7.1f MB/s (%.2f s)   python %7.1f MB/s (%.2f s)   ratio %.2fx\n",
               name, ours, $1, theirs, $4, ours / theirs
    }'
}

BENCH="$BUILD/bench/bench_parsers"
csv_auto=$(best "$BENCH" csv "$CSV")
csv_text=$(best "$BENCH" csv-text "$CSV")
csv_build=$(best "$BENCH" csv-build "$CSV")
csv_python=$(best python3 bench/parsers/python_side.py csv "$CSV")
xml_ours=$(best "$BENCH" xml "$XML")
xml_python=$(best python3 bench/parsers/python_side.py xml "$XML")

echo "CSV $CSV_MB MB, $(echo "$csv_auto" | cut -d' ' -f3) records; XML $XML_MB MB"
report "CSV typed (auto) vs csv.DictReader" "$csv_auto" "$csv_python"
report "CSV as text vs csv.DictReader" "$csv_text" "$csv_python"
# The records alone, built without reading: the most any parser that
# returns maps of variants could gain on python.
report "CSV records built, no parsing" "$csv_build" "$csv_python"
report "XML to map vs xmltodict" "$xml_ours" "$xml_python"
