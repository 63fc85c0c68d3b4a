#include "XmlUtility.h"
#include "LoomkitLogging.h"
#include "XmlElementValue.h"
#include "XmlGuard.h"
#include "XmlVariantReader.h"

#include <QDomDocument>

namespace {

QVariant elementToVariant(const QDomElement &element, const XmlElementValue::Context &context)
{
    XmlElementValue value(&context);
    if (element.hasAttributes()) {
        const QDomNamedNodeMap attributes = element.attributes();
        const int attributeCount = attributes.count();
        for (int i = 0; i < attributeCount; ++i) {
            const QDomAttr attribute = attributes.item(i).toAttr();
            value.addAttribute(attribute.name(), attribute.value());
        }
    }

    for (QDomNode node = element.firstChild(); !node.isNull(); node = node.nextSibling()) {
        switch (node.nodeType()) {
        case QDomNode::ElementNode: {
            const QDomElement child = node.toElement();
            value.addElement(context.elementKey(child.tagName()), elementToVariant(child, context));
            break;
        }
        case QDomNode::TextNode:
            value.addText(node.nodeValue());
            break;
        case QDomNode::CDATASectionNode:
            value.addCData(node.nodeValue());
            break;
        case QDomNode::CommentNode:
            value.addComment(node.nodeValue());
            break;
        default:
            qCDebug(lcUtility) << Q_FUNC_INFO << "Skipping node" << node.nodeName();
            break;
        }
    }
    return value.take();
}

} // namespace

XmlUtility::Options XmlUtility::Options::fromMap(const QVariantMap &map)
{
    Options options;
    auto text = [&map](const char *key, QString *field) {
        const auto it = map.constFind(QLatin1String(key));
        if (it != map.constEnd())
            *field = it.value().toString();
    };
    auto flag = [&map](const char *key, bool *field) {
        const auto it = map.constFind(QLatin1String(key));
        if (it != map.constEnd())
            *field = it.value().toBool();
    };
    text("attributePrefix", &options.attributePrefix);
    text("textProperty", &options.textProperty);
    text("commentProperty", &options.commentProperty);
    text("cdataProperty", &options.cdataProperty);
    text("nodesProperty", &options.nodesProperty);
    text("indexFormat", &options.indexFormat);
    flag("rootProperty", &options.rootProperty);
    flag("preserveNamespaces", &options.preserveNamespaces);
    return options;
}

// The value comes from the events the document's tree would be built from,
// not from the tree: the same result without the tree's cost.
QVariantMap XmlUtility::toVariantMap(const QString &xml, const QVariantMap &optionMap)
{
    const Options options = Options::fromMap(optionMap);

    QString reason;
    if (!XmlGuard::check(xml, &reason)) {
        qCDebug(lcUtility) << Q_FUNC_INFO << reason;
        return QVariantMap();
    }

    XmlVariantReader reader(options);
    if (!reader.read(xml)) {
        qCDebug(lcUtility) << Q_FUNC_INFO << reader.errorMessage() << "Line:" << reader.errorLine()
                           << "Column:" << reader.errorColumn();
        return QVariantMap();
    }

    if (options.rootProperty) {
        QVariantMap result;
        result.insert(reader.rootKey(), reader.rootValue());
        return result;
    }
    return reader.rootValue().toMap();
}

QVariant XmlUtility::toVariant(const QDomElement &element, const Options &options)
{
    const XmlElementValue::Context context(options);
    return elementToVariant(element, context);
}
