// Values and objects as JSON and by name, known by their records alone.
@import "rows/rows.h"
@import "kinds/graph.h"
@import "kinds/plain.h"
@import "Vesk/vxObject/Json.h"

using namespace kinds;

namespace {

// Quotes as apostrophes, for text that is full of them.
vesk::xstring Q(vesk::xstring const& text) { return Replaced(text, "'", "\""); }

template <typename T>
vesk::xstring Json(T const& value) {
    return Outcome<vesk::AccessError>([&] { return vesk::ToJson(vesk::Value::Of(value)); });
}

template <typename T>
vesk::xstring ReadError(T& value, std::string_view text, vesk::JsonLimits const& limits = {}) {
    return ErrorOf<vesk::AccessError>([&] { vesk::FromJsonText(value, text, limits); });
}

// What the value is after the text was read, or the error.
template <typename T>
vesk::xstring Read(std::string_view text) {
    T value = T();
    const vesk::xstring error = ReadError(value, text);
    return error == "none" ? Json(value) : error;
}

Part MakePart(int32 number, vesk::string8 const& name) {
    Part part;
    part.number = number;
    part.name = name;
    part.marks = {1, -2};
    return part;
}

const Part g_part = MakePart(7, "p"), g_other = MakePart(8, "a much longer name than fits");

// A value of each kind.
vesk::xstring ReflectedText() {
    const vesk::xstring text =
        Q("{'flag':true,'i8':-128,'i16':0,'i64':'-9223372036854775808',"
          "'i128':'-170141183460469231731687303715884105728','u64':'18446744073709551615',"
          "'u128':'340282366920938463463374607431768211455','f32':0.1,'f64':-1e+300,'c8':'a','c16':'b',"
          "'s8':'a\\'\\\\\\n\\u0001é😀','s16':'A😀\\ud800','colour':'Blue','level':'High','part':PART,'parts':[PART,OTHER],"
          "'bits':[true,false,true],'words':[['a','b'],[],['c']],'dynamic':[OTHER,PART],'list':[PART,OTHER,PART],"
          "'bytes':[1,2,3],'deque':[PART,OTHER],'shorts':[4,5],'names':['$y','x'],'partSet':[PART,OTHER],"
          "'bag':[1,3,3],'wides':[{'big':'4','small':0},{'big':'5','small':0}],'byName':{'':OTHER,'$$k':PART},"
          "'deep':{'-4':[{'a':1.5},{}]},'byColour':{'Green':3},'wideMap':{'2':{'big':'9','small':0}},"
          "'byPart':[[OTHER,1]],'byFloat':[[0.5,'half']],'trees':[{'leaf':1},{'void':null},{'leaf':3}],"
          "'any':{'$type':'string8','$value':'any'},'objects':{},'shared':null,'typedefd':[6],'fixed':[0,9,0]}");
    return Replaced(Replaced(text, "PART", Q("{'number':7,'name':'p','marks':[1,-2]}")),
                    "OTHER", Q("{'number':8,'name':'a much longer name than fits','marks':[1,-2]}"));
}

}

ROW(JsonBothWays) {
    const vesk::xstring text = ReflectedText();
    Reflected r;
    r.list = {Part(), Part()};
    r.byName["old"] = Part();
    r.dynamic = {Part()};
    CHECK(ReadError(r, text), "none");
    CHECK(Json(r), text);
    CHECK(r.flag && r.i8 == -128 && r.i64 == INT64_MIN && r.i128 == -int128(~uint128(0) >> 1) - 1 && r.u128 == ~uint128(0), true);
    CHECK(r.f32 == 0.1f && r.f64 == -1e300 && r.s8 == "a\"\\\n\x01\xc3\xa9\xf0\x9f\x98\x80", true);
    CHECK(r.s16 == (vesk::string16{0x41, 0xD83D, 0xDE00, 0xD800}) && r.colour == shapes::Blue && r.level == shapes::Level::High, true);
    // What was made is what the class itself would have made: it can be used and destroyed as any other.
    CHECK(r.list == (vesk::xlist<Part>{g_part, g_other, g_part}) && r.deque == (vesk::xdeque<Part>{g_part, g_other}), true);
    CHECK(r.bits == (vesk::xvector<bool>{true, false, true}) && r.bag == (vesk::xbag<int32>{3, 3, 1}) && r.fixed[1] == 9, true);
    CHECK(r.partSet.Contains(g_part) && r.byName.at("$k") == g_part && r.deep.at(-4)[0].at("a") == 1.5, true);
    r.parts.push_back(Part());
    r.list.push_back(Part());
    r.deque.push_front(Part());
    r.byName["new"].marks.push_back(1);
    r.dynamic.resize(5);

    // Indented, and partly.
    Part part = MakePart(1, "n");
    vesk::JsonStyle style;
    style.m_indent = 2;
    CHECK(vesk::ToJsonText(part, style),
          "{\n  \"number\": 1,\n  \"name\": \"n\",\n  \"marks\": [\n    1,\n    -2\n  ]\n}");
    CHECK(vxMakeString(ReadError(part, Q(" { 'name' : 'm' } ")) << Json(part)), Q("none{'number':1,'name':'m','marks':[1,-2]}"));

    // A model, with containers of all kinds in it.
    Everything all;
    all.maps[2]["k"] = 2.5;
    all.names.Insert("n");
    all.grid[1][2].height = 6;
    all.any = Size(3);
    Everything read;
    CHECK(ReadError(read, Json(all)) == "none" && read == all, true);

    // Variants: items by name, and by their archive where the record tells nothing.
    vesk::xvector<Value> values = {Value(), Value(vesk::string8("t")), Value::ratio(2.5), Value::list({1, 2}),
                                   Value(Size(3)), Value::numbers({4})};
    CHECK(Json(values),
          Q("[{'int32':7},{'string8':'t'},{'ratio':2.5},{'list':{'$bytes':'020100000002000000'}},"
          "{'kinds::Size':{'width':3,'height':3,'colour':'Red','level':'Mid'}},{'numbers':[4]}]"));
    vesk::xvector<Value> back;
    CHECK(ReadError(back, Json(values)) == "none" && back == values, true);
}

// At the ends of blocks and across them; 512 bytes in one library.
template <typename T, typename Make>
void CheckDeque(Make make) {
    const int inBlock = int(512 / sizeof(T));
    for (int size : {0, 1, inBlock - 1, inBlock, 9 * inBlock + 1}) {
        vesk::xdeque<T> items, back;
        for (int i = 0; i < size; ++i) items.push_back(make(i));
        for (int i = 0; i < size && i < 3; ++i) {  // so that it does not begin where a block does
            items.push_front(items.back());
            items.pop_back();
        }
        for (int round = 0; round < 2; ++round) CHECK(ReadError(back, Json(items)), "none");
        CHECK(back == items, true);
        back.push_back(make(1));
        back.push_front(make(2));
        CHECK(back.front() == make(2) && back.back() == make(1) && back.size() == items.size() + 2, true);
    }
    vesk::xdeque<T> broken;
    CHECK(ReadError(broken, "[null]") != "none" && broken.size() <= 1, true);
}

ROW(JsonDeques) {
    CheckDeque<int8>([](int i) { return int8(i); });
    CheckDeque<int16>([](int i) { return int16(i); });
    CheckDeque<vesk::float64>([](int i) { return i * 0.5; });
    CheckDeque<vesk::string8>([](int i) { return vesk::string8(i % 50, 'x'); });
    CheckDeque<Part>([](int i) { return MakePart(i, "a much longer name than fits"); });
}

ROW(JsonErrors) {
    typedef vesk::xvector<int32> Ints;
    for (auto [text, error] : std::initializer_list<std::pair<const char*, const char*>>{
             {"", "line 1, column 1: expected a value"},
             {"[1", "line 1, column 3: expected , or ]"},
             {"[1,]", "line 1, column 4: expected a value"},
             {"[1 2]", "line 1, column 4: expected , or ]"},
             {"[1]]", "line 1, column 4: text behind the value"},
             {"[1}\n", "line 1, column 3: expected , or ]"},
             {"\n [01]", "line 2, column 3: number with a leading zero"},
             {"[-]", "line 1, column 3: expected a digit"},
             {"[1.]", "line 1, column 4: expected a digit"},
             {"[1e]", "line 1, column 4: expected a digit"},
             {"[nul]", "line 1, column 2: expected a value"},
             {"[1.5]", "line 1, column 2: expected an integer"},
             {"[1e1]", "line 1, column 2: expected an integer"},
             {"[2147483648]", "line 1, column 2: out of the range of int32"},
             {"[-2147483649]", "line 1, column 2: out of the range of int32"},
             {"[\"\"]", "line 1, column 2: expected digits"},
             {"[\"1x\"]", "line 1, column 2: expected an integer"},
             {"[true]", "line 1, column 2: expected a number"},
             {"{}", "line 1, column 1: expected an array"},
             {"[-2147483648, \"2147483647\"]", "[-2147483648,2147483647]"}}) {
        CHECK(Read<Ints>(text), error);
    }
    for (auto [text, error] : std::initializer_list<std::pair<const char*, const char*>>{
             {"\xff", "2: text is not UTF-8"},
             {"\xed\xa0\x80", "2: text is not UTF-8"},
             {"\n", "2: control character in a string"},
             {"\\x", "3: unknown escape"},
             {"\\u12g4", "6: expected four hexadecimal digits"},
             {"\\ud800", "1: lone surrogate in a string of UTF-8"}}) {
        CHECK(Read<vesk::string8>('"' + std::string(text) + '"'), std::string("line 1, column ") + error);
    }
    CHECK(Read<vesk::string8>("\"a"), "line 1, column 1: string without an end");
    CHECK(Read<vesk::string8>("\"\\ud83d\\ude00\\/\\u0041\""), "\"😀/A\"");
    CHECK(Json(vesk::string8("\xff")), "string is not UTF-8");
    for (auto text : {"1e-999", "0.0001e-330", "0.1e-99999999999999999999"}) CHECK(Read<vesk::float64>(text), "0");
    for (auto text : {"1e999", "100000e305", "1e99999999999999999999", "-1e+309"}) {
        CHECK(Read<vesk::float64>(text), "line 1, column 1: out of range");
    }
    CHECK(Read<vesk::float32>("1e39"), "line 1, column 1: out of range");
    for (auto text : {"\"-Infinity\"", "\"NaN\""}) CHECK(Read<vesk::float64>(text), text);
    for (auto text : {"18446744073709551616", "-1"}) {
        CHECK(Read<vesk::uint64>(text), "line 1, column 1: out of the range of uint64");
    }
    CHECK(Read<vesk::uint128>("\"340282366920938463463374607431768211456\""),
          "line 1, column 1: out of the range of uint128");
    CHECK(Read<bool>("1"), "line 1, column 1: expected true or false");
    CHECK(Read<shapes::Level>("\"Top\""), "line 1, column 1: no label of shapes::Level: Top");
    CHECK(Read<shapes::Colour>("7"), "line 1, column 1: no label of shapes::Colour: 7");
    CHECK(Read<shapes::Colour>("6"), "\"Blue\"");
    CHECK((Read<vesk::Array<int32, 2>>("[1]")), "line 1, column 1: expected 2 elements");
    CHECK(Read<vesk::xset<int32>>("[1,1]"), "line 1, column 4: repeated element");
    CHECK((Read<vesk::xmap<int32, bool>>(Q("{'1':true,'01':true}"))), "line 1, column 11: repeated key");
    CHECK(Read<Part>(Q("{'number':1,'number':2}")), "line 1, column 13: repeated member number");
    CHECK(Read<Part>(Q("{'nummer':1}")), "line 1, column 2: no field nummer in kinds::Part");
    CHECK(Read<Value>(Q("{'void':null}")), "line 1, column 2: no item void in kinds::Value");
    CHECK(Read<Value>("{}"), "line 1, column 1: expected one item");
    CHECK(Read<Value>(Q("{'ratio':1,'name':'n'}")), "line 1, column 12: expected one item");
    CHECK(Read<Value>(Q("{'point':{'$bytes':'01'}}")),
          "line 1, column 1: read beyond the end of an archive");
    CHECK(Read<vesk::openvariant<int32>>(Q("{'$type':'nobody','$value':{'$bytes':''}}")),
          "line 1, column 1: type of an openvariant is not registered: nobody");
    CHECK(Read<vesk::openvariant<int32>>(Q("{'$type':'kinds::Everything','$value':{}}")),
          "references in a variant: kinds::Everything");
    CHECK(Json(vesk::openvariant<int32>(vesk::xlist<int32>{1})), "type of an openvariant is not registered");
    vesk::openvariant<int32> any;
    vesk::JsonLimits noSize;
    noSize.m_allowType = [](vesk::xstring const& type) { return type != "kinds::Size"; };
    CHECK(ReadError(any, Q("{'$type':'kinds::Size','$value':{}}"), noSize),
          "line 1, column 1: type is not allowed: kinds::Size");
    CHECK(ReadError(any, Q("{'$type':'int32','$value':1}"), noSize), "none");
    // Limits.
    CHECK(Read<Tree>(std::string(200000, '[')), "line 1, column 101: nested too deeply");
    vesk::JsonLimits limits;
    limits.m_memory = 1000;
    limits.m_bytes = 3000;
    Ints ints;
    CHECK(ReadError(ints, "[" + std::string(2000, ' ') + "]", limits), "none");
    CHECK(ReadError(ints, std::string(3001, ' '), limits), "text of 3001 bytes");
    vesk::xvector<Reflected> large;
    CHECK(ReadError(large, "[{},{},{}]", limits), "line 1, column 1: more memory than is allowed");
    // What is written with the same limits is read, and nothing else.
    typedef vesk::xlist<vesk::xvector<vesk::string8>> Texts;
    const vesk::xmap<vesk::string8, Texts> texts = {{"a", {{"", "b"}, {}}}, {"c", {}}};
    const vesk::xset<int32> numbers = {1, 2, 3};
    Doc doc;
    doc.next = &doc;
    const vesk::pref<IDoc> object(&doc);
    auto compare = [](auto value) {
        const vesk::xstring text = Json(value);
        int refused = 0;
        auto compareWith = [&](vesk::JsonLimits const& bounds, int indent) {
            auto copy = value;
            const bool isWritten = !Throws([&] { vesk::ToJsonText(value, {indent}, bounds); });
            const bool isRead = ReadError(copy, text, bounds) == "none";
            if constexpr (std::is_same<decltype(value), vesk::pref<IDoc>>::value) {
                if (isRead) copy->DestroyObject();
            }
            refused += !isRead;
            if (isWritten != isRead) CHECK(vxMakeString(bounds.m_memory << ' ' << bounds.m_depth), "written and read");
        };
        vesk::JsonLimits bounds;
        bounds.m_memory = 0;
        for (; bounds.m_memory < 4000; bounds.m_memory += 7) compareWith(bounds, 2 * (bounds.m_memory % 2));
        CHECK(refused > 2 && refused < 500, true);
        for (bounds.m_depth = 0; bounds.m_depth < 10; ++bounds.m_depth) compareWith(bounds, 0);
        for (bounds.m_bytes = text.size() - 2; bounds.m_bytes < text.size() + 2; ++bounds.m_bytes) compareWith(bounds, 0);
    };
    compare(texts);
    compare(numbers);
    compare(object);
    limits.m_ignoreUnknown = true;
    Part part;
    CHECK(ReadError(part, Q("{'x':[{'number':5},'}'],'number':2}"), limits), "none");
    CHECK(part.number, 2);
}

ROW(JsonObjects) {
    // A cycle of two, by interfaces.
    Doc doc, next;
    doc.title = "one";
    next.title = "two";
    doc.next = &next;
    next.next = &doc;
    next.list.push_back(vesk::pref<IDoc>(&next));
    const vesk::xstring text = vesk::ObjectToJson(vesk::ptr<IDoc>(&doc));
    CHECK(text.substr(0, 60), Q("{'$objects':[{'$class':'kinds::Doc','title':'one','count':0,"));
    CHECK(text.substr(text.size() - 22), Q("],'$value':{'$ref':1}}"));
    const vesk::ptr<IDoc> copy = vesk::ObjectFromJson<IDoc>(text);
    CHECK(vesk::ObjectToJson(copy), text);
    Doc& read = *static_cast<Doc*>(copy.Object());
    Doc& second = *static_cast<Doc*>(read.next.Get().Object());
    CHECK(second.next.Get() == copy && second.list.read()[0].Object() == &second, true);
    second.DestroyObject();
    read.DestroyObject();

    // A long chain is a flat list.
    vesk::xvector<Doc> chain(20000);
    for (std::size_t i = 1; i < chain.size(); ++i) chain[i - 1].next = &chain[i];
    const vesk::xstring flat = vesk::ObjectToJson(vesk::ptr<IDoc>(&chain[0]));
    vesk::ptr<IDoc> at = vesk::ObjectFromJson<IDoc>(flat);
    ssize_t length = 0;
    while (at) {
        Doc* object = static_cast<Doc*>(at.Object());
        at = object->next.Get();
        object->DestroyObject();
        ++length;
    }
    CHECK(length, 20000);

    // Plain structs behind a cref; objects as values of a map.
    Part part = MakePart(3, "shared");
    Reflected r;
    r.shared = &part;
    r.objects["doc"] = vesk::pref<vesk::IObject>(vesk::ptr<vesk::IObject>(&doc));
    doc.next = nullptr;
    Reflected other;
    CHECK(ReadError(other, Json(r)) == "none" && Json(other) == Json(r), true);
    CHECK(*other.shared == part, true);
    delete other.shared.Get();
    other.objects["doc"]->DestroyObject();

    // What may be made, and what a refused text leaves: nothing.
    auto refused = [](std::string_view objects) {
        Reflected target;
        vesk::JsonLimits limits;
        limits.m_allow = [](vesk::ReflectedClass const& record) { return record.m_name != std::string("kinds::Calc"); };
        const vesk::xstring error =
            ReadError(target, vxMakeString("{\"$objects\":[" << objects << "],\"$value\":{\"shared\":{\"$ref\":1},"
                                                           << "\"objects\":{\"a\":{\"$ref\":2}}}}"), limits);
        CHECK(target.shared.Get() == nullptr && (target.objects.empty() || !target.objects["a"]), true);
        return error;
    };
    const vesk::xstring shared = Q("{'$class':'kinds::Part'},");
    CHECK(refused(shared + Q("{'$class':'kinds::Doc','next':{'$ref':9}}")), "line 1, column 69: no such object");
    CHECK(refused(shared + Q("{'$class':'kinds::Part'}")), "line 1, column 110: kinds::Part is no vesk::IObject");
    CHECK(refused(shared + Q("{'$class':'kinds::Nobody'}")), "line 1, column 39: class is not registered: kinds::Nobody");
    CHECK(refused(shared + Q("{'$class':'kinds::Calc'}")), "line 1, column 39: class is not allowed: kinds::Calc");
    CHECK(refused(shared + Q("{'$class':'kinds::Doc'},{'$class':'kinds::Doc','next':{'$ref':3}}")),
          "line 1, column 164: object 3 is not reached from the value");
    CHECK(refused(Q("{'$class':'kinds::Doc'},{}")), "line 1, column 39: expected $class");
    CHECK(refused(Q("{'$class':'kinds::Doc'},{'$class':'kinds::Doc'}")),
          "line 1, column 82: kinds::Doc is no kinds::Part");
}

ROW(Access) {
    Reflected r;
    vesk::FromJsonText(r, ReflectedText());
    const vesk::Value value = vesk::Value::Of(r);
    CHECK(vxMakeString(value.Count() << value.Name(0) << value.At(1).Text()), "41flag-128");
    CHECK(value.Find("parts[1].marks[0]").As<vesk::int8>(), 1);
    CHECK(vxMakeString(value.Find("deep[-4][0][a]").Text() << value.Find("byColour").Text()), "1.5[(Green,3)]");
    for (const char* path : {"parts[9]", "parts[-1]", "parts[01]", "parts[", "[", "nothing.at.all"}) {
        if (value.Find(path)) CHECK(path, "nothing");
    }
    CHECK(vxMakeString(value.Find("parts").TypeName() << value.Find("typedefd").TypeName()), "xvector<kinds::Part>xvector<int32>");
    value.Find("parts[1].name").Set(vesk::string8("set"));
    value.Find("bits[1]").Set(true);
    vesk::FromJson(value.Find("byName[$k]"), Q("{'number':70}"));
    CHECK(vxMakeString(r.parts[1].name << bool(r.bits[1]) << r.byName["$k"].number), "settrue70");
    CHECK(Throws([&] { value.Find("i8").Set(int32(1)); }) && Throws([&] { value.At(41); }) && Throws([] { vesk::Value().Set(1); }), true);
    CHECK(vesk::DumpText(value.Find("parts[0]")),
          "value: kinds::Part\n    number = 7\n    name = \"p\"\n    marks: xvector<int8>, 2\n        [0] = 1\n"
          "        [1] = -2\n");

    // Hooks and the graph are told, of models and of sources.
    Watched watched;
    watched.size.width = 2;
    watched.size.height += 3;
    CHECK(watched.area.read(), 6);
    vesk::xvector<vesk::xstring> changes;
    {
        vesk::ModelHook hook([&](vesk::ModelChange const& change) { changes.push_back(change.PathText()); });
        vesk::Value::Of(watched).Find("size.width").Set(int32(5));
    }
    CHECK(vxMakeString(changes << watched.area.read()), "[size.width]15");
    Sources sources;
    sources.number = 20;
    sources.tiny = 1;
    CHECK(sources.twice.read(), 41);
    CHECK(Json(sources), Q("{'tiny':1,'number':20,'text':''}"));
    vesk::FromJsonText(sources, Q("{'tiny':2,'text':'t'}"));
    CHECK(vxMakeString(sources.twice.read() << sources.text.read()), "42t");
    vesk::Value::Of(sources).Find("number").Set(int32(1));
    CHECK(sources.twice.read(), 4);

    // Methods by name.
    CHECK(vesk::CallMethod<int32(int32, int32)>(r, "Add", 200, 1), 73);
    vesk::CallMethod<void(vesk::string8 const&)>(r, "Rename", "renamed");
    CHECK(r.s8, "renamed");
    Reflected const& fixed = r;
    CHECK(ErrorOf<vesk::AccessError>([&] { vesk::CallMethod<void(vesk::string8 const&)>(fixed, "Rename", ""); }),
          "kinds::Reflected::Rename is not const");
    CHECK(ErrorOf<vesk::AccessError>([&] { vesk::CallMethod<int32(int32)>(r, "Add", 1); }),
          "kinds::Reflected::Add takes 2 arguments, not 1");
    CHECK(ErrorOf<vesk::AccessError>([&] { vesk::CallMethod<int32(int32, int64)>(r, "Add", 1, 2); }),
          "kinds::Reflected::Add: b is int32, not int64");
    CHECK(ErrorOf<vesk::AccessError>([&] { vesk::CallMethod<void(int32, int32)>(r, "Add", 1, 2); }),
          "kinds::Reflected::Add: the result is int32, not void");
    CHECK(ErrorOf<vesk::AccessError>([&] { vesk::CallMethod<void()>(r, "Remove"); }), "no method Remove in kinds::Reflected");
}
