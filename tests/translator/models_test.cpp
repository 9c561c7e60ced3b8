#include "translate_fixture.h"

namespace qrex {
namespace {

using ModelsTest = TranslateTest;

TEST_F(ModelsTest, WithoutSchema) {
  EXPECT_EQ(Section(TranslateHeader("$model Point\n{\n    string8 name;\n};\n").header, "", "\nnamespace vesk\n"),
            R"(struct Point
{
    
    Point() {}
    explicit Point(vesk::string8 const& name_) : name(name_) {}
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
    void EvictDgsNodes() const;
    void VisitObjects(vesk::IObjectVisitor& _v) const;
    void VisitPrefs(vesk::IPrefVisitor& _v) const;
    bool operator<(Point const& _rhs) const
    {
        return (name < _rhs.name);
    }
    bool operator==(Point const& _rhs) const
    {
        return name == _rhs.name;
    }
    bool operator!=(Point const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(Point const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(Point const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(Point const& _rhs) const { return !operator<(_rhs); }
    
    static void GetnamePath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetnamePath() { vesk::Path _path; GetnamePath(_path); return _path; }
    vesk::string8 const& _model__name() const { return name; }
    vesk::string8& _model__name() { return name; }
    vesk::string8 const& Getname() const { return name; }
    void CreateIntoname(vesk::ssize_t _i,vesk::char8 const* _src,vesk::ssize_t _n)
    {
        name.insert(name.begin()+_i,_src,_src+_n);
    }
    void DeleteFromname(vesk::ssize_t _i1,vesk::ssize_t _i2)
    {
        name.erase(_i1,_i2-_i1);
    }
    
    vesk::string8 name;
};
template <typename BC>
struct Point_model_mixin : public BC
{
    using typename BC::FinalClass;
    
    bool operator<(Point_model_mixin const& _rhs) const {return _model_ < _rhs._model_;}
    bool operator==(Point_model_mixin const& _rhs) const {return _model_ == _rhs._model_;}
    bool operator!=(Point_model_mixin const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(Point_model_mixin const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(Point_model_mixin const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(Point_model_mixin const& _rhs) const { return !operator<(_rhs); }
    void EvictDgsNodes() const {BC::EvictDgsNodes();_model_.EvictDgsNodes();}
    void VisitObjects(vesk::IObjectVisitor& _v) const {BC::VisitObjects(_v); _model_.VisitObjects(_v);}
    void VisitPrefs(vesk::IPrefVisitor& _v) const {BC::VisitPrefs(_v); _model_.VisitPrefs(_v);}
    
    static void GetnamePath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetnamePath() { vesk::Path _path; GetnamePath(_path); return _path; }
    vesk::string8 const& _model__name() const { return _model_.name; }
    vesk::string8& _model__name() { return _model_.name; }
    vesk::string8 const& Getname() const { vesk::DataSourceReadBarrier(&_model_.name,vesk::null,"Point::_model_.name"); return _model_.name; }
    void CreateIntoname(vesk::ssize_t _i,vesk::char8 const* _src,vesk::ssize_t _n)
    {
        vesk::DataSourceWriteBarrier(&_model_.name,vesk::null,"Point::_model_.name"); _model_.name.insert(_model_.name.begin()+_i,_src,_src+_n);
    }
    void DeleteFromname(vesk::ssize_t _i1,vesk::ssize_t _i2)
    {
        vesk::DataSourceWriteBarrier(&_model_.name,vesk::null,"Point::_model_.name"); _model_.name.erase(_i1,_i2-_i1);
    }
    union
    {
        struct
        {
            operator vesk::string8 const&() const { return CONST_ATTRIB_CAST(Point_model_mixin,name)->Getname(); }
            vesk::string8 const& read() const { return CONST_ATTRIB_CAST(Point_model_mixin,name)->Getname(); }
            vesk::string8 & write() { return ATTRIB_CAST(Point_model_mixin,name)->Writename(); }
            vesk::string8 const& model() const { return CONST_ATTRIB_CAST(Point_model_mixin,name)->_model__name(); }
            vesk::string8& model() { return ATTRIB_CAST(Point_model_mixin,name)->_model__name(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(Point_model_mixin,name)->GetnamePath(); }
            void insert(vesk::ssize_t _i,vesk::char8 const* _src,vesk::ssize_t _n)
            {
                ATTRIB_CAST(Point_model_mixin,name)->CreateIntoname(_i,_src,_n);
            }
            void insert(vesk::ssize_t _i,vesk::char8 const& _v)
            {
                insert(_i,&_v,1);
            }
            void push_front(vesk::char8 const& _v)
            {
                insert(0,_v);
            }
            void push_back(vesk::char8 const& _v)
            {
                insert(model().size(),_v);
            }
            void erase_range(vesk::ssize_t _i1,vesk::ssize_t _i2)
            {
                ATTRIB_CAST(Point_model_mixin,name)->DeleteFromname(_i1,_i2);
            }
            void erase(vesk::ssize_t _i)
            {
                erase_range(_i,_i+1);
            }
            void pop_front()
            {
                erase(0);
            }
            void pop_back()
            {
                erase(model().size()-1);
            }
            void clear()
            {
                erase_range(0,model().size());
            }
        } name;
    };
    typedef Point model_type;
    Point const& model() const { return _model_; }
    Point& model() { return _model_; }
    Point const& read() const { vesk::DataSourceReadBarrier(static_cast<const typename BC::FinalClass*>(this), vesk::null,"Point"); return _model_; }
    Point & write() { vesk::DataSourceWriteBarrier(static_cast<typename BC::FinalClass*>(this), vesk::null,"Point"); return _model_; }
    Point _model_;
};

inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,Point const& _x) { _x.VisitObjects(_v); return _v; }
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,Point const*) { return _v; }
inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,Point const& _x) { _x.VisitPrefs(_v); return _v; }

template<typename Archive> inline void Serialise(Archive& _ar,Point const& _x) { _x.Serialise(_ar); }

template<typename Archive> inline void Deserialise(Archive& _ar,Point& _x) { _x.Deserialise(_ar); }
inline vesk::xostream& operator<<(vesk::xostream& _os,Point const& _x)
{
    _os << "Point(" << _x.name << ')';
    return _os;
}
)");
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
  EXPECT_EQ(
      Section(tail, "    void Record::EvictDgsNodes", "    \n    // Registration"),
      R"(() const {vesk::DataSourceEvict(&a);vesk::DataSourceEvict(&c);vesk::DataSourceEvict(&f);vesk::DataSourceEvict(&e);}
    void Record::VisitObjects(vesk::IObjectVisitor& _v) const {}
    void Record::VisitPrefs(vesk::IPrefVisitor& _v) const {}
    void Record::Serialise(vesk::Archive& _ar) const
    {
        _ar << this->a
           << this->c
           << this->f
           << this->e;
    }
    void Record::Deserialise(vesk::InputArchive& _ar)
    {
        vesk::RSN _rsn = vesk::app_GetModelRsn();
        struct EvolveCode
        {
            static void calc_d(vesk::int64& d,vesk::int32 const& b) { d = b * 1000; }
            static void calc_e(vesk::float32& e,vesk::int64 const& d,vesk::string8 const& a) { e = float(d);
                        Log(a); }
        };
        
        _ar >> this->a;
        
        vesk::int32 b;
        if (_rsn < 3) _ar >> b;
        
        if (_rsn <= 2) {  }
        else _ar >> this->c;
        
        vesk::int64 d;
        if (_rsn <= 2) { EvolveCode::calc_d(d,b); }
        else if (_rsn < 7) _ar >> d;
        
        if (_rsn <= 2) {  }
        else _ar >> this->f;
        
        if (_rsn <= 6) { EvolveCode::calc_e(e,d,a); }
        else _ar >> this->e;
    }
)");
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
            R"(class K : public K_model_mixin<vesk::BaseMixin<K,vesk::EmptyBase>>
{
public:
    typedef K_model_mixin<vesk::BaseMixin<K,vesk::EmptyBase>> BaseClass;

    int more;

public:
    
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
};


inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,K const& _x) { _x.VisitObjects(_v); return _v; }
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,K const*) { return _v; }
inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,K const& _x) { _x.VisitPrefs(_v); return _v; }

template<typename Archive> inline void Serialise(Archive& _ar,K const& _x) { _x.Serialise(_ar); }

template<typename Archive> inline void Deserialise(Archive& _ar,K& _x) { _x.Deserialise(_ar); }

inline vesk::xostream& operator<<(vesk::xostream& _os,K const& _x) { _os << _x._model_; return _os; }

)");
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
  });
  // A vector of its own kind is no part of a model's path.
  EXPECT_NE(TranslateHeader("$model M { xvector<M> children; };").header.find("CreateIntochildren"), std::string::npos);
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
