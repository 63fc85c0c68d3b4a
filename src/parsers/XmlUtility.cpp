#include "XmlUtility.h"
#include "LoomkitLogging.h"
#include "XmlGuard.h"

#include <QDomDocument>
#include <QHash>
#include <QJsonValue>
#include <QPair>
#include <QStringBuilder>
#include <QVarLengthArray>

namespace {

QString elementName(const QString &tagName, bool preserveNamespaces)
{
    if (preserveNamespaces)
        return tagName;
    const int colon = tagName.indexOf(QLatin1Char(':'));
    return colon < 0 ? tagName : tagName.mid(colon + 1);
}

// "[%1]" and its like split once into the text before and after the marker,
// so that each entry of the order list costs one concatenation.
class IndexFormat
{
public:
    explicit IndexFormat(const QString &format)
        : m_format(format)
    {
        const int marker = format.indexOf(QLatin1String("%1"));
        const bool lone = marker >= 0 && format.indexOf(QLatin1Char('%'), marker + 2) < 0
            && (marker == 0 || format.lastIndexOf(QLatin1Char('%'), marker - 1) < 0)
            && (marker + 2 == format.size() || !format.at(marker + 2).isDigit());
        if (lone) {
            m_prefix = format.left(marker);
            m_suffix = format.mid(marker + 2);
            m_split = true;
        }
    }

    QString entry(const QString &key, int index) const
    {
        if (m_split)
            return key % m_prefix % QString::number(index) % m_suffix;
        // Without a place-marker there is nothing to fill in.
        if (!m_format.contains(QLatin1Char('%')))
            return key + m_format;
        return key + m_format.arg(index);
    }

private:
    QString m_format;
    QString m_prefix;
    QString m_suffix;
    bool m_split = false;
};

// A key's values; the list is made only when a second value comes, as most
// keys have one.
struct Group
{
    QString key;
    QVariant first;
    QVariantList values;
    int count = 0;

    void add(QVariant value)
    {
        if (count == 0) {
            first = std::move(value);
        } else {
            if (count == 1)
                values.append(std::move(first));
            values.append(std::move(value));
        }
        ++count;
    }
};

// Values of one element's children under their keys, and the order in
// which they came. Order entries become text only at the end, when it is
// known whether a key stands alone (bare) or repeats (indexed).
class Children
{
public:
    bool isEmpty() const { return m_groups.isEmpty(); }

    void add(const QString &key, QVariant value)
    {
        const int groupIndex = find(key);
        Group &group = m_groups[groupIndex];
        m_order.append(qMakePair(groupIndex, group.count));
        group.add(std::move(value));
    }

    void storeInto(QVariantMap &result, const QString &nodesProperty, const IndexFormat &format)
    {
        for (Group &group : m_groups) {
            if (group.count == 1)
                result.insert(group.key, std::move(group.first));
            else
                result.insert(group.key, std::move(group.values));
        }
        if (m_order.isEmpty() || nodesProperty.isEmpty())
            return;
        QStringList nodes;
        nodes.reserve(m_order.size());
        for (const auto &entry : qAsConst(m_order)) {
            const Group &group = m_groups.at(entry.first);
            nodes.append(group.count == 1 ? group.key : format.entry(group.key, entry.second));
        }
        result.insert(nodesProperty, nodes);
    }

private:
    int find(const QString &key)
    {
        // Most elements have a handful of distinct children; a hash pays
        // off only for the wide ones.
        if (m_index.isEmpty()) {
            for (int i = 0; i < m_groups.size(); ++i) {
                if (m_groups.at(i).key == key)
                    return i;
            }
            if (m_groups.size() < 16) {
                m_groups.append(Group { key, {}, {}, 0 });
                return m_groups.size() - 1;
            }
            for (int i = 0; i < m_groups.size(); ++i)
                m_index.insert(m_groups.at(i).key, i);
        }
        const auto it = m_index.constFind(key);
        if (it != m_index.constEnd())
            return it.value();
        m_index.insert(key, m_groups.size());
        m_groups.append(Group { key, {}, {}, 0 });
        return m_groups.size() - 1;
    }

    // On the stack for the common small element.
    QVarLengthArray<Group, 8> m_groups;
    QHash<QString, int> m_index;
    QVarLengthArray<QPair<int, int>, 16> m_order;
};

QVariant elementToVariant(const QDomElement &element, const XmlUtility::Options &options,
                          const IndexFormat &format)
{
    QVariantMap result;

    if (element.hasAttributes()) {
        const QDomNamedNodeMap attributes = element.attributes();
        const int attributeCount = attributes.count();
        for (int i = 0; i < attributeCount; ++i) {
            const QDomAttr attribute = attributes.item(i).toAttr();
            result.insert(options.attributePrefix + attribute.name(), attribute.value());
        }
    }

    Children children;
    QString pendingText;
    auto flushText = [&]() {
        if (!pendingText.isEmpty()) {
            children.add(options.textProperty, pendingText);
            pendingText.clear();
        }
    };

    for (QDomNode node = element.firstChild(); !node.isNull(); node = node.nextSibling()) {
        switch (node.nodeType()) {
        case QDomNode::ElementNode: {
            flushText();
            const QDomElement child = node.toElement();
            children.add(elementName(child.tagName(), options.preserveNamespaces),
                         elementToVariant(child, options, format));
            break;
        }
        case QDomNode::TextNode:
            pendingText = node.nodeValue();
            if (pendingText.isEmpty())
                pendingText.clear();
            if (!pendingText.isEmpty() && !children.isEmpty()) {
                children.add(options.textProperty, pendingText);
                pendingText.clear();
            }
            break;
        case QDomNode::CDATASectionNode:
            flushText();
            children.add(options.cdataProperty, node.nodeValue());
            break;
        case QDomNode::CommentNode:
            flushText();
            children.add(options.commentProperty, node.nodeValue());
            break;
        default:
            qCDebug(lcUtility) << Q_FUNC_INFO << "Skipping node" << node.nodeName();
            break;
        }
    }

    children.storeInto(result, options.nodesProperty, format);

    if (!result.isEmpty()) {
        if (!pendingText.isEmpty())
            result.insert(options.textProperty, pendingText);
        return result;
    }
    if (!pendingText.isEmpty())
        return pendingText;
    return QVariant::fromValue(QJsonValue());
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

QVariantMap XmlUtility::toVariantMap(const QString &xml, const QVariantMap &optionMap)
{
    const Options options = Options::fromMap(optionMap);

    QString reason;
    if (!XmlGuard::check(xml, &reason)) {
        qCDebug(lcUtility) << Q_FUNC_INFO << reason;
        return QVariantMap();
    }

    QDomDocument document;
    QString errorMessage;
    int errorLine = 0;
    int errorColumn = 0;
    if (!document.setContent(xml, &errorMessage, &errorLine, &errorColumn)) {
        qCDebug(lcUtility) << Q_FUNC_INFO << errorMessage << "Line:" << errorLine << "Column:" << errorColumn;
        return QVariantMap();
    }

    const QDomElement root = document.documentElement();
    const IndexFormat format(options.indexFormat);
    const QVariant value = elementToVariant(root, options, format);
    if (options.rootProperty) {
        QVariantMap result;
        result.insert(elementName(root.tagName(), options.preserveNamespaces), value);
        return result;
    }
    return value.toMap();
}

QVariant XmlUtility::toVariant(const QDomElement &element, const Options &options)
{
    const IndexFormat format(options.indexFormat);
    return elementToVariant(element, options, format);
}
