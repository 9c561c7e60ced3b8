#include "t.h"

//### Registration of stub/scion of $interface I
struct StubI : vesk::Stub {
    StubI() : Stub(vesk::ptr<I>(this),1) {}
    static void Result_Get(vesk::Archive& _ar, void** _p) {
        _ar >> *(vesk::int32*) *_p++;
    }
    void Get(vesk::int32& n) {
        vesk::QueuedResponse<1>* qr__ = new vesk::QueuedResponse<1>;
        qr__->m_fn = &Result_Get;
        qr__->m_outparams[0] = &n;
        StubBegin(0,qr__);
        StubEnd();
    }
};
struct StubIFactory : public vesk::IStubFactory {
    StubIFactory() {
        vesk::RegisterStub(vesk::GetIpcInterfaceName<I>(),this);
    }
    ~StubIFactory() {
        vesk::UnregisterStub(vesk::GetIpcInterfaceName<I>());
    }
    virtual vesk::Stub* CreateStub() {
        return new StubI;
    }
};
void _Register_StubI() {
    static StubIFactory s;
}
struct ScionI : vesk::Scion {
    ScionI() : vesk::Scion(GetScionThunkFnTable(),1) {}
    I& Invoke() {
        return reinterpret_cast<I&>(m_delegate);
    }
    void Thunk0() {
        vesk::int32 n;
        Pop();
        Invoke().Get(n);
        Push() << n;
    }
    static void sThunk0(void* _self) { ((ScionI*)_self)->Thunk0(); }
    static const vesk::ScionThunkFn* GetScionThunkFnTable() {
        static const vesk::ScionThunkFn t[] = { &sThunk0, };
        return t;
    }
};
struct ScionIFactory : public vesk::IScionFactory {
    ScionIFactory() {
        vesk::RegisterScion(vesk::GetIpcInterfaceName<I>(),this);
    }
    ~ScionIFactory() {
        vesk::UnregisterScion(vesk::GetIpcInterfaceName<I>());
    }
    virtual vesk::Scion* CreateScion() {
        return new ScionI;
    }
};
void _Register_ScionI() {
    static ScionIFactory s;
}
