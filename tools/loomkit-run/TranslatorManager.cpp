#include "TranslatorManager.h"

#include <QCoreApplication>
#include <QDir>
#include <QLocale>
#include <QTranslator>

TranslatorManager::TranslatorManager(QObject *parent)
    : QObject(parent)
{
}

void TranslatorManager::loadTranslator(const QVariant &translations, const QString &appFolderPath, const QString &locale)
{
    for (QTranslator *translator : qAsConst(m_translators)) {
        QCoreApplication::removeTranslator(translator);
        delete translator;
    }
    m_translators.clear();

    QStringList baseNames;
    if (translations.canConvert<QStringList>())
        baseNames = translations.toStringList();
    else if (!translations.toString().isEmpty())
        baseNames << translations.toString();

    const QString localeName = locale.isEmpty() ? QLocale().name() : QLocale(locale).name();
    const QStringList folders { appFolderPath, QDir(appFolderPath).filePath(QStringLiteral("languages")) };
    for (const QString &baseName : qAsConst(baseNames)) {
        for (const QString &folder : folders) {
            auto *translator = new QTranslator(this);
            if (translator->load(baseName + QLatin1Char('_') + localeName, folder)
                && QCoreApplication::installTranslator(translator)) {
                m_translators.append(translator);
                break;
            }
            delete translator;
        }
    }
}
