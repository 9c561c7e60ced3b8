@import "rows/rows.h"
@import "kinds/graph.h"

using namespace kinds;

ROW(Graph) {
    Cell c;
    c.source = 42;
    CHECK(c.twice.read(), 84);
    CHECK(c.tens(), 4);
    CHECK(vxMakeString(c.sections.read() << ' ' << c.calculated), "104 2");
    // The source changes and what is read of it does not: only the node between is calculated again.
    c.source = 43;
    CHECK(c.invalidated, 1);
    CHECK(c.calculated, 2);
    CHECK(vxMakeString(c.sections.read() << ' ' << c.calculated), "104 3");
    c.source = 51;
    CHECK(vxMakeString(c.sections.read() << ' ' << c.calculated), "105 5");
    CHECK(c.hard.read(), 5);
    c.effect();
    c.effect();
    CHECK(c.effects, 1);
    c.source = 52;
    c.effect();
    CHECK(c.effects, 2);
    CHECK(c.list.read().size(), 52);
    CHECK(c.pointer.read() == nullptr, true);
    CHECK(Throws([&] { c.cyclic.read(); }), true);
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
    CHECK(c.evicted, 2);
    CHECK(c.sections.IsUpToDate(), false);
    CHECK(c.sections.read(), 103);
    CHECK(c.label.Dependents().size(), 0);

    vesk::EvictionQueue& queue = vesk::EvictionQueue::Get(2);
    CHECK(c.filled(), "[30,30,30]");
    CHECK(vxMakeString(queue.Count() << ' ' << queue.ByteSize()), "1 12");
    queue.EvictDownTo(0);
    CHECK(queue.Count(), 0);
    CHECK(c.filled(), "[30,30,30]");

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
    CHECK(collector.objects.size(), 1);
    CHECK(collector.objects[0].Object() == &b, true);
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
