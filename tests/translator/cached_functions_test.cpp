// $cache: functions whose results are kept in nodes, one per function or one per key.

#include "translator/translate_fixture.h"

namespace qrex {
namespace {

using CachedFunctionsTest = TranslateTest;

TEST_F(CachedFunctionsTest, Plain) {
  EXPECT_EQ(R"~(inline vesk::int32 _calc_f() const
{
    return 1; 
}


struct _depnode_f : public vesk::DGSyncDepNode<_depnode_f,S,vesk::int32>
{
    typedef vesk::DGSyncDepNode<_depnode_f,S,vesk::int32> base;
    using typename base::output_type;
    virtual bool RecalcCache() const
    {
        vesk::int32 _prev = _output;
        _output = _GetSelf()->_calc_f();
        if (vesk::TypeHasAdditionalSize<output_type>()) UpdateByteSize();
        return _prev != _output;
    }
    S const* _GetSelf() const { return CONST_ATTRIB_CAST(S,_dn_f); }
    S const* _GetFinalSelf() const { return _GetSelf(); }
    virtual vesk::xstring Name() const { return "S::f()"; }
    virtual vesk::ssize_t EvictionQueueIndex() const { return 3; }
} _dn_f;
inline vesk::int32 const& f() const
{
    return _dn_f.read();
}
)~",
            Body("$cache <<queue(1 + 2) visit>> inline int32 f() const\n{\n    return 1; \n}\n"));
}

TEST_F(CachedFunctionsTest, AsyncByReferenceWithInputInMixin) {
  EXPECT_EQ(
      R"~(void _calc_f_input(vesk::string8& in) const
{
    in = name()
}
void _calc_f(vesk::xvector<vesk::int32>& out,vesk::string8 in) const
{ }


struct _depnode_f : public vesk::DGAsyncNodeOnInput<_depnode_f,M,vesk::string8,vesk::xvector<vesk::int32>>
{
    typedef vesk::DGAsyncNodeOnInput<_depnode_f,M,vesk::string8,vesk::xvector<vesk::int32>> base;
    using typename base::output_type;
    using typename base::input_type;
    _depnode_f() { SetFlag(vesk::DF_ASYNC_IO); }
    static void CalcOutput(const M* _self, output_type& _output, const input_type& _input)
    {
        _self->_calc_f(_output,_input);
    }
    static void CalcInput(const M* _self, input_type& _input)
    {
        _self->_calc_f_input(_input);
    }
    M const* _GetSelf() const { return CONST_ATTRIB_CAST(M,_dn_f); }
    const typename BC::FinalClass* _GetFinalSelf() const { return static_cast<const typename BC::FinalClass*>(_GetSelf()); }
    virtual vesk::xstring Name() const { return "M::f()"; }
} _dn_f;
vesk::xvector<vesk::int32> const& f() const
{
    return _dn_f.read();
}
)~",
      Body("$cache - ^ <<async io>> void f(xvector<int32>& out) const with string8 in = name(); { }\n", "$mixin M"));
}

TEST_F(CachedFunctionsTest, AsyncKeyedByOne) {
  const std::string text = Body("$cache <<io async -io>> int32 f(string8 const& k = \"\") const { }\n", "$mixin M");
  EXPECT_EQ(R"(vesk::int32 _calc_f(vesk::string8 const& k="") const
{ }


struct _depnode_f : public vesk::DGKeyedAsyncIndepNode<_depnode_f,M,vesk::string8,vesk::int32>
)",
            Section(text, "", "{\n    typedef"));
  EXPECT_EQ(R"(    static void CalcOutput(const M* _self, output_type& _output, const key_type& _key)
    {
        _output = _self->_calc_f(_key);
    }
    virtual vesk::xstring Name() const
    {
        return vxMakeString("M::f(" << _GetKey() << ')');
    }
    map_type& _GetMap() const { return _self->_map_f; }
    const typename BC::FinalClass* _GetFinalSelf() const { return static_cast<const typename BC::FinalClass*>(_self); }
};
mutable typename _depnode_f::map_type _map_f;
vesk::int32 const& f(vesk::string8 const& k="") const
{
    return _map_f[k].read(this);
}
)",
            Section(text, "map_type;\n", ""));
}

TEST_F(CachedFunctionsTest, KeyedBySeveralByReference) {
  EXPECT_EQ(
      R"~(void _calc_f(bool& out,vesk::int32 a,vesk::string8 const& b,vesk::float64 c) const
{ }


struct _depnode_f : public vesk::DGKeyedSyncDepNode<_depnode_f,S,std::pair<vesk::int32,std::pair<vesk::string8,vesk::float64>>,bool>
{
    typedef vesk::DGKeyedSyncDepNode<_depnode_f,S,std::pair<vesk::int32,std::pair<vesk::string8,vesk::float64>>,bool> base;
    using typename base::key_type;
    using typename base::output_type;
    using typename base::map_type;
    _depnode_f() { SetFlag(vesk::DF_PROPAGATE_HARD_DIRTINESS); }
    virtual bool RecalcCache() const
    {
        std::pair<vesk::int32,std::pair<vesk::string8,vesk::float64>> const& _key = _GetKey();
        _self->_calc_f(_output,_key.first,_key.second.first,_key.second.second);
        if (vesk::TypeHasAdditionalSize<output_type>()) UpdateByteSize();
        return true;
    }
    virtual vesk::xstring Name() const
    {
        std::pair<vesk::int32,std::pair<vesk::string8,vesk::float64>> const& _key = _GetKey();
        return vxMakeString("S::f(" << _key.first << ',' << _key.second.first << ',' << _key.second.second << ')');
    }
    virtual vesk::ssize_t EvictionQueueIndex() const { return 7; }
    map_type& _GetMap() const { return _self->_map_f; }
    S const* _GetFinalSelf() const { return _self; }
};
mutable typename _depnode_f::map_type _map_f;
bool const& f(vesk::int32 a,vesk::string8 const& b,vesk::float64 c) const
{
    return _map_f[std::make_pair(a,std::make_pair(b,c))].read(this);
}
)~",
      Body("$cache ^ <<queue(7)>> void f(bool& out, int32 a, string8 const& b, float64 c) const { }\n"));
}

TEST_F(CachedFunctionsTest, PartsOfOtherForms) {
  std::string text = Body("$cache ^ void f(bool& b) const { }\n");
  EXPECT_EQ("\n        _GetSelf()->_calc_f(_output);\n", Section(text, "RecalcCache() const\n    {", "        if"));
  EXPECT_EQ("bool>\n", Section(text, "DGSyncDepNode<_depnode_f,S,", "{"));

  text = Body("$cache int32 f(int32 const& a) const { }\n");
  EXPECT_EQ("        auto _prev = _output;\n        _output = _self->_calc_f(_GetKey());\n",
            Section(text, "RecalcCache() const\n    {\n", "        if"));

  text = Body("$cache <<async>> int32 f(int32 a, bool b) const with string8 in { in = $$; } { return size(in); }\n");
  EXPECT_EQ("(vesk::string8& in,vesk::int32 a,bool b) const\n\n{ in = S; } \n\n",
            Section(text, "_input", "vesk::int32 _calc"));
  EXPECT_EQ("(vesk::int32 a,bool b,vesk::string8 in) const\n", Section(text, "vesk::int32 _calc_f", "{"));
  EXPECT_EQ("std::pair<vesk::int32,bool>,vesk::string8,vesk::int32>\n",
            Section(text, "DGKeyedAsyncNodeOnInput<_depnode_f,S,", "{"));
  EXPECT_EQ(
      R"(    static void CalcOutput(const S* _self, output_type& _output, const key_type& _key, const input_type& _input)
    {
        _output = _self->_calc_f(_key.first,_key.second,_input);
    }
    static void CalcInput(const S* _self, input_type& _input, const key_type& _key)
    {
        _self->_calc_f_input(_input,_key.first,_key.second);
    }
)",
      Section(text, "using typename base::input_type;\n", "    virtual"));
}

TEST_F(CachedFunctionsTest, Errors) {
  const std::vector<ErrorCase> cases = {
      {"<<fast>> int32 f() const { } };", 2, "Unrecognised qualifier << fast >> on $cache"},
      {"<<queue(8)>> int32 f() const { } };", 2, "Eviction queue index 8 must be between 0 and 7"},
      {"<<-queue(-1)>> int32 f() const { } };", 2, "Eviction queue index -1 must be between 0 and 7"},
      {"<<queue 1>> int32 f() const { } };", 2, "Expected ( after queue when read 1"},
      {"int32 f()\n{ } };", 3, "$cache function must be declared const"},
      {"void f() const { } };", 2, "$cache function missing output type"},
      {"void f(int32 a) const { } };", 2, "$cache function missing output type"},
      {"void f(const int32& a) const { } };", 2, "$cache function missing output type"},
      {"int32 f() const with int32 i { } { } };", 2, "'with' only allowed on async $cache function"},
      {"<<async>> int32 f() const with int32 { } { } };", 2, "Error parsing input type and name"},
      {"<<async>> int32 f() const with int32 i() { } };", 2, "Error parsing input type and name"},
      {"<<async>> int32 f() const with 7 { } };", 2, "Error parsing input type and name"},
      {"<<async>> int32 f() const with const 7 { } };", 2, "Error parsing input type and name"},
      {"<<async>> int32 f() const with int32 i = 1", 2, "Met EOS while scanning forwards for semicolon"},
      {"<<async>> int32 f() const with int32 i = { } { } };", 2, "Expected ; after } when read {"},
      {"int32 f() const; };", 2, "Expected { after const when read ;"},
      {"int32 f() const { ", 2, "Met EOS before read matching brace"},
      {"int32 f([int32 a]) const { } };", 2, "'[' unexpected.  Polymorphic argument not allowed here"},
  };
  AssertErrors(cases, "$struct S {\n$cache ");
}

}  // namespace
}  // namespace qrex
