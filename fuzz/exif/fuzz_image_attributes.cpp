// The attribute reader and writer over any file: read every value, then
// rewrite the file into a copy and read that again.
#include "ImageAttributes.h"

#include <QCoreApplication>
#include <QDir>
#include <QFile>
#include <QLoggingCategory>
#include <QTemporaryDir>

namespace {
QTemporaryDir *folder = nullptr;
}

extern "C" int LLVMFuzzerInitialize(int *, char ***)
{
    QLoggingCategory::setFilterRules(QStringLiteral("*.debug=false\n*.warning=false"));
    folder = new QTemporaryDir(QDir::tempPath() + QStringLiteral("/fuzz_image_attributes-XXXXXX"));
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    const QString source = folder->filePath(QStringLiteral("in.jpg"));
    const QString target = folder->filePath(QStringLiteral("out.jpg"));
    {
        QFile file(source);
        if (!file.open(QIODevice::WriteOnly))
            return 0;
        file.write(reinterpret_cast<const char *>(data), qint64(size));
    }

    ImageAttributes attributes;
    attributes.setFilePath(source);
    const QStringList keys = attributes.keys().toStringList();
    attributes.values();
    if (!keys.isEmpty())
        attributes.value(keys.first());

    attributes.setDestFilePath(target);
    attributes.setValues({{QStringLiteral("k"), QByteArray(70000, 'x')}, {QStringLiteral("m"), QVariantMap{{QStringLiteral("a"), 1}}}});
    ImageAttributes copy;
    copy.setFilePath(target);
    copy.values();
    if (QFile(target).size() > qint64(size) + 2 * 66000)
        __builtin_trap(); // the copy holds the source and our two values, no more
    copy.removeAll();
    return 0;
}
