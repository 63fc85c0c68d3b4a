#ifndef ENUMUTILITY_H
#define ENUMUTILITY_H

#include <QMetaEnum>
#include <QString>
#include <QVariant>

class QObject;

// Lets QML give an enum as a name (any case) or as a number.
class EnumUtility
{
public:
    static QMetaEnum enumerator(const QMetaObject &metaObject, const char *enumName);
    static QMetaEnum enumerator(const QObject *object, const char *enumName);

    static int enumValue(const QMetaEnum &metaEnum, const QString &name, int defaultValue);
    static int enumValue(const QMetaEnum &metaEnum, const QVariant &value, int defaultValue);
    static int enumValue(const QMetaObject &metaObject, const char *enumName, const QString &name, int defaultValue);
    static int enumValue(const QMetaObject &metaObject, const char *enumName, const QVariant &value, int defaultValue);
    static int enumValue(const QObject *object, const char *enumName, const QString &name, int defaultValue);
    static int enumValue(const QObject *object, const char *enumName, const QVariant &value, int defaultValue);

    static const char *enumValueName(const QMetaEnum &metaEnum, int value);
    static const char *enumValueName(const QMetaObject &metaObject, const char *enumName, int value);
    static const char *enumValueName(const QObject *object, const char *enumName, int value);
};

#endif // ENUMUTILITY_H
