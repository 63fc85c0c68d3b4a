#include "XmlGuard.h"

#include <QtTest>

namespace {

QString repeat(const char *text, int count)
{
    return QString::fromLatin1(text).repeated(count);
}

QString nested(int depth)
{
    return repeat("<a>", depth) + repeat("</a>", depth);
}

} // namespace

class tst_XmlGuard : public QObject
{
    Q_OBJECT

private slots:
    void check_data();
    void check();
};

void tst_XmlGuard::check_data()
{
    QTest::addColumn<QString>("xml");
    QTest::addColumn<QString>("refusal"); // empty when the text may pass

    const QString big = repeat("x", 100000);
    const QString deep = QStringLiteral("Elements nested more than 1000 levels deep");
    const QString expands = QStringLiteral("Entity expansion exceeds 16777216 characters");

    QTest::newRow("plain") << "<r a='1'><b>x</b></r>" << "";
    QTest::newRow("empty") << "" << "";
    QTest::newRow("1000 levels") << nested(1000) << "";
    QTest::newRow("1001 levels") << nested(1001) << deep;
    QTest::newRow("closing tags don't undercount") << repeat("<a></a>", 5000) << "";
    QTest::newRow("self-closed") << "<r>" + repeat("<a/>", 5000) + "</r>" << "";
    QTest::newRow("self-closed with attributes") << "<r>" + repeat("<a b='/'  />", 3000) + "</r>" << "";
    QTest::newRow("'>' inside an attribute") << "<r>" + repeat("<a b='>'/>", 3000) + "</r>" << "";
    QTest::newRow("tags in comments") << "<r><!--" + repeat("<a>", 3000) + "--></r>" << "";
    QTest::newRow("tags in CDATA") << "<r><![CDATA[" + repeat("<a>", 3000) + "]]></r>" << "";
    QTest::newRow("tags in a processing instruction") << "<r><?p " + repeat("<a>", 3000) + "?></r>" << "";
    QTest::newRow("unclosed tags") << repeat("<a>", 1001) << deep;
    QTest::newRow("deep inside an entity")
        << "<!DOCTYPE r [<!ENTITY e '" + nested(701) + "'>]><r>" + nested(299).insert(299 * 3, "&e;") + "</r>"
        << deep;
    QTest::newRow("1000 levels through an entity")
        << "<!DOCTYPE r [<!ENTITY e '" + nested(700) + "'>]><r>" + nested(299).insert(299 * 3, "&e;") + "</r>" << "";
    QTest::newRow("entity nesting adds up through references")
        << "<!DOCTYPE r [<!ENTITY e '" + nested(600) + "'><!ENTITY f '" + repeat("<b>", 400) + "&e;"
               + repeat("</b>", 400) + "'>]><r>&f;</r>"
        << deep;
    QTest::newRow("predefined and character references") << "<r>" + repeat("&amp;&#65;&#x42;", 100000) + "</r>" << "";
    QTest::newRow("many small references")
        << "<!DOCTYPE r [<!ENTITY e 'abc'>]><r>" + repeat("&e;", 100000) + "</r>" << "";
    QTest::newRow("quadratic in content")
        << "<!DOCTYPE r [<!ENTITY e '" + big + "'>]><r>" + repeat("&e;", 200) + "</r>" << expands;
    QTest::newRow("quadratic in an attribute")
        << "<!DOCTYPE r [<!ENTITY e \"" + big + "\">]><r a='" + repeat("&e;", 200) + "'/>" << expands;
    QTest::newRow("exponential")
        << "<!DOCTYPE r [<!ENTITY a 'xxxxxxxxxx'><!ENTITY b '&a;&a;&a;&a;&a;&a;&a;&a;&a;&a;'>"
           "<!ENTITY c '&b;&b;&b;&b;&b;&b;&b;&b;&b;&b;'><!ENTITY d '&c;&c;&c;&c;&c;&c;&c;&c;&c;&c;'>"
           "<!ENTITY e '&d;&d;&d;&d;&d;&d;&d;&d;&d;&d;'><!ENTITY f '&e;&e;&e;&e;&e;&e;&e;&e;&e;&e;'>"
           "<!ENTITY g '&f;&f;&f;&f;&f;&f;&f;&f;&f;&f;'><!ENTITY h '&g;&g;&g;&g;&g;&g;&g;&g;&g;&g;'>]><r>&h;</r>"
        << expands;
    QTest::newRow("cycle") << "<!DOCTYPE r [<!ENTITY a '&b;'><!ENTITY b '&a;'>]><r>&a;</r>"
                           << "Entity \"a\" refers to itself";
    QTest::newRow("declared twice, the larger counts")
        << "<!DOCTYPE r [<!ENTITY e 'x'><!ENTITY e '" + big + "'>]><r>" + repeat("&e;", 200) + "</r>" << expands;
    QTest::newRow("declared inside a parameter entity")
        << "<!DOCTYPE r [<!ENTITY % d \"<!ENTITY e '" + big + "'>\">%d;]><r>" + repeat("&e;", 200) + "</r>"
        << expands;
    QTest::newRow("parameter entities expanding each other")
        << "<!DOCTYPE r [<!ENTITY % a '" + repeat("x", 1000) + "'><!ENTITY % b '%a;%a;%a;%a;%a;%a;%a;%a;%a;%a;'>"
               "<!ENTITY % c '%b;%b;%b;%b;%b;%b;%b;%b;%b;%b;'>" + repeat("%c;", 2000) + "]><r/>"
        << expands;
    QTest::newRow("long chain")
        << [] {
               QString dtd = QStringLiteral("<!DOCTYPE r [<!ENTITY e0 'x'>");
               for (int i = 1; i <= 100; ++i)
                   dtd += QStringLiteral("<!ENTITY e%1 '&e%2;'>").arg(i).arg(i - 1);
               return dtd + QStringLiteral("]><r>&e100;</r>");
           }()
        << "Entities nested more than 64 levels deep";
    QTest::newRow("external entities aren't fetched, so cost nothing")
        << "<!DOCTYPE r [<!ENTITY e SYSTEM 'http://example.invalid/x'>]><r>" + repeat("&e;", 100000) + "</r>" << "";
    QTest::newRow("undeclared references") << "<r>" + repeat("&nope;", 10000) + "</r>" << "";
}

void tst_XmlGuard::check()
{
    QFETCH(QString, xml);
    QFETCH(QString, refusal);

    QString reason;
    const bool passed = XmlGuard::check(xml, &reason);
    QCOMPARE(passed, refusal.isEmpty());
    QCOMPARE(reason, refusal);
}

QTEST_GUILESS_MAIN(tst_XmlGuard)

#include "tst_XmlGuard.moc"
