#include "CsvDateTimeCache.h"

#include <QString>

#include <algorithm>

namespace {

constexpr int kFirstDateBits = 10;
constexpr int kMaximumDateBits = 16;
constexpr int kMaximumTextSlots = 1 << 15;

bool isDigit(QChar c)
{
    return c.unicode() >= '0' && c.unicode() <= '9';
}

// The digits of "yyyy-MM-dd" as yyyyMMdd, or -1 for any other text. Distinct
// texts give distinct keys.
int plainDateKey(const QChar *p, int size)
{
    if (size != 10 || p[4].unicode() != '-' || p[7].unicode() != '-')
        return -1;
    int key = 0;
    for (int i : { 0, 1, 2, 3, 5, 6, 8, 9 }) {
        if (!isDigit(p[i]))
            return -1;
        key = key * 10 + (p[i].unicode() - '0');
    }
    return key;
}

} // namespace

QDateTime CsvDateTimeCache::fromIsoText(const QChar *text, int size)
{
    const int key = plainDateKey(text, size);
    if (key >= 0)
        return plainDate(key, text);
    return otherText(text, size);
}

void CsvDateTimeCache::clear()
{
    m_dates.reset();
    m_dateBits = 0;
    m_dateCount = 0;
    m_slots.reset();
    m_slotCount = 0;
    m_misses = 0;
    m_clock = 0;
}

// Open addressing, at most half full: the entry holding the key, or the
// free one where it belongs.
CsvDateTimeCache::DateEntry *CsvDateTimeCache::dateEntry(int key) const
{
    const quint32 mask = (1u << m_dateBits) - 1;
    quint32 index = (quint32(key) * 0x9e3779b1u) >> (32 - m_dateBits);
    while (m_dates[index].key >= 0 && m_dates[index].key != key)
        index = (index + 1) & mask;
    return &m_dates[index];
}

// When the table can't grow any more, further dates are converted each time.
QDateTime CsvDateTimeCache::plainDate(int key, const QChar *text)
{
    const int size = m_dates ? 1 << m_dateBits : 0;
    if (m_dateCount * 2 >= size && m_dateBits < kMaximumDateBits) {
        std::unique_ptr<DateEntry[]> old = std::move(m_dates);
        m_dateBits = m_dateBits == 0 ? kFirstDateBits : m_dateBits + 1;
        m_dates.reset(new DateEntry[1 << m_dateBits]);
        for (int i = 0; i < size; ++i) {
            if (old[i].key >= 0)
                *dateEntry(old[i].key) = std::move(old[i]);
        }
    }
    DateEntry *entry = dateEntry(key);
    if (entry->key == key)
        return entry->dateTime;
    const QDateTime dateTime = QDateTime::fromString(QString(text, 10), Qt::ISODate);
    if (m_dateCount * 2 < (1 << m_dateBits)) {
        entry->key = key;
        entry->dateTime = dateTime;
        ++m_dateCount;
    }
    return dateTime;
}

QDateTime CsvDateTimeCache::otherText(const QChar *text, int size)
{
    if (size > TextSlot::kMaximumText)
        return QDateTime::fromString(QString(text, size), Qt::ISODate);
    uint hash = 2166136261u;
    for (int i = 0; i < size; ++i)
        hash = (hash ^ text[i].unicode()) * 16777619u;
    if (m_misses >= m_slotCount && m_slotCount < kMaximumTextSlots) {
        m_slotCount = m_slotCount == 0 ? 256 : std::min(m_slotCount * 8, kMaximumTextSlots);
        m_slots.reset(new TextSlot[m_slotCount]);
        m_misses = 0;
    }
    const uint index = (hash ^ (hash >> 15)) & uint(m_slotCount - 2);
    TextSlot *pair = m_slots.get() + index;
    for (int way = 0; way < 2; ++way) {
        TextSlot &slot = pair[way];
        if (slot.size == size && std::equal(text, text + size, slot.text)) {
            slot.age = ++m_clock;
            return slot.dateTime;
        }
    }
    ++m_misses;
    TextSlot &slot = pair[0].age <= pair[1].age ? pair[0] : pair[1];
    std::copy(text, text + size, slot.text);
    slot.size = size;
    slot.age = ++m_clock;
    slot.dateTime = QDateTime::fromString(QString(text, size), Qt::ISODate);
    return slot.dateTime;
}
