#include "TestSupport.h"
#include "XmlElementValue.h"
#include "XmlUtility.h"

#include <QDir>
#include <QDirIterator>
#include <QDomDocument>
#include <QFile>
#include <QJsonDocument>
#include <QJsonValue>
#include <QTextCodec>
#include <QtTest>

namespace {

QString toJson(const QVariant &value)
{
    return QString::fromUtf8(QJsonDocument::fromVariant(value).toJson(QJsonDocument::Compact));
}

QVariantMap options(std::initializer_list<std::pair<QString, QVariant>> pairs)
{
    QVariantMap map;
    for (const auto &pair : pairs)
        map.insert(pair.first, pair.second);
    return map;
}

QString readText(const QString &path)
{
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly))
        return QString();
    const QByteArray bytes = file.readAll();
    QTextCodec *codec = QTextCodec::codecForUtfText(bytes, QTextCodec::codecForName("UTF-8"));
    return codec->toUnicode(bytes);
}

// What a walk over the DOM of the text gives.
QVariantMap viaDom(const QString &xml, const QVariantMap &optionMap)
{
    QDomDocument document;
    if (!document.setContent(xml))
        return QVariantMap();
    const XmlUtility::Options options = XmlUtility::Options::fromMap(optionMap);
    const QDomElement root = document.documentElement();
    const QVariant value = XmlUtility::toVariant(root, options);
    if (!options.rootProperty)
        return value.toMap();
    QVariantMap result;
    result.insert(XmlElementValue::Context(options).elementKey(root.tagName()), value);
    return result;
}

QString nested(int depth)
{
    return QStringLiteral("<a>").repeated(depth) + QStringLiteral("x") + QStringLiteral("</a>").repeated(depth);
}

} // namespace

class tst_XmlUtility : public QObject
{
    Q_OBJECT

private slots:
    void conversion_data();
    void conversion();
    void toVariantOfElement();
    void corpusMatchesDom_data();
    void corpusMatchesDom();
    void hostile_data();
    void hostile();
    void nestingLimit();
};

void tst_XmlUtility::conversion_data()
{
    QTest::addColumn<QString>("xml");
    QTest::addColumn<QVariantMap>("options");
    QTest::addColumn<QString>("json");

    const QVariantMap none;
    QTest::newRow("attributes") << "<r a=\"1\" b=\"x\"/>" << none << R"({"@a":"1","@b":"x"})";
    QTest::newRow("text child is a string") << "<r><c>hi</c></r>" << none << R"({"#nodes":["c"],"c":"hi"})";
    QTest::newRow("text child with attribute")
        << "<r><c k=\"v\">hi</c></r>" << none << R"({"#nodes":["c"],"c":{"#text":"hi","@k":"v"}})";
    QTest::newRow("repeated elements")
        << "<r a=\"1\"><x>1</x><y>2</y><x>3</x></r>" << none
        << R"({"#nodes":["x[0]","y","x[1]"],"@a":"1","x":["1","3"],"y":"2"})";
    QTest::newRow("empty child is null") << "<r><e/><f></f></r>" << none << R"({"#nodes":["e","f"],"e":null,"f":null})";
    QTest::newRow("comment after text")
        << "<r>text<!--note--></r>" << none << R"({"#comment":"note","#nodes":["#text","#comment"],"#text":"text"})";
    QTest::newRow("text after a child") << "<r><a/>tail</r>" << none << R"({"#nodes":["a","#text"],"#text":"tail","a":null})";
    QTest::newRow("mixed content")
        << "<r>one<b>two</b>three<b>four</b></r>" << none
        << R"({"#nodes":["#text[0]","b[0]","#text[1]","b[1]"],"#text":["one","three"],"b":["two","four"]})";
    QTest::newRow("CDATA") << "<r><![CDATA[<x>]]></r>" << none << R"({"#cdata":"<x>","#nodes":["#cdata"]})";
    QTest::newRow("text around CDATA")
        << "<r>a<![CDATA[b]]>c</r>" << none
        << R"({"#cdata":"b","#nodes":["#text[0]","#cdata","#text[1]"],"#text":["a","c"]})";
    QTest::newRow("whitespace between elements is dropped")
        << "<r>\n  <a>1</a>\n  <b>2</b>\n</r>" << none << R"({"#nodes":["a","b"],"a":"1","b":"2"})";
    QTest::newRow("processing instruction is skipped") << "<r><?pi data?><a/></r>" << none << R"({"#nodes":["a"],"a":null})";
    QTest::newRow("references") << "<r>a &amp; b &#65;&lt;</r>" << ::options({ { "rootProperty", true } })
                                << R"({"r":"a & b A<"})";
    QTest::newRow("local names") << "<ns:r xmlns:ns=\"u\"><ns:c ns:k=\"v\">1</ns:c></ns:r>" << none
                                 << R"({"#nodes":["c"],"@xmlns:ns":"u","c":{"#text":"1","@ns:k":"v"}})";
    QTest::newRow("whole names") << "<ns:r xmlns:ns=\"u\"><ns:c>1</ns:c></ns:r>"
                                 << ::options({ { "preserveNamespaces", true }, { "rootProperty", true } })
                                 << R"({"ns:r":{"#nodes":["ns:c"],"@xmlns:ns":"u","ns:c":"1"}})";
    QTest::newRow("root property, local name") << "<ns:r xmlns:ns=\"u\"/>" << ::options({ { "rootProperty", true } })
                                               << R"({"r":{"@xmlns:ns":"u"}})";
    QTest::newRow("only the first colon splits") << "<r><a:b:c/></r>" << none << R"({"#nodes":["b:c"],"b:c":null})";
    QTest::newRow("root of text") << "<r>hi</r>" << none << "{}";
    QTest::newRow("root of text, root property") << "<r>hi</r>" << ::options({ { "rootProperty", true } }) << R"({"r":"hi"})";
    QTest::newRow("empty root, root property") << "<r/>" << ::options({ { "rootProperty", "true" } }) << R"({"r":null})";
    QTest::newRow("no order list") << "<r><a/><a/></r>" << ::options({ { "nodesProperty", "" } }) << R"({"a":[null,null]})";
    QTest::newRow("renamed properties")
        << "<r k=\"v\">x<!--c--><![CDATA[d]]><a/><a/></r>"
        << ::options({ { "attributePrefix", "_" }, { "textProperty", "$t" }, { "commentProperty", "$c" },
                       { "cdataProperty", "$d" }, { "nodesProperty", "order" }, { "indexFormat", "#%1" } })
        << R"({"$c":"c","$d":"d","$t":"x","_k":"v","a":[null,null],"order":["$t","$c","$d","a#0","a#1"]})";
    QTest::newRow("index format without a marker")
        << "<r><a/><a/></r>" << ::options({ { "indexFormat", "-" } }) << R"({"#nodes":["a-","a-"],"a":[null,null]})";
    QTest::newRow("index format with a two-digit marker")
        << "<r><a/><a/></r>" << ::options({ { "indexFormat", "(%10)" } }) << R"j({"#nodes":["a(0)","a(1)"],"a":[null,null]})j";
    QTest::newRow("child overwrites a like-named attribute")
        << "<r c=\"attr\"><c>child</c></r>" << ::options({ { "attributePrefix", "" } }) << R"({"#nodes":["c"],"c":"child"})";
    QTest::newRow("option keys are exact")
        << "<r a=\"1\"/>" << ::options({ { "AttributePrefix", "_" } }) << R"({"@a":"1"})";
    QTest::newRow("empty text") << "" << none << "{}";
    QTest::newRow("malformed") << "<r><a></r>" << none << "{}";
    QTest::newRow("text outside the root") << "<r/>x" << none << "{}";
    QTest::newRow("entity with markup")
        << "<!DOCTYPE r [<!ENTITY e \"<b>in</b>\">]><r>&e;</r>" << none << R"({"#nodes":["b"],"b":"in"})";
    QTest::newRow("entity inside text")
        << "<!DOCTYPE r [<!ENTITY e \"mid\">]><r k=\"&e;\">a&e;b</r>" << none << R"({"#text":"amidb","@k":"mid"})";
    QTest::newRow("empty CDATA") << "<r><![CDATA[]]></r>" << none << R"({"#cdata":"","#nodes":["#cdata"]})";
    QTest::newRow("carriage return kept") << "<r><a>x\r\ny</a></r>" << none << R"({"#nodes":["a"],"a":"x\r\ny"})";
    QTest::newRow("around the root") << "<?xml version=\"1.0\"?><!--c--><?pi?><r><a/></r><!--d--><?pj?>" << none
                                     << R"({"#nodes":["a"],"a":null})";
}

void tst_XmlUtility::conversion()
{
    QFETCH(QString, xml);
    QFETCH(QVariantMap, options);
    QFETCH(QString, json);

    const QVariantMap result = XmlUtility::toVariantMap(xml, options);
    QCOMPARE(toJson(result), json);
    QCOMPARE(toJson(result), toJson(viaDom(xml, options)));
}

void tst_XmlUtility::toVariantOfElement()
{
    QDomDocument document;
    QVERIFY(document.setContent(QStringLiteral("<r><a>1</a><a>2</a><b/></r>")));
    const QDomElement root = document.documentElement();
    const QVariant value = XmlUtility::toVariant(root, XmlUtility::Options());
    QCOMPARE(toJson(value), QStringLiteral(R"({"#nodes":["a[0]","a[1]","b"],"a":["1","2"],"b":null})"));
    // The element is read, not consumed.
    QCOMPARE(root.childNodes().count(), 3);
    QCOMPARE(value.toMap().value("b").userType(), int(QMetaType::QJsonValue));

    XmlUtility::Options options;
    options.indexFormat = QStringLiteral("<%1>");
    options.nodesProperty = QStringLiteral("n");
    QCOMPARE(toJson(XmlUtility::toVariant(root, options)),
             QStringLiteral(R"({"a":["1","2"],"b":null,"n":["a<0>","a<1>","b"]})"));
    const QVariant text = XmlUtility::toVariant(root.firstChildElement(), options);
    QCOMPARE(text.userType(), int(QMetaType::QString));
    QCOMPARE(text.toString(), QStringLiteral("1"));
}

void tst_XmlUtility::corpusMatchesDom_data()
{
    QTest::addColumn<QString>("path");
    for (const char *folder : { "xml-libxml2/wellformed", "xml-libxml2/errors", "xml-defusedxml" }) {
        QDirIterator it(TestSupport::dataPath(QStringLiteral("parsers/") + QLatin1String(folder)), QDir::Files);
        while (it.hasNext()) {
            const QString path = it.next();
            if (path.endsWith(QLatin1String(".md")) || path.endsWith(QLatin1String("LICENSE"))
                || path.endsWith(QLatin1String("quadratic.xml")))
                continue;
            QTest::newRow(qPrintable(QDir(TestSupport::dataPath()).relativeFilePath(path))) << path;
        }
    }
    QTest::newRow("good.xml") << TestSupport::dataPath("parsers/xml-libxml2/entity-expansion/good.xml");
    QTest::newRow("good_attr.xml") << TestSupport::dataPath("parsers/xml-libxml2/entity-expansion/good_attr.xml");
}

// Honest documents come out exactly as the DOM alone makes them: the guard
// turns none of them away.
void tst_XmlUtility::corpusMatchesDom()
{
    QFETCH(QString, path);
    const QString xml = readText(path);
    QCOMPARE(toJson(XmlUtility::toVariantMap(xml)), toJson(viaDom(xml, QVariantMap())));
}

void tst_XmlUtility::hostile_data()
{
    QTest::addColumn<QString>("xml");
    QTest::addColumn<bool>("accepted");

    const QString defused = TestSupport::dataPath("parsers/xml-defusedxml/");
    const QString lol = TestSupport::dataPath("parsers/xml-libxml2/entity-expansion/");
    QTest::newRow("quadratic blow-up") << readText(defused + "quadratic.xml") << false;
    QTest::newRow("small bomb") << readText(defused + "xmlbomb.xml") << true;
    QTest::newRow("cyclic") << readText(defused + "cyclic.xml") << false;
    QTest::newRow("external entity") << readText(defused + "external.xml") << true;
    QTest::newRow("external DTD") << readText(defused + "dtd.xml") << true;
    QTest::newRow("billion laughs") << readText(lol + "lol_classic.xml") << false;
    QTest::newRow("laughs in an attribute") << readText(lol + "lol_ig_attr.xml") << false;
    QTest::newRow("laughs in content") << readText(lol + "lol_ig_content.xml") << false;
    QTest::newRow("long value") << readText(lol + "lol_long_value.xml") << false;

    // Quadratic growth through an attribute, made here at 20 MB of expansion.
    const QString big = QStringLiteral("x").repeated(20000);
    QTest::newRow("quadratic attribute")
        << "<!DOCTYPE r [<!ENTITY e \"" + big + "\">]><r a=\"" + QStringLiteral("&e;").repeated(1100) + "\"/>" << false;
    // Declarations hidden in a parameter entity still count.
    QTest::newRow("parameter entity declares the bomb")
        << "<!DOCTYPE r [<!ENTITY % d \"<!ENTITY e '" + big + "'>\">%d;]><r>" + QStringLiteral("&e;").repeated(1100)
               + "</r>"
        << false;
}

void tst_XmlUtility::hostile()
{
    QFETCH(QString, xml);
    QFETCH(bool, accepted);
    QVERIFY(!xml.isEmpty());
    const QVariantMap result = XmlUtility::toVariantMap(xml, ::options({ { "rootProperty", true } }));
    QCOMPARE(!result.isEmpty(), accepted);
}

void tst_XmlUtility::nestingLimit()
{
    // The DOM parser would overflow the stack at about 25,000 levels.
    QVERIFY(XmlUtility::toVariantMap(nested(100000)).isEmpty());
    QVERIFY(XmlUtility::toVariantMap(nested(1001)).isEmpty());

    QVariant value = XmlUtility::toVariantMap(nested(1000), ::options({ { "rootProperty", true } })).value("a");
    int depth = 1;
    while (value.userType() == QMetaType::QVariantMap) {
        value = value.toMap().value("a");
        ++depth;
    }
    QCOMPARE(depth, 1000);
    QCOMPARE(value.toString(), QStringLiteral("x"));

    // Self-closed elements add no depth; comments and CDATA hold no tags.
    const QString flat = "<r>" + QStringLiteral("<a/>").repeated(5000) + "<!--" + QStringLiteral("<b>").repeated(2000)
        + "--><![CDATA[" + QStringLiteral("<c>").repeated(2000) + "]]></r>";
    QCOMPARE(XmlUtility::toVariantMap(flat).value("a").toList().size(), 5000);
}

QTEST_GUILESS_MAIN(tst_XmlUtility)

#include "tst_XmlUtility.moc"
