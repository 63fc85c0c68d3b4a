#ifndef ZIPFILEINFO_H
#define ZIPFILEINFO_H

#include "LoomkitObject.h"

#include <QDateTime>
#include <QFileInfo>

#include <unzip.h>

// Read-only description of one archive entry, as ZipReader::fileInfo gives it.
class ZipFileInfo : public LoomkitObject
{
    Q_OBJECT

    Q_PROPERTY(QString filePath READ filePath NOTIFY filePathChanged)
    Q_PROPERTY(qlonglong size READ size NOTIFY filePathChanged)
    Q_PROPERTY(qlonglong compressedSize READ compressedSize NOTIFY filePathChanged)
    Q_PROPERTY(QString path READ path NOTIFY filePathChanged)
    Q_PROPERTY(QString fileName READ fileName NOTIFY filePathChanged)
    Q_PROPERTY(QString suffix READ suffix NOTIFY filePathChanged)
    Q_PROPERTY(QDateTime lastModified READ lastModified NOTIFY filePathChanged)
    Q_PROPERTY(ulong crc READ crc NOTIFY filePathChanged)

public:
    explicit ZipFileInfo(QObject *parent = nullptr);
    ZipFileInfo(const QString &fileName, const unz_file_info64 &info, QObject *parent = nullptr);

    QString filePath() const { return m_fileInfo.filePath(); }
    qlonglong size() const { return qlonglong(m_info.uncompressed_size); }
    qlonglong compressedSize() const { return qlonglong(m_info.compressed_size); }
    QString path() const { return m_fileInfo.path(); }
    QString fileName() const { return m_fileInfo.fileName(); }
    QString suffix() const { return m_fileInfo.suffix(); }
    QDateTime lastModified() const;
    ulong crc() const { return ulong(m_info.crc); }

signals:
    void filePathChanged();

private:
    QFileInfo m_fileInfo;
    unz_file_info64 m_info;
};

#endif // ZIPFILEINFO_H
