#ifndef NETWORKFILEPART_H
#define NETWORKFILEPART_H

#include <QIODevice>

// A read-only window on an open file: `size` bytes from `offset`, or to the
// end of the file when size is -1. The file is not owned.
class NetworkFilePart : public QIODevice
{
    Q_OBJECT

public:
    NetworkFilePart(QIODevice *file, qint64 offset, qint64 size, QObject *parent = nullptr);

    bool isSequential() const override;
    qint64 pos() const override;
    qint64 size() const override;
    bool seek(qint64 position) override;

protected:
    qint64 readData(char *data, qint64 maxlen) override;
    qint64 writeData(const char *data, qint64 len) override;

private:
    qint64 end() const;

    QIODevice *m_file = nullptr;
    qint64 m_offset = 0;
    qint64 m_size = -1;
};

#endif // NETWORKFILEPART_H
