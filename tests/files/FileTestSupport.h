#ifndef FILETESTSUPPORT_H
#define FILETESTSUPPORT_H

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QRegularExpression>
#include <QtTest>

#include <sys/stat.h>

// Small helpers shared by the file and storage tests.
namespace FileTestSupport {

// Writes the bytes, making the folders on the way.
inline bool writeBytes(const QString &path, const QByteArray &bytes)
{
    QDir().mkpath(QFileInfo(path).absolutePath());
    QFile file(path);
    return file.open(QIODevice::WriteOnly) && file.write(bytes) == bytes.size();
}

inline QByteArray contents(const QString &path)
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray("<unreadable>");
}

inline bool makeFifo(const QString &path)
{
    return ::mkfifo(QFile::encodeName(path).constData(), 0600) == 0;
}

// True, so that it can lead a check: QVERIFY(expectWarning("...") && !call()).
inline bool expectWarning(const char *pattern, QtMsgType type = QtWarningMsg)
{
    QTest::ignoreMessage(type, QRegularExpression(QString::fromUtf8(pattern)));
    return true;
}

} // namespace FileTestSupport

#endif // FILETESTSUPPORT_H
