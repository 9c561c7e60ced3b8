#include "t.h"

//### Registration of stub/scion of $interface n::J
namespace  {
namespace n {
struct StubJ : vesk::Stub {
    StubJ() : Stub(vesk::ptr<J>(this),0) {}
};
struct StubJFactory : public vesk::IStubFactory {
    StubJFactory() {
        vesk::RegisterStub(vesk::GetIpcInterfaceName<J>(),this);
    }
    ~StubJFactory() {
        vesk::UnregisterStub(vesk::GetIpcInterfaceName<J>());
    }
    virtual vesk::Stub* CreateStub() {
        return new StubJ;
    }
};
void _Register_StubJ() {
    static StubJFactory s;
}
struct ScionJ : vesk::Scion {
    ScionJ() : vesk::Scion(GetScionThunkFnTable(),0) {}
    J& Invoke() {
        return reinterpret_cast<J&>(m_delegate);
    }
    static const vesk::ScionThunkFn* GetScionThunkFnTable() {
        static const vesk::ScionThunkFn t[] = { };
        return t;
    }
};
struct ScionJFactory : public vesk::IScionFactory {
    ScionJFactory() {
        vesk::RegisterScion(vesk::GetIpcInterfaceName<J>(),this);
    }
    ~ScionJFactory() {
        vesk::UnregisterScion(vesk::GetIpcInterfaceName<J>());
    }
    virtual vesk::Scion* CreateScion() {
        return new ScionJ;
    }
};
void _Register_ScionJ() {
    static ScionJFactory s;
}
} // n
} // 
