#include "LocaleInfo.h"
#include "LoomkitLogging.h"

#include <QDateTime>
#include <QQmlEngine>
#include <QtMath>

LocaleInfo::LocaleInfo(QObject *parent)
    : QObject(parent)
{
}

LocaleInfo::LocaleInfo(const QString &name, QObject *parent)
    : QObject(parent)
    , m_locale(name)
{
}

LocaleInfo *LocaleInfo::create(const QLocale &locale)
{
    auto *object = new LocaleInfo();
    object->m_locale = locale;
    QQmlEngine::setObjectOwnership(object, QQmlEngine::JavaScriptOwnership);
    return object;
}

QString LocaleInfo::name() const
{
    return m_locale.name();
}

void LocaleInfo::setName(const QString &name)
{
    const QLocale locale(name);
    if (locale == m_locale)
        return;
    m_locale = locale;
    emit localeChanged();
}

QString LocaleInfo::bcp47Name() const
{
    return m_locale.bcp47Name();
}

QString LocaleInfo::languageCode() const
{
    return m_locale.name().section(QLatin1Char('_'), 0, 0);
}

QString LocaleInfo::countryCode() const
{
    return m_locale.name().section(QLatin1Char('_'), 1, 1);
}

QString LocaleInfo::languageName() const
{
    return QLocale::languageToString(m_locale.language());
}

QString LocaleInfo::countryName() const
{
    return QLocale::countryToString(m_locale.country());
}

QString LocaleInfo::scriptName() const
{
    return QLocale::scriptToString(m_locale.script());
}

QString LocaleInfo::nativeLanguageName() const
{
    return m_locale.nativeLanguageName();
}

QString LocaleInfo::nativeCountryName() const
{
    return m_locale.nativeCountryName();
}

bool LocaleInfo::isRightToLeft() const
{
    return m_locale.textDirection() == Qt::RightToLeft;
}

QStringList LocaleInfo::uiLanguages() const
{
    return m_locale.uiLanguages();
}

QString LocaleInfo::decimalPoint() const
{
    return m_locale.decimalPoint();
}

QString LocaleInfo::groupSeparator() const
{
    return m_locale.groupSeparator();
}

QString LocaleInfo::percent() const
{
    return m_locale.percent();
}

QString LocaleInfo::zeroDigit() const
{
    return m_locale.zeroDigit();
}

QString LocaleInfo::negativeSign() const
{
    return m_locale.negativeSign();
}

QString LocaleInfo::positiveSign() const
{
    return m_locale.positiveSign();
}

QString LocaleInfo::currencySymbol() const
{
    return m_locale.currencySymbol(QLocale::CurrencySymbol);
}

QString LocaleInfo::currencyIsoCode() const
{
    return m_locale.currencySymbol(QLocale::CurrencyIsoCode);
}

bool LocaleInfo::isMetric() const
{
    return m_locale.measurementSystem() == QLocale::MetricSystem;
}

int LocaleInfo::firstDayOfWeek() const
{
    return int(m_locale.firstDayOfWeek());
}

QString LocaleInfo::amText() const
{
    return m_locale.amText();
}

QString LocaleInfo::pmText() const
{
    return m_locale.pmText();
}

QString LocaleInfo::formatNumber(double value, int decimals) const
{
    return m_locale.toString(value, 'f', qBound(0, decimals, 17));
}

QString LocaleInfo::formatInteger(double value) const
{
    return m_locale.toString(value, 'f', 0);
}

QString LocaleInfo::formatCurrency(double value, const QString &symbol, int decimals) const
{
    return m_locale.toCurrencyString(value, symbol, decimals < 0 ? -1 : qMin(decimals, 17));
}

QString LocaleInfo::formatDataSize(double bytes, int decimals) const
{
    return m_locale.formattedDataSize(qint64(bytes), qBound(0, decimals, 17));
}

double LocaleInfo::parseNumber(const QString &text) const
{
    bool ok = false;
    const double value = m_locale.toDouble(text.trimmed(), &ok);
    return ok ? value : qQNaN();
}

template <typename Value, typename Formatter>
QString LocaleInfo::format(const Value &value, const QVariant &format, Formatter formatter) const
{
    if (!value.isValid()) {
        qCWarning(lcCore) << Q_FUNC_INFO << "Invalid date or time";
        return QString();
    }
    if (format.userType() == QMetaType::QString)
        return formatter(value, format.toString(), QLocale::LongFormat);
    const int type = format.isValid() ? format.toInt() : int(LongFormat);
    return formatter(value, QString(), QLocale::FormatType(qBound(0, type, 2)));
}

QString LocaleInfo::formatDate(const QVariant &date, const QVariant &format) const
{
    return this->format(date.toDate(), format, [this](const QDate &d, const QString &pattern, QLocale::FormatType type) {
        return pattern.isNull() ? m_locale.toString(d, type) : m_locale.toString(d, pattern);
    });
}

QString LocaleInfo::formatTime(const QVariant &time, const QVariant &format) const
{
    // A script Date arrives as a date-time; its time part is meant.
    const QTime value = time.userType() == QMetaType::QDateTime ? time.toDateTime().time() : time.toTime();
    return this->format(value, format, [this](const QTime &t, const QString &pattern, QLocale::FormatType type) {
        return pattern.isNull() ? m_locale.toString(t, type) : m_locale.toString(t, pattern);
    });
}

QString LocaleInfo::formatDateTime(const QVariant &dateTime, const QVariant &format) const
{
    return this->format(dateTime.toDateTime(), format,
                        [this](const QDateTime &dt, const QString &pattern, QLocale::FormatType type) {
        return pattern.isNull() ? m_locale.toString(dt, type) : m_locale.toString(dt, pattern);
    });
}

QString LocaleInfo::dateFormat(FormatType format) const
{
    return m_locale.dateFormat(QLocale::FormatType(format));
}

QString LocaleInfo::timeFormat(FormatType format) const
{
    return m_locale.timeFormat(QLocale::FormatType(format));
}

QString LocaleInfo::dateTimeFormat(FormatType format) const
{
    return m_locale.dateTimeFormat(QLocale::FormatType(format));
}

QString LocaleInfo::monthName(int month, FormatType format) const
{
    return m_locale.monthName(month, QLocale::FormatType(format));
}

QString LocaleInfo::standaloneMonthName(int month, FormatType format) const
{
    return m_locale.standaloneMonthName(month, QLocale::FormatType(format));
}

QString LocaleInfo::dayName(int day, FormatType format) const
{
    return m_locale.dayName(day, QLocale::FormatType(format));
}
