// Class statements: whole headers and tails, each variation of the head and the members, and all that may be wrong.

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

// The heads of definitions: what stands between `struct` and the body.
TEST_F(ClassesTest, Heads) {
  const std::pair<std::string, std::string> cases[] = {
      {"$struct A { };", "struct A\n{"},
      {"$struct A final { };", "struct A final\n{"},
      {"$class A : public B, virtual_base::C<x> { };", "class A : public B, virtual_base::C<x>\n\n{"},
      {"$class A isa vesk::IObject { };",
       "class A : public vesk::IObjectBaseMixin<A,vesk::EmptyBase>\n{\npublic:\n"
       "    typedef vesk::IObjectBaseMixin<A,vesk::EmptyBase> BaseClass;\n"},
      {"$struct A isa vesk::IPersistable : B { };",
       "struct A : public vesk::PersistableMixin<vesk::IObjectBaseMixin<A,vesk::EmptyBase>>,B\n\n{\n    typedef "},
      {"$struct A<class T> isa vesk::IObject { };",
       "template <class T>\nstruct A : public vesk::IObjectBaseMixin<A<T>,vesk::EmptyBase>\n{\n    typedef "},
      {"$struct A : mixin [ ] { };", "struct A : public vesk::BaseMixin<A,vesk::EmptyBase>\n{\n    typedef "},
      {"$struct A : B mixin [ ? M] C, D : [ 7 ] { };",
       "struct A : public M<vesk::BaseMixin<A,A__BASE> >\n,C, D\n{\n    typedef "},
      {"$struct A : [ 1 ] { };", "struct A\n{"},
      {"$mixin M { };", "template <typename BC>\nstruct M : public BC\n{\n    typedef BC BaseClass;\n"},
      {"$mixin M<int N, class T> : B { };",
       "template <typename BC,int N, class T>\nstruct M : public BC,B\n\n{\n    typedef BC BaseClass;\n"},
      {"$mixin M : B mixin [ ? X ] { };",
       "template <typename BC>\nstruct M__BASE : BC,B {};\ntemplate <typename BC>\nstruct M : public X <M__BASE<BC> >"
       "\n\n{\n    typedef X <M__BASE<BC> > BaseClass;\n "},
  };
  for (const auto& [text, head] : cases) EXPECT_EQ(head, ClassText(text).substr(0, head.size())) << text;
  EXPECT_EQ("struct A__BASE : public B, C {};\nstruct A;\n",
            Section(TranslateHeader("$struct A : public B, C mixin [ ] { };").header, "", "\nnamespace vesk"));
}

TEST_F(ClassesTest, ForwardAndDeferred) {
  const std::pair<std::string, std::string> cases[] = {
      {"$class A; $class A;", "class A;\n class A;\n"},
      {"$model A; $adt B;", "struct A;\n struct B;\n"},
      {"$mixin M; $mixin M2<int N>;", "template <typename BC> struct M;\n template <typename BC,int N> struct M2;\n"},
      {"$struct A<class T>;", "template <class T> struct A;\n"},
      {"$struct A <<os>>;",
       "struct A;\n\ninline vesk::xostream& operator<<(vesk::xostream& _os,A const& _x) "
       "{ ((A&)_x).Write(_os); return _os; }\n"},
      {"$struct+ A <<extern>>;",
       "vesk::ReflectedClass const& _GetReflected(A const*);\nvesk::TypeOps const& _GetTypeOps(A const*);\n"},
  };
  for (const auto& [text, header] : cases) EXPECT_EQ(header, TranslateHeader(text).header) << text;
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
