#ifndef PROPERTYSET_H
#define PROPERTYSET_H

#include <QQmlPropertyMap>
#include <QStringList>
#include <QVariant>
#include <QVariantMap>

// A keyed set of values that QML reads and writes as properties
// (set.name, set["Any-Key"]). Writes from C++ through setValue() and writes
// from QML both report valueChanged(key, value); QQmlPropertyMap itself
// reports only the latter.
class PropertySet : public QQmlPropertyMap
{
    Q_OBJECT

    Q_PROPERTY(QVariantMap json READ json WRITE setJson NOTIFY jsonChanged)

public:
    explicit PropertySet(QObject *parent = nullptr);

    QVariantMap json() const;
    void setJson(const QVariantMap &json);

    // Keys that hold a value; a cleared key is gone from here.
    Q_INVOKABLE QStringList keys() const;
    Q_INVOKABLE QVariant value(const QString &key) const;
    Q_INVOKABLE QVariant value(const QString &key, const QVariant &defaultValue) const;
    Q_INVOKABLE bool setValue(const QString &key, const QVariant &value);
    Q_INVOKABLE void clear();
    Q_INVOKABLE void clear(const QString &key);
    Q_INVOKABLE bool containsKey(const QString &key) const;
    Q_INVOKABLE bool containsValue(const QVariant &value) const;
    Q_INVOKABLE QString replaceVariables(const QString &text) const;

    static bool isValidKey(const QString &key);

signals:
    void jsonChanged();

protected:
    template <class DerivedType>
    PropertySet(DerivedType *derived, QObject *parent)
        : QQmlPropertyMap(derived, parent)
        , m_typeMetaObject(&DerivedType::staticMetaObject)
    {
        init();
    }

    QVariant updateValue(const QString &key, const QVariant &input) override;

private:
    void init();
    bool isMemberName(const QString &key) const;

    // The class's own meta-object: the dynamic one in front of it makes up
    // a property for any name it is asked about.
    const QMetaObject *m_typeMetaObject = nullptr;
};

#endif // PROPERTYSET_H
