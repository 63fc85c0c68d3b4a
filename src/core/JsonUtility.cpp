#include "JsonUtility.h"
#include "FileFolder.h"
#include "LoomkitLogging.h"

#include <QFile>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>

namespace {

bool isListLike(const QVariant &value)
{
    // Strings and byte arrays convert to lists too; only real containers count.
    switch (value.userType()) {
    case QMetaType::QVariantList:
    case QMetaType::QStringList:
        return true;
    default:
        return value.canConvert<QVariantList>() && !value.canConvert<QString>()
               && !value.canConvert<QVariantMap>();
    }
}

bool isMapLike(const QVariant &value)
{
    switch (value.userType()) {
    case QMetaType::QVariantMap:
    case QMetaType::QVariantHash:
        return true;
    default:
        return value.canConvert<QVariantMap>() && !value.canConvert<QString>();
    }
}

} // namespace

void JsonUtility::normalizeList(QVariantList &list)
{
    for (QVariant &element : list) {
        if (element.isValid() && isMapLike(element)) {
            QVariantMap map = element.toMap();
            normalizeMap(map);
            element = map;
        }
    }
}

void JsonUtility::normalizeMap(QVariantMap &map)
{
    for (auto it = map.begin(); it != map.end(); ++it) {
        QVariant &value = it.value();
        if (!value.isValid())
            continue;
        if (isListLike(value)) {
            QVariantList list = value.toList();
            normalizeList(list);
            value = list;
        } else if (isMapLike(value)) {
            QVariantMap nested = value.toMap();
            normalizeMap(nested);
            value = nested;
        }
    }
}

QVariant JsonUtility::toVariant(const QByteArray &json, bool normalize)
{
    if (json.isEmpty())
        return QVariant();

    QJsonParseError parseError;
    const QJsonDocument document = QJsonDocument::fromJson(json, &parseError);
    if (parseError.error != QJsonParseError::NoError) {
        qCDebug(lcRuntimeUtility) << Q_FUNC_INFO << "Error:" << parseError.error << parseError.errorString()
                                  << "Offset:" << parseError.offset << "json:" << QString::fromUtf8(json);
        return QVariant(QVariantMap());
    }

    if (document.isArray()) {
        QVariantList list = document.array().toVariantList();
        if (normalize)
            normalizeList(list);
        return list;
    }

    QVariantMap map = document.object().toVariantMap();
    if (normalize)
        normalizeMap(map);
    return map;
}

QVariantMap JsonUtility::toVariantMap(const QByteArray &json, bool normalize)
{
    if (json.isEmpty())
        return QVariantMap();

    QJsonParseError parseError;
    const QJsonDocument document = QJsonDocument::fromJson(json, &parseError);
    if (parseError.error != QJsonParseError::NoError || !document.isObject()) {
        qCDebug(lcRuntimeUtility) << Q_FUNC_INFO << "Error" << parseError.error << parseError.errorString()
                                  << "Offset" << parseError.offset << "json:" << QString::fromUtf8(json);
        return QVariantMap();
    }

    QVariantMap map = document.object().toVariantMap();
    if (normalize)
        normalizeMap(map);
    return map;
}

QVariantMap JsonUtility::fromFile(const QString &path)
{
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly))
        return QVariantMap();
    return toVariantMap(file.readAll(), false);
}

QVariantMap JsonUtility::fromString(const QString &text)
{
    if (text.isEmpty())
        return QVariantMap();
    return toVariantMap(text.toUtf8(), text.contains(QLatin1String("null"), Qt::CaseInsensitive));
}

QVariantMap JsonUtility::withoutInvalid(const QVariantMap &map)
{
    QVariantMap copy;
    for (auto it = map.constBegin(); it != map.constEnd(); ++it) {
        const QVariant &value = it.value();
        if (!value.isValid())
            continue;
        if (isMapLike(value))
            copy.insert(it.key(), withoutInvalid(value.toMap()));
        else
            copy.insert(it.key(), value);
    }
    return copy;
}

QByteArray JsonUtility::toJson(const QVariantMap &map)
{
    return QJsonDocument::fromVariant(QVariant(withoutInvalid(map))).toJson(QJsonDocument::Indented);
}

bool JsonUtility::toFile(const QString &path, const QVariantMap &map)
{
    return FileFolder::writeFileData(path, toJson(map));
}
