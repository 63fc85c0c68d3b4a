#include "CsvParser.h"
#include "TestSupport.h"

#include <QBuffer>
#include <QDateTime>
#include <QDir>
#include <QFile>
#include <QJsonDocument>
#include <QSignalSpy>
#include <QTemporaryDir>
#include <QTextCodec>
#include <QtTest>

#include <cmath>
#include <cstring>

namespace {

// A readable, type-exact picture of a value: failures show what differs.
QString describe(const QVariant &value)
{
    switch (value.userType()) {
    case QMetaType::Nullptr:
        return QStringLiteral("null");
    case QMetaType::QString:
        return value.toString().isNull() ? QStringLiteral("nullstring")
                                         : QLatin1Char('\'') + value.toString() + QLatin1Char('\'');
    case QMetaType::Int:
        return QStringLiteral("int:") + QString::number(value.toInt());
    case QMetaType::Double: {
        const double d = value.toDouble();
        quint64 bits;
        std::memcpy(&bits, &d, sizeof bits);
        return QStringLiteral("double:") + QString::number(d, 'g', 17)
            + (std::signbit(d) && d == 0 ? QStringLiteral("(-0)") : QString());
    }
    case QMetaType::QDateTime: {
        const QDateTime dt = value.toDateTime();
        return QStringLiteral("dt:") + dt.toString(Qt::ISODateWithMs)
            + (dt.timeSpec() == Qt::LocalTime ? QStringLiteral("L") : QStringLiteral("S%1").arg(dt.timeSpec()));
    }
    case QMetaType::QVariantMap: {
        QStringList parts;
        const QVariantMap map = value.toMap();
        for (auto it = map.cbegin(); it != map.cend(); ++it)
            parts.append(it.key() + QLatin1Char('=') + describe(it.value()));
        return QLatin1Char('{') + parts.join(QLatin1Char(',')) + QLatin1Char('}');
    }
    case QMetaType::QVariantList: {
        QStringList parts;
        for (const QVariant &item : value.toList())
            parts.append(describe(item));
        return QLatin1Char('[') + parts.join(QLatin1Char(',')) + QLatin1Char(']');
    }
    default:
        return QStringLiteral("?") + QLatin1String(value.typeName());
    }
}

QString describeErrors(const QList<CsvError> &errors)
{
    QStringList parts;
    for (const CsvError &error : errors)
        parts.append(QStringLiteral("%1@%2:%3").arg(error.type).arg(error.line).arg(error.column));
    return parts.join(QLatin1Char(';'));
}

struct Result
{
    bool ok = false;
    QVariantList records;
    QList<CsvError> errors;
    QString errorString;
    QStringList headers;
};

Result parseBytes(const QByteArray &data, const QVariantMap &options = QVariantMap())
{
    QByteArray copy = data;
    QBuffer buffer(&copy);
    CsvParser parser(&buffer);
    Result result;
    result.ok = parser.parse(options);
    result.records = parser.records();
    result.errors = parser.errors();
    result.errorString = parser.errorString();
    result.headers = parser.headers();
    return result;
}

QVariantMap options(std::initializer_list<std::pair<QString, QVariant>> pairs)
{
    QVariantMap map;
    for (const auto &pair : pairs)
        map.insert(pair.first, pair.second);
    return map;
}

// What typing a field means, computed the slow, obvious way with Qt.
QVariant referenceType(const QString &text, const QLocale &locale, const QString &format)
{
    const QDateTime dateTime = format.isEmpty() ? QDateTime::fromString(text, Qt::ISODate)
                                                : locale.toDateTime(text, format);
    if (dateTime.isValid())
        return dateTime;
    bool ok = false;
    const int integer = locale.toInt(text, &ok);
    if (ok)
        return integer;
    const double real = locale.toDouble(text, &ok);
    if (ok)
        return real;
    return text;
}

} // namespace

class tst_CsvParser : public QObject
{
    Q_OBJECT

private slots:
    void records_data();
    void records();
    void errorTexts_data();
    void errorTexts();
    void headerFailures_data();
    void headerFailures();
    void signalOrder_data();
    void signalOrder();
    void typing_data();
    void typing();
    void typingWords_data();
    void typingWords();
    void encodings_data();
    void encodings();
    void csvSpectrum_data();
    void csvSpectrum();
    void chunkBoundaries();
    void devices();
    void repeatedParse();
    void options();
};

void tst_CsvParser::records_data()
{
    QTest::addColumn<QByteArray>("data");
    QTest::addColumn<QVariantMap>("options");
    QTest::addColumn<QString>("records");
    QTest::addColumn<QString>("errors");

    const QVariantMap none;
    QTest::newRow("simple, no final newline") << QByteArray("a,b\n1,x") << none << "[{a=int:1,b='x'}]" << "";
    QTest::newRow("final newline adds a short record")
        << QByteArray("a,b\n1,x\n") << none << "[{a=int:1,b='x'}]" << "1@3:0";
    QTest::newRow("final newline, one header") << QByteArray("a\n1\n") << none << "[{a=int:1},{a=null}]" << "";
    QTest::newRow("header row only") << QByteArray("a,b\n") << none << "[]" << "1@2:0";
    QTest::newRow("quoted field across lines")
        << QByteArray("a,b\n\"l1\nl2\",2\n3,4") << none << "[{a='l1\nl2',b=int:2},{a=int:3,b=int:4}]" << "";
    QTest::newRow("line numbers count lines inside quotes")
        << QByteArray("a,b\n\"l1\nl2\",2\n3\n4,5") << none << "[{a='l1\nl2',b=int:2},{a=int:4,b=int:5}]"
        << "1@5:0";
    QTest::newRow("doubled qualifier") << QByteArray("a\n\"say \"\"hi\"\"\"") << none << "[{a='say \"hi\"'}]" << "";
    QTest::newRow("null, empty quoted, blank")
        << QByteArray("a,b,c\n,\"\",  ") << none << "[{a=null,b='',c=''}]" << "";
    QTest::newRow("emptyValueAsNull false")
        << QByteArray("a,b,c\n,\"\",  ") << ::options({ { "emptyValueAsNull", false } }) << "[{a='',b='',c=''}]" << "";
    QTest::newRow("trim false")
        << QByteArray("a,b,c\n 1 , x ,\" q \"") << ::options({ { "trim", false } }) << "[{a=int:1,b=' x ',c=' q '}]"
        << "";
    QTest::newRow("trimmed plain, untrimmed quoted")
        << QByteArray("a,b\n 1 ,\" q \"") << none << "[{a=int:1,b=' q '}]" << "";
    QTest::newRow("typed values")
        << QByteArray("i,d,t,q,dt,neg\n42,3.5,abc,\"7\",2020-01-02,-12") << none
        << "[{d=double:3.5,dt=dt:2020-01-02T00:00:00.000L,i=int:42,neg=int:-12,q='7',t='abc'}]" << "";
    QTest::newRow("valueType text")
        << QByteArray("i,d,dt\n42,3.5,2020-01-02") << ::options({ { "valueType", "TEXT" } })
        << "[{d='3.5',dt='2020-01-02',i='42'}]" << "";
    QTest::newRow("dateTimeFormat")
        << QByteArray("a,b\n03.04.2021,2021-04-03") << ::options({ { "dateTimeFormat", "dd.MM.yyyy" } })
        << "[{a=dt:2021-04-03T00:00:00.000L,b='2021-04-03'}]" << "";
    QTest::newRow("large integer becomes double")
        << QByteArray("a\n12345678901") << none << "[{a=double:12345678901}]" << "";
    QTest::newRow("blank line, one header")
        << QByteArray("a\n1\n\n2") << none << "[{a=int:1},{a=null},{a=int:2}]" << "";
    QTest::newRow("blank line, two headers")
        << QByteArray("a,b\n1,2\n\n3,4") << none << "[{a=int:1,b=int:2},{a=int:3,b=int:4}]" << "1@4:0";
    QTest::newRow("CRLF") << QByteArray("a,b\r\n1,2\r\n3,4") << none << "[{a=int:1,b=int:2},{a=int:3,b=int:4}]" << "";
    QTest::newRow("lone CR ends the parse quietly") << QByteArray("a\r1\r2") << none << "[{a=int:1}]" << "";
    QTest::newRow("text after a closing qualifier")
        << QByteArray("a,b\n\"x\"y,2") << none << "[]" << "3@2:4;4@2:7";
    QTest::newRow("text after a closing qualifier, strict")
        << QByteArray("a,b\n\"x\"y,2\n3,4") << ::options({ { "ignoreInvalidLines", false } }) << "[]" << "3@2:4";
    QTest::newRow("qualifier in a plain field")
        << QByteArray("a,b\nx\"y,2\n3,4") << none << "[{a=int:3,b=int:4}]" << "2@2:2";
    QTest::newRow("qualifier in a plain field, strict")
        << QByteArray("a,b\n1,2\nx\"y,2\n3,4") << ::options({ { "ignoreInvalidLines", false } })
        << "[{a=int:1,b=int:2}]" << "2@3:2";
    QTest::newRow("space before a quoted field")
        << QByteArray("a\n \"x\"") << none << "[]" << "2@2:2;2@2:4";
    QTest::newRow("too few fields") << QByteArray("a,b\n1\n2,3") << none << "[{a=int:2,b=int:3}]" << "1@3:0";
    QTest::newRow("too few fields, strict")
        << QByteArray("a,b\n1\n2,3") << ::options({ { "ignoreInvalidLines", false } }) << "[]" << "1@3:0";
    QTest::newRow("too many fields") << QByteArray("a,b\n1,2,3") << none << "[]" << "1@2:0";
    QTest::newRow("overflow lands on a header named Field")
        << QByteArray("Field,b\n1,2,3") << none << "[{Field=int:3,b=int:2}]" << "";
    QTest::newRow("too many fields as array")
        << QByteArray("a,b\n1,2,3") << ::options({ { "dataElementAsArray", true } }) << "[['a','b']]" << "1@2:0";
    QTest::newRow("end of data inside quotes") << QByteArray("a\n\"abc") << none << "[]" << "4@2:5";
    QTest::newRow("end of data inside quotes after a newline")
        << QByteArray("a\n1\n\"ab\nc") << none << "[{a=int:1}]" << "4@4:2";
    QTest::newRow("other delimiter and qualifier")
        << QByteArray("a;b\n'x;y';2") << ::options({ { "delimiter", ";" }, { "textQualifier", "'" } })
        << "[{a='x;y',b=int:2}]" << "";
    QTest::newRow("two-character delimiter is ignored")
        << QByteArray("a,b\n1,2") << ::options({ { "delimiter", "::" }, { "textQualifier", "''" } })
        << "[{a=int:1,b=int:2}]" << "";
    QTest::newRow("explicit fields")
        << QByteArray("1,2\n3,4") << ::options({ { "fields", QStringList { "x", " y " } } })
        << "[{x=int:1,y=int:2},{x=int:3,y=int:4}]" << "";
    QTest::newRow("array mode keeps the header row")
        << QByteArray("a,b\n1,2") << ::options({ { "DATAELEMENTASARRAY", true } }) << "[['a','b'],[int:1,int:2]]" << "";
    QTest::newRow("typed header names")
        << QByteArray("1.50,b\n1,2") << none << "[{1.5=int:1,b=int:2}]" << "";
    QTest::newRow("U+FFFF is data")
        << QByteArray("a\nx\xef\xbf\xbfy") << none << QStringLiteral("[{a='x\uffffy'}]") << "";
}

void tst_CsvParser::records()
{
    QFETCH(QByteArray, data);
    QFETCH(QVariantMap, options);
    QFETCH(QString, records);
    QFETCH(QString, errors);

    const Result result = parseBytes(data, options);
    QVERIFY(result.ok);
    QCOMPARE(describe(result.records), records);
    QCOMPARE(describeErrors(result.errors), errors);
}

void tst_CsvParser::errorTexts_data()
{
    QTest::addColumn<QByteArray>("data");
    QTest::addColumn<int>("type");
    QTest::addColumn<QString>("message");
    QTest::addColumn<QString>("errorString");

    QTest::newRow("count") << QByteArray("a,b\n1") << 1
                           << "Incorrect number of fields (Header length: 2, current record length: 1)"
                           << "Incorrect number of fields (Header length: 2, current record length: 1) at line 2";
    QTest::newRow("plain") << QByteArray("a\nx\"") << 2
                           << "Illegal data format: Text qualifier inside non-escaped field"
                           << "Illegal data format: Text qualifier inside non-escaped field at line 2 column 2";
    QTest::newRow("quoted") << QByteArray("a\n\"x\"y\"") << 3
                            << "Illegal data format: Unescaped text qualifier inside escaped field"
                            << "Illegal data format: Unescaped text qualifier inside escaped field at line 2 column 4";
    QTest::newRow("end") << QByteArray("a\n\"x") << 4 << "Illegal data format: EndOfFile inside escaped field"
                         << "Illegal data format: EndOfFile inside escaped field at line 2 column 3";
}

void tst_CsvParser::errorTexts()
{
    QFETCH(QByteArray, data);
    QFETCH(int, type);
    QFETCH(QString, message);
    QFETCH(QString, errorString);

    const Result result = parseBytes(data);
    QVERIFY(result.ok);
    QVERIFY(!result.errors.isEmpty());
    QCOMPARE(result.errors.first().type, type);
    QCOMPARE(result.errors.first().message, message);
    if (result.errors.size() == 1)
        QCOMPARE(result.errorString, errorString);
}

void tst_CsvParser::headerFailures_data()
{
    QTest::addColumn<QByteArray>("data");
    QTest::addColumn<QVariantMap>("options");
    QTest::addColumn<QString>("message");

    const QVariantMap none;
    QTest::newRow("empty file") << QByteArray() << none << "Duplicate or empty header name: \"\" at header no.1";
    QTest::newRow("duplicate") << QByteArray("a,b,a\n1,2,3") << none
                               << "Duplicate or empty header name: \"a\" at header no.3";
    QTest::newRow("duplicate after trimming") << QByteArray("a, a\n1,2") << none
                                              << "Duplicate or empty header name: \"a\" at header no.2";
    QTest::newRow("blank") << QByteArray("a,,c\n1,2,3") << none << "Duplicate or empty header name: \"\" at header no.2";
    QTest::newRow("fields") << QByteArray("1,2") << ::options({ { "fields", QVariantList { "x", "y", "x" } } })
                            << "Duplicate or empty header name: \"x\" at header no.3";
}

void tst_CsvParser::headerFailures()
{
    QFETCH(QByteArray, data);
    QFETCH(QVariantMap, options);
    QFETCH(QString, message);

    QByteArray copy = data;
    QBuffer buffer(&copy);
    CsvParser parser(&buffer);
    QSignalSpy fileRead(&parser, &CsvParser::fileRead);
    QSignalSpy errorSpy(&parser, &CsvParser::error);
    QSignalSpy errorsChanged(&parser, &CsvParser::errorsChanged);
    QVERIFY(!parser.parse(options));
    QCOMPARE(fileRead.count(), 0);
    QCOMPARE(errorsChanged.count(), 1);
    QCOMPARE(errorSpy.count(), 1);
    const CsvError error = errorSpy.first().first().value<CsvError>();
    QCOMPARE(error.type, int(CsvError::BadHeaderName));
    QCOMPARE(error.line, 0);
    QCOMPARE(error.column, 0);
    QCOMPARE(error.message, message);
    QCOMPARE(parser.errorString(), message);
    QVERIFY(!buffer.isOpen());
}

void tst_CsvParser::signalOrder_data()
{
    QTest::addColumn<bool>("asArray");
    QTest::addColumn<QStringList>("expected");

    QTest::newRow("objects") << false
                             << QStringList { "headers a,b", "object", "errorsChanged", "error 1", "object",
                                              "errorsChanged", "error 1", "fileRead 2" };
    QTest::newRow("arrays") << true
                            << QStringList { "array", "headers a,b", "array", "errorsChanged", "error 1", "array",
                                             "errorsChanged", "error 1", "fileRead 3" };
}

void tst_CsvParser::signalOrder()
{
    QFETCH(bool, asArray);
    QFETCH(QStringList, expected);

    QByteArray data("a,b\n1,2\n3\n4,5\n");
    QBuffer buffer(&data);
    CsvParser parser(&buffer);
    QStringList log;
    connect(&parser, &CsvParser::headersRead, [&](const QStringList &h) { log << "headers " + h.join(','); });
    connect(&parser, &CsvParser::recordReadAsArray, [&](const QVariantList &) { log << "array"; });
    connect(&parser, &CsvParser::recordReadAsObject, [&](const QVariantMap &) { log << "object"; });
    connect(&parser, &CsvParser::errorsChanged, [&]() { log << "errorsChanged"; });
    connect(&parser, &CsvParser::error, [&](const CsvError &e) { log << QStringLiteral("error %1").arg(e.type); });
    connect(&parser, &CsvParser::fileRead, [&](const QVariantList &all) {
        log << QStringLiteral("fileRead %1").arg(all.size());
        // The list delivered is the list kept.
        QCOMPARE(all, parser.records());
    });
    QVERIFY(parser.parse(::options({ { "dataElementAsArray", asArray } })));
    QCOMPARE(log, expected);
}

void tst_CsvParser::typing_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("locale");
    QTest::addColumn<QString>("format");

    const QStringList samples {
        "0", "7", "-0", "+5", "-12", "007", "123456789", "999999999", "2147483647", "2147483648", "-2147483648",
        "-2147483649", "1234567890123", "3.5", "-3.50", "+0.25", "0.1", "1.", ".5", "-.5", "1e5", "1E-3",
        "12.34.56", "1,234", "1,234.5", "inf", "-inf", "nan", "NaN", "Infinity", "0x1F", "1_000", "12abc",
        "abc", "e5", "Zürich", "١٢٣", "0.30000000000000004", "179769313486231570000000000000000000000.0",
        "2020-01-02", "2020/01/02", "2020-13-02", "2020-02-30", "0000-01-01", "2020-01-02T03:04:05",
        "2020-01-02T03:04:05.678", "2020-01-02T03:04:05Z", "2020-01-02T03:04:05+02:00", "2020-01-02T03:04:05-0130",
        "2020-01-02 03:04:05", "2020-01-02T24:00:00", "2020-01-02T25:00:00", "2020-01-02T03:04", "2020-01-023",
        "20200102", "20200102T030405", "2020.01.02", "2020-1-2", " 2020-01-02", "2020-01-02x", "99999-01-02",
        "1.5.2020", "03.04.2021", "1.000", "1.000,5", "-1,5", "1 000", "12:30",
    };
    for (const QString &sample : samples) {
        QTest::addRow("C %s", qPrintable(sample)) << sample << "C" << QString();
        QTest::addRow("de %s", qPrintable(sample)) << sample << "de_DE" << QString();
    }
    QTest::newRow("format match") << "03.04.2021" << "C" << "dd.MM.yyyy";
    QTest::newRow("format miss, number") << "3.5" << "C" << "dd.MM.yyyy";
    QTest::newRow("format, de") << "03.04.2021 10:11" << "de_DE" << "dd.MM.yyyy hh:mm";
}

// The parser takes shortcuts for common shapes of numbers and dates; every
// one must give what Qt's own conversions give.
void tst_CsvParser::typing()
{
    QFETCH(QString, text);
    QFETCH(QString, locale);
    QFETCH(QString, format);

    const QByteArray data = "h\n" + text.toUtf8();
    const QVariantMap options = ::options({ { "locale", locale }, { "dateTimeFormat", format }, { "delimiter", ";" } });
    const Result result = parseBytes(data, options);
    QVERIFY(result.ok);
    QCOMPARE(result.records.size(), 1);
    const QVariant value = result.records.first().toMap().value("h");
    QCOMPARE(describe(value), describe(referenceType(text.trimmed(), QLocale(locale), format)));

    // Twice in one parse: the date cache returns what the first one gave.
    const Result twice = parseBytes("h\n" + text.toUtf8() + "\n" + text.toUtf8(), options);
    QCOMPARE(twice.records.size(), 2);
    QCOMPARE(describe(twice.records.at(1)), describe(twice.records.at(0)));
}

void tst_CsvParser::typingWords_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<bool>("trim");

    const QStringList samples { "india", "november", "naïve", "nan", "NaN", "NAN", "inf", "Inf", "iNF", "in",
                                "i", "n", "na", "info", "nanny", "infinity", "inf ", "nan\t", " inf", "in f",
                                "ina", "x-ray", "Zulu", "İnf", "ınf" };
    for (const QString &sample : samples) {
        QTest::addRow("'%s'", qPrintable(sample)) << sample << true;
        QTest::addRow("'%s' untrimmed", qPrintable(sample)) << sample << false;
    }
}

// Words, some of which Qt reads as numbers, in the C locale and with the
// surrounding white space kept or not.
void tst_CsvParser::typingWords()
{
    QFETCH(QString, text);
    QFETCH(bool, trim);

    const Result result = parseBytes("h\n" + text.toUtf8(), ::options({ { "trim", trim } }));
    QVERIFY(result.ok);
    QCOMPARE(result.records.size(), 1);
    const QVariant value = result.records.first().toMap().value("h");
    QCOMPARE(describe(value), describe(referenceType(trim ? text.trimmed() : text, QLocale::c(), QString())));
}

void tst_CsvParser::encodings_data()
{
    QTest::addColumn<QByteArray>("data");
    QTest::addColumn<QString>("encoding");

    const QString text = QStringLiteral("name,city\nJosé,\"Zürich, Łódź\"\n");
    QTest::newRow("UTF-8") << text.toUtf8() << QString();
    QTest::newRow("UTF-8 with a mark") << QByteArray("\xef\xbb\xbf") + text.toUtf8() << QString();
    QTest::newRow("mark wins over the option") << QByteArray("\xef\xbb\xbf") + text.toUtf8() << "ISO-8859-1";
    // Encoded without a mark of the codec's own; the rows add theirs.
    auto encoded = [&text](const char *name) {
        QTextCodec::ConverterState state(QTextCodec::IgnoreHeader);
        return QTextCodec::codecForName(name)->fromUnicode(text.constData(), text.size(), &state);
    };
    QTest::newRow("UTF-16LE with a mark") << QByteArray("\xff\xfe") + encoded("UTF-16LE") << QString();
    QTest::newRow("UTF-16BE with a mark") << QByteArray("\xfe\xff") + encoded("UTF-16BE") << QString();
    QTest::newRow("UTF-32LE with a mark") << QByteArray("\xff\xfe\x00\x00", 4) + encoded("UTF-32LE") << QString();
    QTest::newRow("UTF-16LE by name") << encoded("UTF-16LE") << "UTF-16LE";
    QTest::newRow("UTF-16BE mark, option says Latin-1") << QByteArray("\xfe\xff") + encoded("UTF-16BE") << "ISO-8859-1";
}

void tst_CsvParser::encodings()
{
    QFETCH(QByteArray, data);
    QFETCH(QString, encoding);

    const Result result = parseBytes(data, ::options({ { "encoding", encoding } }));
    QVERIFY(result.ok);
    QCOMPARE(result.headers, QStringList({ "name", "city" }));
    QCOMPARE(describe(result.records), QStringLiteral("[{city='Zürich, Łódź',name='José'}]"));

    // Latin-1 bytes read as Latin-1 when asked, and as damaged UTF-8 otherwise.
    const QByteArray latin1 = QByteArray("a\nJos\xe9");
    QCOMPARE(describe(parseBytes(latin1, ::options({ { "encoding", "ISO-8859-1" } })).records),
             QStringLiteral("[{a='José'}]"));
    QCOMPARE(describe(parseBytes(latin1).records), QStringLiteral("[{a='Jos\ufffd'}]"));
}

void tst_CsvParser::csvSpectrum_data()
{
    QTest::addColumn<QString>("name");
    const QDir dir(TestSupport::dataPath("parsers/csv-spectrum/csvs"));
    const QStringList files = dir.entryList({ "*.csv" }, QDir::Files, QDir::Name);
    QVERIFY(files.size() >= 12);
    for (const QString &file : files)
        QTest::newRow(qPrintable(file)) << file.chopped(4);
}

// The suite's expectations, read with every value as text. One file holds
// a quote inside a plain field, which this parser reports and drops.
void tst_CsvParser::csvSpectrum()
{
    QFETCH(QString, name);
    const QString base = TestSupport::dataPath("parsers/csv-spectrum/");
    QFile file(base + "csvs/" + name + ".csv");
    CsvParser parser(&file);
    QVERIFY(parser.parse(::options({ { "valueType", "text" } })));

    QFile json(base + "json/" + name + ".json");
    QVERIFY(json.open(QIODevice::ReadOnly));
    const QVariantList expected = QJsonDocument::fromJson(json.readAll()).toVariant().toList();

    if (name == QLatin1String("location_coordinates")) {
        QCOMPARE(parser.records().size(), 0);
        QCOMPARE(describeErrors(parser.errors()), QStringLiteral("2@2:22;2@2:35"));
        return;
    }
    QCOMPARE(describe(parser.records()), describe(expected));
    // A final line break reports one short record, as it should.
    const QList<CsvError> errors = parser.errors();
    QVERIFY(errors.size() <= 1);
    for (const CsvError &error : errors)
        QCOMPARE(error.type, int(CsvError::WrongFieldCount));
}

// Fields, line breaks inside quotes and multi-byte characters that straddle
// the reader's chunks come out whole.
void tst_CsvParser::chunkBoundaries()
{
    QByteArray data("id,text,value\n");
    QStringList texts;
    for (int i = 0; data.size() < 3 * 1024 * 1024 + 77; ++i) {
        const QString text = QStringLiteral("ł%1 \"q\"\nż€😀").arg(i).repeated(1 + i % 7);
        texts.append(text);
        QString quoted = text;
        quoted.replace('"', "\"\"");
        data += QByteArray::number(i) + ",\"" + quoted.toUtf8() + "\"," + QByteArray::number(i * 0.5, 'f', 1) + "\n";
    }
    data += QByteArray::number(texts.size()) + ",last," + QByteArray("żółw");

    QTemporaryDir dir;
    QFile file(dir.filePath("big.csv"));
    QVERIFY(file.open(QIODevice::WriteOnly));
    file.write(data);
    file.close();

    CsvParser parser(&file);
    QVERIFY(parser.parse());
    const QVariantList records = parser.records();
    QCOMPARE(records.size(), texts.size() + 1);
    QVERIFY(parser.errors().isEmpty());
    int line = 2;
    for (int i = 0; i < texts.size(); ++i) {
        const QVariantMap record = records.at(i).toMap();
        QCOMPARE(record.value("id").toInt(), i);
        QCOMPARE(record.value("text").toString(), texts.at(i));
        QCOMPARE(record.value("value").toDouble(), i * 0.5);
        line += 1 + texts.at(i).count('\n');
    }
    QCOMPARE(records.last().toMap().value("value").toString(), QStringLiteral("żółw"));

    // Positions stay right across the chunks: an error on the last line.
    data.chop(QByteArray("żółw").size());
    data += "x\"y";
    QVERIFY(file.open(QIODevice::WriteOnly));
    file.write(data);
    file.close();
    QVERIFY(parser.parse());
    QCOMPARE(describeErrors(parser.errors()), QStringLiteral("2@%1:%2").arg(line).arg(QString::number(texts.size()).size() + 8));
}

void tst_CsvParser::devices()
{
    CsvParser none(nullptr);
    QVERIFY(!none.parse());
    QCOMPARE(none.errorString(), QStringLiteral("QIODevice has not been set."));

    QTemporaryDir dir;
    QFile missing(dir.filePath("missing.csv"));
    CsvParser unopened(&missing);
    QSignalSpy fileRead(&unopened, &CsvParser::fileRead);
    QVERIFY(!unopened.parse());
    QCOMPARE(unopened.errorString(), QStringLiteral("Open QIODevice failed."));
    QCOMPARE(fileRead.count(), 0);

    // The device is closed after the parse, and the parser never deletes it.
    QFile file(dir.filePath("ok.csv"));
    QVERIFY(file.open(QIODevice::WriteOnly));
    file.write("a\n1");
    file.close();
    {
        CsvParser parser(&file);
        QVERIFY(parser.parse());
        QVERIFY(!file.isOpen());
        QVERIFY(file.open(QIODevice::ReadOnly));
    }
    QVERIFY(!file.isOpen());

    // A device deleted before the parser leaves nothing dangling.
    auto *buffer = new QBuffer;
    CsvParser orphan(buffer);
    delete buffer;
    QVERIFY(!orphan.parse());
}

void tst_CsvParser::repeatedParse()
{
    QByteArray data("1,2\n3\n");
    QBuffer buffer(&data);
    CsvParser parser(&buffer);
    QVERIFY(parser.setOptions(::options({ { "fields", QStringList { "x", "y" } } })));
    QVERIFY(parser.hasFixedFields());
    for (int round = 0; round < 2; ++round) {
        QVERIFY(parser.parse());
        QCOMPARE(describe(parser.records()), QStringLiteral("[{x=int:1,y=int:2}]"));
        QCOMPARE(describeErrors(parser.errors()), QStringLiteral("1@3:0;1@3:0"));
        QCOMPARE(parser.headers(), QStringList({ "x", "y" }));
    }
    // New fields replace the old ones instead of clashing with them.
    QVERIFY(parser.setOptions(::options({ { "fields", QStringList { "y", "z" } } })));
    QCOMPARE(parser.headers(), QStringList({ "y", "z" }));

    QByteArray other("a\n1");
    QBuffer second(&other);
    CsvParser free(&second);
    QVERIFY(free.parse());
    second.setData("b\n2");
    QVERIFY(free.parse());
    QCOMPARE(free.headers(), QStringList({ "b" }));
    QCOMPARE(describe(free.records()), QStringLiteral("[{b=int:2}]"));
}

void tst_CsvParser::options()
{
    QByteArray data;
    QBuffer buffer(&data);
    CsvParser parser(&buffer);
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Unknown valueType, defaulting to \"auto\"\\.$"));
    QVERIFY(parser.setOptions(::options({ { "ValueType", "number" }, { "Delimiter", ";" }, { "TRIM", false },
                                         { "locale", QLocale(QLocale::German) }, { "encoding", "UTF-16" },
                                         { "textqualifier", "" }, { "fields", QVariantList() } })));
    QCOMPARE(parser.valueType(), QStringLiteral("auto"));
    QCOMPARE(parser.delimiter(), QChar(';'));
    QCOMPARE(parser.textQualifier(), QChar('"'));
    QVERIFY(!parser.trim());
    QCOMPARE(parser.locale().language(), QLocale::German);
    QCOMPARE(parser.encoding(), QStringLiteral("UTF-16"));
    QVERIFY(!parser.hasFixedFields());

    QVERIFY(parser.setOptions(::options({ { "locale", "fr_FR" }, { "valueType", "Text" } })));
    QCOMPARE(parser.locale().language(), QLocale::French);
    QCOMPARE(parser.valueType(), QStringLiteral("text"));
    QVERIFY(parser.setOptions(::options({ { "locale", QVariant::fromValue(&buffer) } })));
    QCOMPARE(parser.locale().language(), QLocale::French);
}

QTEST_GUILESS_MAIN(tst_CsvParser)

#include "tst_CsvParser.moc"
