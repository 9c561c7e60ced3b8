// Nodes of a graph and what they cache; and graphs as they are shown: names, owners, links, counts and times, within
// limits and without a change of anything.
@import "rows/rows.h"
@import "kinds/cached.h"
@import "kinds/graph.h"
@import "Vesk/vxObject/GraphView.h"

#include <memory>

using namespace kinds;

ROW(Graph) {
    Cell c;
    c.source = 42;
    CHECK(vxMakeString(c.twice.read() << ' ' << c.tens() << ' ' << c.sections.read() << ' ' << c.calculated), "84 4 104 2");
    // The source changes and what is read of it does not: only the node between is calculated again.
    c.source = 43;
    CHECK(vxMakeString(c.invalidated << c.calculated << ' ' << c.sections.read() << ' ' << c.calculated), "12 104 3");
    c.source = 51;
    CHECK(vxMakeString(c.sections.read() << ' ' << c.calculated << ' ' << c.hard.read()), "105 5 5");
    c.effect();
    c.effect();
    CHECK(c.effects, 1);
    c.source = 52;
    c.effect();
    CHECK(vxMakeString(c.effects << ' ' << c.list.read().size()), "2 52");
    CHECK(c.pointer.read() == nullptr && Throws([&] { c.cyclic.read(); }), true);
    CHECK(c.label.read(), "start");
    c.Setlabel("set");
    CHECK(c.Getlabel(), "set");

    // Fields of a model are sources, by path.
    c.input = 5;
    CHECK(c.twice.read(), 109);
    c.input = 6;
    CHECK(c.twice.read(), 110);
    Watched w;
    w.size.width = 2;
    w.size.height += 3;
    CHECK(vxMakeString(w.area.read() << w.calculated), "61");
    w.set.Insert(1);
    w.size.colour = shapes::Green;
    CHECK(vxMakeString(w.area.read() << w.calculated), "61");
    w.size.width = 4;
    CHECK(vxMakeString(w.area.read() << w.calculated), "122");
    Watched copy(w);
    CHECK(vxMakeString(copy.area.read() << copy.calculated), "123");
    copy.a = 1;
    CHECK(vxMakeString(copy.area.read() << w.area.read()), "1312");
}

ROW(Caches) {
    Cell c;
    c.source = 30;
    c.sections.read();
    c.EvictDgsNodes();
    CHECK(vxMakeString(c.evicted << c.sections.IsUpToDate() << c.sections.read() << c.label.Dependents().size()), "2false1030");

    vesk::EvictionQueue& queue = vesk::EvictionQueue::Get(2);
    CHECK(vxMakeString(c.filled() << queue.Count() << ' ' << queue.ByteSize()), "[30,30,30]1 12");
    queue.EvictDownTo(0);
    CHECK(vxMakeString(queue.Count() << c.filled()), "0[30,30,30]");

    Nodes nodes;
    nodes.a = 1;
    CHECK(nodes.c(), 3);
    WithNodes with;
    with.base = 4;
    CHECK(vxMakeString(with.derived << with.more << (with.Final() == &with)), "54true");
}

ROW(Visiting) {
    struct Collector : vesk::IObjectVisitor {
        void VisitObject(vesk::ptr<vesk::IObject> const& object) override { objects.push_back(object); }
        vesk::xvector<vesk::ptr<vesk::IObject>> objects;
    };
    struct Prefs : vesk::IPrefVisitor {
        void VisitPref(vesk::PersistentReference const&) override { ++count; }
        int count = 0;
    };
    Cell a, b;
    a.seen = &b;
    Collector collector;
    collector << a;
    CHECK(collector.objects.size() == 1 && collector.objects[0].Object() == &b, true);
    a.sections.VisitContainingObject(collector);
    CHECK(collector.objects.size(), 2);
    a.twice.VisitContainingObject(collector);
    CHECK(collector.objects[2].Object() == &a, true);
    Doc doc;
    doc.next = &doc;
    doc.list.push_back(vesk::pref<IDoc>());
    Prefs prefs;
    prefs << doc;
    CHECK(prefs.count, 2);
    collector << doc;
    CHECK(collector.objects.size(), 4);
}

namespace {

template <typename Object>
void CheckCachesOf(Object& object, vesk::xstring const& name) {
    auto readAsync = [&] {
        return vxMakeString(object.later() << ',' << object.laterInto() << ',' << object.laterKeyed(3) << ','
                                           << object.laterPlain(3, 4));
    };
    object.source = 40;
    CHECK(vxMakeString(object.tens() << object.filled() << object.keyed(2) << object.sum(1, "abc")), "4[40,40,40]xx45");
    CHECK(vxMakeString(object.plus(1) << ',' << object.plus(2) << ',' << object.plus(1) << ',' << object.calculated), "41,42,41,3");
    CHECK(vxMakeString(readAsync() << ' ' << vesk::RunAsyncCalculations() << ' ' << readAsync()), "0,0,0,0 4 41,80,43,12");

    // What has an input follows it; without one the value stays.
    object.source = 50;
    CHECK(vxMakeString(object.tens() << object.filled() << object.plus(1) << object.sum(1, "")), "5[50,50,50]5152");
    CHECK(object.calculated, 5);
    readAsync();
    CHECK(vxMakeString(vesk::RunAsyncCalculations() << ' ' << readAsync()), "2 41,100,53,12");

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

namespace {

vesk::ConstStringZ const g_states[] = {"fresh", "unsure", "stale", "running"};

vesk::xstring ViewText(vesk::GraphView const& view) {
    return vesk::TextOf([&](vesk::xostream& os) {
        for (auto const& node : view.m_nodes) {
            os << node.m_class << "::" << node.m_name;
            if (!node.m_value.empty()) os << '=' << node.m_value;
            os << ' ' << g_states[node.m_state] << ' ' << node.m_distance << (node.m_owner ? ", " : "?, ");
        }
        for (auto const& link : view.m_links) os << link.m_from << '>' << link.m_to << ' ';
        if (view.m_isPartial) os << "partial";
    });
}

vesk::xstring ViewText(Cell const& cell, const char* name, vesk::GraphLimits const& limits = {}) {
    return ViewText(vesk::ViewGraph({vesk::FindNode(vesk::GetReflectedClass<Cell>(), &cell, name)}, limits));
}

}

ROW(GraphViews) {
    Cell cell;
    cell.source = 5;
    cell.input = 3;
    CHECK(ViewText(cell, "twice"), "kinds::Cell::twice stale 0, ");
    (void)cell.twice.read();
    (void)cell.plus(2);
    CHECK(ViewText(cell, "twice"), "kinds::Cell::twice=13 fresh 0, kinds::Cell::source=5 fresh -1, "
                                   "kinds::Cell::input=3 fresh -1, 1>0 2>0 ");
    cell.source = 6;
    CHECK(cell.calculated, 1);
    CHECK(ViewText(cell, "twice"), "kinds::Cell::twice=13 stale 0, kinds::Cell::input=3 fresh -1, 1>0 ");
    CHECK(cell.calculated, 1);
    CHECK(vesk::FindNode(vesk::GetReflectedClass<Cell>(), &cell, "none") == nullptr, true);
    (void)cell.twice.read();
    (void)cell.plus(2);
    CHECK(ViewText(cell, "source"), "kinds::Cell::source=6 fresh 0, kinds::Cell::twice=15 fresh 1, "
                                    "kinds::Cell::plus(2) fresh 1, 0>1 0>2 ");
    vesk::GraphLimits narrow;
    narrow.m_breadth = 1;
    CHECK(ViewText(cell, "source", narrow), "kinds::Cell::source=6 fresh 0, kinds::Cell::twice=15 fresh 1, 0>1 partial");

    // Nodes of mixins are in no record; fields of a model have the object's paths.
    WithNodes nodes;
    (void)nodes.derived.read();
    CHECK(ViewText(vesk::ViewGraph(vesk::NodesOf(vesk::GetReflectedClass<WithNodes>(), &nodes))),
          "kinds::WithNodes::base fresh 0, kinds::WithNodes::derived fresh 0, 0>1 ");
    Watched watched;
    watched.size.width = 4;
    (void)watched.area.read();
    CHECK(ViewText(vesk::ViewGraph(vesk::NodesOf(vesk::GetReflectedClass<Watched>(), &watched))),
          "kinds::Watched::area=0 fresh 0, kinds::Watched::size.width=4 fresh -1, "
          "kinds::Watched::size.height=0 fresh -1, kinds::Watched::a=0 fresh -1, 1>0 2>0 3>0 ");
}

ROW(GraphWatches) {
    auto cell = std::make_unique<Cell>();
    cell->source = 40;
    vesk::DGNode const& tens = *[&] {
        (void)cell->tens();
        return vesk::FindNode(vesk::GetReflectedClass<Cell>(), cell.get(), "tens()");
    }();
    vesk::uint64 number;
    {
        vesk::GraphWatch watch, other;
        CHECK(watch.TimesOf(tens).m_count, 0);
        for (int i = 0; i < 3; ++i) {
            cell->source = i;
            (void)cell->sections.read();
        }
        CHECK(other.TimesOf(tens).m_count, 3);
        auto const sections = watch.TimesOf(*vesk::FindNode(vesk::GetReflectedClass<Cell>(), cell.get(), "sections"));
        CHECK(sections.m_count, 1);
        CHECK(sections.m_own > 0 && sections.m_own < sections.m_total, true);
        CHECK(Throws([&] { (void)cell->cyclic.read(); }), true);
        CHECK(watch.TimesOf(cell->cyclic).m_failed, 1);
        (void)cell->later();
        CHECK(vesk::RunAsyncCalculations(), 1);
        auto const view = vesk::ViewGraph(vesk::NodesOf(vesk::GetReflectedClass<Cell>(), cell.get()), {}, &watch);
        for (auto const& node : view.m_nodes) {
            if (node.m_kind == vesk::GN_ASYNC) CHECK(vxMakeString(node.m_name << node.m_times.m_count), "later()1");
        }
        number = watch.NumberOf(tens);
        CHECK(other.Find(number) == &tens, true);
        watch.BeginAnew();
        CHECK(watch.TimesOf(tens).m_count, 0);
        cell.reset();
        CHECK(watch.Find(number) == nullptr, true);
    }
    vesk::GraphWatch watch;
    Cell fresh;
    CHECK(watch.NumberOf(fresh.twice) > number, true);
}
