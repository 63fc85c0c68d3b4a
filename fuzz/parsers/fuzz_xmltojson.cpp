// Feeds arbitrary text to the XML conversion. Whatever the guard lets
// through must convert without crashing; what it refuses gives nothing.
#include "XmlGuard.h"
#include "XmlUtility.h"

#include <QCoreApplication>

#include <cstdlib>

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    static int argc = 1;
    static char name[] = "fuzz_xmltojson";
    static char *argv[] = { name, nullptr };
    static QCoreApplication app(argc, argv);

    if (size < 1)
        return 0;
    const uint8_t flags = data[0];
    const QString xml = QString::fromUtf8(reinterpret_cast<const char *>(data + 1), int(size - 1));

    QVariantMap options;
    options.insert(QStringLiteral("rootProperty"), bool(flags & 1));
    options.insert(QStringLiteral("preserveNamespaces"), bool(flags & 2));
    if (flags & 4)
        options.insert(QStringLiteral("indexFormat"), QStringLiteral("%1%2"));
    if (flags & 8)
        options.insert(QStringLiteral("nodesProperty"), QString());
    if (flags & 16)
        options.insert(QStringLiteral("attributePrefix"), QString());

    const bool passes = XmlGuard::check(xml);
    const QVariantMap result = XmlUtility::toVariantMap(xml, options);
    if (!passes && !result.isEmpty())
        std::abort();
    return 0;
}
