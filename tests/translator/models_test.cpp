#include "translate_fixture.h"

namespace qrex {
namespace {

using ModelsTest = TranslateTest;

TEST_F(ModelsTest, WithoutSchema) {
  EXPECT_EQ(Section(TranslateHeader("$model Point\n{\n    string8 name;\n};\n").header, "", "\nnamespace vesk\n"),
            Golden("models_without_schema"));
}

// Three releases: `c` and `e` come late, one with code; `b` and `d` go, and the code of later fields reads them.
TEST_F(ModelsTest, ThreeReleases) {
  const std::string tail = TranslateHeader(R"($model+ Record
{
    string8 a; int32 c; float32 e; xvector<int32> f;
    $dropped { int32 b; int64 d; }
    $schema { 1: +a +b 3: -b +c +d +f 7: -d +e }
    $evolve
    {
        d(b) { d = b * 1000; // in pence
        }
        e(d, a)
        {
            e = float(d);
            Log(a);
        }
        f { // starts empty
        }
    }
};
)")
                               .tail;
  EXPECT_EQ(Section(tail, "XTarget* app_GetXTarget(); }\n", "    vesk::Ref"),
            "namespace vesk { RSN app_GetModelRsn(); }\n");
  EXPECT_EQ(Section(tail, "    void Record::EvictDgsNodes", "    \n    // Registration"),
            Golden("models_three_releases"));
  EXPECT_EQ(Section(tail, "_modelFields[] =\n", "        };\n"), R"(        {
            { "a", offsetof(Record,a), Record_a, 1, -1 },
            { "b", -1, Record_b, 1, 3 },
            { "c", offsetof(Record,c), Record_c, 3, -1 },
            { "d", -1, Record_d, 3, 7 },
            { "f", offsetof(Record,f), Record_f, 3, -1 },
            { "e", offsetof(Record,e), Record_e, 7, -1 },
)");
}

TEST_F(ModelsTest, SchemaOfOneReleaseIsTheSimpleForm) {
  const std::string tail = TranslateHeader("$model M { int32 a; int32 b; $schema { 4: +b +a } };\n").tail;
  EXPECT_EQ(Section(tail, "Deserialise(vesk::InputArchive& _ar)\n", ""),
            "    {\n        _ar >> this->b\n           >> this->a;\n    }\n");
}

TEST_F(ModelsTest, Comparisons) {
  EXPECT_EQ(Section(TranslateHeader("$model M { bool a; bool b; bool c; };\n").header, "    bool operator<",
                    "    bool operator!="),
            R"((M const& _rhs) const
    {
        return (a < _rhs.a || (a == _rhs.a &&
        (b < _rhs.b || (b == _rhs.b &&
        (c < _rhs.c)))));
    }
    bool operator==(M const& _rhs) const
    {
        return a == _rhs.a &&
        b == _rhs.b &&
        c == _rhs.c;
    }
)");
  const std::string empty = TranslateHeader("$model M { };\n").header;
  EXPECT_EQ(Section(empty, "    bool operator<", "    bool operator!="),
            "(M const& _rhs) const\n    {\n        return true;\n    }\n"
            "    bool operator==(M const& _rhs) const\n    {\n        return true;\n    }\n");
  EXPECT_EQ(Section(empty, "struct M\n", "    void Serialise"), "{\n    \n    M() {}\n");
  EXPECT_EQ(empty.find("union"), empty.npos);
}

TEST_F(ModelsTest, Constructors) {
  EXPECT_EQ(
      Section(TranslateHeader("$enum E { e1 }; $model M { E kind; bool* flag; offsettable<uint8> n; xvector<int32> v;\n"
                              "    explicit $$(bool* f)  : flag(f) { n = 1; }\n    $$(int a, int b) { }\n};\n")
                  .header,
              "struct M\n", "    M(E const&"),
      R"({
    explicit M(bool* f)  : flag(f) { n = 1; }
    M(int a, int b) { }
    
    M() : kind((E)0),flag(0),n(0) {}
)");
  // A default constructor of its own takes the place of the generated one; a single field makes the other explicit.
  EXPECT_EQ(
      Section(TranslateHeader("$model M { int32 a; $$() { a = 7; } };\n").header, "struct M\n", "    void Serialise"),
      "{\n    M() { a = 7; }\n    \n    explicit M(vesk::int32 const& a_) : a(a_) {}\n");
}

TEST_F(ModelsTest, ClassOfNamedModel) {
  const std::string declarations = "$model M { xset<int32> s; };\n$class K : model M\n{\n    int more;\n};\n";
  const std::string header = TranslateHeader(declarations).header;
  const std::string mixin = Section(header, "struct K_model_mixin : public BC\n", "namespace vesk");
  EXPECT_EQ(Section(mixin, "    typedef M model_type;\n", ""), R"(    M const& model() const { return _model_; }
    M& model() { return _model_; }
    M const& read() const { vesk::DataSourceReadBarrier(static_cast<const typename BC::FinalClass*>(this), vesk::null,"K"); return _model_; }
    M & write() { vesk::DataSourceWriteBarrier(static_cast<typename BC::FinalClass*>(this), vesk::null,"K"); return _model_; }
    M _model_;
};
class K;

)");
  EXPECT_EQ(Section(header, "using_model_base_class = 1;\n};\n} // namespace vesk\n", ""),
            Golden("models_class_of_named_model"));
  EXPECT_EQ(Section(TranslateHeader(declarations).tail, "//### $class K\n", "//### $model M\n"),
            R"(namespace vesk { XTarget* app_GetXTarget(); }
namespace vesk
{
    void app_WriteDataSourceRsn(Archive& ar);
    void app_ReadDataSourceRsn(InputArchive& ar);
}
    void K::Serialise(vesk::Archive& _ar) const
    {
        vesk::app_WriteDataSourceRsn(_ar);
        _model_.Serialise(_ar);
    }
    void K::Deserialise(vesk::InputArchive& _ar)
    {
        vesk::app_ReadDataSourceRsn(_ar);
        _model_.Deserialise(_ar);
    }

)");
}

// The struct is N_model, and the functions of the class itself keep the data source's release number.
TEST_F(ModelsTest, ClassThatDerivesFromItsModel) {
  const std::string declarations =
      "$interface+ I : vesk::IObject { };\n$struct+ S << multiline >> isa I : model { pref<I> p; int32 n; } { };\n";
  const std::string header = TranslateHeader(declarations).header;
  EXPECT_EQ(Section(header, "struct S_model\n", "bool operator<"), R"({
    
    S_model() : n(0) {}
    S_model(vesk::pref<I> const& p_,vesk::int32 const& n_) : p(p_),n(n_) {}
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
    void VisitObjects(vesk::IObjectVisitor& _v) const;
    void VisitPrefs(vesk::IPrefVisitor& _v) const;
    )");
  EXPECT_EQ(Section(header, "    S_model& model() { return _model_; }\n", "};\n"),
            "    S_model const& read() const { vesk::IndepFieldReadBarrier(static_cast<const typename "
            "BC::FinalClass*>(this), vesk::Path()); return _model_; }\n    S_model _model_;\n");
  EXPECT_EQ(Section(header, "inline vesk::xostream& operator<<", ""), R"((vesk::xostream& _os,S const& _x)
{
    _os << "S\n";
    vesk::ScopeWriter2 sw(_os);
    _os << "p = " << _x._model_.p << '\n';
    _os << "n = " << _x._model_.n << '\n';
    return _os;
}

)");
  const std::string tail = TranslateHeader(declarations).tail;
  EXPECT_EQ(Section(tail, "    void S_model::", "    void S::Serialise"),
            R"(VisitObjects(vesk::IObjectVisitor& _v) const {_v << p;}
    void S_model::VisitPrefs(vesk::IPrefVisitor& _v) const {_v << p;}
    void S_model::Serialise(vesk::Archive& _ar) const
    {
        _ar << this->p
           << this->n;
    }
    void S_model::Deserialise(vesk::InputArchive& _ar)
    {
        _ar >> this->p
           >> this->n;
    }
)");
  EXPECT_EQ(Section(tail, "S_modelFields[] =\n", "};"),
            "        {\n            { \"p\", offsetof(S,_model_.p), S_p, 0, -1 },\n"
            "            { \"n\", offsetof(S,_model_.n), S_n, 0, -1 },\n        ");
}

TEST_F(ModelsTest, FaultsOfTheBlock) {
  AssertErrors({
      {"$model M {\nint32 a; $foo { } };", 2, "$dropped or $schema expected when read $foo"},
      {"$model M { int32 a;\n$dropped { } $evolve { } };", 2, "$schema expected when read $evolve"},
      {"$model M { int32 a; $dropped { }\n};", 2, "Expected $schema after } when read }"},
      {"$model M { int32 a; $schema { 1: +a }\n$foo { } };", 2, "$evolve expected when read $foo"},
      {"$model M { int32 a; $schema { 1: +a }\nint32 b; };", 2, "Expected } after } when read int32"},
      {"$model M { int32 a; $$() { }\nint32 b; };", 2, "Expected } after } when read int32"},
      {"$model M {\nint32 a;", 2, "Met EOS before read matching brace for $model block"},
      {"$model M {\nint32 a, b; };", 2, "; expected after field declaration when read ,"},
      {"$model M { int32 a;\nstring8 a; };", 2, "Repeated field name a"},
      {"$model M { int32 a; $dropped {\nint32 a; } $schema { 1: +a } };", 2, "Repeated field name a"},
      {"$struct S { $int32 a; $model {\nint32 a; } };", 2, "Repeated field name a"},
      {"$model M {\nint32& a; };", 2, "References not permitted within models"},
      {"$model M {\nconst int32 a; };", 2, "const or volatile qualifiers not permitted within models"},
      {"$model M { int32 a;\nexplicit M(int32 a) { } };", 2, "Expected $$ after explicit when read M"},
      {"$model M { int32 a;\n$$(int32 b)", 2, "Met EOS while scanning for '{'"},
      {"$model M { }\n$model N { };", 2, "; expected after definition of $model M when read $"},
      {"$model M { int32 a;\nM b; };", 2, "Field b : $model M contains itself"},
      {"$model M;\n$model N { M m[]; };\n$model M { xmap<int32, N> n; };", 3, "Field n : $model M contains itself"},
      {"$struct S : model {\nDynArray<S> s; } { };", 2, "Field s : $struct S contains itself"},
      {"$struct S { $model { xmap<int8, S> s; } };\n$model M { S s[2]; };", 2, "Field s : $struct S contains itself"},
      {"$struct S;\n$model M { S s[]; };\n$struct S { $model { M m; } };\n$struct T : model M { };", 4,
       "Field s : $model M contains itself"},
  });
}

// What of its own kind a model may hold: where accessors end, nothing repeats.
TEST_F(ModelsTest, OfItsOwnKind) {
  const std::pair<std::string, std::string> kModels[] = {
      {"$model M { xvector<M> children; };", "    void CreateIntochildren(vesk::ssize_t _i,M const* _src"},
      {"$model M { int32 v; assignable<DynArray<M> > kids; };", "    void Setkids(vesk::DynArray<M> const& _v) {"},
      {"$model M { int32 v; $dropped { M old[]; } $schema { 1: +v +old 2: -old } };", "    vesk::int32 v;\n"},
      {"$struct S { $model { DynArray<S> kids; xmap<string8,S> named; } };",
       "    void SetkidsElement(vesk::ssize_t _k0,S const& _v) { kids[_k0] = _v; }\n"},
      {"$struct S { $model { DynArray<S> kids; } };\n$model M { S s; xvector<S> v; };", "void Sets(S const& _v) {"},
      {"$model M { int32 v; assignable<xvector<M> > kids; };\n$interface I { M a; };",
       "vesk::xvector<M> (__stdcall *Getakids)(void const* _self);\n"},
  };
  for (const auto& [text, expected] : kModels) {
    const std::string header = TranslateHeader(text).header;
    EXPECT_NE(header.find(expected), header.npos) << text << "\n" << header;
  }
}

TEST_F(ModelsTest, FaultsOfTheSchema) {
  const std::vector<ErrorCase> cases = {
      {"a: +a", 1, "Release number expected when read a"},
      {"1: +a\n1: +b", 2, "Unexpected release number 1 (must strictly increase)"},
      {"3000000000: +a", 1, "Unexpected release number -1294967296 (must strictly increase)"},
      {"1 +a", 1, "Expected : after 1 when read +"},
      {"1: +a\n2:", 2, "No schema changes specified"},
      {"1: +5", 1, "Expected field identifier after + when read 5"},
      {"1: -5", 1, "Expected field identifier after - when read 5"},
      {"1: +z", 1, "Field z not declared in the model"},
      {"1: +a\n2: +a", 2, "Field a already added in the schema"},
      {"1: -d", 1, "Field d can't be dropped from the schema until it has been added"},
      {"1: +a +d\n2: -a", 2, "Field a not declared as dropped"},
      {"1: +a +d\n2: -z", 2, "Field z not declared as dropped"},
      {"1: +a +d\n2: -d\n3: -d", 3, "Field d already dropped in the schema"},
      {"1: +a +d\n2: +b -d", 2,
       "Syntax error: unexpected '-' : note that dropped fields must appear before added fields within a "
       "schema"},
      {"1: +a +b\n", 2, "Field d never added in a schema"},
      {"1: +a +d\n2: -d", 2, "Field b never added in a schema"},
      {"1: +a +b +d\n", 2, "Field d never dropped in a schema"},
  };
  AssertErrors(cases, "$model M { int32 a; int32 b; $dropped { int32 d; } $schema { ", "} };");
  AssertErrors({{"$model M { int32 a; $schema {\n1: +a", 2, "Met EOS before read matching brace for $schema block"}});
}

TEST_F(ModelsTest, FaultsOfTheEvolution) {
  const std::vector<ErrorCase> cases = {
      {"5 { }", 1, "Expected field identifier after { when read 5"},
      {"z { }", 1, "Field z not declared in the model"},
      {"a { }", 1, "Can't initialise field a that appeared in the first schema"},
      {"c { c = 1; }\nc { c = 2; }", 2, "Repeated initialisation code for field c"},
      {"c(5) { }", 1, "Expected identifier after ( when read 5"},
      {"c(z) { }", 1, "Field z not declared in the model"},
      {"g(c) { }", 1, "Field c not available in the schema just before g was added"},
      {"c(e) { }", 1, "Field e not available in the schema just before c was added"},
      {"c(b;\na) { }", 1, "Syntax error in dependency arg list : ;"},
      {"c 5", 1, "Expected { after c when read 5"},
      {"e { e = 1; }\n", 2, "Redundant initialisation of field e"},
  };
  const std::string model =
      "$model M { int32 a; int32 c; int32 g; $dropped { int32 b; int32 e; } "
      "$schema { 1: +a +b 3: +g +e 4: -e 5: -b +c } $evolve { ";
  AssertErrors(cases, model, "} };");
  AssertErrors({{"\nc(b,", 2, "Met EOS in middle of arg list"},
                {"\nc { c = 1;", 2, "Met EOS before read matching brace for $evolve block"},
                {"\nc { c = 1; }", 2, "Met EOS before read matching brace for $evolve block"}},
               model);
  // An argument that goes in the very release of the field is at hand, and empty code is none.
  EXPECT_NE(TranslateHeader(model + "c(b) { } c(b) { c = b; } } };").header.find("struct M"), std::string::npos);
}

}  // namespace
}  // namespace qrex
