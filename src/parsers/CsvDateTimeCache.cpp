#include "CsvDateTimeCache.h"

#include <QString>

#include <algorithm>

namespace {

constexpr int kDaysPerYear = 12 * 31;
constexpr int kWindowYears = 64;
constexpr int kWindow = kWindowYears * kDaysPerYear;
constexpr int kDatesBeforeTable = 256;
constexpr int kMaximumTextSlots = 1 << 15;

bool isDigit(QChar c)
{
    return c.unicode() >= '0' && c.unicode() <= '9';
}

int twoDigits(const QChar *p)
{
    return (p[0].unicode() - '0') * 10 + (p[1].unicode() - '0');
}

// "yyyy-MM-dd" with a month of 1 to 12 and a day of 1 to 31 as a day number
// that counts 31 days a month: distinct texts give distinct numbers, and the
// dates of a few decades lie close together. -1 for any other text.
int plainDateNumber(const QChar *p, int size)
{
    if (size != 10 || p[4].unicode() != '-' || p[7].unicode() != '-')
        return -1;
    for (int i : { 0, 1, 2, 3, 5, 6, 8, 9 }) {
        if (!isDigit(p[i]))
            return -1;
    }
    const int year = twoDigits(p) * 100 + twoDigits(p + 2);
    const int month = twoDigits(p + 5);
    const int day = twoDigits(p + 8);
    if (month < 1 || month > 12 || day < 1 || day > 31)
        return -1;
    return year * kDaysPerYear + (month - 1) * 31 + day - 1;
}

} // namespace

QDateTime CsvDateTimeCache::fromIsoText(const QChar *text, int size)
{
    const int number = plainDateNumber(text, size);
    if (number >= 0)
        return plainDate(number, text);
    return otherText(text, size);
}

void CsvDateTimeCache::clear()
{
    m_dates.reset();
    m_known.clear();
    m_firstDate = 0;
    m_plainDates = 0;
    m_slots.reset();
    m_slotCount = 0;
    m_misses = 0;
    m_clock = 0;
}

// A window of years around the date that makes the table, one entry a day;
// dates outside it share the slots of the other texts, and so do the first
// dates of a parse, so that a small file doesn't pay for the table.
QDateTime CsvDateTimeCache::plainDate(int number, const QChar *text)
{
    if (!m_dates) {
        if (++m_plainDates <= kDatesBeforeTable)
            return otherText(text, 10);
        const int year = number / kDaysPerYear;
        m_firstDate = std::max(0, year - kWindowYears / 2) * kDaysPerYear;
        m_dates.reset(new QDateTime[kWindow]);
        m_known.assign((kWindow + 63) / 64, 0);
    }
    const int index = number - m_firstDate;
    if (index < 0 || index >= kWindow)
        return otherText(text, 10);
    quint64 &known = m_known[index / 64];
    const quint64 bit = quint64(1) << (index % 64);
    if (!(known & bit)) {
        m_dates[index] = QDateTime::fromString(QString(text, 10), Qt::ISODate);
        known |= bit;
    }
    return m_dates[index];
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
