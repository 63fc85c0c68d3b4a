#ifndef LOOMKITERROR_H
#define LOOMKITERROR_H

#include <QObject>
#include <QString>

// The error record passed by pointer in `error` signals, or held as a
// property by an owner that needs it to outlive the signal.
class LoomkitError : public QObject
{
    Q_OBJECT

    Q_PROPERTY(int code READ code NOTIFY objectChanged)
    Q_PROPERTY(QString message READ message NOTIFY objectChanged)
    Q_PROPERTY(QString details READ details NOTIFY objectChanged)

public:
    explicit LoomkitError(QObject *parent = nullptr);
    LoomkitError(const QString &message, const QString &details, QObject *parent = nullptr);

    int code() const { return m_code; }
    QString message() const { return m_message; }
    QString details() const { return m_details; }

    void clear();
    void assign(const LoomkitError &other);

signals:
    void objectChanged();

private:
    int m_code = 0;
    QString m_message;
    QString m_details;
};

#endif // LOOMKITERROR_H
