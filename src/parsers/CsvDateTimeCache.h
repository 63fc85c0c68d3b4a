#ifndef CSVDATETIMECACHE_H
#define CSVDATETIMECACHE_H

#include <QDateTime>

#include <memory>

// Remembers what QDateTime::fromString(text, Qt::ISODate) made of the texts
// of one parse. Turning a local date-time into an instant costs a time zone
// lookup in the C library (a stat of /etc/localtime), far more than the rest
// of a field, and columns of dates repeat.
class CsvDateTimeCache
{
public:
    QDateTime fromIsoText(const QChar *text, int size);
    void clear();

private:
    // "yyyy-MM-dd" texts, the common shape, keyed by their digits: sixteen
    // bytes an entry, so that the dates of a long column stay in the
    // processor's cache while the records around them stream through it.
    struct DateEntry
    {
        int key = -1;
        QDateTime dateTime;
    };

    // Anything else up to 24 characters: a two-way cache keyed by the text,
    // a cache line a slot. Small at first; many distinct texts make it grow.
    struct alignas(64) TextSlot
    {
        static constexpr int kMaximumText = 24;
        QChar text[kMaximumText];
        int size = -1;
        quint32 age = 0;
        QDateTime dateTime;
    };

    DateEntry *dateEntry(int key) const;
    QDateTime plainDate(int key, const QChar *text);
    QDateTime otherText(const QChar *text, int size);

    std::unique_ptr<DateEntry[]> m_dates;
    int m_dateBits = 0;
    int m_dateCount = 0;

    std::unique_ptr<TextSlot[]> m_slots;
    int m_slotCount = 0;
    int m_misses = 0;
    quint32 m_clock = 0;
};

#endif // CSVDATETIMECACHE_H
