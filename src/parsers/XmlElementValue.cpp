#include "XmlElementValue.h"

#include <QJsonValue>
#include <QStringBuilder>
#include <QStringList>

XmlElementValue::Context::Context(const XmlUtility::Options &options)
    : m_options(options)
{
    // "[%1]" and its like split into the text before and after the marker,
    // so that each order entry costs one concatenation.
    const QString &format = options.indexFormat;
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

QString XmlElementValue::Context::elementKey(const QString &tagName) const
{
    if (m_options.preserveNamespaces)
        return tagName;
    const int colon = tagName.indexOf(QLatin1Char(':'));
    return colon < 0 ? tagName : tagName.mid(colon + 1);
}

QString XmlElementValue::Context::indexEntry(const QString &key, int index) const
{
    if (m_split)
        return key % m_prefix % QString::number(index) % m_suffix;
    // Without a place-marker there is nothing to fill in.
    if (!m_options.indexFormat.contains(QLatin1Char('%')))
        return key + m_options.indexFormat;
    return key + m_options.indexFormat.arg(index);
}

XmlElementValue::XmlElementValue(const Context *context)
    : m_context(context)
{
}

void XmlElementValue::reset()
{
    m_result.clear();
    m_pendingText.clear();
    m_groups.clear();
    m_index.clear();
    m_order.clear();
}

void XmlElementValue::addAttribute(const QString &name, const QString &value)
{
    m_result.insert(m_context->options().attributePrefix + name, value);
}

void XmlElementValue::addElement(const QString &key, QVariant value)
{
    flushText();
    add(key, std::move(value));
}

// Text waits, as more text or the end of the element may follow; it joins
// the children at once when some came before it.
void XmlElementValue::addText(const QString &text)
{
    m_pendingText = text;
    if (m_pendingText.isEmpty())
        m_pendingText.clear();
    if (!m_pendingText.isEmpty() && !m_groups.isEmpty()) {
        add(m_context->options().textProperty, m_pendingText);
        m_pendingText.clear();
    }
}

void XmlElementValue::addCData(const QString &text)
{
    flushText();
    add(m_context->options().cdataProperty, text);
}

void XmlElementValue::addComment(const QString &text)
{
    flushText();
    add(m_context->options().commentProperty, text);
}

QVariant XmlElementValue::take()
{
    const XmlUtility::Options &options = m_context->options();
    for (Group &group : m_groups) {
        if (group.count == 1)
            m_result.insert(group.key, std::move(group.first));
        else
            m_result.insert(group.key, std::move(group.values));
    }
    if (!m_order.isEmpty() && !options.nodesProperty.isEmpty()) {
        QStringList nodes;
        nodes.reserve(m_order.size());
        for (const auto &entry : qAsConst(m_order)) {
            const Group &group = m_groups.at(entry.first);
            nodes.append(group.count == 1 ? group.key : m_context->indexEntry(group.key, entry.second));
        }
        m_result.insert(options.nodesProperty, nodes);
    }

    if (!m_result.isEmpty()) {
        if (!m_pendingText.isEmpty())
            m_result.insert(options.textProperty, m_pendingText);
        return std::exchange(m_result, QVariantMap());
    }
    if (!m_pendingText.isEmpty())
        return std::exchange(m_pendingText, QString());
    return QVariant::fromValue(QJsonValue());
}

void XmlElementValue::flushText()
{
    if (!m_pendingText.isEmpty()) {
        add(m_context->options().textProperty, m_pendingText);
        m_pendingText.clear();
    }
}

void XmlElementValue::add(const QString &key, QVariant value)
{
    const int groupIndex = groupOf(key);
    Group &group = m_groups[groupIndex];
    m_order.append(qMakePair(groupIndex, group.count));
    if (group.count == 0) {
        group.first = std::move(value);
    } else {
        if (group.count == 1)
            group.values.append(std::move(group.first));
        group.values.append(std::move(value));
    }
    ++group.count;
}

int XmlElementValue::groupOf(const QString &key)
{
    // Most elements have a handful of distinct children; a hash pays off
    // only for the wide ones.
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
