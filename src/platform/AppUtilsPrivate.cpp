#include "AppUtilsPrivate.h"
#include "AppUtilsLinux.h"

AppUtilsPrivate::AppUtilsPrivate(QObject *parent)
    : QObject(parent)
{
}

AppUtilsPrivate *AppUtilsPrivate::create(QObject *parent)
{
    return new AppUtilsLinux(parent);
}
