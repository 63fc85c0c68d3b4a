#ifndef ENVIRONMENT_H
#define ENVIRONMENT_H

#include <QObject>
#include <QString>
#include <QStringList>
#include <QVariant>
#include <QVariantMap>

// The process environment, for QML: read, list, test, set and unset
// variables. Changes affect this process and the processes it starts.
class Environment : public QObject
{
    Q_OBJECT

    Q_PROPERTY(QStringList names READ names NOTIFY environmentChanged)
    Q_PROPERTY(QVariantMap values READ values NOTIFY environmentChanged)

public:
    explicit Environment(QObject *parent = nullptr);

    QStringList names() const;
    QVariantMap values() const;

    Q_INVOKABLE QString value(const QString &name, const QString &defaultValue) const;
    Q_INVOKABLE QString value(const QString &name) const;
    Q_INVOKABLE bool contains(const QString &name) const;
    Q_INVOKABLE bool setValue(const QString &name, const QString &value);
    Q_INVOKABLE bool remove(const QString &name);

signals:
    void environmentChanged();

private:
    static bool isValidName(const QString &name, const char *function);
};

#endif // ENVIRONMENT_H
