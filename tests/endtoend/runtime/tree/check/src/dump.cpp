// Archives as they are shown: each byte, those of old releases, what is read of them today, and what differs.
@import "rows/rows.h"
@import "kinds/models.h"
@import "kinds/kinds.h"

@import "Vesk/vxObject/DumpArchive.h"

$warning(disable: 1002)

using namespace kinds;

// Written by itself: its record tells nothing.
$class+ ByItself isa kinds::IDoc
{
public:
    void Serialise(vesk::Archive& ar) const { ar << number << next; }
    void Deserialise(vesk::InputArchive& ar) { ar >> number >> next; }
    int32 number = 5;
    vesk::pref<IDoc> next;
};
// A field has no record, and a project's own release stands ahead of a model of another one.
$class+ HalfKnown isa kinds::IDoc : model { int32 own; kinds::Characters hidden; bool behind; } { };
$class+ OfKinds isa kinds::IDoc : model kinds::Size { };
$class+ Album isa kinds::IDoc : model {
    int32 ahead; xvector<pref<kinds::IDoc>> docs; cref<kinds::Size> size; kinds::Value value; openvariant<int32> any;
    xmap<string8,xvector<kinds::Size>> sizes; xvector<string8> words; xset<int16> numbers; int32 behind;
} { };

namespace {

// The parts that are no groups, with their paths and values.
vesk::xstring Brief(vesk::ArchiveView const& view) {
    return vesk::TextOf([&](vesk::xostream& os) {
        for (vesk::ArchivePart const& part : view.Parts()) {
            if (part.m_kind != vesk::AP_GROUP) os << part.m_path << '=' << part.m_value << ' ';
        }
        os << view.Error();
    });
}
template <typename T>
vesk::xstring Brief(Bytes bytes, vesk::ArchiveOptions const& options = {}) {
    return Brief(vesk::ArchiveView::Of<T>(std::move(bytes), options));
}

vesk::xstring ChangesText(vesk::xvector<vesk::ArchiveChange> const& changes) {
    return vesk::TextOf([&](vesk::xostream& os) {
        for (vesk::ArchiveChange const& change : changes) {
            os << vesk::xvector<vesk::xstring>{"+", "-", ""}[change.m_kind] << change.m_path << ' ' << change.m_old << '|'
               << change.m_new << "; ";
        }
    });
}
template <typename T>
vesk::xstring Difference(T const& a, T const& b) {
    return ChangesText(vesk::CompareArchives(vesk::ArchiveView::Of<T>(Written(a)), vesk::ArchiveView::Of<T>(Written(b))));
}

// Of the first release of `kinds`.
const Bytes g_oldDoc = {1, 1, 'T', 2, 0, 0, 0, 9, 0, 0, 0};
const Bytes g_oldOfKinds = {0xFF, 'v', 'x', 2, 1, 5, 'k', 'i', 'n', 'd', 's', 1, 0, 2, 7, 'O', 'f', 'K', 'i', 'n', 'd', 's', 1,
                            20, 0, 0, 0, 7, 0, 0, 0};

}

ROW(Dumps) {
    CHECK(vesk::DumpArchive(g_oldOfKinds), "OfKinds, 31 bytes\n"
          "offset    bytes                     path                        type                value\n"
          "00000000  ff 76 78 02                                           head                objects, form 2\n"
          "00000004  01                                                    count               1 whose models occur\n"
          "00000005  05 6b 69 6e 64 73                                     project             \"kinds\"\n"
          "0000000b  01                                                    release             1 of kinds, today 3\n"
          "0000000c  00                                                    count               0 others\n"
          "0000000d  02                                                    pref<vesk::IPersistable>  #1, new\n"
          "0000000e  07 4f 66 4b 69 6e 64 73                               class               \"OfKinds\"\n"
          "00000016                            #1                          OfKinds\n"
          "00000016  01                        #1                          release             1 of check\n"
          "00000017  14 00 00 00               #1.width                    int32               20\n"
          "0000001b  07 00 00 00               #1.height                   int32               7\n"
          "as it is read today:\n"
          "  #1.colour: not written -> Green\n"
          "  #1.level: not written -> High\n");
    vesk::ArchiveView view(g_oldOfKinds);
    CHECK(vxMakeString(view.Today().Text() << view.Releases()[0].m_current), "Size(20,7,Green,High)3");
    CHECK(vesk::DumpArchiveOf<vesk::xvector<vesk::string8>>({1, 9, 'n', 'i', 'n', 'e', ' ', 'b', 'y', 't', 'e'}),
          "xvector<string8>, 11 bytes\n"
          "offset    bytes                     path                        type                value\n"
          "00000000                                                        xvector<string8>\n"
          "00000000  01                                                    count               1\n"
          "00000001  09 6e 69 6e 65 20 62 79   [0]                         string8             \"nine byte\"\n"
          "00000009  74 65\n");
}

ROW(DumpedObjects) {
    ByItself itself;
    HalfKnown half;
    OfKinds last;
    Album around;
    Size size(7);
    itself.next = &last;
    half.own = 3;
    around.docs.push_back(vesk::pref<IDoc>(&itself));
    around.docs.push_back(vesk::pref<IDoc>(&half));
    around.docs.push_back(vesk::pref<IDoc>(&itself));
    around.size = &size;
    around.value = Value(Value::point{1, 2});
    around.any = vesk::openvariant<int32>(size);
    const auto at = [](vesk::xstring const& path) {
        return Replaced("PATHwidth=7 PATHheight=7 PATHcolour=Red PATHlevel=Mid ", "PATH", path);
    };
    // The contents of objects follow the first reference, or the one that leads to all.
    const vesk::xstring itselfText = "=13 bytes that only the class knows ";
    const vesk::xstring lastText = "=1 of check #2.width=0 #2.height=0 #2.colour=Red #2.level=Low ";
    const vesk::xstring rest = "value=4, point value=8 bytes that only the class knows any=\"kinds::Size\" " + at("any.") +
                               "sizes=0 words=0 numbers=0 behind=0 ";
    const vesk::xstring halfText = "=1 of check #3.own=3 #3.hidden=20 bytes that only the class knows ";
    CHECK(Brief<Album>(Written(around)),
          "=1 of check ahead=0 docs=3 docs[0]=#1, new docs[0]=\"ByItself\" #1" + itselfText + "#2" + lastText +
              "docs[1]=#3, new docs[1]=\"HalfKnown\" #3" + halfText + "docs[2]=#1 size=#4, new " + at("#4.") + rest);
    vesk::ArchiveView view(vesk::WriteObject(vesk::ptr<IDoc>(&around)));
    const std::string text = Brief(view);
    CHECK(text.substr(text.find("#1.docs=3")).find("#1.docs[2]=#2 #1.size=#4, new ") != text.npos, true);
    CHECK(text.find("#5=1 of check #5.width=0") != text.npos, true);
    CHECK(view.Error().empty() && view.Today().Class() == &vesk::GetReflectedClass<Album>(), true);
}

ROW(DumpedReleases) {
    CHECK(Brief<Doc>(g_oldDoc), "=1 of kinds, today 3 title=\"T\" pages=2 count=9 ");
    const std::string evolved = ChangesText(vesk::ArchiveView::Of<Doc>(g_oldDoc).Evolved());
    CHECK(evolved.substr(0, 41), "-pages 2|; +lines |2 elements; +marks |4 ");
    CHECK(evolved.find("+size |Size(0,0,Red,Low); +next |null; +total |9; ") != evolved.npos, true);
    CHECK(ChangesText(vesk::ArchiveView::Of<Doc>(Written(Doc())).Evolved()), "");
    // Evolve code that refuses what was written: the bytes are shown all the same.
    Bytes pages = g_oldDoc;
    pages[6] = 1;
    CHECK(Brief<Doc>(pages), "=1 of kinds, today 3 title=\"T\" pages=16777218 count=9 number of pages");
    CHECK(ChangesText(vesk::CompareArchives(vesk::ArchiveView::Of<Doc>(g_oldDoc), vesk::ArchiveView::Of<Doc>(pages))),
          "pages 2|16777218; ");
}

ROW(DumpedErrors) {
    const Bytes size = {20, 0, 0, 0, 7, 0, 0, 0, 0, 1};
    const vesk::xstring numbers = "width=20 height=7 ";
    CHECK(Brief<Size>(Bytes(size.begin(), size.end() - 3)), "width=20 =3 bytes, not read read beyond the end of an archive");
    CHECK(Brief<Size>(Joined(Bytes(size.begin(), size.end() - 2), {4, 0})),
          numbers + "=2 bytes, not read number without a label in an enumeration");
    CHECK(Brief<Size>(Joined(size, {3})), numbers + "colour=Red level=Mid =1 byte, not read bytes behind the value");
    CHECK(Brief<vesk::xvector<bool>>({2, 1, 2}), "=2 =2 bytes, not read not a bool");
    CHECK(Brief<vesk::xvector<Size>>({0xF0, 0xFF, 0xFF, 0xFF, 0xFF}),
          "=4294967295 read beyond the end of an archive");
    CHECK(Brief(vesk::ArchiveView(Bytes())), "read beyond the end of an archive");
    Bytes later = g_oldOfKinds;
    later[11] = 4;
    const std::string text = Brief(vesk::ArchiveView(later));
    CHECK(text.substr(text.find("=4 of")), "=4 of kinds, today 3 =0 others =18 bytes, not read archive of release 4 of kinds, "
                                           "this is release 3");
    vesk::ArchiveOptions options;
    options.m_allow = [](vesk::ReflectedClass const& record) { return record.m_name != vesk::xstring("OfKinds"); };
    CHECK(vesk::ArchiveView(g_oldOfKinds, options).Error(), "class is not allowed: OfKinds");
    options.m_limits.m_bytes = 30;
    CHECK(Brief(vesk::ArchiveView(g_oldOfKinds, options)), "=31 bytes, not read archive larger than allowed");
    CHECK(Throws([] { vesk::ArchiveView::OfType("none", {}); }), true);
}

ROW(DumpedParts) {
    vesk::xvector<int32> numbers(1000);
    numbers[999] = 5;
    const Bytes bytes = Written(numbers);
    vesk::ArchiveView view = vesk::ArchiveView::Of<vesk::xvector<int32>>(bytes);
    const vesk::ArchivePart last = view.Parts(501)[0];
    CHECK(vxMakeString(view.CountParts() << last.m_path << last.m_value << view.Parts(500, 9).size()), "502[998..999]0 52");
    vesk::xvector<vesk::string8> words(10, "word");
    vesk::ArchiveOptions options;
    options.m_parts = 5;
    view = vesk::ArchiveView::Of<vesk::xvector<vesk::string8>>(Written(words), options);
    CHECK(Brief(view), "=10 [0]=\"word\" [1]=\"word\" =40 bytes, more than is shown ");
    options.m_text = 3;
    CHECK(Brief<vesk::string8>({6, 'a', 'b', 0xC3, 0xA4, '"', 'c'}, options), "=\"ab\"... (6 bytes) ");
    CHECK(Brief<vesk::string16>({2, 'a', 0, 0x3D, 0xD8}), "=\"a\\ud83d\" ");
}

ROW(ArchiveDifferences) {
    Album a, b;
    a.words.read();
    for (auto word : {"one", "two", "three", "four"}) a.words.push_back(word);
    for (auto word : {"zero", "one", "three", "4"}) b.words.push_back(word);
    for (int32 i : {1, 2, 3}) a.numbers.Insert(i);
    for (int32 i : {2, 3, 4}) b.numbers.Insert(i);
    CHECK(Difference(a, b), "+words[0] |\"zero\"; -words[1] \"two\"|; words[3] \"four\"|\"4\"; -numbers[0] 1|; +numbers[2] |4; ");
    typedef vesk::xmap<vesk::string8, Size> Sizes;
    CHECK(Difference(Sizes{{"a", Size(1)}, {"b", Size(2)}}, Sizes{{"b", Size(3)}, {"c", Size(4)}}),
          "-[a] kinds::Size|; [b].width 2|3; [b].height 2|3; +[c] |kinds::Size; ");
    const vesk::ArchiveView none(vesk::WriteObject(vesk::ptr<IDoc>()));
    CHECK(none.Error(), "");
    CHECK(ChangesText(vesk::CompareArchives(none, vesk::ArchiveView(g_oldOfKinds))), " |OfKinds; ");
    CHECK(Difference(Value(int32(3)), Value(vesk::string8("3"))), " int32 3|string8 \"3\"; ");

    // An object is the one that the same reference leads to, whatever its number is.
    OfKinds first, second;
    Album c, d;
    first.width = 1;
    second.width = 2;
    c.docs.push_back(vesk::pref<IDoc>(&first));
    c.docs.push_back(vesk::pref<IDoc>(&second));
    Bytes before = vesk::WriteObject(vesk::ptr<IDoc>(&c));
    second.width = 3;
    c.docs.push_back(vesk::pref<IDoc>(&first));
    vesk::ArchiveView now(vesk::WriteObject(vesk::ptr<IDoc>(&c)));
    CHECK(ChangesText(vesk::CompareArchives(vesk::ArchiveView(before), now)), "+#1.docs[2] |#2; #3.width 2|3; ");
}
