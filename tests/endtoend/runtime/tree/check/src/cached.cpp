// Cached functions, also where what their nodes inherit depends on template parameters.
@import "rows/rows.h"
@import "kinds/cached.h"
@import "kinds/graph.h"

using namespace kinds;

namespace {

template <typename Object>
void CheckCachesOf(Object& object, vesk::xstring const& name) {
    auto readAsync = [&] {
        return vxMakeString(object.later() << ',' << object.laterInto() << ',' << object.laterKeyed(3) << ','
                                           << object.laterPlain(3, 4));
    };
    object.source = 40;
    CHECK(vxMakeString(object.tens() << object.filled() << object.keyed(2) << object.sum(1, "abc")), "4[40,40,40]xx45");
    CHECK(vxMakeString(object.plus(1) << ',' << object.plus(2) << ',' << object.plus(1)), "41,42,41");
    CHECK(object.calculated, 3);
    CHECK(readAsync(), "0,0,0,0");
    CHECK(vesk::RunAsyncCalculations(), 4);
    CHECK(readAsync(), "41,80,43,12");

    // What has an input follows it; without one the value stays.
    object.source = 50;
    CHECK(vxMakeString(object.tens() << object.filled() << object.plus(1) << object.sum(1, "")), "5[50,50,50]5152");
    CHECK(object.calculated, 5);
    readAsync();
    CHECK(vesk::RunAsyncCalculations(), 2);
    CHECK(readAsync(), "41,100,53,12");

    CHECK(vxMakeString(object._dn_tens.Name() << object._map_plus.begin()->second.Name()),
          name + "::tens()" + name + "::plus(1)");
    CHECK(object._dn_filled.ByteSize() > 0 && object._dn_filled.EvictionQueueIndex() == 2, true);
    const int32 calculated = object.calculated;
    vesk::TryEvict(object._map_plus);
    object._dn_tens.TryEvict(false);
    CHECK(vxMakeString(object.tens() << object.plus(1)), "551");
    CHECK(object.calculated, calculated + 2);
}

// Whose final object it is.
struct Seen : vesk::IObjectVisitor {
    void VisitObject(vesk::ptr<vesk::IObject> const& object) override {
        names.push_back(object->GetReflectedClass()->m_name);
    }
    vesk::xvector<vesk::xstring> names;
};

}

ROW(CachedFunctions) {
    Cell cell;
    CheckCachesOf(cell, "Cell");

    WithCaches mixed;
    CheckCachesOf(mixed, "CacheMixin");
    Seen seen;
    mixed._dn_tens.VisitContainingObject(seen);
    mixed._map_plus.begin()->second.VisitContainingObject(seen);
    CHECK(seen.names, "[kinds::WithCaches,kinds::WithCaches]");
    mixed.EvictDgsNodes();
    CHECK(mixed._dn_tens.IsUpToDate(), false);

    CacheTemplate<int32> ofInts;
    CheckCachesOf(ofInts, "CacheTemplate");
    CacheTemplate<vesk::float64> ofNumbers;
    CheckCachesOf(ofNumbers, "CacheTemplate");
}
