// $function, $var and $typedef: what they leave in place, their records, their faults.

#include "translator/translate_fixture.h"

namespace qrex {
namespace {

class GlobalsTest : public TranslateTest {};

// --- $function

TEST_F(GlobalsTest, FunctionsInPlace) {
  AssertHeader("$function int f(int a = 1, char const* b = g(2, 3));\n", "int f(int a=1,char const* b=g(2, 3));\n");
  AssertHeader("$function inline int32 f() : [ 1 ] { if (x) { y(); } return $x$ + '}'; } // rest\n",
               "inline vesk::int32 f() { if (x) { y(); } return $x$ + '}'; } // rest\n");
  AssertHeader(
      "$function inline C* f()\n{\n    $new C(1, $new D) ; return $new a::B<int>(2)->c;\n}\n",
      "inline C* f()\n{\n    vesk::DollarNew(new C(1, $new D) ); return vesk::DollarNew(new a::B<int>(2))->c;\n}\n");
}

// A function may be declared in any number of files; its definition is found behind all of them.
TEST_F(GlobalsTest, DeclarationsInSeveralFiles) {
  for (const char* header : {"a.h", "b.h"}) Translate(header, "$function void f();\n");
  EXPECT_EQ("#include \"a.h\"\n#include \"b.h\"\nvoid f();\nvoid f() { }\nvoid g(f* a) { }\n",
            Translate("t.cpp",
                      "@import \"a.h\"\n@import \"b.h\"\n$function void f();\n$function void f() { }\n"
                      "$function void g(f* a) { }\n"));
}

TEST_F(GlobalsTest, FunctionMessages) {
  AssertMessages({
      {"$function void f();\n$function int32 f(int32 a);",
       "t.h(2) : warning W1010 : $function f declarations have inconsistent signatures :\n"
       "    vesk::int32 f(vesk::int32 a)\n    void f()\n\nt.h(1) : see declaration of $function f\n"},
      {"$typedef int32 T; $function void f(T a); $function void f(int32 b);", ""},
      {"$function void f() : [ 1 ];",
       "t.h(1) : warning W1000 : Forward declaration of $function f contains metadata\n"},
      {"$function void f() { }",
       "t.h(1) : warning W1011 : $function f is defined in a header file and isn't inlined\n"},
      {"$function inline void f() : [ 1 ] { }",
       "t.h(1) : warning W1001 : Non-reflected $function f contains metadata\n"},
      {"$enum E { a };\n$function+ inline E f() { }",
       "t.h(2) : warning W1002 : Reflected $function+ f references non-registered $enum E\n"
       "t.h(1) : see declaration of $enum E\n"},
  });
  MakeWorld(TargetType::StaticLibrary);
  AssertMessages(
      {
          {"$function void f() { }",
           "t.cpp(1) : warning W1012 : $function f defined in library without prior declaration\n"},
          {"$function void f(); $function void f() { }", ""},
          {"$function inline void f() { }", ""},
          {"$function+ void f();",
           "t.cpp(1) : warning W1008 : $function+ f doesn't appear in public header of library\n"},
      },
      "t.cpp");
  MakeWorld(TargetType::StaticLibrary);
  Translate("api/p.h",
            "@import \"Vesk/vxObject/IObject.h\"\n$function void f();\n$var int32 v;\n$typedef int32 T;\n"
            "$enum E { a };\n$variant V { int32; };\n$functor void F();\n");
  EXPECT_EQ(R"(app/api/p.h(2) : warning W1009 : $function f not exported in public header of library
app/api/p.h(3) : warning W1009 : $var v not exported in public header of library
app/api/p.h(4) : warning W1009 : $typedef T not exported in public header of library
app/api/p.h(5) : warning W1009 : $enum E not exported in public header of library
app/api/p.h(6) : warning W1009 : $variant V not exported in public header of library
app/api/p.h(7) : warning W1009 : $functor F not exported in public header of library
)",
            Messages());
}

TEST_F(GlobalsTest, FunctionErrors) {
  AssertErrors({
      {"$enum f;\n$function void f();", 2, "$function f conflicts with previous declaration of $enum f"},
      {"$function inline void f() { }\n$function void f() { }", 2, "Repeated definition of $function f"},
      {"$function void f()\nint x;", 2, "Expected { after ) when read int"},
      {"\n$function void f() {\n{ }", 2, "Met EOF while scanning body of function f"},
  });
}

// --- $var

TEST_F(GlobalsTest, Variables) {
  AssertHeader("$var int x[3] = {1,2,3};\n", "int x[3] = {1,2,3};\n");
  AssertHeader("$var DynArray<int32> a; $var xvector<int32> b[2][] = f(); $var string8 const& c = d;\n",
               "vesk::DynArray<vesk::int32> a; vesk::xvector<vesk::int32> b[2][] = f(); vesk::string8 const& c = d;\n");
  EXPECT_EQ(TailText("$var+ p", R"(    void _Register_p()
    {
        static const vesk::octet_t p_type[] = { 0x50,0x03,0x00,0x00,0x00,0x42,0x21,0x00,0x00 };
        static vesk::ConstStringZ p_stringTable[] = { "vesk::IObject", };
        static const vesk::ReflectedGlobalVariable p_var =
        {
            "p",
            &p,
            p_type,
            p_stringTable
        };
        vxVerify(vesk::RegisterReflectedGlobalVariable(&p_var,vesk::app_GetXTarget()) == vesk::NSE_OK);
    }
)"),
            Folded(TranslateHeader("$var+ vesk::pref<vesk::IObject> p[3];\n").tail));
}

TEST_F(GlobalsTest, VariableErrors) {
  AssertErrors({
      {"$var <<\nextern>> int32 v;", 2, "Unrecognised qualifier << extern >> on $typedef"},
      {"$var <<register -reflect>>\n7;", 2, "Variable declaration expected when read 7"},
      {"$var const\n5 v;", 2, "Variable declaration expected when read 5"},
      {"$var int32;", 1, "Expected identifier after int32 when read ;"},
      {"$var int32 v;\n$var int32 v;", 2, "$var v conflicts with previous declaration of $var v"},
      {"$var\nint32 v =\n1", 2, "Missing semicolon after definition of variable v"},
      {"$var+ int v;", 1, "Can't accept platform dependent type: int"},
  });
  EXPECT_EQ("a.cpp(1) : error : @import of IObject.h required", ErrorOf("a.cpp", "$var int32 v;"));
  EXPECT_EQ("b.cpp(1) : error : @import of IObject.h required", ErrorOf("b.cpp", "$typedef int32 T;"));
}

// --- $typedef

TEST_F(GlobalsTest, Typedefs) {
  AssertHeader("namespace n { $typedef int32 T[2]; }\n", R"(namespace n { typedef vesk::int32 T[2];
inline vesk::ConstStringZ GetTypedefName_T()
{
    return "n::T";
}
 }
)");
  AssertGenerated("$typedef+ <<extern>> xmap<int32,string8> T;\n",
                  ";\ninline vesk::ConstStringZ GetTypedefName_T()\n{\n    return \"T\";\n}\n\n",
                  TailText("$typedef+ T", R"(    void _Register_T()
    {
        static const vesk::octet_t T_type[] = { 0x51,0x04,0x10 };
        static const vesk::ReflectedTypedef T_typedef =
        {
            "T",
            T_type,
            0
        };
        vxVerify(vesk::RegisterReflectedTypedef(&T_typedef,vesk::app_GetXTarget()) == vesk::NSE_OK);
    }
)"));
}

TEST_F(GlobalsTest, TypedefMessagesAndErrors) {
  AssertMessages(
      {{"$typedef int32 : [ 1 ] T;", "t.h(1) : warning W1001 : Non-reflected $typedef T contains metadata\n"}});
  AssertErrors({
      {"$typedef <<\ncopy>> int32 T;", 2, "Unrecognised qualifier << copy >> on $typedef"},
      {"$typedef\n7;", 2, "Type expected when read 7"},
      {"$struct T;\n$typedef int32 T;", 2, "$typedef T conflicts with previous declaration of $struct T"},
      {"$typedef\nint32 T\n", 2, "Missing semicolon after typedef T"},
  });
}

}  // namespace
}  // namespace qrex
