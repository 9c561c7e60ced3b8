@import "compilable/nested_kinds.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace nested_kinds
{

static vesk::int32 __stdcall Sum(void*, vesk::int32 a, vesk::string8 const& b) { return a + vesk::int32(b.size()); }

ROW
{
    Outer::Value value(vesk::int32(5)), read;
    CHECK(read.as<vesk::int32>(), 2);
    Copy(value, read);
    CHECK(read.as<vesk::int32>(), 5);
    CHECK(value == read, true);
    value = Outer::Value::boxed("text", vesk::xvector<vesk::int32>{1, 2});
    CHECK(read < value, true);
    Copy(value, read);
    CHECK(read.as<Outer::Value::boxed>().b[1], 2);
    CHECK(vxMakeString(read), vxMakeString(value));
    CHECK(vxMakeString(Outer::Value(vesk::string8("s"))), "s");
    value = Outer::Value::far("away");
    read = value;
    CHECK(read.as<Outer::Value::far>(), "away");
    Outer::Shown shown, back;
    shown = vesk::xvector<vesk::int32>{1, 2};
    Copy(shown, back);
    CHECK(back == shown, true);
    Outer outer;
    CHECK(outer.state.is<Outer::State::off>(), true);
    Outer::Callback callback(nullptr, &Sum);
    CHECK(callback(2, "abc"), 5);
    CHECK(callback == Outer::Callback(), false);
    CHECK(vxMakeString(Outer::Action()).substr(0, 7), "Action(");
    Holder holder;
    holder.deep.choice = vesk::int32(1);
    CHECK(holder.deep.choice.is<vesk::int32>(), true);
    CHECK(vxMakeString(holder.deep.choice), "1");
    CHECK(bool(holder.deep.pick), false);
    Box<vesk::int32> box;
    box.held = Box<vesk::int32>::Held::text("in a template");
    CHECK(vxMakeString(box.held), "text(in a template)");
    CHECK(vxMakeString(Box<char>::Changed()).substr(0, 8), "Changed(");
}

}
