#include "CsvDateTimeCache.h"

#include <QtTest>

#include <ctime>

namespace {

// Everything a caller can see of a date-time.
QString describe(const QDateTime &dateTime)
{
    if (!dateTime.isValid())
        return dateTime.isNull() ? QStringLiteral("null") : QStringLiteral("invalid");
    return dateTime.toString(Qt::ISODateWithMs) + QStringLiteral(" time kind %1 ms %2 dst %3")
                                                      .arg(dateTime.timeSpec())
                                                      .arg(dateTime.toMSecsSinceEpoch())
                                                      .arg(dateTime.isDaylightTime());
}

QString cached(CsvDateTimeCache &cache, const QString &text)
{
    return describe(cache.fromIsoText(text.constData(), text.size()));
}

QString reference(const QString &text)
{
    return describe(QDateTime::fromString(text, Qt::ISODate));
}

} // namespace

class tst_CsvDateTimeCache : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void shapes_data();
    void shapes();
    void manyDates();
};

// A zone whose clocks went forward at midnight: some dates have no start of
// day there, which Qt answers in its own way.
void tst_CsvDateTimeCache::initTestCase()
{
    if (!QFile::exists(QStringLiteral("/usr/share/zoneinfo/America/Sao_Paulo")))
        QSKIP("tzdata is not installed");
    qputenv("TZ", "America/Sao_Paulo");
    tzset();
    QCOMPARE(QDateTime(QDate(2018, 11, 4), QTime(0, 30)).isValid(), false);
}

void tst_CsvDateTimeCache::shapes_data()
{
    QTest::addColumn<QString>("text");
    const char *texts[] = {
        "2021-04-03", "2021-02-29", "2020-02-29", "2021-02-30", "2021-13-01", "2021-00-10", "0000-01-01",
        "0001-01-01", "9999-12-31", "2021-4-03x", "2021/04/03", "2021.04.03", "2021-04-03T10:11:12",
        "2021-04-03T10:11:12Z", "2021-04-03T10:11:12+02:00", "2021-04-03T10:11:12.345+02:00",
        "2021-04-03 10:11", "2021-04-03T25:00", "2018-11-04", "2018-11-04T00:30", "2019-02-16",
        "1970-01-01T00:00:00.000000000000Z", "２０２１-04-03",
        "2021-04-0３", "-021-04-03", "+021-04-03", " 2021-04-03",
    };
    for (const char *text : texts)
        QTest::newRow(text) << QString::fromUtf8(text);
}

// Each shape of text, first seen and then from the cache, against Qt's own
// reading, before and after the dates of a parse have their own table.
void tst_CsvDateTimeCache::shapes()
{
    QFETCH(QString, text);
    CsvDateTimeCache cache;
    const QString expected = reference(text);
    QCOMPARE(cached(cache, text), expected);
    QCOMPARE(cached(cache, text), expected);

    // Again once the parse has seen enough dates for the table of days.
    cache.clear();
    for (int i = 0; i < 300; ++i) {
        const QString filler = QDate(2000, 1, 1).addDays(i).toString(Qt::ISODate);
        QCOMPARE(cached(cache, filler), reference(filler));
    }
    QCOMPARE(cached(cache, text), expected);
    QCOMPARE(cached(cache, text), expected);
}

// More distinct dates than the tables hold, so that they grow and then
// fill up, and date-times that share the second table; every answer, first
// or repeated, must be Qt's.
void tst_CsvDateTimeCache::manyDates()
{
    CsvDateTimeCache cache;
    const QDate first(1900, 1, 1);
    const int days = 40000;
    QStringList texts;
    for (int i = 0; i < days; i += 1)
        texts.append(first.addDays(i).toString(Qt::ISODate));
    for (int i = 0; i < 3000; ++i)
        texts.append(first.addDays(i * 7).toString(Qt::ISODate)
                     + QStringLiteral("T%1:30").arg(i % 24, 2, 10, QLatin1Char('0')));
    QStringList expected;
    for (const QString &text : qAsConst(texts))
        expected.append(reference(text));

    for (int pass = 0; pass < 2; ++pass) {
        for (int i = 0; i < texts.size(); ++i) {
            const int index = pass == 0 ? i : (i * 7919) % texts.size();
            QCOMPARE(cached(cache, texts.at(index)), expected.at(index));
        }
    }
}

QTEST_GUILESS_MAIN(tst_CsvDateTimeCache)
#include "tst_CsvDateTimeCache.moc"
