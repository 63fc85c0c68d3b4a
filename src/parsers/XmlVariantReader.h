#ifndef XMLVARIANTREADER_H
#define XMLVARIANTREADER_H

#include "XmlElementValue.h"

#include <vector>

// Converts XML text straight from the events of the reader that QDomDocument
// builds its tree with, set up as QDomDocument sets it up: the events are
// the same, so the values are those of a walk over the document's tree,
// without making the tree.
class XmlVariantReader
{
public:
    explicit XmlVariantReader(const XmlUtility::Options &options);

    // False when the text doesn't parse; errorMessage() and the position
    // say why.
    bool read(const QString &xml);

    // The root element's key, as the options make it from its tag name.
    QString rootKey() const { return m_rootKey; }
    QVariant rootValue() const { return m_rootValue; }
    QString errorMessage() const { return m_errorMessage; }
    int errorLine() const { return m_errorLine; }
    int errorColumn() const { return m_errorColumn; }

private:
    // Receives the reader's events; Qt 5.15 deprecates its base classes,
    // which are yet what the DOM is built with, so it stays out of sight.
    class Handler;

    bool startElement(const QString &tagName);
    void addAttribute(const QString &name, const QString &value);
    bool endElement();
    bool characters(const QString &text);
    void processingInstruction(const QString &target);
    void comment(const QString &text);

    XmlElementValue::Context m_context;
    // The open elements, innermost last; entries past the depth are kept
    // for reuse.
    std::vector<XmlElementValue> m_stack;
    std::vector<QString> m_keys;
    int m_depth = 0;
    bool m_inCData = false;
    QString m_rootKey;
    QVariant m_rootValue;
    QString m_errorMessage;
    int m_errorLine = 0;
    int m_errorColumn = 0;
};

#endif // XMLVARIANTREADER_H
