#ifndef MORVEL_STRINGINDEX_H
#define MORVEL_STRINGINDEX_H

#include <QString>
#include <QStringView>

#include <vector>

// A set of strings, each with a number: the lookup tables of the rewriting, which must stay fast
// for tables and files of a hundred thousand atoms. Open addressing in one flat array keeps a
// lookup to a cache miss or two, and a fixed hash avoids Qt's seeded string hash, which is slow
// on some machines; the strings come from the user's own files, so nobody gains by colliding them.
class StringIndex
{
public:
    void reserve(qsizetype count);

    // Adds key with value unless key is there already (the first value stays); true if added.
    bool insert(const QString &key, qsizetype value);

    // The value stored with key, or -1.
    qsizetype value(QStringView key) const;

private:
    struct Slot
    {
        size_t hash = 0;
        qsizetype entry = -1; // into keys and values; -1: empty
    };

    static size_t hashOf(QStringView key);
    size_t slotOf(QStringView key, size_t hash) const;
    void rehash(size_t slotCount);

    std::vector<Slot> buckets; // a power of two in size, at most half full
    std::vector<QString> keys;
    std::vector<qsizetype> values;
};

#endif
