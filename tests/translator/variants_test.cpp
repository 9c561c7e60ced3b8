// $variant: the class, the operations behind it, the record; $polymorphic functions over variants.

#include "translator/translate_fixture.h"

namespace qrex {
namespace {

using VariantsTest = TranslateTest;

TEST_F(VariantsTest, EverySortOfItem) {
  AssertGenerated(R"($variant+ V <<-compare>> : [ 7 ]
{
    default x("a");
    int32;
    string8 x;
    void none;
    *pref<vesk::IObject> ref;
    { int32 a; string8 b; } s;
    *{ pref<vesk::IObject> p; } h;
};
)",
                  R"(class V
{
    public:
    V()
    {
        new (this) V(x("a"));
    }
    
    struct x
    {
        enum { tag=1 };
        typedef vesk::string8 Value;
        x(const Value& _v) : value(_v) {}
        Value value;
    };
    struct none
    {
        enum { tag=2 };
        typedef void Value;
    };
    struct ref
    {
        enum { tag=3 };
        typedef vesk::pref<vesk::IObject> Value;
        ref(const Value& _v) : value(_v) {}
        Value value;
    };
    struct s
    {
        enum { tag=4 };
        s() {}
        s(vesk::int32 const& a_,vesk::string8 const& b_) : a(a_),b(b_) {}
        bool operator==(s const& _rhs) const { return true && a == _rhs.a && b == _rhs.b; }
        bool operator<(s const& _rhs) const { return (a < _rhs.a || a == _rhs.a &&
        (b < _rhs.b)); }
        void Write(vesk::xostream& _os) const { _os << "s(" << a << ',' << b << ')'; }
        template<typename Archive> void Serialise(Archive& _ar) const { _ar << a << b; }
        template<typename Archive> void Deserialise(Archive& _ar) { _ar >> a >> b; }
        typedef s Value;
        vesk::int32 a;
        vesk::string8 b;
    };
    struct h;
    template<typename T> struct _mapvalue_ { enum { tag=T::tag }; typedef typename T::Value Value; };
    V(vesk::int32 const& _rhs)
    {
        _tag = 0;
        new (_data) vesk::int32(_rhs);
    }
    V(x const& _rhs)
    {
        _tag = 1;
        new (_data) x(_rhs);
    }
    V(none const& _rhs)
    {
        _tag = 2;
    }
    V(ref const& _rhs)
    {
        _tag = 3;
        *(ref**)_data = new ref(_rhs);
    }
    V(s const& _rhs)
    {
        _tag = 4;
        new (_data) s(_rhs);
    }
    V(h const& _rhs);
    V(V const& _rhs);
    ~V();
    V& operator=(V const& _rhs)
    {
        if (this != &_rhs) { this->~V(); new (this) V(_rhs); }
        return *this;
    }
    void VisitObjects(vesk::IObjectVisitor&) const;
    void VisitPrefs(vesk::IPrefVisitor&) const;
    vesk::int32 GetTag() const { return _tag; }
    bool operator==(V const& _rhs) const;
    bool operator!=(V const& _rhs) const { return !operator==(_rhs); }
    bool operator<(V const& _rhs) const;
    template<typename T> bool is() const { return is((T*)0); }
    template<typename T> const typename _mapvalue_<T>::Value& as() const { return as((T*)0); }
    template<typename T> typename _mapvalue_<T>::Value& as() { return as((T*)0); }
    void Write(vesk::xostream&) const;
    template<typename Archive> void Serialise(Archive&) const;
    template<typename Archive> void Deserialise(Archive&);
    private:
    template<typename T> typename T::Value const& as(T*) const { vxAssert(is<T>()); return *(typename T::Value const*)_data; }
    template<typename T> typename T::Value& as(T*) { vxAssert(is<T>()); return *(typename T::Value*)_data; }
    vesk::int32 const& as(vesk::int32*) const { vxAssert((is<vesk::int32 >())); return *(vesk::int32 const*) _data; }
    vesk::int32& as(vesk::int32*) { vxAssert((is<vesk::int32 >())); return *(vesk::int32*) _data; }
    ref::Value const& as(ref*) const { vxAssert((is<ref >())); return ** (ref::Value const**) _data; }
    ref::Value& as(ref*) { vxAssert((is<ref >())); return ** (ref::Value**) _data; }
    h const& as(h*) const { vxAssert((is<h >())); return ** (h const**) _data; }
    h& as(h*) { vxAssert((is<h >())); return ** (h**) _data; }
    bool is(vesk::int32*) const { return _tag == 0; }
    bool is(x*) const { return _tag == 1; }
    bool is(none*) const { return _tag == 2; }
    bool is(ref*) const { return _tag == 3; }
    bool is(s*) const { return _tag == 4; }
    bool is(h*) const { return _tag == 5; }
    vesk::int32 _tag;
    vesk::octet_t _data[VESK_MAX6(sizeof(vesk::int32),sizeof(x),0,sizeof(void*),sizeof(s),sizeof(void*))];
};
template <> struct V::_mapvalue_<vesk::int32 > { enum { tag=0 }; typedef vesk::int32 Value; };
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,V const& _x) { _x.VisitObjects(_v); return _v; }
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,V const*) { return _v; }
inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,V const& _x) { _x.VisitPrefs(_v); return _v; }
inline vesk::xostream& operator<<(vesk::xostream& _os,V const& _x) { _x.Write(_os); return _os; }
vesk::ReflectedVariant const& _GetReflected(V const*);
vesk::TypeOps const& _GetTypeOps(V const*);
template<typename Archive> inline void Serialise(Archive& _ar,V const& _x) { _x.Serialise(_ar); }
template<typename Archive> inline void Deserialise(Archive& _ar,V & _x) { _x.Deserialise(_ar); }
struct V::h
{
    enum { tag=5 };
    h() {}
    h(vesk::pref<vesk::IObject> const& p_) : p(p_) {}
    bool operator==(h const& _rhs) const { return true && p == _rhs.p; }
    bool operator<(h const& _rhs) const { return (p < _rhs.p); }
    void Write(vesk::xostream& _os) const { _os << "h(" << p << ')'; }
    template<typename Archive> void Serialise(Archive& _ar) const { _ar << p; }
    template<typename Archive> void Deserialise(Archive& _ar) { _ar >> p; }
    typedef h Value;
    vesk::pref<vesk::IObject> p;
};
inline V::V(h const& _x)
{
    _tag = 5;
    *(h**)_data = new h(_x);
}
inline V::V(V const& _rhs)
{
    _tag = _rhs._tag;
    switch(_tag)
    {
        case 0 : new (_data) vesk::int32(_rhs.as<vesk::int32 >()); break;
        case 1 : new (_data) x(_rhs.as<x >()); break;
        case 3 : *(ref**)_data = new ref(_rhs.as<ref >()); break;
        case 4 : new (_data) s(_rhs.as<s >()); break;
        case 5 : *(h**)_data = new h(_rhs.as<h >()); break;
    }
}
inline V::~V()
{
    switch(_tag)
    {
        case 1 : as<x >().vesk::string8::~basic_xstring(); break;
        case 3 : delete *(ref**)_data; break;
        case 4 : (*(s**)_data)->~s(); break;
        case 5 : delete *(h**)_data; break;
    }
}
inline bool V::operator==(V const& _rhs) const
{
    if (_tag != _rhs._tag) return false;
    switch(_tag)
    {
        case 0 : return as<vesk::int32 >() == _rhs.as<vesk::int32 >();
        case 1 : return as<x >() == _rhs.as<x >();
        case 3 : return as<ref >() == _rhs.as<ref >();
        case 4 : return as<s >() == _rhs.as<s >();
        case 5 : return as<h >() == _rhs.as<h >();
    }
    return true;
}
inline bool V::operator<(V const& _rhs) const
{
    if (_tag < _rhs._tag) return true;
    if (_tag > _rhs._tag) return false;
    switch(_tag)
    {
        case 0 : return as<vesk::int32 >() < _rhs.as<vesk::int32 >();
        case 1 : return as<x >() < _rhs.as<x >();
        case 3 : return as<ref >() < _rhs.as<ref >();
        case 4 : return as<s >() < _rhs.as<s >();
        case 5 : return as<h >() < _rhs.as<h >();
    }
    return false;
}
inline void V::Write(vesk::xostream& _os) const
{
    switch(_tag)
    {
        case 0 : _os << as<vesk::int32 >(); break;
        case 1 : _os << "x(" << as<x >() << ')'; break;
        case 2 : _os << "none"; break;
        case 3 : _os << "ref(" << as<ref >() << ')'; break;
        case 4 : as<s >().Write(_os); break;
        case 5 : as<h >().Write(_os); break;
        default: vxAssert(0);
    }
}
inline void V::VisitObjects(vesk::IObjectVisitor& _v) const
{
    switch(_tag)
    {
        case 3 : _v << as<ref >(); break;
        case 5 : _v << as<h >(); break;
    }
}
inline void V::VisitPrefs(vesk::IPrefVisitor& _v) const
{
    switch(_tag)
    {
        case 3 : _v << as<ref >(); break;
        case 5 : _v << as<h >(); break;
    }
}
template<typename Archive> inline void V::Serialise(Archive& _ar) const
{
    vesk::SerialiseVariableLengthUint(_ar,_tag);
    switch(_tag)
    {
        case 0 : _ar << as<vesk::int32 >(); break;
        case 1 : _ar << as<x >(); break;
        case 3 : _ar << as<ref >(); break;
        case 4 : as<s >().Serialise(_ar); break;
        case 5 : as<h >().Serialise(_ar); break;
    }
}
template<typename Archive> inline void V::Deserialise(Archive& _ar)
{
    this->~V();
    vesk::DeserialiseVariableLengthUint(_ar,_tag);
    switch(_tag)
    {
        case 0 : new (_data) vesk::int32(); _ar >> as<vesk::int32 >(); break;
        case 1 : new (_data) vesk::string8(); _ar >> as<x >(); break;
        case 3 : *(vesk::pref<vesk::IObject>**)_data = new vesk::pref<vesk::IObject>(); _ar >> as<ref >(); break;
        case 4 : new (_data) s(); as<s >().Deserialise(_ar); break;
        case 5 : *(h**)_data = new h(); as<h >().Deserialise(_ar); break;
    }
}

)" + TraitsText("V", "variant", "1111") +
                      "} // namespace vesk\n\n",
                  TailText("$variant+ V", R"(    vesk::ReflectedVariant const& _GetReflected(V const*)
    {
        static const vesk::octet_t V_metadata[] = { 0xe1,0xa2,0x07,0x00,0x00,0x00 };
        static const vesk::octet_t V_tag_vesk_8__8_int32[] = { 0x04 };
        static const vesk::octet_t V_tag_x[] = { 0x10 };
        static const vesk::octet_t V_tag_none[] = { 0x00 };
        static const vesk::octet_t V_tag_ref[] = { 0x42,0x21,0x00,0x00 };
        // todo : byte code for anonymous struct
        // todo : byte code for anonymous struct
        static const vesk::ReflectedField V_fields[] = { { "vesk::int32", 4, V_tag_vesk_8__8_int32 }, { "x", 4, V_tag_x }, { "none", 4, V_tag_none }, { "ref", 4, V_tag_ref }, { "s", 4, NULL }, { "h", 4, NULL }, };
        static vesk::ConstStringZ V_stringTable[] = { "vesk::IObject", };
        static const vesk::ReflectedVariant V_variant =
        {
            "V",
            sizeof(V),
            V_metadata,
            V_fields,6,
            V_stringTable,
            { sizeof(V), 0, 0, PrintVariable, ConstructArray, CopyConstructArray, AssignArray, DestructArray, SerialiseArray, DeserialiseArray, VisitObjectsInArray, VisitPrefsInArray, 0, 0 }
        };
        return V_variant;
    }
    vesk::TypeOps const& _GetTypeOps(V const*)
    {
        return vesk::GetReflectedVariant<V>().m_ops;
    }
)") + RegistrationText("$variant+ V", "Variant"));
}

TEST_F(VariantsTest, OnlyVoidItems) {
  const std::string text = TranslateHeader("$variant E <<-os -ar>> { void a; void; };\n").header;
  EXPECT_EQ(R"(    bool is(a*) const { return _tag == 0; }
    bool is(void*) const { return _tag == 1; }
    vesk::int32 _tag;
};
template <> struct E::_mapvalue_<void > { enum { tag=1 }; typedef void Value; };
)",
            Section(text, "    private:\n", "inline vesk::IObjectVisitor"));
  for (const char* absent : {" as()", "Write", "Serialise", "switch"})
    EXPECT_EQ(std::string::npos, text.find(absent)) << absent;
}

TEST_F(VariantsTest, Serialisability) {
  const auto serialises = [this](const std::string& declarations) {
    const std::string header = TranslateHeader(declarations).header;
    return header.find("void V::Serialise(") != std::string::npos;
  };
  EXPECT_TRUE(serialises("$variant V { int32; void; };"));
  EXPECT_FALSE(serialises("$variant V { int32; int32* p; };"));
  EXPECT_FALSE(serialises("$variant V { { int32* p; } s; };"));
  EXPECT_TRUE(serialises("$variant V <<ar>> { int32* p; };"));
  EXPECT_FALSE(serialises("$variant V <<-ar>> { int32; };"));
  EXPECT_TRUE(serialises("$variant V; $variant V { *xvector<V> children; int32 leaf; };"));  // under test
  EXPECT_FALSE(serialises("$variant W <<-ar>> { int32; }; $variant V { W w; };"));
  EXPECT_FALSE(serialises("$variant W <<-ser>> { int32; }; $variant V { W w; };"));
  EXPECT_TRUE(serialises("$variant W <<ser -ar>> { int32; }; $variant V { W w; };"));
}

TEST_F(VariantsTest, NamesOfItemsInRecords) {
  const std::string tail =
      TranslateHeader("$variant+ V { xmap<int32,string8>; int32 const*; ptr<ptr<vesk::IObject>>&; };").tail;
  for (const char* name :
       {"V_tag_vesk_8__8_xmap_6_vesk_8__8_int32_vesk_8__8_string8_9_[]", "V_tag_vesk_8__8_int32const_ptr_[]",
        "V_tag_vesk_8__8_ptr_6_vesk_8__8_ptr_6_vesk_8__8_IObject_9__9__ref_[]"}) {
    EXPECT_NE(std::string::npos, tail.find(name)) << name << " in:\n" << tail;
  }
}

TEST_F(VariantsTest, Destructors) {
  const std::string header =
      TranslateHeader(
          "$enum E { a }; namespace n { $typedef xvector<int32> T; }\n$variant V "
          "{ E; n::T t; xmap<int32,bool> m; std::map<int, std::string> s; A<b::C>::D d; int8; };")
          .header;
  EXPECT_EQ(R"(        case 0 : as<E >().E::~E(); break;
        case 1 : as<t >().n::T::~T(); break;
        case 2 : as<m >().vesk::xmap<vesk::int32,bool >::~xmap(); break;
        case 3 : as<s >().std::map<int, std::string>::~map<int, std::string>(); break;
        case 4 : as<d >().A<b::C>::D::~D(); break;
)",
            Section(header, "inline V::~V()\n{\n    switch(_tag)\n    {\n", "    }\n"));
}

TEST_F(VariantsTest, Messages) {
  AssertMessages({
      {"\n$variant V <<copy>> { int32; };",
       "t.h(2) : warning W1004 : $variant V is not reflected and has redundant << >> directives\n"},
      {"$variant V <<os -ar multiline extern>> { int32; };", ""},
      {"$variant V; $variant V; $variant V { V* next; };", ""},
      {"$enum E { a };\n$variant+ V { E e; };",
       "t.h(2) : warning W1002 : Reflected $variant+ V references non-registered $enum E\n"
       "t.h(1) : see declaration of $enum E\n"},
      {"$variant V { { int32 : [ 1 ] a; } s; };",
       "t.h(1) : warning W1001 : Non-reflected $variant V contains metadata\n"},
  });
}

TEST_F(VariantsTest, Errors) {
  AssertErrors({
      {"$struct S {\n$variant+ V { int32; }; };", 2, "'+' modifier not permitted on nested variant"},
      {"$enum V;\n$variant V;", 2, "$variant V conflicts with previous declaration of $enum V"},
      {"$variant V { void; };\n$variant V { void; };", 2, "Repeated definition of $variant V"},
      {"$variant V <<\ndc>> { };", 2, "Unrecognised qualifier << dc >> on $variant V"},
      {"$variant V\nint32;", 2, "Expected { after V when read int32"},
      {"$variant V { default 1", 1, "Met EOS before read ';'"},
      {"$variant V {", 1, "Met EOS before read matching brace for $variant block"},
      {"$variant V { { int32 a;", 1, "Met EOS before read matching brace for struct within $variant block"},
      {"$variant V { {\nint32 f(); } s; };", 2, "Syntax error : ("},
      {"$variant V {\nint32 f(); };", 2, "Syntax error : ("},
      {"$variant V {\n7; };", 2, "Syntax error : 7"},
      {"$variant V { { int32 a } s; };", 1, "; expected after type definition when read }"},
      {"$variant V { int32 a }", 1, "; expected after type definition when read }"},
      {"$variant V { { int32; } s; };", 1, "Expected identifier after int32 when read ;"},
      {"$variant V { { int32 a; }; };", 1, "Expected identifier after } when read ;"},
      {"$variant V { void;\nvoid; };", 2, "Variant V : anonymous type 'void' incompatible with a default value"},
      {"$variant V { default 1;\nvoid; };", 2, "Variant V : anonymous type 'void' incompatible with a default value"},
      {"$variant V {\n};", 2, "$variant V is empty"},
      {"$variant V { int32; $ };", 1, "Expected } after ; when read $"},
      {"$variant V { int32; }\nint x;", 2, "; expected after definition of $variant V when read int"},
  });
}

// --- $polymorphic

const char kTwoVariants[] = "$variant A { int32; void n; };\n$variant B { string8 x; { bool f; } s; };\n";

TEST_F(VariantsTest, PolymorphicFunctions) {
  const std::string header = TranslateHeader(std::string(kTwoVariants) +
                                             "$polymorphic int32 f([A a], bool flag = true, [B const& b]);\n"
                                             "$polymorphic inline void g([A& a]);\n")
                                 .header;
  EXPECT_EQ(R"(A a,bool flag=true,B const& b)
{
        switch(a.GetTag())
        {
        case 0 :
            switch(b.GetTag())
            {
            case 0 : return f(a.as<vesk::int32>(),flag,b.as<x>());
            case 1 : return f(a.as<vesk::int32>(),flag,b.as<s>());
            default: vxAssertUnreachable();
            }
        case 1 :
            switch(b.GetTag())
            {
            case 0 : return f(a.as<n>(),flag,b.as<x>());
            case 1 : return f(a.as<n>(),flag,b.as<s>());
            default: vxAssertUnreachable();
            }
        default: vxAssertUnreachable();
        }
}

inline void g(A& a)
{
        switch(a.GetTag())
        {
        case 0 : g(a.as<vesk::int32>()); break;
        case 1 : g(a.as<n>()); break;
        default: vxAssertUnreachable();
        }
}

)",
            Section(header, "vesk::int32 f(", ""));
}

TEST_F(VariantsTest, PolymorphicErrors) {
  AssertErrors({
      {"$variant A { int32; };\n$polymorphic void f([A a]) { }", 2,
       "; expected after definition of $function f when read {"},
      {"$variant A { int32; };\n$function void f([A a]);", 2, "'[' unexpected.  Polymorphic argument not allowed here"},
      {"$variant A { int32; };\n$polymorphic void f([A a);", 2, "Expected ] after a when read )"},
      {"$polymorphic void f([int32 a]);", 1, "Polymorphic argument a is not a defined $variant"},
      {"$variant A;\n$polymorphic void f([A a]);", 2, "Polymorphic argument a is not a defined $variant"},
  });
}

}  // namespace
}  // namespace qrex
