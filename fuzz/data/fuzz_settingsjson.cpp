// Reads arbitrary bytes as a JSON settings file. Whatever the file holds,
// reading must succeed, and what was read must survive a write and a
// second read unchanged.
#include "Settings.h"

#include <QBuffer>

#include <cstdlib>

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    QByteArray bytes(reinterpret_cast<const char *>(data), int(size));
    QBuffer input(&bytes);
    input.open(QIODevice::ReadOnly);
    QSettings::SettingsMap map;
    if (!Settings::readJson(input, map))
        abort();

    QByteArray written;
    QBuffer output(&written);
    output.open(QIODevice::WriteOnly);
    if (!Settings::writeJson(output, map))
        abort();
    output.close();

    output.open(QIODevice::ReadOnly);
    QSettings::SettingsMap again;
    Settings::readJson(output, again);
    if (again != map)
        abort();
    return 0;
}
