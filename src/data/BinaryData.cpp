#include "BinaryData.h"
#include "LoomkitLogging.h"
#include "StringUtility.h"

#include <QMetaType>
#include <QQmlEngine>

#include <algorithm>
#include <cstring>
#include <limits>

namespace {

// Largest buffer that setDataAt may grow to; QByteArray cannot hold more.
constexpr qint64 kMaxSize = std::numeric_limits<int>::max() - 64;

bool isKnownType(int type)
{
    switch (type) {
    case BinaryData::TypeUInt8:
    case BinaryData::TypeInt8:
    case BinaryData::TypeUInt16:
    case BinaryData::TypeInt16:
    case BinaryData::TypeUInt32:
    case BinaryData::TypeInt32:
    case BinaryData::TypeUInt64:
    case BinaryData::TypeInt64:
    case BinaryData::TypeSingle:
    case BinaryData::TypeDouble:
        return true;
    default:
        return false;
    }
}

// Copies width bytes into value, reversing them when asked.
template <typename T>
T load(const char *source, bool swap)
{
    char raw[sizeof(T)];
    memcpy(raw, source, sizeof(T));
    if (swap)
        std::reverse(raw, raw + sizeof(T));
    T value;
    memcpy(&value, raw, sizeof(T));
    return value;
}

template <typename T>
void store(char *target, T value, bool swap)
{
    char raw[sizeof(T)];
    memcpy(raw, &value, sizeof(T));
    if (swap)
        std::reverse(raw, raw + sizeof(T));
    memcpy(target, raw, sizeof(T));
}

bool isValidHex(const QByteArray &text)
{
    int digits = 0;
    for (char c : text) {
        if ((c >= '0' && c <= '9') || (c >= 'a' && c <= 'f') || (c >= 'A' && c <= 'F'))
            ++digits;
        else if (c != ' ' && c != '\n' && c != '\r' && c != '\t')
            return false;
    }
    return digits % 2 == 0;
}

} // namespace

BinaryData::BinaryData(QObject *parent)
    : QObject(parent)
{
}

BinaryData *BinaryData::create(const QByteArray &data)
{
    auto *object = new BinaryData();
    object->m_data = data;
    QQmlEngine::setObjectOwnership(object, QQmlEngine::JavaScriptOwnership);
    return object;
}

BinaryData *BinaryData::create(const QJSValue &value, TextEncoding encoding)
{
    // No value simply means no bytes: not worth a warning.
    if (value.isUndefined() || value.isNull())
        return create(QByteArray());
    if (auto *other = qobject_cast<BinaryData *>(value.toQObject()))
        return create(other->m_data);
    return create(StringUtility::toValueData(value, ::TextEncoding(encoding)));
}

bool BinaryData::toBytes(const QVariant &value, QByteArray *bytes, TextEncoding encoding)
{
    const int type = value.userType();
    if (type == QMetaType::QByteArray) {
        *bytes = value.toByteArray();
        return true;
    }
    if (type == QMetaType::QString) {
        *bytes = StringUtility::toStringData(value.toString(), ::TextEncoding(encoding));
        return true;
    }
    if (type == qMetaTypeId<QJSValue>())
        return toBytes(value.value<QJSValue>().toVariant(), bytes, encoding);
    if (type == QMetaType::QObjectStar) {
        if (auto *other = qobject_cast<BinaryData *>(value.value<QObject *>())) {
            *bytes = other->m_data;
            return true;
        }
        return false;
    }
    if (!value.isValid())
        return false;
    if (value.canConvert<QByteArray>()) {
        *bytes = value.toByteArray();
        return true;
    }
    if (value.canConvert<QString>()) {
        *bytes = StringUtility::toStringData(value.toString(), ::TextEncoding(encoding));
        return true;
    }
    return false;
}

bool BinaryData::isNull() const
{
    return m_data.isNull();
}

bool BinaryData::isEmpty() const
{
    return m_data.isEmpty();
}

int BinaryData::size() const
{
    return m_data.size();
}

void BinaryData::setSize(int size)
{
    size = qMax(0, size);
    const int oldSize = m_data.size();
    if (size == oldSize)
        return;
    m_data.resize(size);
    // Grown bytes are zero rather than whatever the allocator left there.
    if (size > oldSize)
        memset(m_data.data() + oldSize, 0, size_t(size - oldSize));
    emit sizeChanged();
}

QVariant BinaryData::data() const
{
    return QVariant(m_data);
}

void BinaryData::setData(const QVariant &data)
{
    QByteArray bytes;
    if (!toBytes(data, &bytes, m_textEncoding)) {
        qCWarning(lcCore) << Q_FUNC_INFO << "Unsupported:" << data;
        return;
    }
    replace(bytes);
}

BinaryData::TextEncoding BinaryData::textEncoding() const
{
    return m_textEncoding;
}

void BinaryData::setTextEncoding(TextEncoding encoding)
{
    if (encoding == m_textEncoding)
        return;
    m_textEncoding = encoding;
    emit textEncodingChanged();
}

QString BinaryData::base64() const
{
    return QString::fromLatin1(m_data.toBase64());
}

void BinaryData::setBase64(const QString &base64)
{
    const QByteArray text = base64.toLatin1();
    if (QByteArray::fromBase64Encoding(text, QByteArray::AbortOnBase64DecodingErrors).decodingStatus
        != QByteArray::Base64DecodingStatus::Ok) {
        qCWarning(lcCore) << Q_FUNC_INFO << "Invalid Base64; characters outside the alphabet are skipped:" << base64;
    }
    replaceDecoded(QByteArray::fromBase64(text));
}

QString BinaryData::hex() const
{
    return QString::fromLatin1(m_data.toHex());
}

void BinaryData::setHex(const QString &hex)
{
    const QByteArray text = hex.toLatin1();
    if (!isValidHex(text))
        qCWarning(lcCore) << Q_FUNC_INFO << "Invalid hexadecimal text; non-digits are skipped:" << hex;
    replaceDecoded(QByteArray::fromHex(text));
}

void BinaryData::setBytes(const QByteArray &bytes)
{
    replace(bytes);
}

void BinaryData::clear()
{
    replace(QByteArray());
}

QJSValue BinaryData::dataAt(int offset, Type type, ByteOrder byteOrder) const
{
    if (!isKnownType(type))
        return QJSValue(QJSValue::UndefinedValue);
    const int width = QMetaType::sizeOf(type);
    if (offset < 0 || qint64(offset) + width > m_data.size())
        return QJSValue(QJSValue::UndefinedValue);

    const char *p = m_data.constData() + offset;
    const bool swap = byteOrder != LittleEndian;
    switch (type) {
    case TypeUInt8:
        return QJSValue(uint(quint8(*p)));
    case TypeInt8:
        return QJSValue(int(qint8(*p)));
    case TypeUInt16:
        return QJSValue(uint(load<quint16>(p, swap)));
    case TypeInt16:
        return QJSValue(int(load<qint16>(p, swap)));
    case TypeUInt32:
        return QJSValue(load<quint32>(p, swap));
    case TypeInt32:
        return QJSValue(load<qint32>(p, swap));
    case TypeUInt64:
        return QJSValue(double(load<quint64>(p, swap)));
    case TypeInt64:
        return QJSValue(double(load<qint64>(p, swap)));
    case TypeSingle:
        return QJSValue(double(load<float>(p, swap)));
    case TypeDouble:
        return QJSValue(load<double>(p, swap));
    }
    return QJSValue(QJSValue::UndefinedValue);
}

int BinaryData::setDataAt(int index, const QJSValue &value, Type type, ByteOrder byteOrder)
{
    if (value.isNull() || value.isUndefined())
        return -1;
    if (!isKnownType(type)) {
        qCWarning(lcCore) << Q_FUNC_INFO << "Unsupported type:" << int(type);
        return -1;
    }
    const int width = QMetaType::sizeOf(type);
    if (index < 0 || qint64(index) + width > kMaxSize) {
        qCWarning(lcCore) << Q_FUNC_INFO << "Index out of range:" << index;
        return -1;
    }

    const int oldSize = m_data.size();
    const bool wasNull = m_data.isNull();
    if (index + width > oldSize) {
        m_data.resize(index + width);
        memset(m_data.data() + oldSize, 0, size_t(index + width - oldSize));
    }

    char *p = m_data.data() + index;
    const bool swap = byteOrder != LittleEndian;
    // Every integer type goes through the script's 32-bit integer conversion;
    // the 64-bit types widen it with its sign.
    switch (type) {
    case TypeUInt8:
    case TypeInt8:
        *p = char(value.toInt());
        break;
    case TypeUInt16:
    case TypeInt16:
        store<quint16>(p, quint16(value.toInt()), swap);
        break;
    case TypeUInt32:
    case TypeInt32:
        store<qint32>(p, value.toInt(), swap);
        break;
    case TypeUInt64:
    case TypeInt64:
        store<qint64>(p, qint64(value.toInt()), swap);
        break;
    case TypeSingle:
        store<float>(p, float(value.toNumber()), swap);
        break;
    case TypeDouble:
        store<double>(p, value.toNumber(), swap);
        break;
    }

    emit dataChanged();
    if (m_data.size() != oldSize || wasNull)
        emit sizeChanged();
    return index + width;
}

void BinaryData::fill(int byteValue, int size)
{
    qCDebug(lcCore) << Q_FUNC_INFO << "byteValue:" << byteValue << "size:" << size;
    m_data.fill(char(byteValue), size);
    if (size >= 0)
        emit sizeChanged();
    emit dataChanged();
}

QString BinaryData::stringData(TextEncoding encoding) const
{
    return StringUtility::toString(m_data, ::TextEncoding(encoding));
}

QString BinaryData::stringData() const
{
    return stringData(m_textEncoding);
}

void BinaryData::setStringData(const QString &string, TextEncoding encoding)
{
    replace(StringUtility::toStringData(string, ::TextEncoding(encoding)));
}

void BinaryData::setStringData(const QString &string)
{
    setStringData(string, m_textEncoding);
}

void BinaryData::replace(const QByteArray &bytes)
{
    if (bytes == m_data && bytes.isNull() == m_data.isNull())
        return;
    const int oldSize = m_data.size();
    const bool wasNull = m_data.isNull();
    m_data = bytes;
    emit dataChanged();
    if (m_data.size() != oldSize || m_data.isNull() != wasNull)
        emit sizeChanged();
}

void BinaryData::replaceDecoded(const QByteArray &bytes)
{
    m_data = bytes;
    emit dataChanged();
    emit sizeChanged();
}
