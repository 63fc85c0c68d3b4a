#ifndef XMLGUARD_H
#define XMLGUARD_H

#include <QString>

// A quick look at XML text before Qt's reader parses it: the reader (under
// the DOM too) recurses once per level of nesting and expands entities
// without a total limit, so documents that are too deep or expand too far
// are turned away.
// Text that isn't well-formed passes; the parser rejects it on its own.
class XmlGuard
{
public:
    static constexpr int kMaximumDepth = 1000;
    static constexpr qint64 kExpansionBudget = 16 * 1024 * 1024; // characters

    // True if the text may go to the parser; otherwise reason says why.
    static bool check(const QString &xml, QString *reason = nullptr);
};

#endif // XMLGUARD_H
