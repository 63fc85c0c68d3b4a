#include "Uuid.h"

#include <QtTest>

class tst_Uuid : public QObject
{
    Q_OBJECT

private slots:
    void fromText_data();
    void fromText();
    void equalsAndBytes();
};

static const QString kBraced = QStringLiteral("{67c8770b-44f1-410a-ab9a-f9b5446f13ee}");

void tst_Uuid::fromText_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<bool>("valid");

    QTest::newRow("braces") << kBraced << true;
    QTest::newRow("no braces") << "67c8770b-44f1-410a-ab9a-f9b5446f13ee" << true;
    QTest::newRow("upper case") << "{67C8770B-44F1-410A-AB9A-F9B5446F13EE}" << true;
    QTest::newRow("digits only") << "67c8770b44f1410aab9af9b5446f13ee" << true;
    QTest::newRow("blanks around") << "  67c8770b-44f1-410a-ab9a-f9b5446f13ee\n" << true;
    QTest::newRow("short") << "67c8770b-44f1" << false;
    QTest::newRow("not hex") << "zzc8770b44f1410aab9af9b5446f13ee" << false;
    QTest::newRow("word") << "hello" << false;
}

void tst_Uuid::fromText()
{
    QFETCH(QString, text);
    QFETCH(bool, valid);
    if (!valid) {
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Not a UUID"));
        QVERIFY(Uuid::fromString(text).isNull());
        return;
    }
    const Uuid uuid = Uuid::fromString(text);
    QCOMPARE(uuid.string(), kBraced);
    QCOMPARE(uuid.withoutBraces(), kBraced.mid(1, 36));
    QCOMPARE(uuid.id128(), QStringLiteral("67c8770b44f1410aab9af9b5446f13ee"));
    QCOMPARE(uuid.rfc4122().toHex(), uuid.id128().toLatin1());
    QCOMPARE(uuid.version(), 4);
}

// Creation, == and the text forms in script are covered by tst_values.qml.
void tst_Uuid::equalsAndBytes()
{
    const Uuid value = Uuid::fromString(kBraced);
    const QByteArray bytes = value.rfc4122();
    QVERIFY(value.equals(kBraced.toUpper()));
    QVERIFY(value.equals(QVariant(bytes)));
    QVERIFY(!value.equals(Uuid::createUuid().toVariant()));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Expected 16 bytes, got 15"));
    QVERIFY(Uuid::fromRfc4122(bytes.left(15)).isNull());
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Expected 16 bytes, got 17"));
    QVERIFY(Uuid::fromRfc4122(bytes + 'x').isNull());
}

QTEST_MAIN(tst_Uuid)
#include "tst_Uuid.moc"
