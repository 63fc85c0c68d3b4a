#ifndef NETWORKFORMDATA_H
#define NETWORKFORMDATA_H

#include <QIODevice>
#include <QList>

class NetworkFilePart;
class QBuffer;
class QFile;

// A multipart body as a chain of devices: blocks of bytes in memory and
// files read as the network pulls them. It can be rewound, so that a
// re-sent request reads the files again.
class NetworkFormData : public QIODevice
{
    Q_OBJECT

public:
    explicit NetworkFormData(QObject *parent = nullptr);
    ~NetworkFormData() override;

    bool appendData(const QByteArray &data);
    bool appendPath(const QString &path, qint64 offset = 0, qint64 size = -1);
    void clear();

    bool isAborted() const;
    void setAborted(bool aborted);

    bool isSequential() const override;
    qint64 pos() const override;
    qint64 size() const override;
    bool seek(qint64 position) override;

signals:
    void readProgress(double progress);

protected:
    qint64 readData(char *data, qint64 maxlen) override;
    qint64 writeData(const char *data, qint64 len) override;

private:
    void emitProgress(qint64 total);

    QList<QIODevice *> m_sequence;
    QList<QBuffer *> m_buffers;
    QList<QFile *> m_files;
    QList<NetworkFilePart *> m_fileParts;
    QList<QByteArray *> m_byteArrays;
    qint64 m_currentIndex = 0;
    qint64 m_bytesRead = 0;
    bool m_aborted = false;
};

#endif // NETWORKFORMDATA_H
