#include "translate_fixture.h"

namespace qrex {
namespace {

class RemoteTest : public TranslateTest {
 protected:
  // An interface with a method of no parameters, one with all directions, one that only answers.
  std::string Declared(const std::string& kind) {
    return "$model Pos { bool y; };\nnamespace n\n{\n$interface+ " + kind + R"( J
{
    void none() const;
    void all([in] int32 a, [in] const string8& b, [out] string8& c, [inout] xvector<int8>& d, [copy] Pos* e);
    void back([out] int8& r);
};
}
)";
  }
};

TEST_F(RemoteTest, IpcIsAStubAndAScion) {
  EXPECT_EQ(Section(Folded(TranslateHeader(Declared("ipc")).tail), "} // n\n", "    ~ScionJFactory"),
            Golden("remote_ipc_is_a_stub_and_a_scion"));
  EXPECT_EQ(host->RegisterMap().entries.at("app/src/t.cpp"),
            (std::vector<std::string>{"n::J", "n::StubJ", "n::ScionJ"}));
}

TEST_F(RemoteTest, RmiIsAStubAndASkeleton) {
  std::string expected = TranslateHeader(Declared("ipc")).tail;
  ReplaceAllInPlace(expected, "Scion", "Skeleton");
  ReplaceAllInPlace(expected, "(vesk::Archive& _ar, void** _p)", "(vesk::InputArchive& _ar, void** _p)");
  ReplaceAllInPlace(expected, "J& Invoke()", "vesk::ptr<J> Invoke()");
  ReplaceAllInPlace(expected, "reinterpret_cast<J&>(m_delegate)",
                    "vesk::ptr<J>(m_delegate.m_self, m_delegate.m_table)");
  EXPECT_EQ(TranslateHeader(Declared("ipc rmi")).tail, expected);
  EXPECT_EQ(host->RegisterMap().entries.at("app/src/t.cpp"),
            (std::vector<std::string>{"n::J", "n::StubJ", "n::SkeletonJ"}));
}

// A remote interface needs its stubs also where it has no record.
TEST_F(RemoteTest, WithoutReflection) {
  const std::string declarations = "$interface rmi J { };\n";
  const std::string header = TranslateHeader(declarations).header;
  EXPECT_EQ(Section(header, "struct JDelegatorMixin : public BC\n", "\n\nnamespace"),
            "{\n};\n\ninline vesk::ConstStringZ _GetIpcInterfaceName(J const*) { return \"J\"; }");
  EXPECT_EQ(Section(header, "InterfaceTypeTraits<J>\n", "} // namespace vesk"),
            "{\n    static const bool is_ipc = true;\n    static const bool is_rmi = true;\n};\n");
  EXPECT_EQ(Section(TranslateHeader(declarations).tail, "", "    StubJ() : Stub(vesk::ptr<J>(this),0) {}\n"),
            "\n//### Registration of stub/scion of $interface J\nstruct StubJ : vesk::Stub\n{\n");
}

TEST_F(RemoteTest, InAnUnnamedNameSpace) {
  TranslateHeader("namespace { $interface ipc J { }; namespace n { $interface rmi K { }; } }\n");
  EXPECT_EQ(host->RegisterMap().entries.at("app/src/t.cpp"),
            (std::vector<std::string>{"StubJ", "ScionJ", "n::StubK", "n::SkeletonK"}));
}

TEST_F(RemoteTest, Faults) {
  const std::vector<ErrorCase> cases = {
      {"void f(int32 a);", 2, "[in] or [out] expected when read int32"},
      {"int32 f();", 2, "Return type vesk::int32 invalid - must be void"},
      {"int32 a;", 2, "Attributes currently not supported on IPC interfaces"},
  };
  AssertErrors(cases, "$interface ipc I {\n", " };");
}

}  // namespace
}  // namespace qrex
