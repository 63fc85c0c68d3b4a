#include "PropertySet.h"
#include "LoomkitLogging.h"

#include <QJSValue>
#include <QMetaMethod>
#include <QMetaProperty>
#include <QRegularExpression>

namespace {

// Variants of different types can hold the same value (1 and "1" are not
// the same here, 1 and 1.0 are); compare as QML's strict equality would.
bool sameValue(const QVariant &a, const QVariant &b)
{
    if (a.isValid() != b.isValid())
        return false;
    if (!a.isValid())
        return true;
    const bool aIsString = a.userType() == QMetaType::QString;
    const bool bIsString = b.userType() == QMetaType::QString;
    if (aIsString != bIsString)
        return false;
    return a == b;
}

} // namespace

PropertySet::PropertySet(QObject *parent)
    : QQmlPropertyMap(this, parent)
    , m_typeMetaObject(&PropertySet::staticMetaObject)
{
    init();
}

void PropertySet::init()
{
    connect(this, &QQmlPropertyMap::valueChanged, this, &PropertySet::jsonChanged);
}

bool PropertySet::isValidKey(const QString &key)
{
    return !key.isEmpty();
}

bool PropertySet::isMemberName(const QString &key) const
{
    // A key named like a property or method would shadow it in QML.
    const QMetaObject *mo = m_typeMetaObject;
    while (mo && mo != &QQmlPropertyMap::staticMetaObject) {
        const QByteArray name = key.toUtf8();
        if (mo->indexOfProperty(name.constData()) >= 0)
            return true;
        for (int i = mo->methodOffset(); i < mo->methodCount(); ++i) {
            if (mo->method(i).name() == name)
                return true;
        }
        mo = mo->superClass();
    }
    // What QQmlPropertyMap and QObject show to QML.
    static const QStringList reserved = { QStringLiteral("objectName"), QStringLiteral("objectNameChanged"),
                                          QStringLiteral("valueChanged"), QStringLiteral("destroyed"),
                                          QStringLiteral("deleteLater") };
    return reserved.contains(key);
}

QVariantMap PropertySet::json() const
{
    QVariantMap map;
    const QStringList names = keys();
    for (const QString &key : names)
        map.insert(key, QQmlPropertyMap::value(key));
    return map;
}

void PropertySet::setJson(const QVariantMap &json)
{
    const QStringList names = keys();
    for (const QString &key : names) {
        if (!json.contains(key))
            clear(key);
    }
    for (auto it = json.cbegin(); it != json.cend(); ++it)
        setValue(it.key(), it.value());
}

QStringList PropertySet::keys() const
{
    QStringList result;
    const QStringList all = QQmlPropertyMap::keys();
    for (const QString &key : all) {
        if (QQmlPropertyMap::value(key).isValid())
            result.append(key);
    }
    return result;
}

QVariant PropertySet::value(const QString &key) const
{
    return QQmlPropertyMap::value(key);
}

QVariant PropertySet::value(const QString &key, const QVariant &defaultValue) const
{
    const QVariant result = QQmlPropertyMap::value(key);
    return result.isValid() ? result : defaultValue;
}

bool PropertySet::setValue(const QString &key, const QVariant &value)
{
    if (!isValidKey(key) || isMemberName(key)) {
        qCWarning(lcFile) << Q_FUNC_INFO << "Invalid key:" << key;
        return false;
    }
    QVariant stored = value;
    // A JS value is stored as the plain data it stands for.
    if (stored.userType() == qMetaTypeId<QJSValue>())
        stored = stored.value<QJSValue>().toVariant();
    if (sameValue(QQmlPropertyMap::value(key), stored))
        return false;
    insert(key, stored);
    emit valueChanged(key, stored);
    return true;
}

void PropertySet::clear()
{
    const QStringList names = keys();
    for (const QString &key : names)
        clear(key);
}

void PropertySet::clear(const QString &key)
{
    // The underlying map cannot drop a key; an invalid value stands for none.
    if (!QQmlPropertyMap::value(key).isValid())
        return;
    QQmlPropertyMap::clear(key);
    emit valueChanged(key, QVariant());
}

bool PropertySet::containsKey(const QString &key) const
{
    return QQmlPropertyMap::value(key).isValid();
}

bool PropertySet::containsValue(const QVariant &value) const
{
    QVariant wanted = value;
    if (wanted.userType() == qMetaTypeId<QJSValue>())
        wanted = wanted.value<QJSValue>().toVariant();
    const QStringList names = keys();
    for (const QString &key : names) {
        if (sameValue(QQmlPropertyMap::value(key), wanted))
            return true;
    }
    return false;
}

QString PropertySet::replaceVariables(const QString &text) const
{
    // ${key} takes the key's value as text; unknown keys stay as written.
    static const QRegularExpression pattern(QStringLiteral("\\$\\{([^}]+)\\}"));
    QString result;
    int last = 0;
    auto it = pattern.globalMatch(text);
    while (it.hasNext()) {
        const QRegularExpressionMatch match = it.next();
        result += text.midRef(last, match.capturedStart() - last);
        const QVariant replacement = QQmlPropertyMap::value(match.captured(1));
        if (replacement.isValid())
            result += replacement.toString();
        else
            result += match.captured(0);
        last = match.capturedEnd();
    }
    result += text.midRef(last);
    return result;
}

QVariant PropertySet::updateValue(const QString &key, const QVariant &input)
{
    Q_UNUSED(key)
    if (input.userType() == qMetaTypeId<QJSValue>())
        return input.value<QJSValue>().toVariant();
    return input;
}
