#ifndef UNZIPFILE_H
#define UNZIPFILE_H

#include <QByteArray>
#include <QDateTime>
#include <QDir>
#include <QObject>
#include <QStringList>

#include <unzip.h>

// Unpacks a whole archive without telling script anything; package
// unpacking uses it. Entries that would land outside the output folder are
// skipped and logged.
class UnZipFile : public QObject
{
    Q_OBJECT

public:
    explicit UnZipFile(QObject *parent = nullptr);
    ~UnZipFile() override;

    bool open(const QString &path);
    void close();
    bool isOpen() const { return m_zipFile != nullptr; }

    QStringList fileNames();
    bool extractAll(QDir &dir);
    bool extractCurrentFile(const QString &outputFile);

    bool gotoFirstFile();
    bool gotoNextFile();
    QString currentFileName();
    QDateTime currentFileDateTime();

private:
    bool extractEntry(const QString &name, const unz_file_info64 &info, const QString &outputFile, bool noFollow);

    unzFile m_zipFile = nullptr;
    QByteArray m_buffer;
};

#endif // UNZIPFILE_H
