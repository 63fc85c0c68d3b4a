#ifndef XMLELEMENTVALUE_H
#define XMLELEMENTVALUE_H

#include "XmlUtility.h"

#include <QHash>
#include <QPair>
#include <QString>
#include <QVarLengthArray>
#include <QVariant>

// The value of one element, made from its attributes and children as they
// come in document order: a plain text, a map of keys, or a JSON null. The
// same rules serve a walk over a DOM and the events of a reader.
class XmlElementValue
{
public:
    // What all elements of one conversion share: the options, and the index
    // format split once around its place-marker.
    class Context
    {
    public:
        explicit Context(const XmlUtility::Options &options);

        const XmlUtility::Options &options() const { return m_options; }
        // A tag name as a key: less its namespace prefix unless that is kept.
        QString elementKey(const QString &tagName) const;
        // An entry of the order list for the index-th value under a key.
        QString indexEntry(const QString &key, int index) const;

    private:
        const XmlUtility::Options &m_options;
        QString m_prefix;
        QString m_suffix;
        bool m_split = false;
    };

    explicit XmlElementValue(const Context *context);

    // Ready for another element; the space already taken is kept.
    void reset();

    void addAttribute(const QString &name, const QString &value);
    void addElement(const QString &key, QVariant value);
    void addText(const QString &text);
    void addCData(const QString &text);
    void addComment(const QString &text);

    // The element's value once all its children are in. Leaves this one to
    // be reset.
    QVariant take();

private:
    // A key's values; the list is made only when a second value comes, as
    // most keys have one.
    struct Group
    {
        QString key;
        QVariant first;
        QVariantList values;
        int count = 0;
    };

    void flushText();
    void add(const QString &key, QVariant value);
    int groupOf(const QString &key);

    const Context *m_context;
    QVariantMap m_result;
    QString m_pendingText;
    // On the stack for the common small element. Order entries become text
    // only at the end, once it is known whether a key stands alone (bare) or
    // repeats (indexed).
    QVarLengthArray<Group, 8> m_groups;
    QHash<QString, int> m_index;
    QVarLengthArray<QPair<int, int>, 16> m_order;
};

#endif // XMLELEMENTVALUE_H
