// Graphs as they are shown: names, owners, links, counts and times; within limits, and without a change of anything.
@import "rows/rows.h"
@import "kinds/graph.h"

@import "Vesk/vxObject/GraphView.h"

#include <memory>

using namespace kinds;

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
