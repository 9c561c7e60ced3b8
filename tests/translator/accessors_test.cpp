#include "text_cases.h"
#include "translator/translate_fixture.h"

namespace qrex {
namespace {

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
  for (const auto& [name, field, text] : TextCasesOf("translator/accessors/paths.txt"))
    EXPECT_EQ(text, Path(field, name)) << field;
  std::string fields;
  for (int i = 0; i < 200; ++i) fields += "bool f" + ToString(i) + "; ";
  EXPECT_EQ(Path(fields + "bool x;", "x"), ") { vesk::octet_t* p=_path.InitLocalBuffer(2); p[0]=128; p[1]=200; ");
}

// What stands behind the reading accessor.
TEST_F(AccessorsTest, WithOperations) {
  const std::string reading =
      "vesk::IndepFieldReadBarrier(static_cast<const typename BC::FinalClass*>(this),GetxPath()); return _model_.x; "
      "}\n";
  for (const auto& [name, field, text] : TextCasesOf("translator/accessors/operations.txt")) {
    EXPECT_EQ(Section(Mixin(" isa vesk::IObject", field), " const& Getx() const { " + reading, "    union\n"),
              text + "\n")
        << field;
  }
}

TEST_F(AccessorsTest, OperatorsOfAttributes) {
  for (const auto& [name, field, text] : TextCasesOf("translator/accessors/attributes.txt")) {
    EXPECT_EQ(Section(AttributeStruct(field), "->GetxPath(); }\n", "        } x;\n"), text + "\n") << field;
  }
}

// Forwarders hand on what each sort of element offers, with the proxy's own key in front.
TEST_F(AccessorsTest, ForwardersOfAKeyProxy) {
  for (const auto& [name, element, text] : TextCasesOf("translator/accessors/proxies.txt")) {
    const std::string proxy = AttributeStruct("xmap<int8," + element + "> x");
    EXPECT_EQ(Section(proxy, "GetxElement() const { return _self->GetxElement(_k0); }\n", "                operator "),
              text + "\n")
        << element;
    EXPECT_EQ(
        Section(proxy, "struct xElement\n", "                vesk::Path"),
        "            {\n                xElement(K_model_mixin* _self, vesk::int8 _k) : _self(_self),_k0(_k) {}\n");
    EXPECT_EQ(Section(proxy, "                vesk::int8 _k0;\n", "        } x;\n"), R"(            };
            xElement operator[](vesk::int8 _k0)
            {
                return xElement(ATTRIB_CAST(K_model_mixin,x),_k0);
            }
            xElement const operator[](vesk::int8 _k0) const
            {
                return xElement(const_cast<K_model_mixin*>(CONST_ATTRIB_CAST(K_model_mixin,x)),_k0);
            }
)");
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
  for (const std::string& text : {"$model M { " + type + " x; };", models})
    AssertError(text, 1, "Field x : type nested too deeply");
  // one of fields that double grows faster
  std::string ladder = "$model M0 { bool x; bool y; }; ";
  for (int i = 1; i < 16; ++i) {
    const std::string below = "M" + ToString(i - 1);
    ladder += "$model M" + ToString(i) + " { " + below + " x; " + below + " y; };\n";
  }
  AssertError(ladder, 12, "Field y : $model M12 has more than 10000 fields, with those of the models in it");
}

}  // namespace
}  // namespace qrex
