#include "InputValidator.h"

#include <QJSEngine>
#include <QtTest>

class tst_InputValidator : public QObject
{
    Q_OBJECT

private slots:
    void check_data();
    void check();
    void functions();
};

void tst_InputValidator::check_data()
{
    QTest::addColumn<QString>("pattern");
    QTest::addColumn<QString>("script");
    QTest::addColumn<QString>("input");
    QTest::addColumn<int>("state");
    QTest::addColumn<QString>("warning");

    const int ok = QValidator::Acceptable, partial = QValidator::Intermediate, bad = QValidator::Invalid;
    const QString digits = QStringLiteral("[0-9]{3}-[0-9]{2}");
    const QString shortText = QStringLiteral("(function (s) { return s.length < 4 })");
    QTest::newRow("full match") << digits << "" << "123-45" << ok << "";
    QTest::newRow("prefix") << digits << "" << "123-" << partial << "";
    QTest::newRow("wrong") << digits << "" << "12a" << bad << "";
    QTest::newRow("too long") << digits << "" << "123-456" << bad << "";
    QTest::newRow("anchored alternation") << "ab|cd" << "" << "abcd" << bad << "";
    QTest::newRow("empty input") << "x+" << "" << "" << partial << "";
    QTest::newRow("no expression") << "" << "" << "anything" << ok << "";
    QTest::newRow("broken expression") << "(" << "" << "(" << bad << "Invalid expression";
    QTest::newRow("true") << "" << shortText << "abc" << ok << "";
    QTest::newRow("false") << "" << shortText << "abcd" << bad << "";
    QTest::newRow("state number") << "" << "(function (s) { return s === '' ? 1 : 2 })" << "" << partial << "";
    QTest::newRow("state out of range") << "" << "(function () { return 9 })" << "x" << ok << "";
    QTest::newRow("object") << "" << "(function (s) { return { state: s === 'ok' } })" << "ok" << ok << "";
    QTest::newRow("throws") << "" << "(function () { throw new Error('boom') })" << "x" << bad << "Error: boom";
    QTest::newRow("no result") << "" << "(function () { })" << "x" << bad << "Unexpected result";
    QTest::newRow("function says no") << "[a-z]+" << "(function (s) { return s !== 'admin' })" << "admin" << bad << "";
    QTest::newRow("expression says no") << "[a-z]+" << "(function (s) { return true })" << "User" << bad << "";
}

void tst_InputValidator::check()
{
    QFETCH(QString, pattern);
    QFETCH(QString, script);
    QFETCH(QString, input);
    QFETCH(QString, warning);
    QJSEngine engine;
    InputValidator validator;
    if (!warning.isEmpty())
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression(warning));
    validator.setRegularExpression(QRegularExpression(pattern));
    if (!script.isEmpty())
        validator.setValidateFunction(engine.evaluate(script));
    QTEST(validator.check(input), "state");
}

void tst_InputValidator::functions()
{
    QJSEngine engine;
    InputValidator validator;
    QSignalSpy spy(&validator, &QValidator::changed);
    validator.setRegularExpression(QRegularExpression(QStringLiteral("[a-z]+")));
    validator.setRegularExpression(QRegularExpression(QStringLiteral("[a-z]+")));
    QJSValue calls = engine.newArray();
    engine.globalObject().setProperty(QStringLiteral("calls"), calls);
    const QJSValue function = engine.evaluate(QStringLiteral("(function (s) { calls.push(s); return 1 })"));
    validator.setValidateFunction(function);
    validator.setValidateFunction(function);
    QCOMPARE(spy.count(), 2);

    QCOMPARE(validator.check(QStringLiteral("X")), int(QValidator::Invalid));
    QCOMPARE(validator.check(QStringLiteral("x")), int(QValidator::Intermediate));
    QCOMPARE(calls.property(QStringLiteral("length")).toInt(), 1);

    // The function may rewrite the text and move the cursor, within the text.
    validator.setRegularExpression(QRegularExpression());
    validator.setValidateFunction(engine.evaluate(QStringLiteral(
        "(function (s, p) { return { state: 2, input: s.toUpperCase(), position: p + 100 } })")));
    QString input = QStringLiteral("abc");
    int position = 1;
    QCOMPARE(validator.validate(input, position), QValidator::Acceptable);
    QCOMPARE(input, QStringLiteral("ABC"));
    QCOMPARE(position, 3);

    input = QStringLiteral("  x ");
    validator.fixup(input);
    QCOMPARE(input, QStringLiteral("  x "));
    validator.setFixupFunction(engine.evaluate(QStringLiteral("(function (s) { return s.trim() })")));
    validator.fixup(input);
    QCOMPARE(input, QStringLiteral("x"));
    validator.setFixupFunction(engine.evaluate(QStringLiteral("(function (s) { return 5 })")));
    validator.fixup(input);
    QCOMPARE(input, QStringLiteral("x"));
}

QTEST_MAIN(tst_InputValidator)
#include "tst_InputValidator.moc"
