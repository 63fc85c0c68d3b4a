#ifndef FILE_H
#define FILE_H

#include "LoomkitObject.h"

#include <QFile>
#include <QJSValue>
#include <QString>
#include <QUrl>
#include <QVariant>

// A stream over one file, for QML: open, read and write bytes or lines of
// text in one of the module's text encodings.
class File : public LoomkitObject
{
    Q_OBJECT

    Q_PROPERTY(QString path READ path WRITE setPath NOTIFY pathChanged)
    Q_PROPERTY(QUrl url READ url WRITE setUrl NOTIFY pathChanged)
    Q_PROPERTY(int openMode READ openMode NOTIFY openModeChanged)
    Q_PROPERTY(bool isReadable READ isReadable NOTIFY openModeChanged)
    Q_PROPERTY(bool isWritable READ isWritable NOTIFY openModeChanged)
    Q_PROPERTY(bool textMode READ textMode WRITE setTextMode NOTIFY openModeChanged)
    Q_PROPERTY(TextEncoding textEncoding READ textEncoding WRITE setTextEncoding NOTIFY textEncodingChanged)
    Q_PROPERTY(int error READ error NOTIFY errorChanged)
    Q_PROPERTY(QString errorString READ errorString NOTIFY errorChanged)
    Q_PROPERTY(qlonglong position READ position WRITE setPosition NOTIFY positionChanged)
    Q_PROPERTY(bool atEnd READ atEnd NOTIFY positionChanged)
    Q_PROPERTY(bool exists READ exists NOTIFY pathChanged)

public:
    enum OpenMode {
        NotOpen = 0,
        OpenModeReadOnly = 1,
        OpenModeWriteOnly = 2,
        OpenModeReadWrite = 3,
        OpenModeAppend = 4,
        OpenModeTruncate = 8,
        OpenModeText = 16,
        OpenModeUnbuffered = 32
    };
    Q_ENUM(OpenMode)

    enum Error {
        NoError = 0,
        ErrorRead = 1,
        ErrorWrite = 2,
        ErrorFatal = 3,
        ErrorResource = 4,
        ErrorOpen = 5,
        ErrorAbort = 6,
        ErrorTimeOut = 7,
        ErrorUnspecified = 8,
        ErrorRemove = 9,
        ErrorRename = 10,
        ErrorPosition = 11,
        ErrorResize = 12,
        ErrorPermissions = 13,
        ErrorCopy = 14
    };
    Q_ENUM(Error)

    // Same values as the module-wide TextEncoding.
    enum TextEncoding {
        TextEncodingUnknown = -1,
        TextEncodingUtf8 = 0,
        TextEncodingLatin1 = 1,
        TextEncodingLocal8Bit = 2,
        TextEncodingUtf16 = 3
    };
    Q_ENUM(TextEncoding)

    explicit File(QObject *parent = nullptr);
    File(const QString &path, QObject *parent = nullptr);
    File(const QUrl &url, QObject *parent = nullptr);
    ~File() override;

    QString path() const;
    void setPath(const QString &path);
    QUrl url() const;
    void setUrl(const QUrl &url);
    int openMode() const;
    bool isReadable() const;
    bool isWritable() const;
    bool textMode() const;
    void setTextMode(bool textMode);
    TextEncoding textEncoding() const;
    void setTextEncoding(TextEncoding textEncoding);
    int error() const;
    QString errorString() const;
    qlonglong position() const;
    void setPosition(qlonglong position);
    bool atEnd() const;
    bool exists() const;

    // The stream itself, for C++ users such as FileFolder::writeFile.
    QIODevice *device() { return &m_file; }

    Q_INVOKABLE bool open(int openMode);
    Q_INVOKABLE bool open();
    Q_INVOKABLE void close();
    Q_INVOKABLE bool flush();
    Q_INVOKABLE bool reset();
    Q_INVOKABLE QString readLine();
    Q_INVOKABLE void writeLine(const QString &text);
    Q_INVOKABLE QVariant read(int length);
    Q_INVOKABLE QVariant readAll();
    Q_INVOKABLE void write(const QJSValue &data);

signals:
    void pathChanged();
    void openModeChanged();
    void errorChanged();
    void positionChanged();
    void textEncodingChanged();

private slots:
    void onBytesWritten(qint64 bytes);

private:
    void connectSignals();
    bool checkOpen(const char *function) const;
    void writeBytes(const QByteArray &bytes);

    QFile m_file;
    QString m_path;
    TextEncoding m_textEncoding = TextEncodingUtf8;
};

#endif // FILE_H
