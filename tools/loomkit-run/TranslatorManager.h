#ifndef TRANSLATORMANAGER_H
#define TRANSLATORMANAGER_H

#include <QList>
#include <QObject>
#include <QVariant>

class QTranslator;

// The host's translator service, published to the module as the application
// property "Orvane.Loomkit.TranslatorManager".
class TranslatorManager : public QObject
{
    Q_OBJECT

public:
    explicit TranslatorManager(QObject *parent = nullptr);

    // translations: a base name ("MyApp") or a list of them. Each is loaded as
    // <base>_<locale>.qm from appFolderPath or its "languages" sub-folder, with
    // Qt's fallback from de_AT to de. Earlier translators of this manager are
    // removed first, so a new locale replaces the old one.
    Q_INVOKABLE void loadTranslator(const QVariant &translations, const QString &appFolderPath, const QString &locale);

    int installedCount() const { return m_translators.size(); }

private:
    QList<QTranslator *> m_translators;
};

#endif // TRANSLATORMANAGER_H
