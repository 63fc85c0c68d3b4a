#include "Settings.h"
#include "JsonUtility.h"
#include "LoomkitLogging.h"

#include <QIODevice>
#include <QJSValue>
#include <QMetaMethod>
#include <QMetaProperty>

namespace {

bool isBlankString(const QVariant &value)
{
    return value.userType() == QMetaType::QString && value.toString().trimmed().isEmpty();
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
    const QByteArray json = JsonUtility::toJson(map);
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
