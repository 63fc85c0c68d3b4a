#include "SettingsBase.h"

SettingsBase::SettingsBase(QObject *parent)
    : QSettings(parent)
{
}

SettingsBase::SettingsBase(const QString &fileName, QSettings::Format format, QObject *parent)
    : QSettings(fileName, format, parent)
{
}

QString SettingsBase::path() const
{
    return fileName();
}

void SettingsBase::synchronize()
{
    sync();
}
