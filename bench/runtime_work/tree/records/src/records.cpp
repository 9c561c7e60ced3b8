// Vectors of scalars and records, written and read by the runtime.
@import "Vesk/vxObject/IObject.h"

#include "timing.h"

vxDefineTarget(records, 1)

$model Place { int32 x; int32 y; };
$model Entry
{
    int32 id;
    string8 name;
    float64 price;
    bool active;
    Place place;
    xvector<int32> tags;
};

template <typename T>
void Both(const char* name, vesk::xvector<T> const& items)
{
    vesk::ByteBuffer written;
    char line[40];
    std::snprintf(line, sizeof(line), "%s_write", name);
    Measure(line, [&] {
        vesk::Archive ar;
        ar << items;
        written = std::move(ar.m_bytes);
        g_kept = written.data();
    });
    const vesk::xvector<vesk::octet_t> bytes = written;
    std::snprintf(line, sizeof(line), "%s_read", name);
    Measure(line, [&] {
        vesk::InputArchive ar(bytes);
        vesk::xvector<T> read;
        ar >> read;
        g_kept = read.data();
    });
}

int main()
{
    vesk::xvector<vesk::int32> ints(kInts);
    vesk::xvector<vesk::float64> doubles(kInts);
    for (int i = 0; i < kInts; ++i) doubles[i] = ints[i] = i;
    vesk::xvector<Entry> entries(kRecords);
    for (int i = 0; i < kRecords; ++i)
    {
        Entry& entry = entries[i];
        entry.id = i;
        entry.name = "entry number " + std::to_string(i);
        entry.price = i * 0.25;
        entry.active = i % 2;
        entry.place.x = i;
        entry.place.y = -i;
        entry.tags = {i, i + 1, i + 2, i + 3};
    }
    Both("ints", ints);
    Both("doubles", doubles);
    Both("records", entries);
}
