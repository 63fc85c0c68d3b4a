#include "InputValidator.h"

#include <QJSEngine>
#include <QSignalSpy>
#include <QtTest>

class tst_InputValidator : public QObject
{
    Q_OBJECT

private slots:
    void expression_data();
    void expression();
    void function_data();
    void function();
    void bothMustAgree();
    void rewritingFunction();
    void fixup();
    void changedSignal();
};

void tst_InputValidator::expression_data()
{
    QTest::addColumn<QString>("pattern");
    QTest::addColumn<QString>("input");
    QTest::addColumn<int>("state");

    QTest::newRow("full match") << "[0-9]{3}-[0-9]{2}" << "123-45" << int(QValidator::Acceptable);
    QTest::newRow("prefix") << "[0-9]{3}-[0-9]{2}" << "123-" << int(QValidator::Intermediate);
    QTest::newRow("wrong") << "[0-9]{3}-[0-9]{2}" << "12a" << int(QValidator::Invalid);
    QTest::newRow("too long") << "[0-9]{3}-[0-9]{2}" << "123-456" << int(QValidator::Invalid);
    QTest::newRow("anchored alternation") << "ab|cd" << "abcd" << int(QValidator::Invalid);
    QTest::newRow("empty input") << "x+" << "" << int(QValidator::Intermediate);
    QTest::newRow("no expression") << "" << "anything" << int(QValidator::Acceptable);
    QTest::newRow("broken expression") << "(" << "(" << int(QValidator::Invalid);
}

void tst_InputValidator::expression()
{
    QFETCH(QString, pattern);
    QFETCH(QString, input);
    QFETCH(int, state);

    InputValidator validator;
    if (!QRegularExpression(pattern).isValid())
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Invalid expression"));
    validator.setRegularExpression(QRegularExpression(pattern));
    QCOMPARE(validator.check(input), state);
}

void tst_InputValidator::function_data()
{
    QTest::addColumn<QString>("script");
    QTest::addColumn<QString>("input");
    QTest::addColumn<int>("state");

    QTest::newRow("true") << "(function (s) { return s.length < 4 })" << "abc" << int(QValidator::Acceptable);
    QTest::newRow("false") << "(function (s) { return s.length < 4 })" << "abcd" << int(QValidator::Invalid);
    QTest::newRow("state number") << "(function (s) { return s === '' ? 1 : 2 })" << "" << int(QValidator::Intermediate);
    QTest::newRow("state out of range") << "(function () { return 9 })" << "x" << int(QValidator::Acceptable);
    QTest::newRow("object") << "(function (s) { return { state: s === 'ok' } })" << "ok" << int(QValidator::Acceptable);
    QTest::newRow("throws") << "(function () { throw new Error('boom') })" << "x" << int(QValidator::Invalid);
    QTest::newRow("no result") << "(function () { })" << "x" << int(QValidator::Invalid);
}

void tst_InputValidator::function()
{
    QFETCH(QString, script);
    QFETCH(QString, input);
    QFETCH(int, state);

    QJSEngine engine;
    InputValidator validator;
    validator.setValidateFunction(engine.evaluate(script));
    if (QTest::currentDataTag() == QLatin1String("throws"))
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Error: boom"));
    if (QTest::currentDataTag() == QLatin1String("no result"))
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Unexpected result"));
    QCOMPARE(validator.check(input), state);
}

void tst_InputValidator::bothMustAgree()
{
    QJSEngine engine;
    InputValidator validator;
    validator.setRegularExpression(QRegularExpression(QStringLiteral("[a-z]+")));
    validator.setValidateFunction(engine.evaluate(QStringLiteral("(function (s) { return s !== 'admin' })")));
    QCOMPARE(validator.check(QStringLiteral("user")), int(QValidator::Acceptable));
    QCOMPARE(validator.check(QStringLiteral("admin")), int(QValidator::Invalid));
    QCOMPARE(validator.check(QStringLiteral("User")), int(QValidator::Invalid));

    // The function is not asked about text that the expression rejects.
    QJSValue calls = engine.newArray();
    engine.globalObject().setProperty(QStringLiteral("calls"), calls);
    validator.setValidateFunction(engine.evaluate(QStringLiteral("(function (s) { calls.push(s); return 1 })")));
    QCOMPARE(validator.check(QStringLiteral("X")), int(QValidator::Invalid));
    QCOMPARE(validator.check(QStringLiteral("x")), int(QValidator::Intermediate));
    QCOMPARE(calls.property(QStringLiteral("length")).toInt(), 1);
}

void tst_InputValidator::rewritingFunction()
{
    QJSEngine engine;
    InputValidator validator;
    validator.setValidateFunction(engine.evaluate(QStringLiteral(
        "(function (s, p) { return { state: 2, input: s.toUpperCase(), position: p + 100 } })")));
    QString input = QStringLiteral("abc");
    int position = 1;
    QCOMPARE(validator.validate(input, position), QValidator::Acceptable);
    QCOMPARE(input, QStringLiteral("ABC"));
    QCOMPARE(position, 3);
}

void tst_InputValidator::fixup()
{
    QJSEngine engine;
    InputValidator validator;
    QString input = QStringLiteral("  x ");
    validator.fixup(input);
    QCOMPARE(input, QStringLiteral("  x "));

    validator.setFixupFunction(engine.evaluate(QStringLiteral("(function (s) { return s.trim() })")));
    validator.fixup(input);
    QCOMPARE(input, QStringLiteral("x"));

    validator.setFixupFunction(engine.evaluate(QStringLiteral("(function (s) { return 5 })")));
    validator.fixup(input);
    QCOMPARE(input, QStringLiteral("x"));
}

void tst_InputValidator::changedSignal()
{
    QJSEngine engine;
    InputValidator validator;
    QSignalSpy spy(&validator, &QValidator::changed);
    validator.setRegularExpression(QRegularExpression(QStringLiteral("a")));
    validator.setRegularExpression(QRegularExpression(QStringLiteral("a")));
    QCOMPARE(spy.count(), 1);
    const QJSValue function = engine.evaluate(QStringLiteral("(function () { return true })"));
    validator.setValidateFunction(function);
    validator.setValidateFunction(function);
    QCOMPARE(spy.count(), 2);
}

QTEST_MAIN(tst_InputValidator)
#include "tst_InputValidator.moc"
