#ifndef LOCALEINFO_H
#define LOCALEINFO_H

#include <QLocale>
#include <QObject>
#include <QStringList>
#include <QVariant>

// A locale for QML: its names, language and country, and number, date, time
// and currency formatting in its conventions.
class LocaleInfo : public QObject
{
    Q_OBJECT

    Q_PROPERTY(QString name READ name WRITE setName NOTIFY localeChanged)
    Q_PROPERTY(QString bcp47Name READ bcp47Name NOTIFY localeChanged)
    Q_PROPERTY(QString languageCode READ languageCode NOTIFY localeChanged)
    Q_PROPERTY(QString countryCode READ countryCode NOTIFY localeChanged)
    Q_PROPERTY(QString languageName READ languageName NOTIFY localeChanged)
    Q_PROPERTY(QString countryName READ countryName NOTIFY localeChanged)
    Q_PROPERTY(QString scriptName READ scriptName NOTIFY localeChanged)
    Q_PROPERTY(QString nativeLanguageName READ nativeLanguageName NOTIFY localeChanged)
    Q_PROPERTY(QString nativeCountryName READ nativeCountryName NOTIFY localeChanged)
    Q_PROPERTY(bool isRightToLeft READ isRightToLeft NOTIFY localeChanged)
    Q_PROPERTY(QStringList uiLanguages READ uiLanguages NOTIFY localeChanged)
    Q_PROPERTY(QString decimalPoint READ decimalPoint NOTIFY localeChanged)
    Q_PROPERTY(QString groupSeparator READ groupSeparator NOTIFY localeChanged)
    Q_PROPERTY(QString percent READ percent NOTIFY localeChanged)
    Q_PROPERTY(QString zeroDigit READ zeroDigit NOTIFY localeChanged)
    Q_PROPERTY(QString negativeSign READ negativeSign NOTIFY localeChanged)
    Q_PROPERTY(QString positiveSign READ positiveSign NOTIFY localeChanged)
    Q_PROPERTY(QString currencySymbol READ currencySymbol NOTIFY localeChanged)
    Q_PROPERTY(QString currencyIsoCode READ currencyIsoCode NOTIFY localeChanged)
    Q_PROPERTY(bool isMetric READ isMetric NOTIFY localeChanged)
    Q_PROPERTY(int firstDayOfWeek READ firstDayOfWeek NOTIFY localeChanged)
    Q_PROPERTY(QString amText READ amText NOTIFY localeChanged)
    Q_PROPERTY(QString pmText READ pmText NOTIFY localeChanged)

public:
    // The values of QLocale::FormatType.
    enum FormatType {
        LongFormat = QLocale::LongFormat,
        ShortFormat = QLocale::ShortFormat,
        NarrowFormat = QLocale::NarrowFormat
    };
    Q_ENUM(FormatType)

    // The default locale (QLocale()).
    explicit LocaleInfo(QObject *parent = nullptr);
    explicit LocaleInfo(const QString &name, QObject *parent = nullptr);

    // Unparented, in JavaScript ownership.
    static LocaleInfo *create(const QLocale &locale);

    QLocale locale() const { return m_locale; }

    QString name() const;
    void setName(const QString &name);
    QString bcp47Name() const;
    QString languageCode() const;
    QString countryCode() const;
    QString languageName() const;
    QString countryName() const;
    QString scriptName() const;
    QString nativeLanguageName() const;
    QString nativeCountryName() const;
    bool isRightToLeft() const;
    QStringList uiLanguages() const;
    QString decimalPoint() const;
    QString groupSeparator() const;
    QString percent() const;
    QString zeroDigit() const;
    QString negativeSign() const;
    QString positiveSign() const;
    QString currencySymbol() const;
    QString currencyIsoCode() const;
    bool isMetric() const;
    int firstDayOfWeek() const;
    QString amText() const;
    QString pmText() const;

    // Numbers with a fixed count of decimals, grouped as the locale does.
    Q_INVOKABLE QString formatNumber(double value, int decimals = 2) const;
    Q_INVOKABLE QString formatInteger(double value) const;
    Q_INVOKABLE QString formatCurrency(double value, const QString &symbol = QString(), int decimals = -1) const;
    Q_INVOKABLE QString formatDataSize(double bytes, int decimals = 2) const;
    // A number, or NaN when the text is no number in this locale.
    Q_INVOKABLE double parseNumber(const QString &text) const;

    // The format is a FormatType or a pattern such as "yyyy-MM-dd".
    Q_INVOKABLE QString formatDate(const QVariant &date, const QVariant &format = QVariant()) const;
    Q_INVOKABLE QString formatTime(const QVariant &time, const QVariant &format = QVariant()) const;
    Q_INVOKABLE QString formatDateTime(const QVariant &dateTime, const QVariant &format = QVariant()) const;
    Q_INVOKABLE QString dateFormat(FormatType format = LongFormat) const;
    Q_INVOKABLE QString timeFormat(FormatType format = LongFormat) const;
    Q_INVOKABLE QString dateTimeFormat(FormatType format = LongFormat) const;
    Q_INVOKABLE QString monthName(int month, FormatType format = LongFormat) const;
    Q_INVOKABLE QString standaloneMonthName(int month, FormatType format = LongFormat) const;
    Q_INVOKABLE QString dayName(int day, FormatType format = LongFormat) const;

signals:
    void localeChanged();

private:
    template <typename Value, typename Formatter>
    QString format(const Value &value, const QVariant &format, Formatter formatter) const;

    QLocale m_locale;
};

#endif // LOCALEINFO_H
