#include "EnumUtility.h"
#include "LoomkitLogging.h"

#include <QObject>

QMetaEnum EnumUtility::enumerator(const QMetaObject &metaObject, const char *enumName)
{
    if (!enumName) {
        qCCritical(lcUtility) << Q_FUNC_INFO << "Null enum name";
        return QMetaEnum();
    }
    for (int i = 0; i < metaObject.enumeratorCount(); ++i) {
        const QMetaEnum metaEnum = metaObject.enumerator(i);
        if (qstrcmp(metaEnum.name(), enumName) == 0)
            return metaEnum;
    }
    return QMetaEnum();
}

QMetaEnum EnumUtility::enumerator(const QObject *object, const char *enumName)
{
    if (!object) {
        qCCritical(lcUtility) << Q_FUNC_INFO << "Null object";
        return QMetaEnum();
    }
    return enumerator(*object->metaObject(), enumName);
}

int EnumUtility::enumValue(const QMetaEnum &metaEnum, const QString &name, int defaultValue)
{
    if (!metaEnum.isValid()) {
        qCCritical(lcUtility) << Q_FUNC_INFO << "Invalid metaEnum" << name;
        return defaultValue;
    }
    for (int i = 0; i < metaEnum.keyCount(); ++i) {
        if (name.compare(QLatin1String(metaEnum.key(i)), Qt::CaseInsensitive) == 0)
            return metaEnum.value(i);
    }
    return defaultValue;
}

int EnumUtility::enumValue(const QMetaEnum &metaEnum, const QVariant &value, int defaultValue)
{
    if (!metaEnum.isValid()) {
        qCCritical(lcUtility) << Q_FUNC_INFO << "Invalid metaEnum" << value;
        return defaultValue;
    }
    bool ok = false;
    const int number = value.toInt(&ok);
    if (ok)
        return metaEnum.valueToKey(number) ? number : defaultValue;
    return enumValue(metaEnum, value.toString(), defaultValue);
}

int EnumUtility::enumValue(const QMetaObject &metaObject, const char *enumName, const QString &name, int defaultValue)
{
    return enumValue(enumerator(metaObject, enumName), name, defaultValue);
}

int EnumUtility::enumValue(const QMetaObject &metaObject, const char *enumName, const QVariant &value, int defaultValue)
{
    return enumValue(enumerator(metaObject, enumName), value, defaultValue);
}

int EnumUtility::enumValue(const QObject *object, const char *enumName, const QString &name, int defaultValue)
{
    return enumValue(enumerator(object, enumName), name, defaultValue);
}

int EnumUtility::enumValue(const QObject *object, const char *enumName, const QVariant &value, int defaultValue)
{
    return enumValue(enumerator(object, enumName), value, defaultValue);
}

const char *EnumUtility::enumValueName(const QMetaEnum &metaEnum, int value)
{
    if (!metaEnum.isValid()) {
        qCCritical(lcUtility) << Q_FUNC_INFO << "Invalid metaEnum";
        return nullptr;
    }
    return metaEnum.valueToKey(value);
}

const char *EnumUtility::enumValueName(const QMetaObject &metaObject, const char *enumName, int value)
{
    return enumValueName(enumerator(metaObject, enumName), value);
}

const char *EnumUtility::enumValueName(const QObject *object, const char *enumName, int value)
{
    return enumValueName(enumerator(object, enumName), value);
}
