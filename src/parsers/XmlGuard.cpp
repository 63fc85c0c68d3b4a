#include "XmlGuard.h"

#include <QHash>
#include <QVector>

#include <algorithm>

namespace {

// Entities that refer to entities that refer to ... deeper than this are
// turned away; no honest document comes near it.
constexpr int kMaximumEntityChain = 64;
// Parameter entities that expand into declarations are followed this far.
constexpr int kMaximumParameterChain = 8;

bool isSpace(char16_t c)
{
    return c == ' ' || c == '\t' || c == '\n' || c == '\r';
}

bool isNameStart(char16_t c)
{
    return c == ':' || c == '_' || (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z') || c >= 0x80;
}

bool isNameChar(char16_t c)
{
    return isNameStart(c) || c == '-' || c == '.' || (c >= '0' && c <= '9');
}

bool startsWith(const QChar *p, const QChar *end, const char *literal)
{
    for (; *literal; ++literal, ++p) {
        if (p == end || p->unicode() != char16_t(*literal))
            return false;
    }
    return true;
}

// Position just past the literal, or end if it never comes.
const QChar *skipPast(const QChar *p, const QChar *end, const char *literal)
{
    const char16_t first = char16_t(literal[0]);
    for (; p != end; ++p) {
        if (p->unicode() == first && startsWith(p, end, literal))
            return p + qstrlen(literal);
    }
    return end;
}

// Skips a declaration or tag to its closing '>', stepping over quoted text.
const QChar *skipDeclaration(const QChar *p, const QChar *end)
{
    char16_t quote = 0;
    for (; p != end; ++p) {
        const char16_t c = p->unicode();
        if (quote) {
            if (c == quote)
                quote = 0;
        } else if (c == '"' || c == '\'') {
            quote = c;
        } else if (c == '>') {
            return p + 1;
        }
    }
    return end;
}

struct Extent
{
    qint64 size = 0; // characters produced
    int depth = 0;   // deepest element nesting reached, relative
};

class Scanner
{
public:
    bool run(const QString &xml, QString *reason);

private:
    struct Entity
    {
        QVector<QString> values; // every declaration; the largest counts
        int state = 0;           // 0 not measured, 1 being measured, 2 measured
        Extent extent;
    };

    const QChar *scanDoctype(const QChar *p, const QChar *end);
    const QChar *scanSubset(const QChar *p, const QChar *end, int parameterChain);
    const QChar *scanEntityDeclaration(const QChar *p, const QChar *end);
    // Walks markup and text; returns false once a limit is passed.
    bool scanMarkup(const QChar *p, const QChar *end, int baseDepth, int chain, bool isEntityText,
                    Extent *extent);
    const QChar *scanReference(const QChar *p, const QChar *end, int depth, int chain,
                               Extent *extent, bool *ok);
    bool measure(const QString &name, int chain, Extent *extent);
    void addSize(Extent *extent, qint64 size);
    bool fail(const QString &why);

    QHash<QString, Entity> m_general;
    QHash<QString, QString> m_parameter;
    qint64 m_subsetExpansion = 0;
    QString m_reason;
};

bool Scanner::fail(const QString &why)
{
    if (m_reason.isEmpty())
        m_reason = why;
    return false;
}

void Scanner::addSize(Extent *extent, qint64 size)
{
    // Saturates: nested expansions grow exponentially.
    extent->size = std::min(extent->size + size, XmlGuard::kExpansionBudget + 1);
}

bool Scanner::run(const QString &xml, QString *reason)
{
    const QChar *p = xml.constData();
    const QChar *end = p + xml.size();
    Extent document;
    const bool ok = scanMarkup(p, end, 0, 0, false, &document);
    if (!ok && reason)
        *reason = m_reason;
    return ok;
}

const QChar *Scanner::scanDoctype(const QChar *p, const QChar *end)
{
    char16_t quote = 0;
    while (p != end) {
        const char16_t c = p->unicode();
        if (quote) {
            if (c == quote)
                quote = 0;
        } else if (c == '"' || c == '\'') {
            quote = c;
        } else if (c == '[') {
            p = scanSubset(p + 1, end, 0);
            continue;
        } else if (c == '>') {
            return p + 1;
        }
        ++p;
    }
    return end;
}

const QChar *Scanner::scanSubset(const QChar *p, const QChar *end, int parameterChain)
{
    while (p != end) {
        const char16_t c = p->unicode();
        if (c == ']' && parameterChain == 0)
            return p + 1;
        if (c == '<') {
            if (startsWith(p, end, "<!--"))
                p = skipPast(p + 4, end, "-->");
            else if (startsWith(p, end, "<?"))
                p = skipPast(p + 2, end, "?>");
            else if (startsWith(p, end, "<!ENTITY"))
                p = scanEntityDeclaration(p + 8, end);
            else
                p = skipDeclaration(p + 1, end);
            continue;
        }
        if (c == '%') {
            const QChar *nameStart = ++p;
            while (p != end && isNameChar(p->unicode()))
                ++p;
            if (p != end && p->unicode() == ';' && p != nameStart) {
                const QString name(nameStart, int(p - nameStart));
                ++p;
                const auto it = m_parameter.constFind(name);
                if (it != m_parameter.constEnd()) {
                    // The parser reads a parameter entity's text as more
                    // declarations; so do we, a few levels down.
                    if (parameterChain >= kMaximumParameterChain) {
                        m_subsetExpansion = XmlGuard::kExpansionBudget + 1;
                        return end;
                    }
                    m_subsetExpansion += it.value().size();
                    if (m_subsetExpansion > XmlGuard::kExpansionBudget)
                        return end;
                    const QString text = it.value();
                    scanSubset(text.constData(), text.constData() + text.size(), parameterChain + 1);
                }
            }
            continue;
        }
        ++p;
    }
    return end;
}

const QChar *Scanner::scanEntityDeclaration(const QChar *p, const QChar *end)
{
    while (p != end && isSpace(p->unicode()))
        ++p;
    bool parameter = false;
    if (p != end && p->unicode() == '%') {
        parameter = true;
        ++p;
        while (p != end && isSpace(p->unicode()))
            ++p;
    }
    const QChar *nameStart = p;
    while (p != end && isNameChar(p->unicode()))
        ++p;
    const QString name(nameStart, int(p - nameStart));
    while (p != end && isSpace(p->unicode()))
        ++p;
    if (p != end && (p->unicode() == '"' || p->unicode() == '\'')) {
        const char16_t quote = p->unicode();
        const QChar *valueStart = ++p;
        while (p != end && p->unicode() != quote)
            ++p;
        const QString value(valueStart, int(p - valueStart));
        if (!name.isEmpty()) {
            if (parameter)
                m_parameter.insert(name, value);
            else
                m_general[name].values.append(value);
        }
        if (p != end)
            ++p;
    }
    // External entities aren't fetched by the parser: nothing to measure.
    return skipDeclaration(p, end);
}

bool Scanner::measure(const QString &name, int chain, Extent *extent)
{
    const auto it = m_general.find(name);
    if (it == m_general.end())
        return true; // undeclared or predefined: the parser adds nothing big
    if (it->state == 2) {
        *extent = it->extent;
        return true;
    }
    if (it->state == 1)
        return fail(QStringLiteral("Entity \"%1\" refers to itself").arg(name));
    if (chain >= kMaximumEntityChain)
        return fail(QStringLiteral("Entities nested more than %1 levels deep").arg(kMaximumEntityChain));

    it->state = 1;
    const QVector<QString> values = it->values;
    Extent largest;
    for (const QString &value : values) {
        Extent one;
        if (!scanMarkup(value.constData(), value.constData() + value.size(), 0, chain + 1, true, &one))
            return false;
        largest.size = std::max(largest.size, one.size);
        largest.depth = std::max(largest.depth, one.depth);
    }
    Entity &entity = m_general[name];
    entity.state = 2;
    entity.extent = largest;
    *extent = largest;
    return true;
}

const QChar *Scanner::scanReference(const QChar *p, const QChar *end, int depth, int chain,
                                    Extent *extent, bool *ok)
{
    // p stands on '&' (or '%' in entity text).
    const QChar *nameStart = p + 1;
    const QChar *q = nameStart;
    if (q != end && q->unicode() == '#')
        return q + 1; // a character reference
    while (q != end && isNameChar(q->unicode()))
        ++q;
    if (q == end || q->unicode() != ';' || q == nameStart)
        return nameStart;

    Extent referred;
    const QString name(nameStart, int(q - nameStart));
    if (p->unicode() == '%') {
        referred.size = m_parameter.value(name).size();
    } else if (!measure(name, chain, &referred)) {
        *ok = false;
        return end;
    }
    addSize(extent, referred.size);
    extent->depth = std::max(extent->depth, depth + referred.depth);
    if (extent->size > XmlGuard::kExpansionBudget) {
        *ok = fail(QStringLiteral("Entity expansion exceeds %1 characters").arg(XmlGuard::kExpansionBudget));
        return end;
    }
    if (depth + referred.depth > XmlGuard::kMaximumDepth) {
        *ok = fail(QStringLiteral("Elements nested more than %1 levels deep").arg(XmlGuard::kMaximumDepth));
        return end;
    }
    return q + 1;
}

bool Scanner::scanMarkup(const QChar *p, const QChar *end, int baseDepth, int chain,
                         bool isEntityText, Extent *extent)
{
    int depth = baseDepth;
    bool ok = true;
    if (isEntityText)
        addSize(extent, end - p);

    while (p != end) {
        const char16_t c = p->unicode();
        if (c == '&' || (c == '%' && isEntityText)) {
            p = scanReference(p, end, depth, chain, extent, &ok);
            if (!ok)
                return false;
            continue;
        }
        if (c != '<') {
            ++p;
            continue;
        }

        if (startsWith(p, end, "<!--")) {
            p = skipPast(p + 4, end, "-->");
        } else if (startsWith(p, end, "<![CDATA[")) {
            p = skipPast(p + 9, end, "]]>");
        } else if (startsWith(p, end, "<!DOCTYPE") && !isEntityText) {
            p = scanDoctype(p + 9, end);
            if (m_subsetExpansion > XmlGuard::kExpansionBudget)
                return fail(QStringLiteral("Entity expansion exceeds %1 characters").arg(XmlGuard::kExpansionBudget));
        } else if (startsWith(p, end, "<?")) {
            p = skipPast(p + 2, end, "?>");
        } else if (startsWith(p, end, "</")) {
            depth = std::max(baseDepth, depth - 1);
            p = skipDeclaration(p + 2, end);
        } else if (p + 1 != end && isNameStart(p[1].unicode())) {
            // A start tag; references in its attribute values expand too.
            char16_t quote = 0;
            bool empty = false;
            for (++p; p != end; ++p) {
                const char16_t t = p->unicode();
                if (quote) {
                    if (t == quote) {
                        quote = 0;
                    } else if (t == '&') {
                        p = scanReference(p, end, depth, chain, extent, &ok) - 1;
                        if (!ok)
                            return false;
                    }
                } else if (t == '"' || t == '\'') {
                    quote = t;
                } else if (t == '>') {
                    empty = p[-1].unicode() == '/';
                    ++p;
                    break;
                }
            }
            if (!empty) {
                ++depth;
                extent->depth = std::max(extent->depth, depth - baseDepth);
                if (depth > XmlGuard::kMaximumDepth)
                    return fail(QStringLiteral("Elements nested more than %1 levels deep").arg(XmlGuard::kMaximumDepth));
            }
        } else {
            ++p;
        }
    }
    return true;
}

} // namespace

bool XmlGuard::check(const QString &xml, QString *reason)
{
    Scanner scanner;
    return scanner.run(xml, reason);
}
