// Types: their codes, their spellings, what they can do, all that may be wrong with them; and their byte code.

#include <functional>
#include <map>

#include "text_cases.h"
#include "translator/emit/byte_code.h"
#include "translator/emit/emit.h"
#include "translator/file/keywords.h"
#include "translator/translate_fixture.h"

namespace qrex {
namespace {

class TypesTest : public TranslateTest {
 protected:
  // Names that the types of all tests may use.
  TypesTest() {
    Translate(
        "t.cpp",
        "@import \"Vesk/vxObject/IObject.h\"\n$struct K { }; $enum E { a }; $functor void F(); $variant V { int32; };\n"
        "namespace n { $struct+ S { }; $interface+ I { }; $typedef xvector<int32> T; $model M { int32 x; }; }\n"
        "$typedef const K CK; $model O { pref<n::I> x; };");
  }

  // Parses with `read` at the begin of `text`; the printed form of the error that this raises, or "".
  template <typename Read>
  std::string Parse(const std::string& text, Read read) {
    m_texts.push_back(std::make_unique<std::string>(text));
    const TextRange range{std::string_view(*m_texts.back())};
    SourceMap map;
    map.AddVerbatim(range.begin, range.end);
    struct Target : IOutputStream {
      void Write(const void*, size_t) override {}
      void Flush() override {}
    } target;
    ScannedFile& file = Scanned("t.cpp");
    QrexParserOutputStream stream(target, file.text.lines, range, map);
    TextWriter out(stream);
    QrexParser parser(file, stream, out, range, AllKeywords());
    try {
      read(parser);
      return "";
    } catch (const IException& exception) {
      return ExceptionText(exception);
    }
  }

  TypeCode CodeOf(const std::string& text, bool reflected = true) {
    TypeCode code;
    EXPECT_EQ("", Parse(text, [&](QrexParser& parser) {
                code = parser.ParseTypeWithName(Naming::Optional, reflected).value().type;
                EXPECT_TRUE(parser.Is(kEndOfText)) << text;
              }));
    return code;
  }
  static std::string Hex(const std::string& code) {
    static constexpr char kDigits[] = "0123456789abcdef";
    std::string text;
    for (unsigned char byte : code) {
      if (!text.empty()) text += ' ';
      text += kDigits[byte >> 4];
      text += kDigits[byte & 15];
    }
    return text;
  }
  NameSpace& Root() { return *Scanned("t.cpp").rootNameSpace; }

 private:
  std::vector<std::unique_ptr<std::string>> m_texts;
};

TEST_F(TypesTest, Codes) {
  for (const auto& [name, text, code] : TextCasesOf("translator/type_codes.txt"))
    EXPECT_EQ(code, Hex(CodeOf(text))) << text;
}

TEST_F(TypesTest, UnreflectedTypesStayText) {
  EXPECT_EQ("27 03 69 6e 74", Hex(CodeOf("int", false)));
  EXPECT_EQ("20 01 4b", Hex(CodeOf("K", false)));
}

// What is wrong with a type that has a name, with metadata, and with signatures.
TEST_F(TypesTest, Faults) {
  const std::map<std::string, std::function<void(QrexParser&)>> readers = {
      {"type",
       [](QrexParser& parser) {
         if (!parser.ParseTypeWithName(Naming::Required, true)) parser.Fail("no type");
       }},
      {"metadata",
       [](QrexParser& parser) {
         std::string metadata;
         parser.ParseMetadataList(metadata);
       }},
      {"signature", [](QrexParser& parser) { parser.ParseFunctionSignature({.reflected = true}); }},
      {"argument", [](QrexParser& parser) { parser.ParseFunctionArg({.directions = true, .reflected = true}); }},
  };
  for (const auto& [form, text, message] : TextCasesOf("translator/type_faults.txt"))
    EXPECT_EQ(message.empty() ? "" : "error : " + message, Parse(text, readers.at(form))) << text;
  EXPECT_EQ("error : Reached end of stream while scanning for matching >",
            Parse("std::vector<int", [](QrexParser& p) { p.ParseTypeWithName(Naming::None, false); }));
}

TEST_F(TypesTest, Signatures) {
  FunctionSignature signature;
  EXPECT_EQ(
      "",
      Parse("inline K const& f([E e], int32 a[2] = g(1, 2), string8 s = \",)\") const : [1]", [&](QrexParser& parser) {
        signature = parser.ParseFunctionSignature({.constAllowed = true, .polymorphic = true, .reflected = true});
      }));
  MemoryTextWriter out;
  WriteSignature(out, signature);
  EXPECT_EQ("inline K const& f(E e,vesk::Array<vesk::int32,2> a=g(1, 2),vesk::string8 s=\",)\") const", out.TakeText());
  EXPECT_TRUE(signature.arguments.front().polymorphic);
  EXPECT_EQ("e1 a2 01 00 00 00", Hex(signature.metadata));
}

// The spelling; of reflected types also the mangled one and the destructor.
TEST_F(TypesTest, Spellings) {
  for (const auto& [form, text, spellings] : TextCasesOf("translator/spellings.txt")) {
    const TypeCode code = CodeOf(text, form == "reflected");
    const std::string others = "\n" + MangledType(code) + "\n" + QualifiedDestructorText(code);
    EXPECT_EQ(spellings, TypeText(code) + (form == "reflected" ? others : "")) << text;
  }
  MemoryTextWriter out;
  PrintDeclaration(out, CodeOf("K"), "x", DeclarationMode::Reference);
  PrintDeclaration(out, CodeOf("K"), "", DeclarationMode::ConstReference);
  EXPECT_EQ("K& xK const&", out.TakeText());
  EXPECT_EQ("a::xstring::~basic_xstring", QualifiedDestructorText(CodeOf("a::xstring", false)));
}

TEST_F(TypesTest, Sizes) {
  const std::pair<int64_t, std::vector<std::string>> cases[] = {
      {1, {"bool"}},
      {2, {"char16"}},
      {4, {"float32", "E", "const E"}},
      {8, {"uint64", "K*"}},
      {16, {"int128", "F", "ptr<n::I>"}},
      {24, {"string8", "n::T", "xmap<int8,K>", "movable<cref<K>>"}},
      {30, {"int16 x[3][5]"}},
      {-1, {"xlist<K>", "K", "V", "K x[2]", "CK", "n::I", "int32&"}},
  };
  for (const auto& [size, texts] : cases) {
    for (const std::string& text : texts) EXPECT_EQ(size, SizeInBytes(CodeOf(text), Root())) << text;
  }
}

TEST_F(TypesTest, SameTypes) {
  auto same = [&](const std::string& a, const std::string& b) {
    return SameType(CodeOf(a), Root(), CodeOf(b), Root());
  };
  EXPECT_TRUE(same("n::T", "xvector<int32>"));
  EXPECT_TRUE(same("K", "n::S")) << "names of classes are not compared";
  EXPECT_TRUE(same("int8 a[2]", "int8 : [1] a[3]"));
  EXPECT_TRUE(same("CK*", "const K*"));
  EXPECT_FALSE(same("K", "E"));
  EXPECT_FALSE(same("const K*", "K*"));
  EXPECT_FALSE(same("xmap<int8,int8>", "xmap<int16,int8>"));
}

TEST_F(TypesTest, WhatTypesCanDo) {
  // serialised, visited for objects, visited for prefs
  const std::pair<std::string, std::vector<std::string>> cases[] = {
      {"", {"void", "F", "n::I", "K", "const int32"}},
      {"s", {"int32", "E", "n::M", "n::T", "openvariant<V>"}},
      {"o", {"K*", "ptr<n::I>"}},
      {"op", {"xmap<int8,K>", "xmap<K,int8>", "O&"}},
      {"sop", {"pref<n::I>", "cref<K>", "O", "xvector<O>", "O x[2]", "xset<int8>", "movable<pref<n::I>>"}},
  };
  for (const auto& [can, texts] : cases) {
    for (const std::string& text : texts) {
      const TypeCode code = CodeOf(text);
      EXPECT_EQ(can, std::string(IsSerialisable(code, Root()) ? "s" : "") +
                         (NeedsVisitObjects(code, Root()) ? "o" : "") + (NeedsVisitPrefs(code, Root()) ? "p" : ""))
          << text;
    }
  }
  EXPECT_TRUE(HasMetadata(CodeOf("xmap<int8,const int8 : [1]>")));
  EXPECT_FALSE(HasMetadata(CodeOf("xmap<int8,K*>")));
  EXPECT_FALSE(HasMetadata(CodeOf("K")));
}

TEST_F(TypesTest, FieldTypes) {
  for (const auto& [place, text, message] : TextCasesOf("translator/field_types.txt")) {
    TypeContext context;
    context.isMutable = true;
    context.inModel = place == "in a model";
    context.serialisable = place == "serialised";
    EXPECT_EQ(message, TypeFault(CodeOf(text), Root(), context)) << place << ": " << text;
  }
}

// --- Byte code: the codes above with each name as an index into the string table of the record.

TEST_F(TypesTest, ByteCode) {
  StringTable strings;  // to which each type adds its own
  for (const auto& [name, text, expected] : TextCasesOf("translator/byte_code.txt")) {
    MemoryTextWriter out;
    WriteTypeByteCode(out, "A", strings, CodeOf(text));
    WriteStringTable(out, strings, "N");
    EXPECT_EQ(expected + "\n", out.TakeText()) << text;
  }
}

}  // namespace
}  // namespace qrex
