// The reader's classes are deprecated in Qt 5.15 and hidden by the build's
// cut-off; this file alone needs them.
#undef QT_DISABLE_DEPRECATED_BEFORE
#define QT_DISABLE_DEPRECATED_BEFORE 0x050E00

#include "XmlVariantReader.h"
#include "LoomkitLogging.h"

#include <QXmlDefaultHandler>

QT_WARNING_DISABLE_DEPRECATED

class XmlVariantReader::Handler : public QXmlDefaultHandler
{
public:
    explicit Handler(XmlVariantReader *reader)
        : m_reader(reader)
    {
    }

    bool startElement(const QString &, const QString &, const QString &qName,
                      const QXmlAttributes &attributes) override
    {
        if (!m_reader->startElement(qName))
            return false;
        const int count = attributes.count();
        for (int i = 0; i < count; ++i)
            m_reader->addAttribute(attributes.qName(i), attributes.value(i));
        return true;
    }

    bool endElement(const QString &, const QString &, const QString &) override { return m_reader->endElement(); }
    bool characters(const QString &text) override { return m_reader->characters(text); }

    bool processingInstruction(const QString &target, const QString &) override
    {
        m_reader->processingInstruction(target);
        return true;
    }

    bool comment(const QString &text) override
    {
        m_reader->comment(text);
        return true;
    }

    bool startCDATA() override
    {
        m_reader->m_inCData = true;
        return true;
    }

    bool endCDATA() override
    {
        m_reader->m_inCData = false;
        return true;
    }

    bool fatalError(const QXmlParseException &exception) override
    {
        m_reader->m_errorMessage = exception.message();
        m_reader->m_errorLine = exception.lineNumber();
        m_reader->m_errorColumn = exception.columnNumber();
        return QXmlDefaultHandler::fatalError(exception);
    }

private:
    XmlVariantReader *m_reader;
};

XmlVariantReader::XmlVariantReader(const XmlUtility::Options &options)
    : m_context(options)
{
}

bool XmlVariantReader::read(const QString &xml)
{
    m_stack.clear();
    m_stack.reserve(64);
    m_keys.clear();
    m_depth = 0;
    m_inCData = false;
    m_rootKey.clear();
    m_rootValue.clear();
    m_errorMessage.clear();
    m_errorLine = 0;
    m_errorColumn = 0;

    QXmlInputSource source;
    source.setData(xml);
    // Exactly the set-up of QDomDocument::setContent without namespace
    // processing, so that the same text gives the same events.
    Handler handler(this);
    QXmlSimpleReader reader;
    reader.setFeature(QStringLiteral("http://xml.org/sax/features/namespaces"), false);
    reader.setFeature(QStringLiteral("http://xml.org/sax/features/namespace-prefixes"), true);
    reader.setFeature(QStringLiteral("http://trolltech.com/xml/features/report-whitespace-only-CharData"), false);
    reader.setContentHandler(&handler);
    reader.setErrorHandler(&handler);
    reader.setLexicalHandler(&handler);
    reader.setDeclHandler(&handler);
    reader.setDTDHandler(&handler);
    const bool ok = reader.parse(&source);
    // Nothing of a failed parse is kept.
    m_stack.clear();
    m_keys.clear();
    if (!ok) {
        m_rootKey.clear();
        m_rootValue.clear();
    }
    return ok;
}

bool XmlVariantReader::startElement(const QString &tagName)
{
    if (m_depth == int(m_stack.size())) {
        m_stack.emplace_back(&m_context);
        m_keys.emplace_back();
    } else {
        m_stack[size_t(m_depth)].reset();
    }
    m_keys[size_t(m_depth)] = m_context.elementKey(tagName);
    ++m_depth;
    return true;
}

void XmlVariantReader::addAttribute(const QString &name, const QString &value)
{
    m_stack[size_t(m_depth) - 1].addAttribute(name, value);
}

bool XmlVariantReader::endElement()
{
    if (m_depth == 0)
        return false;
    --m_depth;
    QVariant value = m_stack[size_t(m_depth)].take();
    if (m_depth == 0) {
        m_rootKey = m_keys.front();
        m_rootValue = std::move(value);
    } else {
        m_stack[size_t(m_depth) - 1].addElement(m_keys[size_t(m_depth)], std::move(value));
    }
    return true;
}

// The document itself holds no text, as a DOM document doesn't.
bool XmlVariantReader::characters(const QString &text)
{
    if (m_depth == 0)
        return false;
    XmlElementValue &element = m_stack[size_t(m_depth) - 1];
    if (m_inCData)
        element.addCData(text);
    else
        element.addText(text);
    return true;
}

void XmlVariantReader::processingInstruction(const QString &target)
{
    if (m_depth > 0)
        qCDebug(lcUtility) << Q_FUNC_INFO << "Skipping node" << target;
}

// Comments around the root element are not part of it.
void XmlVariantReader::comment(const QString &text)
{
    if (m_depth > 0)
        m_stack[size_t(m_depth) - 1].addComment(text);
}
