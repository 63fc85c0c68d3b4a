// Feeds arbitrary bytes to the CSV parser under options picked by the first
// byte, and checks that every value typed in "auto" mode is what Qt's own
// conversions make of the same field read as text.
#include "CsvParser.h"

#include <QBuffer>
#include <QCoreApplication>
#include <QDateTime>
#include <QLocale>

#include <cmath>
#include <cstdlib>

namespace {

QVariant referenceType(const QString &text)
{
    const QDateTime dateTime = QDateTime::fromString(text, Qt::ISODate);
    if (dateTime.isValid())
        return dateTime;
    const QLocale c = QLocale::c();
    bool ok = false;
    const int integer = c.toInt(text, &ok);
    if (ok)
        return integer;
    const double real = c.toDouble(text, &ok);
    if (ok)
        return real;
    return text;
}

bool sameValue(const QVariant &a, const QVariant &b)
{
    if (a.userType() != b.userType())
        return false;
    if (a.userType() == QMetaType::Double) {
        const double x = a.toDouble();
        const double y = b.toDouble();
        return (x != x && y != y) || (x == y && std::signbit(x) == std::signbit(y));
    }
    if (a.userType() == QMetaType::QDateTime)
        return a.toDateTime() == b.toDateTime() && a.toDateTime().timeSpec() == b.toDateTime().timeSpec();
    return a == b;
}

QVariantList parse(const QByteArray &data, QVariantMap options, QList<CsvError> *errors)
{
    QByteArray copy = data;
    QBuffer buffer(&copy);
    CsvParser parser(&buffer);
    parser.parse(options);
    *errors = parser.errors();
    for (const CsvError &error : *errors) {
        if (error.type < 0 || error.type > 4 || error.line < 0 || error.column < 0)
            std::abort();
    }
    return parser.records();
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    static int argc = 1;
    static char name[] = "fuzz_csvparser";
    static char *argv[] = { name, nullptr };
    static QCoreApplication app(argc, argv);

    if (size < 1)
        return 0;
    const uint8_t flags = data[0];
    const QByteArray input(reinterpret_cast<const char *>(data + 1), int(size - 1));

    QVariantMap options;
    options.insert(QStringLiteral("trim"), bool(flags & 1));
    options.insert(QStringLiteral("ignoreInvalidLines"), bool(flags & 2));
    options.insert(QStringLiteral("emptyValueAsNull"), bool(flags & 4));
    if (flags & 8)
        options.insert(QStringLiteral("delimiter"), QStringLiteral(";"));
    if (flags & 16)
        options.insert(QStringLiteral("textQualifier"), QStringLiteral("'"));
    if (flags & 32)
        options.insert(QStringLiteral("encoding"), QStringLiteral("ISO-8859-1"));

    if (flags & 64) {
        // Free-form: headers from the data, objects.
        QList<CsvError> errors;
        parse(input, options, &errors);
        return 0;
    }

    // Fixed fields and arrays, so that both readings have the same shape.
    options.insert(QStringLiteral("dataElementAsArray"), true);
    options.insert(QStringLiteral("fields"), QStringList { QStringLiteral("a"), QStringLiteral("b") });
    QList<CsvError> autoErrors;
    const QVariantList typed = parse(input, options, &autoErrors);
    options.insert(QStringLiteral("valueType"), QStringLiteral("text"));
    QList<CsvError> textErrors;
    const QVariantList texts = parse(input, options, &textErrors);

    if (typed.size() != texts.size() || autoErrors != textErrors)
        std::abort();
    for (int i = 0; i < typed.size(); ++i) {
        const QVariantList typedRow = typed.at(i).toList();
        const QVariantList textRow = texts.at(i).toList();
        if (typedRow.size() != textRow.size())
            std::abort();
        for (int j = 0; j < typedRow.size(); ++j) {
            const QVariant &value = typedRow.at(j);
            const QVariant &text = textRow.at(j);
            if (value.userType() == QMetaType::Nullptr || value.userType() == QMetaType::QString) {
                if (value.userType() != text.userType())
                    std::abort();
                continue;
            }
            // Typed: a plain field, so the reference applies.
            if (!sameValue(value, referenceType(text.toString())))
                std::abort();
        }
    }
    return 0;
}
