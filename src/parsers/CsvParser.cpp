#include "CsvParser.h"
#include "LoomkitLogging.h"

#include <QDateTime>
#include <QHash>
#include <QIODevice>
#include <QTextCodec>
#include <QTextDecoder>

#include <charconv>

#ifdef __SSE2__
#include <emmintrin.h>
#endif

namespace {

// Out of band, so that U+FFFF in the data stays an ordinary character.
constexpr int kEnd = -1;
constexpr int kLineFeed = '\n';
constexpr int kCarriageReturn = '\r';
constexpr qint64 kChunkSize = 1 << 20;

// The first of [p, end) that is one of the characters, or end; eight at a
// time where the processor allows.
template<typename... Chars>
const QChar *findFirstOf(const QChar *p, const QChar *end, Chars... chars)
{
#ifdef __SSE2__
    const __m128i wanted[] = { _mm_set1_epi16(short(chars))... };
    while (end - p >= 8) {
        const __m128i block = _mm_loadu_si128(reinterpret_cast<const __m128i *>(p));
        __m128i hits = _mm_setzero_si128();
        for (const __m128i &c : wanted)
            hits = _mm_or_si128(hits, _mm_cmpeq_epi16(block, c));
        const int mask = _mm_movemask_epi8(hits);
        if (mask != 0)
            return p + __builtin_ctz(uint(mask)) / 2;
        p += 8;
    }
#endif
    for (; p != end; ++p) {
        for (const char16_t c : { char16_t(chars)... }) {
            if (p->unicode() == c)
                return p;
        }
    }
    return end;
}

bool isAsciiDigit(char16_t c)
{
    return c >= '0' && c <= '9';
}

// QDate's ISO reader wants ten characters with separators at 4 and 7;
// anything else can't be a date, and Qt's parser needn't be asked.
bool mayBeIsoDate(const QChar *text, int size)
{
    // Printable ASCII other than letters and digits passes, a superset of
    // its punctuation, to spare the look-up of the category.
    auto separator = [](QChar c) {
        const char16_t u = c.unicode();
        if (u >= 0x80)
            return c.isPunct();
        return u > ' ' && u < 0x7f && !((u | 0x20) >= 'a' && (u | 0x20) <= 'z') && !isAsciiDigit(u);
    };
    return size >= 10 && separator(text[4]) && separator(text[7]);
}

// In the C locale a number can't begin with a letter, save "inf" and "nan"
// in any case, which Qt reads with white space around them: a text of other
// letters, or longer, is no number.
bool cannotBeCNumber(const QChar *text, int size)
{
    const char16_t c = text[0].unicode();
    if (c >= 0x80)
        return text[0].isLetter();
    const char16_t lower = c | 0x20;
    if (lower < 'a' || lower > 'z')
        return false;
    if (lower != 'i' && lower != 'n')
        return true;
    while (size > 0 && text[size - 1].isSpace())
        --size;
    return size != 3;
}

// Plain decimal integers of up to nine digits, which the C locale reads
// exactly so; anything longer or fancier goes to QLocale.
bool simpleCInt(const QChar *p, int size, int *value)
{
    int i = 0;
    bool negative = false;
    if (size > 0 && (p[0].unicode() == '-' || p[0].unicode() == '+')) {
        negative = p[0].unicode() == '-';
        i = 1;
    }
    const int digits = size - i;
    if (digits < 1 || digits > 9)
        return false;
    int result = 0;
    for (; i < size; ++i) {
        const char16_t c = p[i].unicode();
        if (!isAsciiDigit(c))
            return false;
        result = result * 10 + (c - '0');
    }
    *value = negative ? -result : result;
    return true;
}

// Digits, one point, digits: correctly rounded like QLocale's own reading.
bool simpleCDouble(const QChar *p, int size, double *value)
{
    if (size < 3 || size > 40)
        return false;
    char ascii[48];
    int i = 0;
    if (p[0].unicode() == '-' || p[0].unicode() == '+') {
        ascii[0] = char(p[0].unicode());
        i = 1;
    }
    const int mantissaStart = i;
    int point = -1;
    for (; i < size; ++i) {
        const char16_t c = p[i].unicode();
        if (c == '.' && point < 0)
            point = i;
        else if (!isAsciiDigit(c))
            return false;
        ascii[i] = char(c);
    }
    if (point <= mantissaStart || point == size - 1)
        return false;
    // from_chars refuses a leading plus.
    const char *begin = ascii[0] == '+' ? ascii + 1 : ascii;
    const auto result = std::from_chars(begin, ascii + size, *value);
    return result.ec == std::errc() && result.ptr == ascii + size;
}

} // namespace

struct CsvParser::DecoderState
{
    std::unique_ptr<QTextDecoder> decoder;
};

CsvParser::CsvParser(QIODevice *device, QObject *parent)
    : QObject(parent)
    , m_device(device)
    , m_decoderState(new DecoderState)
{
    qRegisterMetaType<CsvError>();
}

CsvParser::~CsvParser()
{
    if (m_device)
        m_device->close();
}

QIODevice *CsvParser::device() const
{
    return m_device;
}

QVariantList CsvParser::records() const
{
    return m_records;
}

QStringList CsvParser::headers() const
{
    return m_headers;
}

QList<CsvError> CsvParser::errors() const
{
    return m_errors;
}

QString CsvParser::errorString() const
{
    return m_errorString;
}

QChar CsvParser::delimiter() const
{
    return m_delimiter;
}

QChar CsvParser::textQualifier() const
{
    return m_textQualifier;
}

bool CsvParser::trim() const
{
    return m_trim;
}

bool CsvParser::emptyValueAsNull() const
{
    return m_emptyValueAsNull;
}

bool CsvParser::ignoreInvalidLines() const
{
    return m_ignoreInvalidLines;
}

bool CsvParser::dataElementAsArray() const
{
    return m_dataElementAsArray;
}

bool CsvParser::hasFixedFields() const
{
    return m_hasFixedFields;
}

QString CsvParser::valueType() const
{
    return m_autoType ? QStringLiteral("auto") : QStringLiteral("text");
}

QString CsvParser::dateTimeFormat() const
{
    return m_dateTimeFormat;
}

QLocale CsvParser::locale() const
{
    return m_locale;
}

QString CsvParser::encoding() const
{
    return m_encoding;
}

bool CsvParser::parse(const QVariantMap &options)
{
    if (!setOptions(options))
        return false;
    return parse();
}

bool CsvParser::setOptions(const QVariantMap &options)
{
    QVariantMap lowered;
    for (auto it = options.cbegin(); it != options.cend(); ++it)
        lowered.insert(it.key().toLower(), it.value());

    auto value = [&lowered](const char *key, QVariant *out) {
        const auto it = lowered.constFind(QLatin1String(key));
        if (it == lowered.constEnd())
            return false;
        *out = it.value();
        return true;
    };

    QVariant v;
    if (value("dataelementasarray", &v))
        m_dataElementAsArray = v.toBool();
    if (value("trim", &v))
        m_trim = v.toBool();
    if (value("ignoreinvalidlines", &v))
        m_ignoreInvalidLines = v.toBool();
    if (value("emptyvalueasnull", &v))
        m_emptyValueAsNull = v.toBool();
    if (value("valuetype", &v)) {
        const QString type = v.toString();
        if (type.compare(QLatin1String("text"), Qt::CaseInsensitive) == 0) {
            m_autoType = false;
        } else {
            if (type.compare(QLatin1String("auto"), Qt::CaseInsensitive) != 0)
                qCWarning(lcUtility) << Q_FUNC_INFO << "Unknown valueType, defaulting to \"auto\".";
            m_autoType = true;
        }
    }
    if (value("datetimeformat", &v))
        m_dateTimeFormat = v.toString();
    if (value("locale", &v)) {
        if (v.userType() == QMetaType::QLocale) {
            m_locale = v.toLocale();
        } else if (v.canConvert<QString>()) {
            m_locale = QLocale(v.toString());
        }
        m_cLocale = m_locale.language() == QLocale::C;
    }
    if (value("encoding", &v))
        m_encoding = v.toString();
    if (value("delimiter", &v)) {
        const QString text = v.toString();
        if (text.size() == 1)
            m_delimiter = text.at(0);
    }
    if (value("textqualifier", &v)) {
        const QString text = v.toString();
        if (text.size() == 1)
            m_textQualifier = text.at(0);
    }
    if (value("fields", &v)) {
        const QVariantList fields = v.toList();
        if (!fields.isEmpty()) {
            m_hasFixedFields = true;
            // A second set of fields replaces the first rather than adding to it.
            m_headers.clear();
            if (!checkHeaders(fields))
                return false;
        }
    }
    return true;
}

bool CsvParser::parse()
{
    m_errorString.clear();
    if (!m_device) {
        m_errorString = QStringLiteral("QIODevice has not been set.");
        qCDebug(lcUtility) << Q_FUNC_INFO << m_errorString;
        return false;
    }
    if (!open()) {
        m_errorString = QStringLiteral("Open QIODevice failed.");
        qCDebug(lcUtility) << Q_FUNC_INFO << m_errorString;
        return false;
    }

    m_pushBackSize = 0;
    m_errors.clear();
    m_records.clear();
    if (!m_hasFixedFields)
        m_headers.clear();
    m_line = 1;
    m_column = 1;
    m_dateTimes.clear();

    if (!m_hasFixedFields && !readHeaderRow()) {
        close();
        return false;
    }

    bool more = readRecord();
    while (more) {
        if (!readLineEnd())
            break;
        more = readRecord();
    }

    emit fileRead(m_records);
    close();
    return true;
}

bool CsvParser::open()
{
    // A device handed over open for reading is read from where it stands.
    if (!(m_device->isOpen() && m_device->isReadable()) && !m_device->open(QIODevice::ReadOnly))
        return false;

    const QByteArray head = m_device->peek(4);
    QTextCodec *codec = QTextCodec::codecForUtfText(head, nullptr);
    if (!codec) {
        if (m_encoding.isEmpty())
            codec = QTextCodec::codecForName("UTF-8");
        else
            codec = QTextCodec::codecForName(m_encoding.toLatin1());
        // An unknown name leaves the text stream's default, the locale's codec.
        if (!codec)
            codec = QTextCodec::codecForLocale();
    }
    m_codec = codec;
    m_decoderState->decoder.reset(codec->makeDecoder());
    m_buffer.clear();
    m_pos = m_end = nullptr;
    m_atEnd = false;
    return true;
}

void CsvParser::close()
{
    m_decoderState->decoder.reset();
    m_buffer = QString();
    m_rawBuffer = QByteArray();
    m_pos = m_end = nullptr;
    m_atEnd = true;
    if (m_device)
        m_device->close();
}

// Decodes the next chunk of the device into m_buffer.
bool CsvParser::fillBuffer()
{
    while (!m_atEnd) {
        if (m_rawBuffer.size() != kChunkSize)
            m_rawBuffer.resize(kChunkSize);
        const qint64 got = m_device ? m_device->read(m_rawBuffer.data(), kChunkSize) : -1;
        if (got <= 0) {
            m_atEnd = true;
            // A sequence cut off by the end of the data shows as one
            // replacement character rather than vanishing.
            QTextDecoder *decoder = m_decoderState->decoder.get();
            if (decoder && decoder->needsMoreData()) {
                m_buffer = QString(QChar::ReplacementCharacter);
                m_pos = m_buffer.constData();
                m_end = m_pos + 1;
                return true;
            }
            break;
        }
        m_buffer = m_decoderState->decoder->toUnicode(m_rawBuffer.constData(), int(got));
        if (!m_buffer.isEmpty()) {
            m_pos = m_buffer.constData();
            m_end = m_pos + m_buffer.size();
            return true;
        }
    }
    m_pos = m_end = nullptr;
    return false;
}

// Every character of a parse passes through here, or through the bulk scans
// of the field readers, which do the same bookkeeping for a run.
inline int CsvParser::readChar(int &line, int &column)
{
    if (m_pushBackSize > 0) {
        const PushedChar &pushed = m_pushBack[--m_pushBackSize];
        line = pushed.line;
        column = pushed.column;
        return pushed.ch;
    }
    if (m_pos == m_end && !fillBuffer()) {
        line = 0;
        column = 0;
        return kEnd;
    }
    const int ch = m_pos->unicode();
    ++m_pos;
    line = m_line;
    column = m_column;
    if (ch == kLineFeed) {
        ++m_line;
        m_column = 1;
    } else {
        ++m_column;
    }
    return ch;
}

inline void CsvParser::pushBack(int ch, int line, int column)
{
    Q_ASSERT(m_pushBackSize < int(sizeof(m_pushBack) / sizeof(m_pushBack[0])));
    m_pushBack[m_pushBackSize++] = { ch, line, column };
}

bool CsvParser::readHeaderRow()
{
    FieldValues fields;
    readRecordFields(fields, true);
    readLineEnd();
    if (m_recordError)
        return false;
    const QVariantList values = toList(fields);
    if (m_dataElementAsArray) {
        m_records.append(QVariant(values));
        emit recordReadAsArray(values);
    }
    return checkHeaders(values);
}

bool CsvParser::checkHeaders(const QVariantList &values)
{
    for (const QVariant &value : values) {
        const QString name = value.toString().trimmed();
        if (name.isEmpty() || m_headers.contains(name)) {
            const QString message = QStringLiteral("Duplicate or empty header name: \"") + name
                + QStringLiteral("\" at header no.") + QString::number(m_headers.size() + 1);
            reportError(CsvError::BadHeaderName, 0, 0, message);
            return false;
        }
        m_headers.append(name);
    }
    prepareRecordTemplate();
    emit headersRead(m_headers);
    return true;
}

// A record under all the headers is a copy of this map with its values
// filled in, in key order: cheaper than inserting key by key.
void CsvParser::prepareRecordTemplate()
{
    m_recordTemplate.clear();
    for (const QString &header : qAsConst(m_headers))
        m_recordTemplate.insert(header, QVariant());
    m_templateOrder.clear();
    for (auto it = m_recordTemplate.cbegin(); it != m_recordTemplate.cend(); ++it)
        m_templateOrder.append(m_headers.indexOf(it.key()));
}

bool CsvParser::readRecord()
{
    FieldValues fields;
    readRecordFields(fields, m_dataElementAsArray);
    if (m_recordError)
        return m_ignoreInvalidLines;
    if (m_dataElementAsArray) {
        const QVariantList record = toList(fields);
        m_records.append(QVariant(record));
        emit recordReadAsArray(record);
    } else {
        const QVariantMap record = toMap(fields);
        m_records.append(QVariant(record));
        emit recordReadAsObject(record);
    }
    return true;
}

void CsvParser::readRecordFields(FieldValues &fields, bool asArray)
{
    m_recordError = false;
    if (readRecordInBuffer(fields))
        return;
    bool ok = readField(fields);
    while (ok) {
        int line;
        int column;
        const int ch = readChar(line, column);
        if (ch == kEnd)
            break;
        if (ch != m_delimiter.unicode()) {
            pushBack(ch, line, column);
            break;
        }
        ok = readField(fields);
    }

    const int length = asArray ? fields.size() : mapLength(fields.size());
    if (!m_recordError && !m_headers.isEmpty() && length != m_headers.size()) {
        reportError(CsvError::WrongFieldCount, m_line, 0,
                    QStringLiteral("Incorrect number of fields (Header length: %1, current record length: %2)")
                        .arg(m_headers.size())
                        .arg(length));
        m_recordError = true;
    }
}

// The common record in one pass: whole in the buffer, as many fields as
// headers, each one plain without a qualifier or quoted and closed cleanly.
// It leaves the state the field readers would leave: its line end read and
// put back. Anything else returns false with nothing consumed, and the field
// readers take the record and report what is wrong with it.
bool CsvParser::readRecordInBuffer(FieldValues &fields)
{
    const char16_t delimiter = m_delimiter.unicode();
    const char16_t qualifier = m_textQualifier.unicode();
    auto isLineEnd = [](char16_t c) { return c == kLineFeed || c == kCarriageReturn; };
    if (m_pushBackSize != 0 || m_headers.isEmpty() || delimiter == qualifier || isLineEnd(delimiter)
        || isLineEnd(qualifier))
        return false;

    const QChar *p = m_pos;
    int line = m_line;
    int column = m_column;
    for (;;) {
        if (p == m_end)
            break;
        if (p->unicode() == qualifier) {
            QString text;
            ++column;
            p = scanQuotedField(p + 1, m_end, text, line, column);
            if (!p)
                break;
            fields.append(QVariant(text));
        } else {
            const QChar *begin = p;
            p = plainRunEnd(p);
            if (p == m_end || p->unicode() == qualifier)
                break;
            const int size = int(p - begin);
            column += size;
            fields.append(plainValue(begin, size, size == 0));
        }
        const char16_t terminator = p->unicode();
        if (terminator == delimiter) {
            ++p;
            ++column;
            continue;
        }
        if (fields.size() != m_headers.size())
            break;
        m_pos = p + 1;
        pushBack(terminator, line, column);
        if (terminator == kLineFeed) {
            m_line = line + 1;
            m_column = 1;
        } else {
            m_line = line;
            m_column = column + 1;
        }
        return true;
    }
    fields.clear();
    return false;
}

// The size a map would have after inserting this many fields: fields past
// the headers all go under one key, "Field", which may be a header itself.
int CsvParser::mapLength(int fieldCount) const
{
    const int headerCount = m_headers.size();
    if (fieldCount <= headerCount)
        return fieldCount;
    return m_headers.contains(QStringLiteral("Field")) ? headerCount : headerCount + 1;
}

QVariantList CsvParser::toList(FieldValues &fields)
{
    QVariantList list;
    list.reserve(fields.size());
    for (QVariant &value : fields)
        list.append(std::move(value));
    return list;
}

QVariantMap CsvParser::toMap(FieldValues &fields) const
{
    if (fields.size() == m_headers.size()) {
        QVariantMap map = m_recordTemplate;
        map.detach();
        int i = 0;
        for (auto it = map.begin(); it != map.end(); ++it)
            it.value() = std::move(fields[m_templateOrder.at(i++)]);
        return map;
    }
    QVariantMap map;
    for (QVariant &value : fields) {
        const int index = map.size();
        if (index < m_headers.size())
            map.insert(m_headers.at(index), std::move(value));
        else
            map.insert(QStringLiteral("Field"), std::move(value));
    }
    return map;
}

bool CsvParser::readField(FieldValues &fields)
{
    int line;
    int column;
    int ch;
    if (m_pushBackSize == 0 && m_pos != m_end && m_pos->unicode() != m_textQualifier.unicode()) {
        // Reading the first character only to put it back would leave the
        // same state behind once the plain field has read it; it stays.
        QVariant value;
        if (!readPlainField(value))
            return false;
        fields.append(std::move(value));
        return true;
    }
    ch = readChar(line, column);
    if (ch == m_textQualifier.unicode() && ch != kEnd) {
        QString text;
        if (!readQuotedField(text))
            return false;
        // Quoted fields are never typed nor trimmed.
        fields.append(QVariant(text));
        return true;
    }
    if (ch != kEnd)
        pushBack(ch, line, column);
    QVariant value;
    if (!readPlainField(value))
        return false;
    fields.append(std::move(value));
    return true;
}

// Where a run of plain characters from p ends in the buffer: at a delimiter,
// a qualifier, a line end or the buffer's end.
inline const QChar *CsvParser::plainRunEnd(const QChar *p) const
{
    return findFirstOf(p, m_end, m_delimiter.unicode(), m_textQualifier.unicode(), char16_t(kLineFeed),
                       char16_t(kCarriageReturn));
}

bool CsvParser::readPlainField(QVariant &value)
{
    const char16_t delimiter = m_delimiter.unicode();
    const char16_t qualifier = m_textQualifier.unicode();
    // Most fields lie whole in the buffer and end at a delimiter or line
    // end: they are typed straight from the buffer.
    if (m_pushBackSize == 0) {
        const QChar *p = plainRunEnd(m_pos);
        if (p != m_end && p->unicode() != qualifier) {
            const QChar *begin = m_pos;
            const int size = int(p - begin);
            m_column += size;
            m_pos = p;
            int line;
            int column;
            const int ch = readChar(line, column);
            pushBack(ch, line, column);
            value = plainValue(begin, size, size == 0);
            return true;
        }
    }

    QString text;
    for (;;) {
        if (m_pushBackSize == 0) {
            const QChar *p = m_pos;
            p = plainRunEnd(p);
            if (p != m_pos) {
                const int run = int(p - m_pos);
                text.append(m_pos, run);
                m_column += run;
                m_pos = p;
                if (p == m_end)
                    continue;
            }
        }

        int line;
        int column;
        const int ch = readChar(line, column);
        if (ch == kEnd)
            break;
        if (ch == delimiter || ch == kLineFeed || ch == kCarriageReturn) {
            pushBack(ch, line, column);
            break;
        }
        if (ch == qualifier) {
            m_recordError = true;
            reportError(CsvError::QualifierInPlainField, line, column,
                        QStringLiteral("Illegal data format: Text qualifier inside non-escaped field"));
            if (!m_ignoreInvalidLines)
                return false;
            continue;
        }
        text.append(QChar(ch));
    }

    value = plainValue(text.constData(), text.size(), text.isNull());
    return true;
}

// Reads a quoted field from just after its opening qualifier up to the
// character after its closing one, which must be a delimiter or a line end
// before `end`; counts lines and columns on the way and copies the text once,
// doubled qualifiers and all. Null when the field doesn't close so.
const QChar *CsvParser::scanQuotedField(const QChar *begin, const QChar *end, QString &text, int &line,
                                        int &column) const
{
    const char16_t delimiter = m_delimiter.unicode();
    const char16_t qualifier = m_textQualifier.unicode();
    const QChar *q = begin;
    int doubled = 0;
    int lineNumber = line;
    int columnNumber = column;
    for (;;) {
        for (;;) {
            const QChar *stop = findFirstOf(q, end, qualifier, char16_t(kLineFeed));
            columnNumber += int(stop - q);
            q = stop;
            if (q == end || q->unicode() == qualifier)
                break;
            ++lineNumber;
            columnNumber = 1;
            ++q;
        }
        if (q == end || q + 1 == end)
            return nullptr;
        const char16_t next = q[1].unicode();
        if (next == qualifier) {
            ++doubled;
            columnNumber += 2;
            q += 2;
            continue;
        }
        if (next != delimiter && next != kLineFeed && next != kCarriageReturn)
            return nullptr;
        break;
    }

    const int size = int(q - begin) - doubled;
    if (doubled == 0) {
        text = size == 0 ? QString(QLatin1String("")) : QString(begin, size);
    } else {
        text = QString(size, Qt::Uninitialized);
        QChar *out = text.data();
        for (const QChar *p = begin; p != q; ++p) {
            *out++ = *p;
            if (p->unicode() == qualifier)
                ++p;
        }
    }
    line = lineNumber;
    column = columnNumber + 1;
    return q + 1;
}

// A quoted field that ends well inside the buffer is measured first and
// copied once; anything else takes the loop.
bool CsvParser::readQuotedFieldInBuffer(QString &text)
{
    if (m_pushBackSize != 0)
        return false;
    int lineNumber = m_line;
    int columnNumber = m_column;
    const QChar *next = scanQuotedField(m_pos, m_end, text, lineNumber, columnNumber);
    if (!next)
        return false;
    // The closing qualifier is read, and the character after it is read and
    // put back, as the loop would.
    m_pos = next;
    m_line = lineNumber;
    m_column = columnNumber;
    int line;
    int column;
    const int ch = readChar(line, column);
    pushBack(ch, line, column);
    return true;
}

bool CsvParser::readQuotedField(QString &text)
{
    if (readQuotedFieldInBuffer(text))
        return true;
    const char16_t delimiter = m_delimiter.unicode();
    const char16_t qualifier = m_textQualifier.unicode();
    for (;;) {
        if (m_pushBackSize == 0) {
            const QChar *p = m_pos;
            int lineNumber = m_line;
            int columnNumber = m_column;
            while (p != m_end) {
                const char16_t c = p->unicode();
                if (c == qualifier)
                    break;
                if (c == kLineFeed) {
                    ++lineNumber;
                    columnNumber = 1;
                } else {
                    ++columnNumber;
                }
                ++p;
            }
            if (p != m_pos) {
                text.append(m_pos, int(p - m_pos));
                m_line = lineNumber;
                m_column = columnNumber;
                m_pos = p;
                if (p == m_end)
                    continue;
            }
        }

        int line;
        int column;
        const int ch = readChar(line, column);
        if (ch == kEnd) {
            m_recordError = true;
            reportError(CsvError::EndOfFileInQuotedField, m_line, m_column,
                        QStringLiteral("Illegal data format: EndOfFile inside escaped field"));
            return false;
        }
        if (ch != qualifier) {
            text.append(QChar(ch));
            continue;
        }

        int nextLine;
        int nextColumn;
        const int next = readChar(nextLine, nextColumn);
        if (next == qualifier) {
            text.append(QChar(qualifier));
            continue;
        }
        if (next != kEnd)
            pushBack(next, nextLine, nextColumn);
        if (next == kEnd || next == delimiter || next == kLineFeed || next == kCarriageReturn) {
            if (text.isNull())
                text = QLatin1String("");
            return true;
        }
        m_recordError = true;
        reportError(CsvError::UnescapedQualifier, nextLine, nextColumn,
                    QStringLiteral("Illegal data format: Unescaped text qualifier inside escaped field"));
        if (!m_ignoreInvalidLines)
            return false;
        text.append(QChar(qualifier));
    }
}

bool CsvParser::readLineEnd()
{
    int line;
    int column;
    int ch = readChar(line, column);
    if (ch != kEnd && ch != kCarriageReturn)
        pushBack(ch, line, column);
    ch = readChar(line, column);
    if (ch == kEnd)
        return false;
    if (ch == kLineFeed)
        return true;
    pushBack(ch, line, column);
    return false;
}

// The value of a plain field from its characters; isNull means the field
// had none at all, which differs from one that trims to nothing.
QVariant CsvParser::plainValue(const QChar *begin, int size, bool isNull) const
{
    if (isNull) {
        if (m_emptyValueAsNull)
            return QVariant::fromValue(nullptr);
        return QVariant(QString(QLatin1String("")));
    }
    if (m_trim) {
        while (size > 0 && begin->isSpace()) {
            ++begin;
            --size;
        }
        while (size > 0 && begin[size - 1].isSpace())
            --size;
    }
    if (!m_autoType)
        return QVariant(QString(begin, size));

    if (m_dateTimeFormat.isEmpty()) {
        if (mayBeIsoDate(begin, size)) {
            const QDateTime dateTime = m_dateTimes.fromIsoText(begin, size);
            if (dateTime.isValid())
                return QVariant(dateTime);
        }
    } else {
        const QDateTime dateTime = m_locale.toDateTime(QString(begin, size), m_dateTimeFormat);
        if (dateTime.isValid())
            return QVariant(dateTime);
    }

    if (m_cLocale) {
        if (size == 0 || cannotBeCNumber(begin, size))
            return QVariant(QString(begin, size));
        int integer;
        if (simpleCInt(begin, size, &integer))
            return QVariant(integer);
        double real;
        if (simpleCDouble(begin, size, &real))
            return QVariant(real);
    }

    const QString text(begin, size);
    bool ok = false;
    const int integer = m_locale.toInt(text, &ok);
    if (ok)
        return QVariant(integer);
    const double real = m_locale.toDouble(text, &ok);
    if (ok)
        return QVariant(real);
    return QVariant(text);
}

void CsvParser::reportError(int type, int line, int column, const QString &message)
{
    QString text = message;
    if (line > 0)
        text += QStringLiteral(" at line ") + QString::number(line);
    if (column > 0)
        text += QStringLiteral(" column ") + QString::number(column);
    qCDebug(lcUtility) << Q_FUNC_INFO << text;
    m_errorString = text;

    CsvError error;
    error.type = type;
    error.line = line;
    error.column = column;
    error.message = message;
    m_errors.append(error);
    emit errorsChanged();
    emit this->error(error);
}
