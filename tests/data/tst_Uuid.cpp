#include "Loomkit.h"
#include "Uuid.h"

#include <QtTest>

class tst_Uuid : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void textForms_data();
    void textForms();
    void badInput_data();
    void badInput();
    void bytes();
    void variants();
};

static const QString kBraced = QStringLiteral("{67c8770b-44f1-410a-ab9a-f9b5446f13ee}");

void tst_Uuid::initTestCase()
{
    Uuid::registerMetaType();
}

void tst_Uuid::textForms_data()
{
    QTest::addColumn<QString>("text");

    QTest::newRow("braces") << kBraced;
    QTest::newRow("no braces") << QStringLiteral("67c8770b-44f1-410a-ab9a-f9b5446f13ee");
    QTest::newRow("upper case") << QStringLiteral("{67C8770B-44F1-410A-AB9A-F9B5446F13EE}");
    QTest::newRow("digits only") << QStringLiteral("67c8770b44f1410aab9af9b5446f13ee");
    QTest::newRow("blanks around") << QStringLiteral("  67c8770b-44f1-410a-ab9a-f9b5446f13ee\n");
}

void tst_Uuid::textForms()
{
    QFETCH(QString, text);
    const Uuid uuid = Uuid::fromString(text);
    QVERIFY(!uuid.isNull());
    QCOMPARE(uuid.string(), kBraced);
    QCOMPARE(uuid.withoutBraces(), kBraced.mid(1, 36));
    QCOMPARE(uuid.id128(), QStringLiteral("67c8770b44f1410aab9af9b5446f13ee"));
    QCOMPARE(uuid.version(), 4);
    QCOMPARE(uuid.toString(), kBraced);
}

void tst_Uuid::badInput_data()
{
    QTest::addColumn<QString>("text");

    QTest::newRow("short") << QStringLiteral("67c8770b-44f1");
    QTest::newRow("not hex") << QStringLiteral("zzc8770b44f1410aab9af9b5446f13ee");
    QTest::newRow("word") << QStringLiteral("hello");
}

void tst_Uuid::badInput()
{
    QFETCH(QString, text);
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Not a UUID"));
    QVERIFY(Uuid::fromString(text).isNull());
}

void tst_Uuid::bytes()
{
    const Uuid uuid = Uuid::fromString(kBraced);
    const QByteArray bytes = uuid.rfc4122();
    QCOMPARE(bytes.toHex(), QByteArray("67c8770b44f1410aab9af9b5446f13ee"));
    QCOMPARE(Uuid::fromRfc4122(bytes), uuid);

    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Expected 16 bytes, got 15"));
    QVERIFY(Uuid::fromRfc4122(bytes.left(15)).isNull());
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Expected 16 bytes, got 17"));
    QVERIFY(Uuid::fromRfc4122(bytes + 'x').isNull());
}

void tst_Uuid::variants()
{
    Loomkit loomkit;
    const QVariant made = loomkit.uuid();
    QCOMPARE(made.userType(), qMetaTypeId<Uuid>());
    const Uuid fresh = made.value<Uuid>();
    QVERIFY(!fresh.isNull());
    QVERIFY(fresh != loomkit.uuid().value<Uuid>());

    const QVariant parsed = loomkit.uuid(kBraced);
    const QVariant fromBytes = loomkit.uuid(parsed.value<Uuid>().rfc4122());
    // Equal values compare equal as variants, which is what == in script uses.
    QVERIFY(parsed == fromBytes);
    QVERIFY(parsed != made);
    QCOMPARE(parsed.toString(), kBraced);

    const Uuid value = parsed.value<Uuid>();
    QVERIFY(value.equals(kBraced.toUpper()));
    QVERIFY(value.equals(QVariant(value.rfc4122())));
    QVERIFY(value.equals(fromBytes));
    QVERIFY(!value.equals(made));
}

QTEST_MAIN(tst_Uuid)
#include "tst_Uuid.moc"
