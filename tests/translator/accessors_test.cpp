#include <regex>

#include "translator/translate_fixture.h"

namespace qrex {
namespace {

// In expected texts S and C stand for the object that operations and barriers take, W and R for the barriers of the
// field x of a class without operations, AT and CAT for the casts of its attribute struct.
std::string Spelt(std::string text) {
  const std::pair<const char*, const char*> kWords[] = {
      {"\\bS,", "static_cast<typename BC::FinalClass*>(this),"},
      {"\\bC,", "static_cast<const typename BC::FinalClass*>(this),"},
      {"\\bW;", "vesk::DataSourceWriteBarrier(&_model_.x,vesk::null,\"K::_model_.x\");"},
      {"\\bR;", "vesk::DataSourceReadBarrier(&_model_.x,vesk::null,\"K::_model_.x\");"},
      {"\\bAT\\b", "ATTRIB_CAST(K_model_mixin,x)"},
      {"\\bCAT\\b", "CONST_ATTRIB_CAST(K_model_mixin,x)"},
  };
  for (const auto& [word, spelling] : kWords) text = std::regex_replace(text, std::regex(word), spelling);
  return text;
}

class AccessorsTest : public TranslateTest {
 protected:
  const std::string kDeclared =
      "$interface+ I : vesk::IObject { };\n$enum E { e1 };\n$model Inner { bool y; };\n$typedef int32 Number;\n"
      "$variant V { bool; };\n$struct S { };\n"
      "$model Whole { char16 c; E e; V d; ptr<I> p; pref<I> q; cref<Inner> r; S s; int32* t; };\n"
      "$model Names { string8 n[]; };\n";

  std::string Mixin(const std::string& head, const std::string& field) {
    const std::string header =
        TranslateHeader(kDeclared + "$class K" + head + " : model { " + field + "; } { };\n").header;
    return Section(header, "struct K_model_mixin : public BC\n", "};\ntypedef");
  }
  // The reading accessor of x behind its name, and what stands behind it.
  std::string Accessors(const std::string& head, const std::string& field, const std::string& reading) {
    return Section(Mixin(head, field), " const& Getx() const { " + Spelt(reading), "    union\n");
  }
  std::string AttributeStruct(const std::string& field) {
    return Section(Mixin("", field), "    union\n    {\n", "    };\n    typedef");
  }
  // Parameters and body of the function that writes the path of the field, or of its element, as `name` says.
  std::string Path(const std::string& field, const std::string& name) {
    return Section(TranslateHeader(kDeclared + "$model M { " + field + " };\n").header,
                   "static void Get" + name + "Path(vesk::Path& _path", "}\n");
  }
};

TEST_F(AccessorsTest, Paths) {
  const struct {
    const char *field, *name, *text;
  } kPaths[] = {
      {"Inner a; Inner x;", "xy", ") { vesk::octet_t* p=_path.InitLocalBuffer(2); p[0]=1; p[1]=0; "},
      {"int32 x[128];", "xElement",
       ",vesk::ssize_t _k0) { vxAssert(0 <= _k0 && _k0 < 128); vesk::octet_t* p=_path.InitLocalBuffer(2); p[0]=0; "
       "p[1]=(vesk::octet_t)_k0; "},
      {"int32 x[129];", "xElement",
       ",vesk::ssize_t _k0) { vxAssert(0 <= _k0 && _k0 < 129); vesk::octet_t* p=_path.BeginReserveLocal(); *p++ =0; "
       "p=vesk::SerialiseVariableLengthInteger(p,_k0); _path.EndReserveLocal(p); "},
      {"int32 x[4][];", "xElementElement",
       ",vesk::ssize_t _k0,vesk::ssize_t _k1) { vxAssert(0 <= _k0 && _k0 < 4); vxAssert(0 <= _k1); "
       "vesk::octet_t* p=_path.BeginReserveLocal(); *p++ =0; *p++ =(vesk::octet_t)_k0; "
       "p=vesk::SerialiseVariableLengthInteger(p,_k1); _path.EndReserveLocal(p); "},
      {"xmap<string8,int32> x;", "xElement",
       ",vesk::string8 const& _k0) { vesk::FieldPathArchive _ar; vesk::SerialiseVariableLengthUint(_ar,0); "
       "_ar << _k0; _ar.InitPath(_path); "},
      {"xmap<Number,DynArray<int32> > x;", "xElementElement",
       ",Number const& _k0,vesk::ssize_t _k1) { vxAssert(0 <= _k1); vesk::FieldPathArchive _ar; "
       "vesk::SerialiseVariableLengthUint(_ar,0); _ar << _k0; vesk::SerialiseVariableLengthUint(_ar,_k1); "
       "_ar.InitPath(_path); "},
      {"xmap<E,int32> x;", "xElement",
       ",E const& _k0) { vesk::octet_t* p=_path.InitLocalBuffer(5); p[0]=0; *(vesk::int32*)(p+1)=_k0; "},
      {"xmap<int64,xmap<int32,xmap<int16,xmap<int8,bool> > > > x;", "xElementElementElementElement",
       ",vesk::int64 const& _k0,vesk::int32 const& _k1,vesk::int16 const& _k2,vesk::int8 const& _k3) { "
       "vesk::octet_t* p=_path.InitLocalBuffer(16); p[0]=0; *(vesk::int64*)(p+1)=_k0; *(vesk::int32*)(p+9)=_k1; "
       "*(vesk::int16*)(p+13)=_k2; *(vesk::int8*)(p+15)=_k3; "},
      {"xmap<uint128,bool> x;", "xElement",
       ",vesk::uint128 const& _k0) { vesk::octet_t* p=_path.InitHeapBuffer(17); p[0]=0; "
       "*(vesk::uint128*)(p+1)=_k0; "},
      {"xmap<float64,DynArray<DynArray<bool> > > x;", "xElementElementElement",
       ",vesk::float64 const& _k0,vesk::ssize_t _k1,vesk::ssize_t _k2) { vxAssert(0 <= _k1); vxAssert(0 <= _k2); "
       "vesk::octet_t* p=_path.BeginReserveHeap(19); *p++ =0; *(float64*)p=_k0; p+=8; "
       "p=vesk::SerialiseVariableLengthInteger(p,_k1); p=vesk::SerialiseVariableLengthInteger(p,_k2); "
       "_path.EndReserveHeap(p); "},
  };
  for (const auto& [field, name, text] : kPaths) EXPECT_EQ(Path(field, name), text) << field;

  std::string fields;
  for (int i = 0; i < 200; ++i) fields += "bool f" + ToString(i) + "; ";
  EXPECT_EQ(Path(fields + "bool x;", "x"), ") { vesk::octet_t* p=_path.InitLocalBuffer(2); p[0]=128; p[1]=200; ");
}

TEST_F(AccessorsTest, WithOperations) {
  auto setter = [](const std::string& type, const std::string& operation) {
    return "    void Setx(" + type + " const& _v) { vesk::" + operation + "(S,GetxPath(),_model_.x,_v); }";
  };
  auto ofVector = [](const std::string& element, const std::string& operation) {
    return "    void CreateIntox(vesk::ssize_t _i," + element + " const* _src,vesk::ssize_t _n)\n    {\n" +
           "        vesk::genop_CreateInto" + operation + "(S,GetxPath(),_model_.x,_i,_src,_n);\n    }\n" +
           "    void DeleteFromx(vesk::ssize_t _i1,vesk::ssize_t _i2)\n    {\n" + "        vesk::genop_DeleteFrom" +
           operation + "(S,GetxPath(),_model_.x,_i1,_i2);\n    }";
  };
  const std::pair<std::string, std::string> kFields[] = {
      {"int32 x", setter("vesk::int32", "genop_Assign")},
      {"pref<I> x", setter("vesk::pref<I>", "genop_Assign_VisitPrefs")},
      {"movable<pref<I> > x", setter("vesk::pref<I>", "genop_AssignPref")},
      {"assignable<xvector<int32> > x", setter("vesk::xvector<vesk::int32>", "genop_Assign")},
      {"offsettable<int8> x",
       "    void Offsetx(vesk::int8 const& _v) { vesk::genop_OffsetValue(S,GetxPath(),_model_.x,_v); }"},
      {"string16 x", ofVector("vesk::char16", "Vector")},
      {"xvector<pref<I> > x", ofVector("vesk::pref<I>", "Vector_VisitPrefs")},
      {"xvector<movable<pref<I> > > x", ofVector("vesk::pref<I>", "MVector")},
      {"xset<int8> x",
       R"(    static void GetxElementPath(vesk::Path& _path,vesk::int8 const& _k0) { vesk::octet_t* p=_path.InitLocalBuffer(2); p[0]=0; *(vesk::int8*)(p+1)=_k0; }
    static vesk::Path GetxElementPath(vesk::int8 const& _k0) { vesk::Path _path; GetxElementPath(_path,_k0); return _path; }
    bool InsertIntox(vesk::int8 const& _k0) { return vesk::genop_SetInsert(S,GetxElementPath(_k0),_model_.x,_k0); }
    bool DeleteFromx(vesk::int8 const& _k0) { return vesk::genop_SetDelete(S,GetxElementPath(_k0),_model_.x,_k0); })"},
      {"xset<movable<pref<I> > > x",
       R"(    bool InsertIntox(vesk::pref<I> const& _v) { return vesk::genop_InsertIntoMSet(S,GetxPath(),_model_.x,_v); }
    bool DeleteFromx(vesk::pref<I> const& _v) { return vesk::genop_DeleteFromMSet(S,GetxPath(),_model_.x,_v); })"},
      {"xmap<uint8,cref<Inner> > x", R"(    
    static void GetxElementPath(vesk::Path& _path,vesk::uint8 const& _k0) { vesk::octet_t* p=_path.InitLocalBuffer(2); p[0]=0; *(vesk::uint8*)(p+1)=_k0; }
    static vesk::Path GetxElementPath(vesk::uint8 const& _k0) { vesk::Path _path; GetxElementPath(_path,_k0); return _path; }
    vesk::cref<Inner> const& _model__xElement(vesk::uint8 const& _k0) const { return _model_.x[_k0]; }
    vesk::cref<Inner>& _model__xElement(vesk::uint8 const& _k0) { return _model_.x[_k0]; }
    vesk::cref<Inner> const& GetxElement(vesk::uint8 const& _k0) const { vesk::IndepFieldReadBarrier(C,GetxElementPath(_k0)); return _model_.x[_k0]; }
    void SetxElement(vesk::uint8 const& _k0,vesk::cref<Inner> const& _v) { vesk::genop_Assign_VisitPrefs(S,GetxElementPath(_k0),_model_.x[_k0],_v); })"},
  };
  const std::string reading = "vesk::IndepFieldReadBarrier(C,GetxPath()); return _model_.x; }\n";
  for (const auto& [field, text] : kFields) {
    EXPECT_EQ(Accessors(" isa vesk::IObject", field, reading), Spelt(text) + "\n") << field;
  }
}

TEST_F(AccessorsTest, OperatorsOfAttributes) {
  const struct {
    const char *field, *text;
  } kFields[] = {
      {"int32* x", R"(            vesk::int32* operator->() const { return CAT->Getx(); }
            void operator=(vesk::int32* const& _v) { AT->Setx(_v); })"},
      {"pref<I> x", R"(            vesk::pref<I> operator->() const { return CAT->Getx(); }
            I operator*() const { return *CAT->Getx(); }
            vesk::ptr<I > Get() const { return CAT->Getx().Get(); }
            void operator=(vesk::pref<I> const& _v) { AT->Setx(_v); })"},
      {"cref<Inner> x", R"(            vesk::cref<Inner> operator->() const { return CAT->Getx(); }
            Inner& operator*() const { return *CAT->Getx(); }
            Inner* Get() const { return CAT->Getx().Get(); }
            void operator=(vesk::cref<Inner> const& _v) { AT->Setx(_v); })"},
      {"offsettable<uint32> x", R"(            void operator+=(vesk::uint32 const& x) { AT->Offsetx(x); }
            void operator-=(vesk::uint32 const& x) { AT->Offsetx(-(vesk::int32)x); })"},
      {"offsettable<int32> x", R"(            void operator+=(vesk::int32 const& x) { AT->Offsetx(x); }
            void operator-=(vesk::int32 const& x) { AT->Offsetx(-x); })"},
      {"Inner x", R"(            union
            {
                struct
                {
                    operator bool const&() const { return CONST_ATTRIB_CAST(K_model_mixin,x.y)->Getxy(); }
                    bool const& read() const { return CONST_ATTRIB_CAST(K_model_mixin,x.y)->Getxy(); }
                    bool & write() { return ATTRIB_CAST(K_model_mixin,x.y)->Writexy(); }
                    bool const& model() const { return CONST_ATTRIB_CAST(K_model_mixin,x.y)->_model__xy(); }
                    bool& model() { return ATTRIB_CAST(K_model_mixin,x.y)->_model__xy(); }
                    vesk::Path path() const { return CONST_ATTRIB_CAST(K_model_mixin,x.y)->GetxyPath(); }
                    void operator=(bool const& _v) { ATTRIB_CAST(K_model_mixin,x.y)->Setxy(_v); }
                } y;
            };)"},
  };
  for (const auto& [field, text] : kFields) {
    EXPECT_EQ(Section(AttributeStruct(field), "->GetxPath(); }\n", "        } x;\n"), Spelt(text) + "\n") << field;
  }
}

// Forwarders hand on what each sort of element offers, with the proxy's own key in front.
TEST_F(AccessorsTest, ForwardersOfAKeyProxy) {
  const struct {
    const char *element, *text;
  } kElements[] = {
      {"string8", R"(                void CreateIntoxElement(vesk::ssize_t _i,vesk::char8 const* _src,vesk::ssize_t _n)
                {
                    _self->CreateIntoxElement(_k0,_i,_src,_n);
                }
                void DeleteFromxElement(vesk::ssize_t _i1,vesk::ssize_t _i2)
                {
                    _self->DeleteFromxElement(_k0,_i1,_i2);
                })"},
      {"Inner", R"(                vesk::Path GetxElementyPath() const { return _self->GetxElementyPath(_k0); }
                bool const& _model__xElementy() const { return _self->_model__xElementy(_k0); }
                bool& _model__xElementy() { return _self->_model__xElementy(_k0); }
                bool const& GetxElementy() const { return _self->GetxElementy(_k0); }
                void SetxElementy(bool const& _v) { _self->SetxElementy(_k0,_v); })"},
      {"DynArray<xset<E> >",
       R"(                vesk::ssize_t GetxElementSize() const { return _self->GetxElementSize(_k0); }
                vesk::Path GetxElementElementPath(vesk::ssize_t _k1) const { return _self->GetxElementElementPath(_k0,_k1); }
                vesk::xset<E> const& _model__xElementElement(vesk::ssize_t _k1) const { return _self->_model__xElementElement(_k0,_k1); }
                vesk::xset<E>& _model__xElementElement(vesk::ssize_t _k1) { return _self->_model__xElementElement(_k0,_k1); }
                vesk::xset<E> const& GetxElementElement(vesk::ssize_t _k1) const { return _self->GetxElementElement(_k0,_k1); }
                bool InsertIntoxElementElement(vesk::ssize_t _k1,E const& _key)
                {
                    return _self->InsertIntoxElementElement(_k0,_k1,_key);
                }
                bool DeleteFromxElementElement(vesk::ssize_t _k1,E const& _key)
                {
                    return _self->DeleteFromxElementElement(_k0,_k1,_key);
                })"},
  };
  for (const auto& [element, text] : kElements) {
    const std::string proxy = AttributeStruct("xmap<int8," + std::string(element) + "> x");
    EXPECT_EQ(Section(proxy, "GetxElement() const { return _self->GetxElement(_k0); }\n", "                operator "),
              text + std::string("\n"))
        << element;
    EXPECT_EQ(
        Section(proxy, "struct xElement\n", "                vesk::Path"),
        "            {\n                xElement(K_model_mixin* _self, vesk::int8 _k) : _self(_self),_k0(_k) {}\n");
    EXPECT_EQ(Section(proxy, "                vesk::int8 _k0;\n", "        } x;\n"), Spelt(R"(            };
            xElement operator[](vesk::int8 _k0)
            {
                return xElement(AT,_k0);
            }
            xElement const operator[](vesk::int8 _k0) const
            {
                return xElement(const_cast<K_model_mixin*>(CAT),_k0);
            }
)"));
  }
}

TEST_F(AccessorsTest, ForwardersOfWholeFields) {
  for (const bool all : {false, true}) {
    settings.compilableText = all;
    const std::string proxy = AttributeStruct("xmap<int8,Whole> x");
    for (const std::string field : {"c", "d", "e", "p", "q", "r", "s", "t"}) {
      const bool isForwarded = proxy.find("{ _self->SetxElement" + field + "(_k0,_v); }\n") != proxy.npos;
      EXPECT_EQ(isForwarded, all || field < "s") << field;
    }
  }
}

// Keys are counted from the proxy that is the object.
TEST_F(AccessorsTest, ForwardersOfAProxyWithinAModel) {
  const std::string proxy = Section(AttributeStruct("xmap<int8,Names> x"), "struct xElementnElement\n", "struct");
  const std::string path =
      "vesk::Path GetxElementnElementPath() const { return _self->GetxElementnElementPath(_k0); }\n";
  EXPECT_NE(proxy.find(path), proxy.npos) << proxy;
}

TEST_F(AccessorsTest, NestingIsBounded) {
  std::string type = "bool";
  for (int i = 0; i < 60; ++i) type = "DynArray<" + type + " >";
  std::string models = "$model M0 { bool x; }; ";
  for (int i = 1; i < 60; ++i) models += "$model M" + ToString(i) + " { M" + ToString(i - 1) + " x; }; ";
  AssertErrors({{"$model M { " + type + " x; };", 1, "Field x : type nested too deeply"},
                {models, 1, "Field x : type nested too deeply"}});
  // one of fields that double grows faster
  std::string ladder = "$model M0 { bool x; bool y; }; ";
  for (int i = 1; i < 16; ++i) {
    const std::string below = "M" + ToString(i - 1);
    ladder += "$model M" + ToString(i) + " { " + below + " x; " + below + " y; };\n";
  }
  AssertErrors({{ladder, 12, "Field y : $model M12 has more than 10000 fields, with those of the models in it"}});
}

}  // namespace
}  // namespace qrex
