#ifndef JSONUTILITY_H
#define JSONUTILITY_H

#include <QByteArray>
#include <QVariant>
#include <QVariantMap>

// Conversions between JSON text and variants.
class JsonUtility
{
public:
    static QVariant toVariant(const QByteArray &json, bool normalize = false);
    static QVariantMap toVariantMap(const QByteArray &json, bool normalize = false);
    static QVariantMap fromFile(const QString &path);
    static QVariantMap fromString(const QString &text);
    static QByteArray toJson(const QVariantMap &map);
    static bool toFile(const QString &path, const QVariantMap &map);

    // Makes every nested container a plain QVariantMap or QVariantList.
    static void normalizeMap(QVariantMap &map);
    static void normalizeList(QVariantList &list);

private:
    static QVariantMap withoutInvalid(const QVariantMap &map);
};

#endif // JSONUTILITY_H
