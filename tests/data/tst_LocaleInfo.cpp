#include "LocaleInfo.h"
#include "Loomkit.h"

#include <QJSEngine>
#include <QQmlEngine>
#include <QtTest>

class tst_LocaleInfo : public QObject
{
    Q_OBJECT

private slots:
    void namesAndNumbers_data();
    void namesAndNumbers();
    void datesAndTimes_data();
    void datesAndTimes();
    void nameChange();
};

void tst_LocaleInfo::namesAndNumbers_data()
{
    QTest::addColumn<QString>("name");
    // name|languageCode|countryCode|isRightToLeft|currencyIsoCode
    QTest::addColumn<QString>("facts");
    // formatNumber(1234567.891, 2)|formatInteger(-1234.5)|formatCurrency(1234567.891), if given
    QTest::addColumn<QString>("numbers");

    QTest::newRow("german") << "de_DE" << "de_DE|de|DE|0|EUR" << "1.234.567,89|-1.235|1.234.567,89\u00a0\u20ac";
    QTest::newRow("american") << "en_US" << "en_US|en|US|0|USD" << "1,234,567.89|-1,235|$1,234,567.89";
    QTest::newRow("C") << "C" << "C|C||0|" << "1234567.89|-1235|1234567.89";
    QTest::newRow("language only") << "fr" << "fr_FR|fr|FR|0|EUR" << "";
    QTest::newRow("hebrew") << "he_IL" << "he_IL|he|IL|1|ILS" << "";
    QTest::newRow("bcp47 form") << "en-GB" << "en_GB|en|GB|0|GBP" << "";
}

void tst_LocaleInfo::namesAndNumbers()
{
    QFETCH(QString, name);
    QFETCH(QString, numbers);
    const LocaleInfo info(name);
    const QStringList facts { info.name(), info.languageCode(), info.countryCode(),
                              QString::number(info.isRightToLeft()), info.currencyIsoCode() };
    QTEST(facts.join(QLatin1Char('|')), "facts");
    if (numbers.isEmpty())
        return;
    const QStringList formatted { info.formatNumber(1234567.891, 2), info.formatInteger(-1234.5),
                                  info.formatCurrency(1234567.891) };
    QCOMPARE(formatted.join(QLatin1Char('|')), numbers);
    QCOMPARE(info.parseNumber(formatted.first()), 1234567.89);
    QVERIFY(qIsNaN(info.parseNumber(QStringLiteral("12abc"))));
}

void tst_LocaleInfo::datesAndTimes_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<QVariant>("format");
    QTest::addColumn<QString>("date");
    QTest::addColumn<QString>("time");

    QTest::newRow("pattern") << "de_DE" << QVariant("dd.MM.yyyy") << "05.03.2024" << "";
    QTest::newRow("de short") << "de_DE" << QVariant(int(LocaleInfo::ShortFormat)) << "05.03.24" << "14:07";
    QTest::newRow("en_US short") << "en_US" << QVariant(int(LocaleInfo::ShortFormat)) << "3/5/24" << "2:07 PM";
    QTest::newRow("en_US long") << "en_US" << QVariant() << "Tuesday, March 5, 2024" << "2:07:09 PM";
}

void tst_LocaleInfo::datesAndTimes()
{
    QFETCH(QString, name);
    QFETCH(QVariant, format);
    QFETCH(QString, date);
    QFETCH(QString, time);
    const LocaleInfo info(name);
    const QDateTime dateTime(QDate(2024, 3, 5), QTime(14, 7, 9));
    QCOMPARE(info.formatDate(dateTime, format), date);
    QCOMPARE(info.formatDate(QStringLiteral("2024-03-05"), format), date);
    if (!time.isEmpty())
        QVERIFY(info.formatTime(dateTime, format).startsWith(time));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Invalid date or time"));
    QCOMPARE(info.formatDate(QStringLiteral("not a date"), format), QString());
}

void tst_LocaleInfo::nameChange()
{
    Loomkit loomkit;
    QScopedPointer<LocaleInfo> info(loomkit.localeInfo(QJSValue(QStringLiteral("en_US"))));
    QCOMPARE(QQmlEngine::objectOwnership(info.data()), QQmlEngine::JavaScriptOwnership);
    QSignalSpy spy(info.data(), &LocaleInfo::localeChanged);
    info->setName(QStringLiteral("en_US"));
    info->setName(QStringLiteral("de"));
    QCOMPARE(spy.count(), 1);
    QCOMPARE(info->monthName(3), QStringLiteral("M\u00e4rz"));

    // The default comes from the application's default locale, not the C one.
    QLocale::setDefault(QLocale(QStringLiteral("nb_NO")));
    QScopedPointer<LocaleInfo> fromNothing(loomkit.localeInfo());
    QCOMPARE(fromNothing->name(), QStringLiteral("nb_NO"));
    QLocale::setDefault(QLocale::c());
}

QTEST_MAIN(tst_LocaleInfo)
#include "tst_LocaleInfo.moc"
