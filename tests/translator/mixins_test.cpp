#include "translate_fixture.h"

namespace qrex {
namespace {

using MixinsTest = TranslateTest;

constexpr char kListOfEverySort[] = R"($mixin M << reflect >> { $int32 a; };
$model Pos { bool y; };
namespace n { $mixin T { }; }
$class+ K : mixin [ M { $bool b; int plain; } Pos ? other::U <int, 3> n::T<char> model { int8 z; } ]
{
};
)";

TEST_F(MixinsTest, ListOfEverySortOfEntry) {
  const std::string header = TranslateHeader(kListOfEverySort).header;
  EXPECT_EQ(Section(header, "{ a = _v; }\n    \n};\n", "struct Pos\n"),
            "\ntemplate <typename BC> vesk::TypeOps const& _GetTypeOps(M const*)\n{\n"
            "    return vesk::GetReflectedClass<M>().m_ops;\n}\n\n");
  EXPECT_EQ(Section(header, "struct K_Mixin_0 : public BC\n", "    bool operator<"), R"({
    typedef BC BaseClass;
    using typename BC::FinalClass;
 bool b; int plain; 

};

struct K_Mixin_1_model
{
    
    K_Mixin_1_model() : z(0) {}
    explicit K_Mixin_1_model(vesk::int8 const& z_) : z(z_) {}
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
    void EvictDgsNodes() const {vesk::DataSourceEvict(&z);}
    void VisitObjects(vesk::IObjectVisitor& _v) const {}
    void VisitPrefs(vesk::IPrefVisitor& _v) const {}
)");
  EXPECT_EQ(Section(header, "struct K_Mixin_1_model_mixin : public BC\n", "    bool operator<"),
            "{\n    using typename BC::FinalClass;\n    \n");
  const std::string base =
      "K_Mixin_1_model_mixin<n::T<other::U <Pos_model_mixin<K_Mixin_0<M<vesk::BaseMixin<K,vesk::EmptyBase> > > >"
      ",int, 3 >,char > >";
  EXPECT_EQ(Section(header, "} // namespace vesk\nclass K", ""), " : public " + base + R"(
{
public:
    typedef )" + base + R"( BaseClass;


public:
    vesk::int32 Geta() const { return a; }
    void Seta(vesk::int32 _v) { a = _v; }
    bool Getb() const { return b; }
    void Setb(bool _v) { b = _v; }
    
    friend vesk::ReflectedClass const& _GetReflected(K const*);
};

vesk::ReflectedClass const& _GetReflected(K const*);
vesk::TypeOps const& _GetTypeOps(K const*);

)");
}

// What a mixin reflects stands in the record of the class; the model of an entry is reached through its _model_.
TEST_F(MixinsTest, RecordOfAClassWithMixins) {
  const std::string tail = TranslateHeader(kListOfEverySort).tail;
  EXPECT_EQ(Section(tail, "K_fields[] =\n", "        };"), "        {\n            { \"a\", offsetof(K,a), K_a },\n");
  EXPECT_EQ(Section(tail, "K_modelFields[] =\n", "        };"),
            "        {\n            { \"y\", offsetof(K,_model_.y), K_y, 0, -1 },\n"
            "            { \"z\", offsetof(K,_model_.z), K_z, 0, -1 },\n");
}

// A mixin is no type that an archive takes, unless it asks for it.
TEST_F(MixinsTest, ArchiveFunctionsOverANamedModel) {
  const std::string header = TranslateHeader(
                                 "$model R { int32 a; };\n$mixin M : model R { };\n$mixin A << ar >> : model R { };\n"
                                 "$struct K : model R { };\n")
                                 .header;
  for (const auto& [name, isWritten] : {std::pair("M", false), {"A", true}, {"K", true}}) {
    const bool found = header.find("(Archive& _ar," + std::string(name) + " const& _x)") != header.npos;
    EXPECT_EQ(found, isWritten) << name << "\n" << header;
  }
}

TEST_F(MixinsTest, AdtAndItsImplementation) {
  MakeWorld(TargetType::DynamicLinkLibrary);
  const std::string adt = "$adt+ A : [ 7 ] { int32 get(int32 i) const; void set(const string8& s); };\n";
  EXPECT_EQ(Section(TranslateHeader(adt).header, "", "template<> struct ClassTypeTraits"), R"(struct A;
app_API vesk::ReflectedClass const& _GetReflected(A const*);
app_API vesk::TypeOps const& _GetTypeOps(A const*);

app_API vesk::int32 __stdcall get(A const* _self,vesk::int32 i);
app_API void __stdcall set(A* _self,vesk::string8 const& s);
)" + TraitsText("A", "adt", "1111"));
  const std::string source = Translate("a.cpp", R"(@import "t.h"
$adt+ implement A
{
    int n;
    int get(int i) const { return n + i; }
    $implementing adt A { set };
};
int behind;
)");
  EXPECT_EQ(Section(source, "#include \"t.h\"\n", "namespace vesk"), R"(struct A
{
    int n;
    int get(int i) const { return n + i; }
    void set(vesk::string8 const& s);


public:
    
    friend app_API vesk::ReflectedClass const& _GetReflected(A const*);
};

inline vesk::int32 __stdcall get(A const* _self,vesk::int32 i) { return _self->get(i); }
inline void __stdcall set(A* _self,vesk::string8 const& s) { _self->set(s); }
int behind;

//### $adt+ A
)");
  EXPECT_EQ(Section(source, "ReflectedClassMethod A_methods[] =\n", "            sizeof(A)"),
            R"(        {
            {"get",{A_get_return},A_get_args,1,0,true,(vesk::FunctionPointer)(vesk::int32 (__stdcall *)(A const* _self,vesk::int32 i))&::get},
            {"set",{0},A_set_args,1,0,false,(vesk::FunctionPointer)(void (__stdcall *)(A* _self,vesk::string8 const& s))&::set},
        };
        static const vesk::ReflectedClass A_class =
        {
            16,
            "A",
)");
}

TEST_F(MixinsTest, Implementing) {
  const std::string declared =
      "$interface+ I : vesk::IObject { int32 f(int32 a=1) const; void g(); };\n$adt A { void h(string8 s); };\n";
  EXPECT_EQ(Section(TranslateHeader(declared + "$class K isa I { $implementing I { g f }, adt A; };\n").header,
                    " BaseClass;\n", "\npublic"),
            " void g();\nvesk::int32 f(vesk::int32 a=1) const;\nvoid h(vesk::string8 s);\n ");
  EXPECT_EQ(Messages(), "");
  EXPECT_EQ(Section(TranslateHeader(declared + "$class K { $implementing I; };\n").header, "class K\n{", "\npublic"),
            " vesk::int32 f(vesk::int32 a=1) const;\nvoid g();\n ");
  EXPECT_EQ(Messages(),
            "t.h(4) : warning W1014 : $class K implementing $interface+ I without associated 'isa'\n"
            "t.h(2) : see declaration of $interface+ I\n");
}

TEST_F(MixinsTest, Faults) {
  AssertErrors({
      {"$class C { };\n$class K : mixin [ C ] { };", 2, "$class C is not a $mixin or $model"},
      {"$interface I { };\n$class K : mixin [\nI\n] { };", 3, "$interface I is not a $class or $struct"},
      {"$class K : mixin [ X ] { };", 1, "Unrecognised identifier : X"},
      {"$mixin M { };\n$class K : mixin [ M, M ] { };", 2, "Expected identifier after M when read ,"},
      {"$class K : mixin [ ? 5 ] { };", 1, "Expected mixin name when read 5"},
      {"$class K : mixin [ ? a::\n5 ] { };", 2, "Expected identifier after a:: when read 5"},
      {"$class K : mixin [\nmodel\n+ ] { };", 2, "Expected { after 'model' when read +"},
      {"$class K : mixin [ ?\nM<int", 2, "Met EOS before read matching angled bracket"},
      {"$class K { $implementing K; };", 1, "$interface identifier expected when read $class K"},
      {"$interface I { };\n$class K { $implementing\nadt I; };", 3, "$adt identifier expected when read $interface I"},
      {"$interface I { };\n$class K { $implementing I -f; };", 2, "- not supported"},
      {"$interface I { void f(); };\n$class K { $implementing I { f\ng }; };", 3, "$interface I has no method named g"},
      {"$interface I { };\n$class K { $implementing I { 5 }; };", 2, "Expected identifier after { when read 5"},
      {"$interface I { };\n$class K { $implementing I { } x", 2, "Expected , or ; after } when read x"},
  });
}

}  // namespace
}  // namespace qrex
