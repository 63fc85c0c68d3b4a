// Feeds arbitrary text to the XML conversion. What the guard refuses gives
// nothing; what it lets through converts without crashing, and exactly as a
// walk over the DOM of the same text does.
#include "XmlElementValue.h"
#include "XmlGuard.h"
#include "XmlUtility.h"

#include <QCoreApplication>
#include <QDomDocument>
#include <QJsonValue>

#include <cstdlib>

namespace {

bool same(const QVariant &a, const QVariant &b)
{
    if (a.userType() != b.userType())
        return false;
    switch (a.userType()) {
    case QMetaType::QVariantMap: {
        const QVariantMap x = a.toMap();
        const QVariantMap y = b.toMap();
        if (x.keys() != y.keys())
            return false;
        for (auto it = x.cbegin(), jt = y.cbegin(); it != x.cend(); ++it, ++jt) {
            if (!same(it.value(), jt.value()))
                return false;
        }
        return true;
    }
    case QMetaType::QVariantList: {
        const QVariantList x = a.toList();
        const QVariantList y = b.toList();
        if (x.size() != y.size())
            return false;
        for (int i = 0; i < x.size(); ++i) {
            if (!same(x.at(i), y.at(i)))
                return false;
        }
        return true;
    }
    case QMetaType::QStringList:
        return a.toStringList() == b.toStringList();
    case QMetaType::QString:
        return a.toString() == b.toString() && a.toString().isNull() == b.toString().isNull();
    default:
        if (a.userType() == qMetaTypeId<QJsonValue>())
            return a.value<QJsonValue>() == b.value<QJsonValue>();
        return false;
    }
}

} // namespace

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
    if (!passes) {
        if (!result.isEmpty())
            std::abort();
        return 0;
    }

    // The same text through the DOM.
    const XmlUtility::Options parsed = XmlUtility::Options::fromMap(options);
    QVariantMap expected;
    QDomDocument document;
    if (document.setContent(xml)) {
        const QDomElement root = document.documentElement();
        const QVariant value = XmlUtility::toVariant(root, parsed);
        if (parsed.rootProperty)
            expected.insert(XmlElementValue::Context(parsed).elementKey(root.tagName()), value);
        else
            expected = value.toMap();
    }
    if (!same(QVariant(result), QVariant(expected)))
        std::abort();
    return 0;
}
