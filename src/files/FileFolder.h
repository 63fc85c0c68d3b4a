#ifndef FILEFOLDER_H
#define FILEFOLDER_H

#include "LoomkitObject.h"

#include <QDir>
#include <QString>
#include <QStringList>
#include <QUrl>
#include <QVariant>
#include <QVariantMap>

class File;
class FileInfo;
class QIODevice;

// QML's handle on one folder: listing, making and removing folders, reading
// and writing whole files, and moving files to the trash.
class FileFolder : public LoomkitObject
{
    Q_OBJECT

    Q_PROPERTY(QString path READ path WRITE setPath NOTIFY pathChanged)
    Q_PROPERTY(QUrl url READ url WRITE setUrl NOTIFY pathChanged)
    Q_PROPERTY(bool exists READ exists NOTIFY existsChanged)
    Q_PROPERTY(QString folderName READ folderName NOTIFY pathChanged)
    Q_PROPERTY(qlonglong size READ size NOTIFY sizeChanged)
    Q_PROPERTY(QChar separator READ separator CONSTANT)
    Q_PROPERTY(QChar listSeparator READ listSeparator CONSTANT)

public:
    explicit FileFolder(QObject *parent = nullptr);
    FileFolder(const QDir &dir, QObject *parent = nullptr);
    FileFolder(const QString &path, QObject *parent = nullptr);
    FileFolder(const QUrl &url, QObject *parent = nullptr);
    ~FileFolder() override;

    QString path() const;
    void setPath(const QString &path);
    QUrl url() const;
    void setUrl(const QUrl &url);
    bool exists() const;
    QString folderName() const;
    qlonglong size();
    QChar separator() const;
    QChar listSeparator() const;

    // Set by the owner that hands the folder out; not reachable from QML.
    bool isConstant() const { return m_constant; }
    void setConstant(bool constant) { m_constant = constant; }
    bool isReadOnly() const { return m_readOnly; }
    void setReadOnly(bool readOnly) { m_readOnly = readOnly; }

    const QDir &dir() const { return m_dir; }

    // Writes bytes over a file (truncating it), without making missing
    // folders. True when every byte was written.
    static bool writeFileData(const QString &filePath, const QByteArray &data);
    // Reads a regular file whole; anything else (missing, fifo, device,
    // folder) gives an empty array and, if ok is given, false.
    static QByteArray readFileData(const QString &filePath, bool *ok = nullptr);

    Q_INVOKABLE bool cdUp();
    Q_INVOKABLE bool cd(const QString &path);

    Q_INVOKABLE QStringList fileNames(const QVariant &nameFilter, bool subFolders);
    Q_INVOKABLE QStringList fileNames(const QVariant &nameFilter);
    Q_INVOKABLE QStringList fileNames();
    Q_INVOKABLE QStringList folderNames(const QVariant &nameFilter, bool subFolders);
    Q_INVOKABLE QStringList folderNames(const QVariant &nameFilter);
    Q_INVOKABLE QStringList folderNames();

    Q_INVOKABLE bool makeFolder();
    Q_INVOKABLE bool removeFolder();
    Q_INVOKABLE bool removeFolder(const QString &folderName, bool recursive);
    Q_INVOKABLE bool removeFolder(const QString &folderName);
    Q_INVOKABLE bool makePath(const QString &path);
    Q_INVOKABLE bool removePath(const QString &path);

    Q_INVOKABLE QString filePath(const QString &fileName) const;
    Q_INVOKABLE QString relativeFilePath(const QString &fileName) const;
    Q_INVOKABLE QUrl fileUrl(const QString &fileName) const;
    Q_INVOKABLE bool fileExists(const QString &fileName) const;
    Q_INVOKABLE bool removeFile(const QString &fileName);
    Q_INVOKABLE bool renameFile(const QString &oldFileName, const QString &newFileName);
    Q_INVOKABLE bool copyFile(const QString &fileName, const QString &filePath);

    Q_INVOKABLE File *file(const QString &fileName);
    Q_INVOKABLE FileInfo *fileInfo(const QString &fileName);
    Q_INVOKABLE FileFolder *folder(const QString &folderName);

    Q_INVOKABLE QVariant readFile(const QString &fileName, const QVariantMap &options);
    Q_INVOKABLE QVariant readFile(const QString &fileName);
    Q_INVOKABLE bool writeFile(const QString &fileName, const QVariant &content, const QVariantMap &options);
    Q_INVOKABLE bool writeFile(const QString &fileName, const QVariant &content);
    Q_INVOKABLE QVariantMap readJsonFile(const QString &fileName);
    Q_INVOKABLE bool writeJsonFile(const QString &fileName, const QVariantMap &json);
    Q_INVOKABLE QString readTextFile(const QString &fileName);
    Q_INVOKABLE bool writeTextFile(const QString &fileName, const QString &text);

    Q_INVOKABLE void refresh();
    Q_INVOKABLE QVariant moveFileToTrash(const QString &fileName);
    Q_INVOKABLE void moveFileToTrashAsync(const QString &fileName);

    Q_INVOKABLE QString toNativeSeparators(const QString &pathName) const;
    Q_INVOKABLE QString fromNativeSeparators(const QString &pathName) const;

signals:
    void pathChanged();
    void existsChanged();
    void sizeChanged();
    void movedFileToTrash(const QString &originalFile, const QVariant &pathInTrash = QVariant(),
                          const QString &error = QString());

private slots:
    void onPathChanged();

private:
    void connectSignals();
    void changePath(const QString &resolved);
    bool checkConstant(const char *function) const;
    bool checkReadOnly(const char *function) const;
    QStringList entryNames(const QVariant &nameFilter, bool subFolders, QDir::Filters filters) const;
    bool writeDevice(const QString &filePath, QIODevice *device) const;
    static bool copyFolder(const QString &source, const QString &target, QStringList *chain);

    QString m_path;
    QDir m_dir;
    bool m_constant = false;
    bool m_readOnly = false;
    qint64 m_size = -1;
    QString m_error;
};

#endif // FILEFOLDER_H
