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
  EXPECT_EQ(Section(Folded(TranslateHeader(Declared("ipc")).tail), "} // n\n", "    ~ScionJFactory"), R"(
//### Registration of stub/scion of $interface+ n::J
namespace n
{
struct StubJ : vesk::Stub
{
    StubJ() : Stub(vesk::ptr<J>(this),3) {}
    void none() const
    {
        StubBegin(0,NULL);
        StubEnd();
    }
    static void Result_all(vesk::Archive& _ar, void** _p)
    {
        _ar >> *(vesk::string8*) *_p++;
        _ar >> *(vesk::xvector<vesk::int8>*) *_p++;
    }
    void all(vesk::int32 a,vesk::string8 const& b,vesk::string8& c,vesk::xvector<vesk::int8>& d,Pos* e)
    {
        vesk::QueuedResponse<2>* qr__ = new vesk::QueuedResponse<2>;
        qr__->m_fn = &Result_all;
        qr__->m_outparams[0] = &c;
        qr__->m_outparams[1] = &d;
        StubBegin(1,qr__) << a << b << d << *e;
        StubEnd();
    }
    static void Result_back(vesk::Archive& _ar, void** _p)
    {
        _ar >> *(vesk::int8*) *_p++;
    }
    void back(vesk::int8& r)
    {
        vesk::QueuedResponse<1>* qr__ = new vesk::QueuedResponse<1>;
        qr__->m_fn = &Result_back;
        qr__->m_outparams[0] = &r;
        StubBegin(2,qr__);
        StubEnd();
    }
};
struct StubJFactory : public vesk::IStubFactory
{
    StubJFactory()
    {
        vesk::RegisterStub(vesk::GetIpcInterfaceName<J>(),this);
    }
    ~StubJFactory()
    {
        vesk::UnregisterStub(vesk::GetIpcInterfaceName<J>());
    }
    virtual vesk::Stub* CreateStub()
    {
        return new StubJ;
    }
};
void _Register_StubJ()
{
    static StubJFactory s;
}
struct ScionJ : vesk::Scion
{
    ScionJ() : vesk::Scion(GetScionThunkFnTable(),3) {}
    J& Invoke()
    {
        return reinterpret_cast<J&>(m_delegate);
    }
    void Thunk0()
    {
        Pop();
        Invoke()->none();
    }
    void Thunk1()
    {
        vesk::int32 a;
        vesk::string8 b;
        vesk::string8 c;
        vesk::xvector<vesk::int8> d;
        std::auto_ptr<Pos> e(new Pos);
        auto _ar = Pop(); _ar >> a >> b >> d >> *e;
        Invoke()->all(a,b,c,d,e.release());
        Push() << c << d;
    }
    void Thunk2()
    {
        vesk::int8 r;
        auto _ar = Pop(); _ar;
        Invoke()->back(r);
        Push() << r;
    }
    static void sThunk0(void* _self) { ((ScionJ*)_self)->Thunk0(); }
    static void sThunk1(void* _self) { ((ScionJ*)_self)->Thunk1(); }
    static void sThunk2(void* _self) { ((ScionJ*)_self)->Thunk2(); }
    static const vesk::ScionThunkFn* GetScionThunkFnTable()
    {
        static const vesk::ScionThunkFn t[] = { &sThunk0, &sThunk1, &sThunk2, };
        return t;
    }
};
struct ScionJFactory : public vesk::IScionFactory
{
    ScionJFactory()
    {
        vesk::RegisterScion(vesk::GetIpcInterfaceName<J>(),this);
    }
)");
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
