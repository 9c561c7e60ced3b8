// Class statements: whole headers and tails, each variation of the head and the members, and all that may be wrong.

#include "text_cases.h"
#include "translator/translate_fixture.h"

namespace qrex {
namespace {

class ClassesTest : public TranslateTest {
 protected:
  // The text around a definition's name and body in a header, without the traits ahead of it.
  std::string ClassText(const std::string& text) {
    std::string header = TranslateHeader(text).header;
    const size_t traits = header.rfind("} // namespace vesk\n");
    return traits == std::string::npos ? header : header.substr(traits + 20);
  }
};

// What stands between `struct` and the body of definitions, and whole texts of declarations.
TEST_F(ClassesTest, Heads) {
  for (const auto& [form, text, expected] : TextCasesOf("translator/class_heads.txt")) {
    if (form == "head") {
      EXPECT_EQ(expected, ClassText(text).substr(0, expected.size())) << text;
    } else {
      EXPECT_EQ(expected + "\n", TranslateHeader(text).header) << text;
    }
  }
  EXPECT_EQ("struct A__BASE : public B, C {};\nstruct A;\n",
            Section(TranslateHeader("$struct A : public B, C mixin [ ] { };").header, "", "\nnamespace vesk"));
}

TEST_F(ClassesTest, ForwardAndDeferred) {
  // A definition behind a deferred declaration doesn't declare the record functions again.
  const std::string header = TranslateHeader("$struct+ A <<os>>; $struct+ A { };").header;
  EXPECT_EQ(header.find("_GetTypeOps(A const*);"), header.rfind("_GetTypeOps(A const*);"));
}

// The flags of the record, and its operations.
TEST_F(ClassesTest, RecordsOfQualifiers) {
  const std::string none = "0, 0, 0, 0, 0, 0 ";
  const std::string made = "ConstructArray, CopyConstructArray, AssignArray, DestructArray, ";
  const std::array<std::string, 3> cases[] = {
      {"$struct+ A { };", "0", "0, 0, 0, " + made + none},
      {"$class+ A <<passbyvalue returnbyvalue rod>> { };", "225", "0, 0, 0, " + made + none},
      {"$struct A <<reflect>> { };", "0", "0, 0, 0, " + made + none},
      {"$struct+ A <<-dc -copy>> { };", "0", "0, 0, 0, 0, 0, 0, DestructArray, " + none},
      {"$struct+ A <<abstract compare print ser copy dc>> { };", "0",
       "VariableEqual, VariableLess, 0, 0, 0, 0, 0, 0, 0, 0, 0, BinaryLowerBound, BinaryUpperBound "},
      {"$struct+ A <<os ser -copy>> { };", "0",
       "0, 0, PrintVariable, ConstructArray, 0, 0, DestructArray, SerialiseArray, DeserialiseArray, 0, 0, 0, 0 "},
      {"$struct+ A <<os -print>> { };", "0", "0, 0, 0, " + made + none},
      {"$adt A { void f(); }; $adt implement A <<reflect>> { void f() { } };", "16", "0, 0, 0, 0, 0, 0, 0, " + none},
      {"$struct+ A { $model { pref<vesk::IObject> p; } };", "4",
       "0, 0, 0, " + made + "SerialiseArray, DeserialiseArray, VisitObjectsInArray, VisitPrefsInArray, 0, 0 "},
  };
  for (const auto& [text, flags, operations] : cases) {
    const std::string record = Section(Folded(TranslateHeader(text).tail), "A_class =\n        {\n", "        };");
    EXPECT_EQ("            " + flags, record.substr(0, record.find(','))) << text;
    EXPECT_EQ(operations, Section(record, "{ sizeof(A), ", "}")) << text;
  }
}

}  // namespace
}  // namespace qrex
