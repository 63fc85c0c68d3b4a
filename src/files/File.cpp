#include "File.h"
#include "FileUtility.h"
#include "LoomkitLogging.h"
#include "StringUtility.h"

#include <QSysInfo>

namespace {

::TextEncoding moduleEncoding(File::TextEncoding encoding)
{
    return ::TextEncoding(int(encoding));
}

} // namespace

File::File(QObject *parent)
    : LoomkitObject(parent)
{
    connectSignals();
}

File::File(const QString &path, QObject *parent)
    : LoomkitObject(parent)
    , m_path(FileUtility::resolvedPath(path, true))
{
    m_file.setFileName(m_path);
    connectSignals();
}

File::File(const QUrl &url, QObject *parent)
    : LoomkitObject(parent)
    , m_path(FileUtility::resolvedPath(url, true))
{
    m_file.setFileName(m_path);
    connectSignals();
}

File::~File()
{
    if (m_file.isOpen()) {
        m_file.close();
        emit openModeChanged();
    }
}

void File::connectSignals()
{
    connect(&m_file, &QIODevice::bytesWritten, this, &File::onBytesWritten);
    connect(this, &File::openModeChanged, this, &File::positionChanged);
}

bool File::checkOpen(const char *function) const
{
    if (m_file.isOpen())
        return true;
    qCWarning(lcFile) << function << "File not open";
    return false;
}

void File::onBytesWritten(qint64 bytes)
{
    Q_UNUSED(bytes)
    emit positionChanged();
}

// Properties

QString File::path() const
{
    return m_file.fileName();
}

void File::setPath(const QString &path)
{
    qCDebug(lcFile) << Q_FUNC_INFO << path;
    if (m_file.isOpen()) {
        qCWarning(lcFile) << Q_FUNC_INFO << "File is open:" << m_file.fileName();
        return;
    }
    const QString resolved = FileUtility::resolvedPath(path, true);
    if (resolved == m_file.fileName())
        return;
    m_path = resolved;
    m_file.setFileName(resolved);
    emit pathChanged();
}

QUrl File::url() const
{
    return FileUtility::pathUrl(m_file.fileName());
}

void File::setUrl(const QUrl &url)
{
    if (url == this->url())
        return;
    setPath(FileUtility::resolvedPath(url, true));
}

int File::openMode() const
{
    return int(m_file.openMode());
}

bool File::isReadable() const
{
    return m_file.isReadable();
}

bool File::isWritable() const
{
    return m_file.isWritable();
}

bool File::textMode() const
{
    return m_file.isTextModeEnabled();
}

void File::setTextMode(bool textMode)
{
    if (textMode == m_file.isTextModeEnabled())
        return;
    // The device keeps the text flag only while it is open.
    if (!checkOpen(Q_FUNC_INFO))
        return;
    m_file.setTextModeEnabled(textMode);
    emit openModeChanged();
}

File::TextEncoding File::textEncoding() const
{
    return m_textEncoding;
}

void File::setTextEncoding(TextEncoding textEncoding)
{
    if (textEncoding == m_textEncoding)
        return;
    m_textEncoding = textEncoding;
    emit textEncodingChanged();
}

int File::error() const
{
    return int(m_file.error());
}

QString File::errorString() const
{
    return m_file.errorString();
}

qlonglong File::position() const
{
    return m_file.pos();
}

void File::setPosition(qlonglong position)
{
    if (!checkOpen(Q_FUNC_INFO))
        return;
    if (position == m_file.pos())
        return;
    if (!m_file.seek(position)) {
        emit errorChanged();
        return;
    }
    emit positionChanged();
}

bool File::atEnd() const
{
    return m_file.atEnd();
}

bool File::exists() const
{
    return m_file.exists();
}

// Methods

bool File::open(int openMode)
{
    if (!m_file.open(QIODevice::OpenMode(openMode))) {
        qCWarning(lcFile) << Q_FUNC_INFO << m_file.fileName() << openMode << m_file.errorString();
        emit errorChanged();
        return false;
    }
    emit pathChanged();
    emit openModeChanged();
    return true;
}

bool File::open()
{
    return open(OpenModeReadOnly | OpenModeText);
}

void File::close()
{
    if (!m_file.isOpen())
        return;
    m_file.close();
    emit openModeChanged();
}

bool File::flush()
{
    if (!m_file.flush()) {
        emit errorChanged();
        return false;
    }
    emit positionChanged();
    return true;
}

bool File::reset()
{
    if (!m_file.reset()) {
        emit errorChanged();
        return false;
    }
    emit positionChanged();
    return true;
}

QString File::readLine()
{
    if (!checkOpen(Q_FUNC_INFO))
        return QString();

    QByteArray line = m_file.readLine();
    if (m_textEncoding == TextEncodingUtf16) {
        // A line feed byte ends a UTF-16 line only as half of the unit 0x000A
        // at a unit boundary; otherwise it belongs to another character.
        const bool littleEndian = QSysInfo::ByteOrder == QSysInfo::LittleEndian;
        for (;;) {
            if (!line.endsWith('\n'))
                break;
            const bool lowHalf = line.size() % 2 == 1;
            if (littleEndian && lowHalf) {
                char next = 0;
                if (!m_file.getChar(&next))
                    break;
                line.append(next);
                if (next == 0)
                    break;
            } else if (!littleEndian && !lowHalf && line.size() >= 2 && line.at(line.size() - 2) == 0) {
                break;
            }
            const QByteArray more = m_file.readLine();
            if (more.isEmpty())
                break;
            line.append(more);
        }
    }
    const QString text = StringUtility::toString(line, moduleEncoding(m_textEncoding));
    emit positionChanged();
    return text;
}

void File::writeBytes(const QByteArray &bytes)
{
    if (m_file.write(bytes) < bytes.size())
        emit errorChanged();
    // A file reports no bytesWritten of its own; the position moved all the same.
    emit positionChanged();
}

void File::writeLine(const QString &text)
{
    if (!checkOpen(Q_FUNC_INFO))
        return;
    writeBytes(StringUtility::toStringData(text + QLatin1Char('\n'), moduleEncoding(m_textEncoding)));
}

QVariant File::read(int length)
{
    if (!checkOpen(Q_FUNC_INFO))
        return QByteArray();
    const QByteArray bytes = length > 0 ? m_file.read(length) : QByteArray();
    emit positionChanged();
    return bytes;
}

QVariant File::readAll()
{
    if (!checkOpen(Q_FUNC_INFO))
        return QByteArray();
    const QByteArray bytes = m_file.readAll();
    emit positionChanged();
    return bytes;
}

void File::write(const QJSValue &data)
{
    if (!checkOpen(Q_FUNC_INFO))
        return;
    writeBytes(StringUtility::toValueData(data, moduleEncoding(m_textEncoding)));
}
