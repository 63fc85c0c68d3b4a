#ifndef XMLUTILITY_H
#define XMLUTILITY_H

#include <QString>
#include <QVariant>
#include <QVariantMap>

class QDomElement;

// Turns XML text into a string-to-variant map that script sees as a plain
// object. Document order survives in a side list of keys ("#nodes").
class XmlUtility
{
public:
    struct Options
    {
        QString attributePrefix = QStringLiteral("@");
        QString textProperty = QStringLiteral("#text");
        QString commentProperty = QStringLiteral("#comment");
        QString cdataProperty = QStringLiteral("#cdata");
        QString nodesProperty = QStringLiteral("#nodes");
        QString indexFormat = QStringLiteral("[%1]");
        bool rootProperty = false;
        bool preserveNamespaces = false;

        static Options fromMap(const QVariantMap &map);
    };

    static QVariantMap toVariantMap(const QString &xml, const QVariantMap &options = QVariantMap());
    static QVariant toVariant(const QDomElement &element, const Options &options);
};

#endif // XMLUTILITY_H
