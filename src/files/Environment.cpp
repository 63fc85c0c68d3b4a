#include "Environment.h"
#include "LoomkitLogging.h"

#include <QFile>
#include <QProcessEnvironment>

Environment::Environment(QObject *parent)
    : QObject(parent)
{
}

bool Environment::isValidName(const QString &name, const char *function)
{
    // The C library takes everything up to the first "=" as the name.
    if (name.isEmpty() || name.contains(QLatin1Char('=')) || name.contains(QChar(0))) {
        qCWarning(lcFile) << function << "Invalid variable name:" << name;
        return false;
    }
    return true;
}

QStringList Environment::names() const
{
    QStringList list = QProcessEnvironment::systemEnvironment().keys();
    list.sort();
    return list;
}

QVariantMap Environment::values() const
{
    const QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    QVariantMap map;
    const QStringList keys = environment.keys();
    for (const QString &key : keys)
        map.insert(key, environment.value(key));
    return map;
}

QString Environment::value(const QString &name, const QString &defaultValue) const
{
    if (name.isEmpty() || !qEnvironmentVariableIsSet(QFile::encodeName(name).constData()))
        return defaultValue;
    return qEnvironmentVariable(QFile::encodeName(name).constData());
}

QString Environment::value(const QString &name) const
{
    return value(name, QString());
}

bool Environment::contains(const QString &name) const
{
    return !name.isEmpty() && qEnvironmentVariableIsSet(QFile::encodeName(name).constData());
}

bool Environment::setValue(const QString &name, const QString &value)
{
    if (!isValidName(name, Q_FUNC_INFO))
        return false;
    const QByteArray key = QFile::encodeName(name);
    const QByteArray bytes = QFile::encodeName(value);
    if (qEnvironmentVariableIsSet(key.constData()) && qgetenv(key.constData()) == bytes)
        return true;
    if (!qputenv(key.constData(), bytes)) {
        qCWarning(lcFile) << Q_FUNC_INFO << "Unable to set" << name;
        return false;
    }
    emit environmentChanged();
    return true;
}

bool Environment::remove(const QString &name)
{
    if (!isValidName(name, Q_FUNC_INFO))
        return false;
    const QByteArray key = QFile::encodeName(name);
    if (!qEnvironmentVariableIsSet(key.constData()))
        return true;
    if (!qunsetenv(key.constData())) {
        qCWarning(lcFile) << Q_FUNC_INFO << "Unable to unset" << name;
        return false;
    }
    emit environmentChanged();
    return true;
}
