// $functor: the class and the record; $makefunctor and $makeconstfunctor: instances in code.

#include "translator/translate_fixture.h"

namespace qrex {
namespace {

class FunctorsTest : public TranslateTest {
 protected:
  // What comes of `code` behind the declarations of a functor with a result and one without.
  std::string Instance(const std::string& code) {
    const std::string text = "$functor int32 F(int32 a, string8 const& b); $functor void G();\n//\n" + code;
    const std::string header = TranslateHeader(text).header;
    return header.substr(header.find("//\n") + 3);
  }
};

TEST_F(FunctorsTest, PlainInstances) {
  EXPECT_EQ(R"(void use()
{
    struct f_delegator
{
    static vesk::int32 __stdcall static_delegate(void* _self,vesk::int32 a,vesk::string8 const& b)
    {
        if (a)
            return 1;
        return 2;
    }
};

F f(NULL,f_delegator::static_delegate);
    f(1, "");
}
)",
            // A tab counts 4; a shallower line loses its blanks alone.
            Instance("void use()\n{\n    $makefunctor F f\n    {\n\t    if (a)\n\t\t    return 1;\n"
                     "  return 2;\n    }\n    f(1, \"\");\n}\n"));
  EXPECT_EQ(R"(struct g_delegator
{
    static void __stdcall static_delegate(void* _self)
    {
        go();
    }
};

G g(NULL,g_delegator::static_delegate);
)",
            Instance("$makeconstfunctor G g { go(); }\n"));
}

TEST_F(FunctorsTest, BoundInstances) {
  EXPECT_EQ(R"(struct f_delegator : public Base<int, char>
{
    vesk::int32 member_delegate(vesk::int32 a,vesk::string8 const& b)
    {
        return a + m_n;
    }
    static vesk::int32 __stdcall static_delegate(void* _self,vesk::int32 a,vesk::string8 const& b)
    {
        return static_cast<f_delegator*>(_self)->member_delegate(a,b);
    }
};

F f(find(x, y),f_delegator::static_delegate);;
)",
            Instance("$makefunctor F f(find(x, y), `Base<int, char>`) { return a + m_n; };\n"));
  EXPECT_EQ(R"(struct g_delegator : public Base
{
    void member_delegate() const
    {
        go();
    }
    static void __stdcall static_delegate(void* _self)
    {
        static_cast<g_delegator*>(_self)->member_delegate();
    }
};

G g(const_cast<Base*>(this),g_delegator::static_delegate);
)",
            Instance("$makeconstfunctor G g(this, Base)\n{\n\tgo();\n}\n"));
}

TEST_F(FunctorsTest, Errors) {
  const std::string functor = "$functor void F();\n";
  AssertErrors({
      {"$functor <<\ncopy>> void F();", 2, "Unrecognised qualifier << copy >> on $functor "},
      {"$functor void F()\nconst;", 2, "const specifier on global function prohibited"},
      {"$functor void F([int32 a]);", 1, "'[' unexpected.  Polymorphic argument not allowed here"},
      {"$functor+ void F(int a);", 1, "Can't accept platform dependent type: int"},
      {functor + functor, 2, "$functor F conflicts with previous declaration of $functor F"},
      {"$functor void F()\nint x;", 2, "; expected after definition of $functor F when read int"},
  });
}

}  // namespace
}  // namespace qrex
