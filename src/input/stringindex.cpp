#include "stringindex.h"

#include <functional>
#include <string_view>

size_t StringIndex::hashOf(QStringView key)
{
    return std::hash<std::u16string_view>()(
        std::u16string_view(reinterpret_cast<const char16_t *>(key.utf16()), size_t(key.size())));
}

size_t StringIndex::slotOf(QStringView key, size_t hash) const
{
    const size_t mask = buckets.size() - 1;
    for (size_t i = hash & mask;; i = (i + 1) & mask) {
        const Slot &slot = buckets[i];
        if (slot.entry < 0 || (slot.hash == hash && keys[size_t(slot.entry)] == key))
            return i;
    }
}

void StringIndex::rehash(size_t slotCount)
{
    std::vector<Slot> old;
    old.swap(buckets);
    buckets.assign(slotCount, Slot());
    const size_t mask = slotCount - 1;
    for (const Slot &slot : old) {
        if (slot.entry < 0)
            continue;
        size_t i = slot.hash & mask;
        while (buckets[i].entry >= 0)
            i = (i + 1) & mask;
        buckets[i] = slot;
    }
}

void StringIndex::reserve(qsizetype count)
{
    size_t wanted = 16;
    while (wanted < size_t(count) * 2)
        wanted *= 2;
    if (wanted > buckets.size())
        rehash(wanted);
    keys.reserve(size_t(count));
    values.reserve(size_t(count));
}

bool StringIndex::insert(const QString &key, qsizetype value)
{
    if ((keys.size() + 1) * 2 > buckets.size())
        rehash(buckets.empty() ? 16 : buckets.size() * 2);
    const size_t hash = hashOf(key);
    Slot &slot = buckets[slotOf(key, hash)];
    if (slot.entry >= 0)
        return false;
    slot.hash = hash;
    slot.entry = qsizetype(keys.size());
    keys.push_back(key);
    values.push_back(value);
    return true;
}

qsizetype StringIndex::value(QStringView key) const
{
    if (buckets.empty())
        return -1;
    const Slot &slot = buckets[slotOf(key, hashOf(key))];
    return slot.entry < 0 ? -1 : values[size_t(slot.entry)];
}
