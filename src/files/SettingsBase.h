#ifndef SETTINGSBASE_H
#define SETTINGSBASE_H

#include <QSettings>

// QSettings as QML sees it: the store's file and a way to flush it.
class SettingsBase : public QSettings
{
    Q_OBJECT

    Q_PROPERTY(QString path READ path CONSTANT)

public:
    explicit SettingsBase(QObject *parent = nullptr);
    SettingsBase(const QString &fileName, QSettings::Format format, QObject *parent = nullptr);

    QString path() const;

    Q_INVOKABLE void synchronize();
};

#endif // SETTINGSBASE_H
