#ifndef APPUTILSPRIVATE_H
#define APPUTILSPRIVATE_H

#include <QObject>
#include <QString>
#include <QStringList>
#include <QUrl>
#include <QVariantMap>

// Platform services behind the singleton: opening URLs, checks for installed
// applications, and facts about the machine. One subclass per platform.
class AppUtilsPrivate : public QObject
{
    Q_OBJECT

public:
    static AppUtilsPrivate *create(QObject *parent);

    virtual QString osName() const = 0;
    virtual bool openUrlExternally(const QUrl &url) = 0;
    virtual bool isAppInstalled(const QString &appIdentifier) const = 0;
    virtual QString model() const = 0;
    virtual QString manufacturer() const = 0;
    virtual QString family() const = 0;
    virtual QVariantMap processorInformation() const = 0;

protected:
    explicit AppUtilsPrivate(QObject *parent = nullptr);
};

#endif // APPUTILSPRIVATE_H
