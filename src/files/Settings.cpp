#include "Settings.h"
#include "JsonUtility.h"
#include "LoomkitLogging.h"

#include <QIODevice>
#include <QJSValue>
#include <QMetaMethod>
#include <QMetaProperty>
#include <QRandomGenerator>

namespace {

bool isBlankString(const QVariant &value)
{
    return value.userType() == QMetaType::QString && value.toString().trimmed().isEmpty();
}

// Integers beyond 2^53 that QJsonDocument would write through a double.
bool isWideInteger(const QVariant &value)
{
    constexpr qint64 exact = qint64(1) << 53;
    switch (value.userType()) {
    case QMetaType::LongLong:
    case QMetaType::Long: {
        const qint64 n = value.toLongLong();
        return n > exact || n < -exact;
    }
    case QMetaType::ULongLong:
    case QMetaType::ULong:
        return value.toULongLong() > quint64(exact);
    default:
        return false;
    }
}

// Swaps each wide integer for a marker string, prefix + index + "\x01",
// noting its digits. Returns false if any text holds the prefix itself.
bool markWideIntegers(QVariant &value, const QString &prefix, QStringList &digits)
{
    switch (value.userType()) {
    case QMetaType::QVariantMap: {
        QVariantMap map = value.toMap();
        for (auto it = map.begin(); it != map.end(); ++it) {
            if (it.key().contains(prefix) || !markWideIntegers(it.value(), prefix, digits))
                return false;
        }
        value = map;
        return true;
    }
    case QMetaType::QVariantList: {
        QVariantList list = value.toList();
        for (QVariant &element : list) {
            if (!markWideIntegers(element, prefix, digits))
                return false;
        }
        value = list;
        return true;
    }
    case QMetaType::QString:
        return !value.toString().contains(prefix);
    case QMetaType::QStringList:
        return !value.toStringList().join(QChar(1)).contains(prefix);
    default:
        if (isWideInteger(value)) {
            digits.append(value.userType() == QMetaType::ULongLong || value.userType() == QMetaType::ULong
                              ? QString::number(value.toULongLong()) : QString::number(value.toLongLong()));
            value = QString(prefix + QString::number(digits.size() - 1) + QChar(1));
        }
        return true;
    }
}

// JSON text of the store. QJsonDocument writes integers through a double,
// which would change every integer beyond 2^53 in the file at each save;
// those are written with all their digits instead, by way of marker strings
// with a random prefix that no text in the store contains.
QByteArray settingsJson(const QSettings::SettingsMap &map)
{
    for (int attempt = 0; attempt < 8; ++attempt) {
        const QString nonce = QString::number(QRandomGenerator::global()->generate64(), 36);
        const QString prefix = QChar(1) + nonce + QLatin1Char(':');
        QVariant marked(map);
        QStringList digits;
        if (!markWideIntegers(marked, prefix, digits))
            continue;
        if (digits.isEmpty())
            break;
        QByteArray json = JsonUtility::toJson(marked.toMap());
        const QByteArray escapedPrefix = "\"\\u0001" + nonce.toLatin1() + ':';
        for (int i = 0; i < digits.size(); ++i)
            json.replace(escapedPrefix + QByteArray::number(i) + "\\u0001\"", digits.at(i).toLatin1());
        return json;
    }
    return JsonUtility::toJson(map);
}

QString colorText(const QColor &color)
{
    return color.alpha() >= 255 ? color.name(QColor::HexRgb) : color.name(QColor::HexArgb);
}

// What a bound property stores: script values as plain variants, colours
// as text so that every format keeps them readable and exact.
QVariant storable(const QVariant &value)
{
    if (value.userType() == qMetaTypeId<QJSValue>())
        return value.value<QJSValue>().toVariant();
    if (value.userType() == QMetaType::QColor) {
        const QColor color = value.value<QColor>();
        return color.isValid() ? QVariant(colorText(color)) : QVariant();
    }
    return value;
}

} // namespace

Settings::Settings(QObject *parent)
    : SettingsBase(parent)
{
}

Settings::Settings(const QString &fileName, QSettings::Format format, QObject *parent)
    : SettingsBase(fileName, format, parent)
{
}

bool Settings::readJson(QIODevice &device, QSettings::SettingsMap &map)
{
    // An empty or damaged file is an empty store, not an error.
    map = JsonUtility::fromString(QString::fromUtf8(device.readAll()));
    return true;
}

bool Settings::writeJson(QIODevice &device, const QSettings::SettingsMap &map)
{
    const QByteArray json = settingsJson(map);
    return device.write(json) >= json.size();
}

QSettings::Format Settings::jsonFormat()
{
    static QSettings::Format format = QSettings::InvalidFormat;
    if (format <= QSettings::InvalidFormat)
        format = QSettings::registerFormat(QStringLiteral("json"), readJson, writeJson, Qt::CaseSensitive);
    qCDebug(lcFile) << Q_FUNC_INFO << "Format" << format;
    return format;
}

void Settings::setFallbacks(bool enabled)
{
    if (enabled == fallbacksEnabled())
        return;
    QSettings::setFallbacksEnabled(enabled);
    emit fallbacksEnabledChanged();
}

QVariant Settings::value(const QString &key, const QVariant &defaultValue) const
{
    const QVariant stored = QSettings::value(key);
    if (!stored.isValid() || stored.isNull() || isBlankString(stored))
        return defaultValue;
    return stored;
}

QVariant Settings::value(const QString &key) const
{
    return value(key, QVariant());
}

void Settings::setValue(const QString &key, const QVariant &value, const QVariant &defaultValue)
{
    if (!value.isValid() || value.isNull() || (!defaultValue.isNull() && defaultValue == value)
        || isBlankString(value)) {
        QSettings::remove(key);
        if (m_autoSync)
            sync();
        return;
    }
    QSettings::setValue(key, value);
    emit valueChanged(key);
    if (m_autoSync)
        sync();
}

void Settings::setValue(const QString &key, const QVariant &value)
{
    setValue(key, value, QVariant());
}

QColor Settings::colorValue(const QString &key, const QColor &defaultValue) const
{
    return value(key, QVariant(defaultValue)).value<QColor>();
}

QColor Settings::colorValue(const QString &key) const
{
    return colorValue(key, QColor());
}

void Settings::setColorValue(const QString &key, const QColor &value)
{
    // An invalid colour has no text worth keeping: it clears the key.
    setValue(key, value.isValid() ? QVariant(colorText(value)) : QVariant(), QVariant());
}

bool Settings::boolValue(const QString &key, bool defaultValue) const
{
    return value(key, defaultValue).toBool();
}

bool Settings::boolValue(const QString &key) const
{
    return boolValue(key, false);
}

double Settings::numberValue(const QString &key, double defaultValue) const
{
    return value(key, defaultValue).toDouble();
}

double Settings::numberValue(const QString &key) const
{
    return numberValue(key, 0);
}

void Settings::remove(const QString &key)
{
    QSettings::remove(key);
    if (m_autoSync)
        sync();
}

bool Settings::contains(const QString &key) const
{
    return QSettings::contains(key);
}

void Settings::classBegin()
{
    qCDebug(lcFile) << Q_FUNC_INFO;
}

void Settings::componentComplete()
{
    qCDebug(lcFile) << Q_FUNC_INFO;
    connectProperties();
    readProperties();
}

// Properties declared beyond this class: those of the QML element, however
// many QML types lie between it and Settings.
int Settings::firstBoundProperty() const
{
    return Settings::staticMetaObject.propertyCount();
}

void Settings::connectProperties()
{
    const QMetaObject *meta = metaObject();
    const int slot = Settings::staticMetaObject.indexOfSlot("onPropertyChanged()");
    for (int i = firstBoundProperty(); i < meta->propertyCount(); ++i) {
        const QMetaProperty property = meta->property(i);
        if (!property.hasNotifySignal())
            continue;
        qCDebug(lcFile) << Q_FUNC_INFO << property.name();
        QMetaObject::connect(this, property.notifySignalIndex(), this, slot);
    }
}

void Settings::readProperties()
{
    const QMetaObject *meta = metaObject();
    for (int i = firstBoundProperty(); i < meta->propertyCount(); ++i) {
        const QMetaProperty property = meta->property(i);
        const QString name = QString::fromLatin1(property.name());
        QVariant current = property.read(this);
        if (current.userType() == qMetaTypeId<QJSValue>())
            current = current.value<QJSValue>().toVariant();

        const QVariant loaded = value(name, current);
        if (!loaded.isNull()) {
            if (!current.isValid())
                property.write(this, loaded);
            else if (loaded.canConvert(current.userType()) && loaded != current)
                property.write(this, loaded);
        }

        if (!QSettings::contains(name) && current.isValid())
            setValue(name, storable(current), QVariant());
    }
}

void Settings::onPropertyChanged()
{
    QObject *object = sender();
    const int index = senderSignalIndex();
    if (!object || index < 0)
        return;
    QByteArray name = object->metaObject()->method(index).name();
    name.chop(7); // "Changed"
    setValue(QString::fromLatin1(name), storable(object->property(name.constData())), QVariant());
}
