#!/usr/bin/env python3
"""Writes the benchmark inputs: a CSV file and an XML file of a given size.

Usage: generate.py csv|xml OUTPUT MEGABYTES
The content is pseudo-random with a fixed seed, so every run sees the same bytes.
"""
import random
import sys

WORDS = ("alpha bravo charlie delta echo foxtrot golf hotel india juliet kilo lima "
         "mike november oscar papa quebec romeo sierra tango uniform victor whiskey "
         "x-ray yankee zulu Zürich Łódź café naïve").split()


def sentence(rng, low, high):
    return " ".join(rng.choice(WORDS) for _ in range(rng.randint(low, high)))


def quoted_text(rng):
    # Text that needs the qualifier: commas, doubled quotes and line breaks.
    parts = [sentence(rng, 2, 8)]
    kind = rng.random()
    if kind < 0.4:
        parts.append(", " + sentence(rng, 1, 4))
    elif kind < 0.7:
        parts.append(' said ""' + sentence(rng, 1, 3) + '""')
    else:
        parts.append("\n" + sentence(rng, 1, 6))
    return '"' + "".join(parts) + '"'


def csv_row(rng, index):
    day = rng.randint(1, 28)
    month = rng.randint(1, 12)
    year = rng.randint(1990, 2030)
    fields = [
        str(index),
        quoted_text(rng),
        sentence(rng, 1, 3),
        str(rng.randint(-100000, 100000)),
        "%.2f" % rng.uniform(-5000, 5000),
        "%04d-%02d-%02d" % (year, month, day),
        "%s-%05d" % (rng.choice(("AB", "QX", "ZZ", "K7")), rng.randint(0, 99999)),
        "" if rng.random() < 0.5 else sentence(rng, 1, 2),
        '""' if rng.random() < 0.3 else str(rng.randint(0, 1)),
    ]
    return ",".join(fields)


def write_csv(out, size, rng):
    out.write("id,text,label,count,amount,day,code,note,flag\n")
    index = 0
    written = 0
    while written < size:
        row = csv_row(rng, index) + "\n"
        out.write(row)
        written += len(row.encode("utf-8"))
        index += 1


def xml_item(rng, index):
    tags = "".join("<tag>%s</tag>" % rng.choice(WORDS) for _ in range(rng.randint(1, 4)))
    parts = [
        '  <item id="%d" kind="%s" active="%s">\n' % (index, rng.choice(WORDS),
                                                      rng.choice(("true", "false"))),
        "    <name>%s</name>\n" % sentence(rng, 1, 3),
        '    <price currency="%s">%.2f</price>\n' % (rng.choice(("EUR", "USD", "CHF")),
                                                     rng.uniform(0, 1000)),
        "    <tags>%s</tags>\n" % tags,
        "    <description>%s &amp; %s &lt;%d&gt;</description>\n" % (
            sentence(rng, 3, 12), sentence(rng, 1, 4), rng.randint(0, 99)),
    ]
    if rng.random() < 0.3:
        parts.append("    <!-- %s -->\n" % sentence(rng, 2, 5))
    if rng.random() < 0.3:
        parts.append("    <notes><![CDATA[%s <b>%s</b>]]></notes>\n" % (
            sentence(rng, 2, 6), rng.choice(WORDS)))
    if rng.random() < 0.2:
        parts.append("    <mixed>%s <em>%s</em> %s</mixed>\n" % (
            sentence(rng, 1, 3), rng.choice(WORDS), sentence(rng, 1, 3)))
    parts.append("    <empty/>\n  </item>\n")
    return "".join(parts)


def write_xml(out, size, rng):
    out.write('<?xml version="1.0" encoding="UTF-8"?>\n<catalog version="2">\n')
    index = 0
    written = 0
    while written < size:
        item = xml_item(rng, index)
        out.write(item)
        written += len(item.encode("utf-8"))
        index += 1
    out.write("</catalog>\n")


def main():
    if len(sys.argv) != 4 or sys.argv[1] not in ("csv", "xml"):
        sys.exit(__doc__)
    kind, path, megabytes = sys.argv[1], sys.argv[2], float(sys.argv[3])
    rng = random.Random(20240601)
    with open(path, "w", encoding="utf-8", newline="") as out:
        (write_csv if kind == "csv" else write_xml)(out, int(megabytes * 1024 * 1024), rng)


if __name__ == "__main__":
    main()
