@import "compilable/mixin_visits.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace mixin_visits
{

struct Counter : vesk::IObjectVisitor
{
    void VisitObject(vesk::ptr<vesk::IObject> const& object) override { count += object ? 1 : 0; }
    int count = 0;
};

ROW
{
    Holds holds;
    holds.a = 3;
    CHECK(holds.a, 3);
    vesk::ReflectedClass const& record = vesk::GetReflectedClass<Holds>();
    CHECK(record.m_numModelFields, 5);
    CHECK(*reinterpret_cast<vesk::int32 const*>(reinterpret_cast<char const*>(&holds) + record.m_modelFields[0].m_offset), 3);
    Uses uses;
    uses.m_seen = vesk::ptr<vesk::IObject>(&holds);
    Counter counter;
    vesk::ptr<vesk::IObject>(&uses)->VisitObjects(counter);
    CHECK(counter.count, 1);
    Lists lists;
    lists.small = 2;
    CHECK(lists.small, 2);
}

}
