#ifndef ZIPREADER_H
#define ZIPREADER_H

#include "LoomkitObject.h"

#include <QDateTime>
#include <QDir>
#include <QStringList>
#include <QVariantMap>

#include <unzip.h>

class ZipExtractTarget;
class ZipFileInfo;

// Reads a zip archive: lists it, extracts entries with progress, and reads
// single entries into memory. The archive opens on first use and stays open
// until close(), refresh(), a new path or destruction.
class ZipReader : public LoomkitObject
{
    Q_OBJECT

    Q_PROPERTY(QString path READ path WRITE setPath NOTIFY pathChanged)
    Q_PROPERTY(bool caseSensitive READ caseSensitive WRITE setCaseSensitive NOTIFY caseSensitiveChanged)
    Q_PROPERTY(bool isOpen READ isOpen NOTIFY pathChanged)
    Q_PROPERTY(QStringList fileNames READ fileNames NOTIFY fileNamesChanged)
    Q_PROPERTY(QStringList folderNames READ folderNames NOTIFY folderNamesChanged)

public:
    enum Result {
        EndOfListOfFile = UNZ_END_OF_LIST_OF_FILE,
        ErrNo = UNZ_ERRNO,
        EndOfFile = UNZ_EOF,
        ParameterError = UNZ_PARAMERROR,
        BadZipFile = UNZ_BADZIPFILE,
        InternalError = UNZ_INTERNALERROR,
        CrcError = UNZ_CRCERROR
    };
    Q_ENUM(Result)

    explicit ZipReader(QObject *parent = nullptr);
    ~ZipReader() override;

    QString path() const { return m_path; }
    void setPath(const QString &path);

    bool caseSensitive() const { return m_caseSensitive; }
    void setCaseSensitive(bool caseSensitive);

    bool isOpen() const { return m_zipFile != nullptr; }
    QStringList fileNames();
    QStringList folderNames();

    Q_INVOKABLE void close();
    Q_INVOKABLE bool exists(const QString &fileName);
    Q_INVOKABLE ZipFileInfo *fileInfo(const QString &fileName);
    Q_INVOKABLE bool extractFile(const QString &fileName, const QString &outputFilePath);
    Q_INVOKABLE bool extractAll(const QString &outputPath, const QString &basePath);
    Q_INVOKABLE bool extractAll(const QString &outputPath);
    Q_INVOKABLE void refresh();
    Q_INVOKABLE QString readTextFile(const QString &fileName);
    Q_INVOKABLE QVariantMap readJsonFile(const QString &fileName);

signals:
    void pathChanged();
    void caseSensitiveChanged();
    void fileNamesChanged();
    void folderNamesChanged();
    void error(const QString &fileName, const QString &outputFileName, ZipReader::Result result);
    void progress(const QString &fileName, const QString &outputFileName, double percent);
    void completed();

private:
    enum ListFlag { ListFolders = 1, ListFiles = 2 };

    bool zrOpen();
    void closeHandle();
    bool gotoFirstFile();
    bool gotoNextFile();
    bool locateFile(const QString &fileName, int caseSensitivity);
    QString currentFileName();
    QDateTime currentFileDateTime();
    unz_file_info64 currentFileInfo();
    bool extractCurrentFile(QString outputFile);
    bool extractAll(QDir &dir, const QString &basePath);
    QByteArray readFile();
    QStringList names(int flags);
    int locateSensitivity() const;

    // One entry's extraction, given its name and record already read. The
    // file is written at outputFile; signals carry shownFile.
    bool extractEntry(const QString &name, const unz_file_info64 &info, const QString &outputFile,
                      const QString &shownFile, bool noFollow);

    QString m_path;
    unzFile m_zipFile = nullptr;
    bool m_caseSensitive = false;
    // Chunk size of extraction. Large, so that few calls move many bytes.
    qint32 m_bufferSize;
    QByteArray m_buffer;
};

#endif // ZIPREADER_H
