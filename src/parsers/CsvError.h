#ifndef CSVERROR_H
#define CSVERROR_H

#include <QMetaType>
#include <QString>

// One problem found while reading delimited text. Passed by value.
struct CsvError
{
    Q_GADGET
    Q_PROPERTY(int type MEMBER type)
    Q_PROPERTY(int line MEMBER line)
    Q_PROPERTY(int column MEMBER column)
    Q_PROPERTY(QString message MEMBER message)

public:
    enum Type {
        BadHeaderName = 0,
        WrongFieldCount = 1,
        QualifierInPlainField = 2,
        UnescapedQualifier = 3,
        EndOfFileInQuotedField = 4
    };
    Q_ENUM(Type)

    int type = BadHeaderName;
    int line = 0;
    int column = 0;
    QString message;

    bool operator==(const CsvError &other) const
    {
        return type == other.type && line == other.line && column == other.column
            && message == other.message;
    }
    bool operator!=(const CsvError &other) const { return !(*this == other); }
};

Q_DECLARE_METATYPE(CsvError)

#endif // CSVERROR_H
