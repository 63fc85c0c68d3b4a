#ifndef CSVPARSER_H
#define CSVPARSER_H

#include "CsvDateTimeCache.h"
#include "CsvError.h"

#include <QDateTime>
#include <QList>
#include <QLocale>
#include <QObject>
#include <QPointer>
#include <QStringList>
#include <QVarLengthArray>
#include <QVariant>
#include <QVector>

#include <memory>

class QIODevice;
class QTextCodec;

// Reads delimited text from a device, record by record, and reports each
// record, each problem and the whole result through signals. Quoted fields
// may span lines. The device is not owned; it is closed after a parse.
//
// A caller that wants the whole file:
//     CsvParser parser(&file);
//     if (!parser.setOptions(options)) ...   // explicit headers were refused
//     if (!parser.parse()) ...               // parser.errorString() says why
//     QVariantList rows = parser.records();
class CsvParser : public QObject
{
    Q_OBJECT

public:
    explicit CsvParser(QIODevice *device, QObject *parent = nullptr);
    ~CsvParser() override;

    // Applies the options and, if they were accepted, runs the parse.
    bool parse(const QVariantMap &options);

    // Applies the options (keys compared lower-cased). False only when
    // explicit "fields" fail the header check; nothing is read then.
    bool setOptions(const QVariantMap &options);

    // Runs one parse with the options set so far. False when the device is
    // missing or won't open, or when the header row is bad; errors in records
    // don't make it false.
    bool parse();

    QIODevice *device() const;
    QVariantList records() const;
    QStringList headers() const;
    QList<CsvError> errors() const;

    // The text of the last failure: a device problem or the last error
    // recorded, with its position. Empty when nothing went wrong.
    QString errorString() const;

    QChar delimiter() const;
    QChar textQualifier() const;
    bool trim() const;
    bool emptyValueAsNull() const;
    bool ignoreInvalidLines() const;
    bool dataElementAsArray() const;
    bool hasFixedFields() const;
    QString valueType() const;
    QString dateTimeFormat() const;
    QLocale locale() const;
    QString encoding() const;

signals:
    void errorsChanged();
    void error(CsvError error);
    void headersRead(const QStringList &headers);
    void recordReadAsArray(const QVariantList &recordArray);
    void recordReadAsObject(const QVariantMap &recordObject);
    void fileRead(const QVariantList &resultList);

private:
    struct PushedChar
    {
        int ch;
        int line;
        int column;
    };

    bool open();
    void close();
    bool fillBuffer();
    inline int readChar(int &line, int &column);
    inline void pushBack(int ch, int line, int column);

    using FieldValues = QVarLengthArray<QVariant, 32>;

    bool readHeaderRow();
    bool checkHeaders(const QVariantList &values);
    void prepareRecordTemplate();
    bool readRecord();
    void readRecordFields(FieldValues &fields, bool asArray);
    bool readRecordInBuffer(FieldValues &fields);
    int mapLength(int fieldCount) const;
    static QVariantList toList(FieldValues &fields);
    QVariantMap toMap(FieldValues &fields) const;
    bool readField(FieldValues &fields);
    const QChar *plainRunEnd(const QChar *p) const;
    bool readPlainField(QVariant &value);
    bool readQuotedField(QString &text);
    bool readQuotedFieldInBuffer(QString &text);
    const QChar *scanQuotedField(const QChar *begin, const QChar *end, QString &text, int &line,
                                 int &column) const;
    bool readLineEnd();
    QVariant plainValue(const QChar *begin, int size, bool isNull) const;
    void reportError(int type, int line, int column, const QString &message);

    QPointer<QIODevice> m_device;
    int m_line = 1;
    int m_column = 1;
    QString m_encoding;

    // Decoded text of the current chunk and the scan position in it.
    QTextCodec *m_codec = nullptr;
    struct DecoderState;
    std::unique_ptr<DecoderState> m_decoderState;
    QByteArray m_rawBuffer;
    QString m_buffer;
    const QChar *m_pos = nullptr;
    const QChar *m_end = nullptr;
    bool m_atEnd = true;

    // Never holds more than two characters.
    PushedChar m_pushBack[4];
    int m_pushBackSize = 0;

    QVariantList m_records;
    QStringList m_headers;
    QVariantMap m_recordTemplate;
    QVector<int> m_templateOrder;
    QList<CsvError> m_errors;
    QString m_errorString;
    bool m_recordError = false;

    QChar m_delimiter = QLatin1Char(',');
    QChar m_textQualifier = QLatin1Char('"');
    bool m_trim = true;
    bool m_emptyValueAsNull = true;
    bool m_ignoreInvalidLines = true;
    bool m_dataElementAsArray = false;
    bool m_hasFixedFields = false;
    bool m_autoType = true;
    QString m_dateTimeFormat;
    mutable CsvDateTimeCache m_dateTimes;
    QLocale m_locale = QLocale::c();
    bool m_cLocale = true;
};

#endif // CSVPARSER_H
