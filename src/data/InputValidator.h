#ifndef INPUTVALIDATOR_H
#define INPUTVALIDATOR_H

#include <QJSValue>
#include <QRegularExpression>
#include <QValidator>

// A validator for text input, driven by a regular expression that the whole
// text must match, by a script function, or by both (then both must agree).
//
// The function is called as validate(input, position) and returns true or
// false, a state (InputValidator.Invalid, Intermediate or Acceptable), or an
// object { state, input, position } that may also rewrite the text.
class InputValidator : public QValidator
{
    Q_OBJECT

    Q_PROPERTY(QJSValue validate READ validateFunction WRITE setValidateFunction NOTIFY validateFunctionChanged)
    Q_PROPERTY(QJSValue fixup READ fixupFunction WRITE setFixupFunction NOTIFY fixupFunctionChanged)
    Q_PROPERTY(QRegularExpression regularExpression READ regularExpression WRITE setRegularExpression
                   NOTIFY regularExpressionChanged)

public:
    explicit InputValidator(QObject *parent = nullptr);

    QJSValue validateFunction() const;
    void setValidateFunction(const QJSValue &function);
    QJSValue fixupFunction() const;
    void setFixupFunction(const QJSValue &function);
    QRegularExpression regularExpression() const;
    void setRegularExpression(const QRegularExpression &expression);

    QValidator::State validate(QString &input, int &position) const override;
    void fixup(QString &input) const override;

    // The state of a text, without a cursor to move.
    Q_INVOKABLE int check(const QString &text) const;

signals:
    void validateFunctionChanged();
    void fixupFunctionChanged();
    void regularExpressionChanged();

private:
    QValidator::State matchState(const QString &input) const;
    QValidator::State scriptState(QString &input, int &position) const;

    QJSValue m_validate;
    QJSValue m_fixup;
    QRegularExpression m_expression;
    QRegularExpression m_anchored;
};

#endif // INPUTVALIDATOR_H
