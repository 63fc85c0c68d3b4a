// The marker walk over any bytes, and writing back what it found.
#include "JpegMarkers.h"

#include <QBuffer>
#include <QLoggingCategory>

extern "C" int LLVMFuzzerInitialize(int *, char ***)
{
    QLoggingCategory::setFilterRules(QStringLiteral("*.debug=false\n*.warning=false"));
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    QByteArray bytes(reinterpret_cast<const char *>(data), int(size));
    QBuffer buffer(&bytes);
    buffer.open(QIODevice::ReadOnly);
    QBuffer output;
    output.open(QIODevice::WriteOnly);

    JpegMarkers reader(&buffer);
    JpegMarkers writer(&output);
    size_t steps = 0;
    if (reader.first()) {
        do {
            writer.write(reader.markerType(), reader.markerData());
            if (reader.markerSize() < 0 || ++steps > size)
                __builtin_trap(); // a walk must move on
        } while (reader.next());
    }
    return 0;
}
