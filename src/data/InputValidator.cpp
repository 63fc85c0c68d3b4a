#include "InputValidator.h"
#include "LoomkitLogging.h"

InputValidator::InputValidator(QObject *parent)
    : QValidator(parent)
{
}

QJSValue InputValidator::validateFunction() const
{
    return m_validate;
}

void InputValidator::setValidateFunction(const QJSValue &function)
{
    if (function.strictlyEquals(m_validate))
        return;
    if (!function.isCallable() && !function.isUndefined() && !function.isNull())
        qCWarning(lcCore) << Q_FUNC_INFO << "Not a function:" << function.toString();
    m_validate = function;
    emit validateFunctionChanged();
    emit changed();
}

QJSValue InputValidator::fixupFunction() const
{
    return m_fixup;
}

void InputValidator::setFixupFunction(const QJSValue &function)
{
    if (function.strictlyEquals(m_fixup))
        return;
    if (!function.isCallable() && !function.isUndefined() && !function.isNull())
        qCWarning(lcCore) << Q_FUNC_INFO << "Not a function:" << function.toString();
    m_fixup = function;
    emit fixupFunctionChanged();
}

QRegularExpression InputValidator::regularExpression() const
{
    return m_expression;
}

void InputValidator::setRegularExpression(const QRegularExpression &expression)
{
    if (expression == m_expression)
        return;
    if (!expression.isValid())
        qCWarning(lcCore) << Q_FUNC_INFO << "Invalid expression:" << expression.pattern() << expression.errorString();
    m_expression = expression;
    m_anchored = QRegularExpression(QRegularExpression::anchoredPattern(expression.pattern()),
                                    expression.patternOptions());
    emit regularExpressionChanged();
    emit changed();
}

QValidator::State InputValidator::validate(QString &input, int &position) const
{
    const QValidator::State byExpression = matchState(input);
    if (byExpression == Invalid)
        return Invalid;
    return qMin(byExpression, scriptState(input, position));
}

void InputValidator::fixup(QString &input) const
{
    if (!m_fixup.isCallable())
        return;
    QJSValue function = m_fixup;
    const QJSValue result = function.call({ QJSValue(input) });
    if (result.isError()) {
        qCWarning(lcCore) << Q_FUNC_INFO << "Error:" << result.toString();
        return;
    }
    if (result.isString())
        input = result.toString();
}

int InputValidator::check(const QString &text) const
{
    QString input = text;
    int position = input.size();
    return validate(input, position);
}

QValidator::State InputValidator::matchState(const QString &input) const
{
    if (m_expression.pattern().isEmpty() && m_expression.isValid())
        return Acceptable;
    // A broken expression accepts nothing rather than everything.
    if (!m_anchored.isValid())
        return Invalid;
    const QRegularExpressionMatch match = m_anchored.match(input, 0, QRegularExpression::PartialPreferCompleteMatch);
    if (match.hasMatch())
        return Acceptable;
    if (match.hasPartialMatch() || input.isEmpty())
        return Intermediate;
    return Invalid;
}

QValidator::State InputValidator::scriptState(QString &input, int &position) const
{
    if (!m_validate.isCallable())
        return Acceptable;

    QJSValue function = m_validate;
    const QJSValue result = function.call({ QJSValue(input), QJSValue(position) });
    if (result.isError()) {
        qCWarning(lcCore) << Q_FUNC_INFO << "Error:" << result.toString();
        return Invalid;
    }
    if (result.isBool())
        return result.toBool() ? Acceptable : Invalid;
    if (result.isNumber())
        return QValidator::State(qBound(0, result.toInt(), 2));
    if (result.isObject() && !result.isArray()) {
        if (result.hasProperty(QStringLiteral("input"))) {
            input = result.property(QStringLiteral("input")).toString();
            position = qBound(0, position, input.size());
        }
        if (result.hasProperty(QStringLiteral("position")))
            position = qBound(0, result.property(QStringLiteral("position")).toInt(), input.size());
        const QJSValue state = result.property(QStringLiteral("state"));
        if (state.isBool())
            return state.toBool() ? Acceptable : Invalid;
        if (state.isNumber())
            return QValidator::State(qBound(0, state.toInt(), 2));
    }
    qCWarning(lcCore) << Q_FUNC_INFO << "Unexpected result:" << result.toString();
    return Invalid;
}
