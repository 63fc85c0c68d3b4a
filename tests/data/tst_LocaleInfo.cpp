#include "LocaleInfo.h"
#include "Loomkit.h"

#include <QJSEngine>
#include <QQmlEngine>
#include <QSignalSpy>
#include <QtTest>

class tst_LocaleInfo : public QObject
{
    Q_OBJECT

private slots:
    void names_data();
    void names();
    void numbers_data();
    void numbers();
    void datesAndTimes_data();
    void datesAndTimes();
    void nameChange();
    void factory();
};

void tst_LocaleInfo::names_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<QString>("canonical");
    QTest::addColumn<QString>("language");
    QTest::addColumn<QString>("country");
    QTest::addColumn<QString>("nativeLanguage");
    QTest::addColumn<bool>("rightToLeft");
    QTest::addColumn<QString>("currencyIsoCode");

    QTest::newRow("german") << "de_DE" << "de_DE" << "de" << "DE" << "Deutsch" << false << "EUR";
    QTest::newRow("language only") << "fr" << "fr_FR" << "fr" << "FR" << "fran\u00e7ais" << false << "EUR";
    QTest::newRow("hebrew") << "he_IL" << "he_IL" << "he" << "IL" << "\u05e2\u05d1\u05e8\u05d9\u05ea" << true
                            << "ILS";
    QTest::newRow("bcp47 form") << "en-GB" << "en_GB" << "en" << "GB" << "British English" << false << "GBP";
}

void tst_LocaleInfo::names()
{
    QFETCH(QString, name);
    LocaleInfo info(name);
    QTEST(info.name(), "canonical");
    QTEST(info.languageCode(), "language");
    QTEST(info.countryCode(), "country");
    QTEST(info.nativeLanguageName(), "nativeLanguage");
    QTEST(info.isRightToLeft(), "rightToLeft");
    QTEST(info.currencyIsoCode(), "currencyIsoCode");
}

void tst_LocaleInfo::numbers_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<QString>("number");
    QTest::addColumn<QString>("integer");
    QTest::addColumn<QString>("currency");

    QTest::newRow("en_US") << "en_US" << "1,234,567.89" << "-1,235" << "$1,234,567.89";
    QTest::newRow("de_DE") << "de_DE" << "1.234.567,89" << "-1.235" << "1.234.567,89\u00a0\u20ac";
    QTest::newRow("C") << "C" << "1234567.89" << "-1235" << "\u00a41234567.89";
}

void tst_LocaleInfo::numbers()
{
    QFETCH(QString, name);
    QFETCH(QString, number);

    LocaleInfo info(name);
    QCOMPARE(info.formatNumber(1234567.891, 2), number);
    QTEST(info.formatInteger(-1234.5), "integer");
    QCOMPARE(info.parseNumber(number), 1234567.89);
    QVERIFY(qIsNaN(info.parseNumber(QStringLiteral("12abc"))));

    const QString currency = info.formatCurrency(1234567.891);
    if (name == QLatin1String("C"))
        QVERIFY(currency.contains(QLatin1String("1234567.89")));
    else
        QTEST(currency, "currency");
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

    LocaleInfo info(name);
    const QDateTime dateTime(QDate(2024, 3, 5), QTime(14, 7, 9));
    QCOMPARE(info.formatDate(dateTime, format), date);
    if (format.userType() != QMetaType::QString)
        QVERIFY(info.formatTime(dateTime, format).startsWith(time));
    QCOMPARE(info.formatDate(QStringLiteral("2024-03-05"), format), date);

    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Invalid date or time"));
    QCOMPARE(info.formatDate(QStringLiteral("not a date"), format), QString());
}

void tst_LocaleInfo::nameChange()
{
    LocaleInfo info(QStringLiteral("en_US"));
    QSignalSpy spy(&info, &LocaleInfo::localeChanged);
    info.setName(QStringLiteral("en_US"));
    QCOMPARE(spy.count(), 0);
    info.setName(QStringLiteral("de"));
    QCOMPARE(spy.count(), 1);
    QCOMPARE(info.monthName(3), QStringLiteral("M\u00e4rz"));
    QCOMPARE(info.dayName(1, LocaleInfo::ShortFormat), QStringLiteral("Mo."));
    QCOMPARE(info.decimalPoint(), QStringLiteral(","));
    QVERIFY(info.isMetric());
    QCOMPARE(info.firstDayOfWeek(), int(Qt::Monday));
}

void tst_LocaleInfo::factory()
{
    QLocale::setDefault(QLocale(QStringLiteral("nb_NO")));
    Loomkit loomkit;
    QJSEngine engine;

    QScopedPointer<LocaleInfo> fromNothing(loomkit.localeInfo());
    QCOMPARE(fromNothing->name(), QStringLiteral("nb_NO"));
    QCOMPARE(QQmlEngine::objectOwnership(fromNothing.data()), QQmlEngine::JavaScriptOwnership);

    QScopedPointer<LocaleInfo> fromNull(loomkit.localeInfo(QJSValue(QJSValue::NullValue)));
    QCOMPARE(fromNull->name(), QStringLiteral("nb_NO"));

    QScopedPointer<LocaleInfo> fromText(loomkit.localeInfo(QJSValue(QStringLiteral("ja_JP"))));
    QCOMPARE(fromText->name(), QStringLiteral("ja_JP"));

    QScopedPointer<LocaleInfo> fromObject(loomkit.localeInfo(engine.evaluate(QStringLiteral("({ name: 'pt_BR' })"))));
    QCOMPARE(fromObject->name(), QStringLiteral("pt_BR"));

    QLocale::setDefault(QLocale::c());
}

QTEST_MAIN(tst_LocaleInfo)
#include "tst_LocaleInfo.moc"
