#ifndef ZIPWRITER_H
#define ZIPWRITER_H

#include "LoomkitObject.h"

#include <QByteArray>

#include <zip.h>

// Adds files to a zip archive, one call a file. Each call opens the
// archive, adds the entry and closes it again, so that the file on disk is
// a complete archive between calls.
class ZipWriter : public LoomkitObject
{
    Q_OBJECT

    Q_PROPERTY(QString path READ path WRITE setPath NOTIFY pathChanged)

public:
    explicit ZipWriter(QObject *parent = nullptr);
    ~ZipWriter() override;

    QString path() const { return m_path; }
    void setPath(const QString &path);

    Q_INVOKABLE void close();
    Q_INVOKABLE bool addFile(const QString &filePath, const QString &archivedFilePath, const QString &comment,
                             bool append);
    Q_INVOKABLE bool addFile(const QString &filePath, const QString &archivedFilePath, const QString &comment);
    Q_INVOKABLE bool addFile(const QString &filePath, const QString &archivedFilePath);
    Q_INVOKABLE bool addFile(const QString &filePath);

signals:
    void pathChanged();

private:
    bool zwOpen(const QString &path, bool append);
    void zwClose();
    bool zwAddFile(const QString &filePath, const QString &archivedFilePath, const QString &comment, bool cleanPath);

    QString m_path;
    zipFile m_zipFile = nullptr;
    QByteArray m_buffer;
};

#endif // ZIPWRITER_H
