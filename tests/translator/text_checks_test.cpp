// Declarations whose text can't compile, or loses something.
#include "translator/translate_fixture.h"

namespace qrex {
namespace {

class TextChecksTest : public TranslateTest {
 protected:
  // What is printed beside the W1002 of things that nobody registers.
  void AssertWarned(const std::string& text, const std::string& warning) {
    AssertMessages({{"$warning(disable: 1002 1007)\n" + text, warning}});
  }
};

TEST_F(TextChecksTest, OneWarningForEach) {
  settings.compilableText = true;
  const struct {
    std::string text;
    int line;  // 0: nothing is warned of
    std::string warning;
  } cases[] = {
      {"$interface I\n{\n    void F();\n    int32 F(int32 a);\n};", 2,
       "Methods of one name, F, in $interface I, share an entry of the function table: give each a name of its own"},
      {"$struct+ S\n{\n    $void F() {}\n    $void F(int32 a) {}\n};", 5,
       "$ methods of one name, F, in $struct+ S, share the tables of their record: give each a name of its own, or "
       "leave $ out"},
      {"$struct S\n{\n    $void F() {}\n    $int32 F(int32 a) { return a; }\n};", 0, ""},
      {"$struct+ S\n{\n    $void F() {}\n    $void F() const {}\n};", 0, ""},
      {"$class K\n{\n    $void F() {}\npublic:\n    $void G() {}\n    struct X { private: int a; };\n    $void H() "
       "{}\n};",
       4,
       "$ method F of $class K is called by a function outside of the class: write public: ahead of it, or leave $ "
       "out"},
      {"$class K isa vesk::IObject { $void F() {} };", 0, ""},
      {"$struct S { private: $int32 a; protected: $void F() {} };", 2,
       "$ method F of $struct S is called by a function outside of the class: write public: ahead of it, or leave $ "
       "out"},
      {"$adt A<typename T> { void F(); };", 2,
       "$adt A is a template with methods: write a $struct template, or an $adt of its own for each argument"},
      {"$adt A<typename T> { };\n$adt B { void F(); };", 0, ""},
      {"$interface B { void F(); };\n$interface rmi R : B { void G(); };", 3,
       "The stub of $interface R has no methods of $interface B: declare them in it, and leave the base out"},
      {"$interface B { void F(); void G(); };\n$interface I : B { int32 F(); void G() const; };", 3,
       "Method F of $interface I is there already, from $interface B: give it a name of its own, or leave it out"},
      {"$interface I { const int32 a[]; const int32 b[3]; xvector<int32> c; };", 2,
       "Attribute a of $interface I is a container of const elements, which none can hold: leave const out"},
      {"$struct S { $model { int32 a; } $dep int32 b = 5; };\n$struct M : model { int32 a; } { $dep int32 b = 5; };", 2,
       "$struct S has both nodes and a model in its body, and each of them is EvictDgsNodes: put the model into the "
       "head"},
      {"$interface B { };\n$interface rmi R : B { void G(); };\n$interface I : B { void G(); };", 0, ""},
      {"$enum E { a };\n$type E;", 3,
       "$enum E has a record of its own: leave $type out, and write + or <<reflect>> there"},
      {"$type std::vector<int>;\n$typedef+ xvector<int32> Numbers;\n$type Numbers;", 0, ""},
      {"$variant V { int32; };\n$model M { xmap<int32,V> v; };", 3,
       "Model field v of $model M begins with no value of $variant V: give that a default or a void item"},
      {"$variant V { int32; void free; };\n$model M { V v; };", 3,
       "Model field v of $model M begins with no value of $variant V: write default free(); in that"},
      {"$variant V { default void free; int32; };", 2,
       "The default of $variant V is an item, not a value: write default free(); and behind it the item void free;"},
      {"$variant V { default free(); void free; int32; };\n$model M { V v; };", 0, ""},
      {"$variant V { int32; };\n$variant W <<-ar>> { V; };", 0, ""},
      {"$variant V { int32; };\n$variant W { int32; { V v; } item; };", 3,
       "Item item of $variant W is read into no value of $variant V: give that a default or a void item"},
      {"$variant V { int32; };\n$interface rmi R { void F([in] const V& v); };", 3,
       "Argument v of F in $interface R is read into no value of $variant V: give that a default or a void item"},
      {"$variant V { void; int32; };\n$variant D { default 1; int32; };\n$model M { V v; D d; };", 0, ""},
      {"$struct S : model { int32 model; } { };", 2,
       "Model field model of $struct S has the name of the function that gives the model: give it another one"},
      {"$variant V { void none; int32; };\n$polymorphic void F([V v]);", 3,
       "Polymorphic argument v may be void, which no overload takes: give the item of $variant V a struct without "
       "fields, { } name"},
      {"$struct S\n{\n    $variant V <<reflect>> { void; int32; };\n};", 4,
       "$variant V stands in a class, which has no place for a record: declare it in the name space, or leave "
       "<<reflect>> out"},
      {"$struct S\n{\n    $functor <<reflect>> void F();\n};", 4,
       "$functor F stands in a class, which has no place for a record: declare it in the name space, or leave "
       "<<reflect>> out"},
      {"$struct S\n{\n    $variant V { void; *{ V v; } node; };\n};", 4,
       "Item node of $variant V has a value of it, and is complete before it: declare it in the name space"},
      {"$struct S\n{\n    $variant V { void; *{ xvector<V> v; } node; };\n    $functor void F();\n};", 0, ""},
      {"$model A { int32 a; };\n$model B { int32 b; };\n$struct S <<reflect>> : mixin [ A B ] { };", 4,
       "$struct S lists several models: write one that has the fields of all"},
      {"$model A { int32 a; };\n$class S isa vesk::IPersistable : mixin [ model { int32 b; $schema { 1: + b } } ] { "
       "};\n$mixin M : model A { };\n$class T isa vesk::IPersistable : mixin [ M ] { };",
       3,
       "$class S does not archive $model S_Mixin_0, which it lists: put the model into the head, or write Serialise "
       "and Deserialise\nt.h(5) : warning W1018 : $class T does not archive $mixin M, which it lists: put the model "
       "into the head, or write Serialise and Deserialise"},
      {"$model A { int32 a; };\n$class S isa vesk::IObject : mixin [ A ] { };", 0, ""},
      {"$mixin M\n{\n    $struct In : model { int32 a; } { };\n};", 4,
       "$struct In can't stand in $mixin M: write it ahead of that"},
      {"$struct S\n{\n    $struct In : model { int32 a; } { };\n};\n$mixin M { $struct In { $int32 a; }; };", 0, ""},
      {"$mixin M { $const int32 a; };\n$struct+ S : mixin [ M ] { S() : b(1) {} $const int32 b; };", 3,
       "Const field a of $mixin M gets no value: write a constructor, or leave $ out and give the value behind the "
       "name"},
      {"$struct+ S\n{\n    ~S() {}\n    $const int32 a[2];\n};", 2,
       "Const field a of $struct+ S gets no value: write a constructor, or leave $ out and give the value behind the "
       "name"},
      {"$struct+ S { $$() : a(1) {} $const int32 a; };\n$struct U { $const int32 a; };", 0, ""},
      {"$struct S<typename T = int> { $void F() {} };", 2,
       "Template parameters of $struct S can have no defaults and be no packs: leave these out, or write what needs "
       "them in a template without $"},
      {"$struct S<typename... T> { $int32 a; };", 0, ""},
      {"$mixin M\n{\n    $model { int32 a; }\n    $visit { }\n};", 2,
       "$mixin M has both $visit and a model in its body, and each of them is VisitObjects: put the model into the "
       "head"},
      {"$struct S\n{\n    $dep int32 d calc\n    {\n        $struct L { $int32 F() { return 1; } };\n        d = 1;\n  "
       "  };\n    $struct M { $int32 F() { return 1; } };\n};",
       6,
       "$struct L is local to a function, where neither templates nor functions can stand: write it outside of the "
       "block"},
  };
  for (const auto& [text, line, warning] : cases) {
    AssertWarned(text, line == 0 ? "" : "t.h(" + ToString(line) + ") : warning W1018 : " + warning + "\n");
  }
  settings.compilableText = false;
  for (const auto& row : cases) AssertWarned(row.text, "");
}

TEST_F(TextChecksTest, AModelThatHidesAnother) {
  settings.compilableText = true;
  const std::string models = "$mixin M : model { int32 a; } { };\n$model Own { int32 b; };\n";
  const std::string warning =
      "t.h(4) : warning W1019 : $struct S archives and prints the model of $mixin M in place of its own: write one "
      "model that has the fields of both\n";
  AssertWarned(models + "$struct S : model Own mixin [ M ] { };", warning);
  AssertWarned(models + "$struct S : model { int32 c; } mixin [ M ] { };", warning);
  std::string ladder = models + "$mixin L0 : mixin [ M ] { };";
  for (int step = 0; step < 60; ++step) {
    const std::string below = std::to_string(step);
    ladder += "$mixin L" + std::to_string(step + 1) + " : mixin [ L" + below + " L" + below + " ] { };";
  }
  AssertWarned(ladder + " $struct S : model Own mixin [ L60 ] { };", warning);
  AssertWarned(models + "$mixin L : mixin [ M ] { }; $struct S : model Own mixin [ L ] { };", warning);
  AssertWarned(models + "$struct S : mixin [ M ] { };", "");
  settings.compilableText = false;
  AssertWarned(models + "$struct S : model Own mixin [ M ] { };", "");
}

TEST_F(TextChecksTest, AReleaseBehindThatOfAModel) {
  const std::string model =
      "@import \"Vesk/vxObject/IObject.h\"\nnamespace n { $model M { int32 a; int32 b; $schema { 1: +a 4: +b } }; }\n";
  const auto warning = [&](const std::string& definition) {
    MakeWorld(TargetType::Application);
    AddFile("m.h", model);
    AddFile("t.cpp", "@import \"m.h\"\n" + definition);
    Translate("t.cpp");
    return Messages();
  };
  EXPECT_EQ("", warning("vxDefineTargetFunctions(app, 3)"));
  settings.compilableText = true;
  EXPECT_EQ(
      "t.cpp(2) : warning W1020 : The target of the project writes archives of release 3, but $model n::M has release "
      "4: nothing could read them, define the target with 4\n",
      warning("vxDefineTargetFunctions(app, 3)"));
  for (const char* definition :
       {"vxDefineTargetFunctions(app, 4)", "vxDefineTargetFunctions(other, 3)", "vxDefineTargetFunctions(app, RELEASE)",
        "int vxDefineTargetFunctions;", "$warning(disable: 1020) vxDefineTargetFunctions(app, 3)"}) {
    EXPECT_EQ("", warning(definition)) << definition;
  }
}

TEST_F(TextChecksTest, NumbersOfTheKey) {
  const std::string text = "$warning(disable: 1018 1019)\n$class K { $void F() {} };";
  EXPECT_EQ(ErrorOf("t.h", text), "t.h(1) : error : Invalid warning code : 1018");
  settings.compilableText = true;
  AssertWarned(text, "");
}

}  // namespace
}  // namespace qrex
