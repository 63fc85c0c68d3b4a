#ifndef SETTINGS_H
#define SETTINGS_H

#include "SettingsBase.h"

#include <QColor>
#include <QQmlParserStatus>
#include <QVariant>

// A settings store for QML. Blank text and values equal to their default are
// not stored. Properties declared on a Settings element in QML load from the
// store when the element completes and are saved whenever they change.
class Settings : public SettingsBase, public QQmlParserStatus
{
    Q_OBJECT
    Q_INTERFACES(QQmlParserStatus)

    Q_PROPERTY(bool fallbacksEnabled READ fallbacksEnabled WRITE setFallbacks NOTIFY fallbacksEnabledChanged)

public:
    // The application's default store.
    explicit Settings(QObject *parent = nullptr);
    Settings(const QString &fileName, QSettings::Format format, QObject *parent = nullptr);

    // The "json" format: one JSON object whose keys are the settings keys.
    static QSettings::Format jsonFormat();
    // The format's read and write functions.
    static bool readJson(QIODevice &device, QSettings::SettingsMap &map);
    static bool writeJson(QIODevice &device, const QSettings::SettingsMap &map);

    // When set, each change is written to disk at once.
    bool autoSync() const { return m_autoSync; }
    void setAutoSync(bool autoSync) { m_autoSync = autoSync; }

    void setFallbacks(bool enabled);

    Q_INVOKABLE QVariant value(const QString &key, const QVariant &defaultValue) const;
    Q_INVOKABLE QVariant value(const QString &key) const;
    Q_INVOKABLE void setValue(const QString &key, const QVariant &value, const QVariant &defaultValue);
    Q_INVOKABLE void setValue(const QString &key, const QVariant &value);
    Q_INVOKABLE QColor colorValue(const QString &key, const QColor &defaultValue) const;
    Q_INVOKABLE QColor colorValue(const QString &key) const;
    Q_INVOKABLE void setColorValue(const QString &key, const QColor &value);
    Q_INVOKABLE bool boolValue(const QString &key, bool defaultValue) const;
    Q_INVOKABLE bool boolValue(const QString &key) const;
    Q_INVOKABLE double numberValue(const QString &key, double defaultValue) const;
    Q_INVOKABLE double numberValue(const QString &key) const;
    Q_INVOKABLE void remove(const QString &key);
    Q_INVOKABLE bool contains(const QString &key) const;

    void classBegin() override;
    void componentComplete() override;

signals:
    void valueChanged(const QString &key);
    void fallbacksEnabledChanged();

private slots:
    void onPropertyChanged();

private:
    void connectProperties();
    void readProperties();
    int firstBoundProperty() const;

    QString m_path;
    bool m_autoSync = false;
};

#endif // SETTINGS_H
