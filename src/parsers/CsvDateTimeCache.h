#ifndef CSVDATETIMECACHE_H
#define CSVDATETIMECACHE_H

#include <QDateTime>

#include <memory>
#include <vector>

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

    QDateTime plainDate(int number, const QChar *text);
    QDateTime otherText(const QChar *text, int size);

    // "yyyy-MM-dd", the common shape, by day: eight bytes and a bit a day,
    // so that the dates of a long column stay in the processor's cache while
    // the records around them stream through it.
    std::unique_ptr<QDateTime[]> m_dates;
    std::vector<quint64> m_known;
    int m_firstDate = 0;
    int m_plainDates = 0;

    std::unique_ptr<TextSlot[]> m_slots;
    int m_slotCount = 0;
    int m_misses = 0;
    quint32 m_clock = 0;
};

#endif // CSVDATETIMECACHE_H
