#include "t.h"

//### $interface+ n::J
namespace vesk { XTarget* app_GetXTarget(); }
namespace n {
    vesk::ReflectedInterface const& _GetReflected(J const*) {
        static const vesk::octet_t J_all_a[] = { 0x04 };
        static const vesk::octet_t J_all_b[] = { 0x36,0x31,0x10 };
        static const vesk::octet_t J_all_c[] = { 0x36,0x10 };
        static const vesk::octet_t J_all_d[] = { 0x36,0x44,0x02 };
        static const vesk::octet_t J_all_e[] = { 0x35,0x20,0x00,0x00 };
        static const vesk::ReflectedArg J_all_args[] = { { "a", J_all_a }, { "b", J_all_b }, { "c", J_all_c }, { "d", J_all_d }, { "e", J_all_e }, };
        static const vesk::octet_t J_back_r[] = { 0x36,0x02 };
        static const vesk::ReflectedArg J_back_args[] = { { "r", J_back_r }, };
        static vesk::ConstStringZ J_stringTable[] = { "Pos", };
        static const vesk::ReflectedInterfaceMethod J_methods[] = { {"none",{0},0,0,0}, {"all",{0},J_all_args,5,0}, {"back",{0},J_back_args,1,0}, };
        static const vesk::ReflectedInterface J_interface = {
            "n::J",
            0,
            0,0,
            0,
            J_methods,3,
            0,0,
            J_stringTable
        };
        return J_interface;
    }
    
    // Registration of $interface+ n::J
    void _Register_J() {
        vxVerify(vesk::RegisterReflectedInterface(&_GetReflected( (J*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }
} // n

//### Registration of stub/scion of $interface+ n::J
namespace n {
struct StubJ : vesk::Stub {
    StubJ() : Stub(vesk::ptr<J>(this),3) {}
    void none() const {
        StubBegin(0,NULL);
        StubEnd();
    }
    static void Result_all(vesk::InputArchive& _ar, void** _p) {
        _ar >> *(vesk::string8*) *_p++;
        _ar >> *(vesk::xvector<vesk::int8>*) *_p++;
    }
    void all(vesk::int32 a,vesk::string8 const& b,vesk::string8& c,vesk::xvector<vesk::int8>& d,Pos* e) {
        vesk::QueuedResponse<2>* qr__ = new vesk::QueuedResponse<2>;
        qr__->m_fn = &Result_all;
        qr__->m_outparams[0] = &c;
        qr__->m_outparams[1] = &d;
        StubBegin(1,qr__) << a << b << d << *e;
        StubEnd();
    }
    static void Result_back(vesk::InputArchive& _ar, void** _p) {
        _ar >> *(vesk::int8*) *_p++;
    }
    void back(vesk::int8& r) {
        vesk::QueuedResponse<1>* qr__ = new vesk::QueuedResponse<1>;
        qr__->m_fn = &Result_back;
        qr__->m_outparams[0] = &r;
        StubBegin(2,qr__);
        StubEnd();
    }
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
struct SkeletonJ : vesk::Skeleton {
    SkeletonJ() : vesk::Skeleton(GetSkeletonThunkFnTable(),3) {}
    vesk::ptr<J> Invoke() {
        return vesk::ptr<J>(m_delegate.m_self, m_delegate.m_table);
    }
    void Thunk0() {
        Pop();
        Invoke()->none();
    }
    void Thunk1() {
        vesk::int32 a;
        vesk::string8 b;
        vesk::string8 c;
        vesk::xvector<vesk::int8> d;
        std::auto_ptr<Pos> e(new Pos);
        auto _ar = Pop(); _ar >> a >> b >> d >> *e;
        Invoke()->all(a,b,c,d,e.release());
        Push() << c << d;
    }
    void Thunk2() {
        vesk::int8 r;
        auto _ar = Pop(); _ar;
        Invoke()->back(r);
        Push() << r;
    }
    static void sThunk0(void* _self) { ((SkeletonJ*)_self)->Thunk0(); }
    static void sThunk1(void* _self) { ((SkeletonJ*)_self)->Thunk1(); }
    static void sThunk2(void* _self) { ((SkeletonJ*)_self)->Thunk2(); }
    static const vesk::SkeletonThunkFn* GetSkeletonThunkFnTable() {
        static const vesk::SkeletonThunkFn t[] = { &sThunk0, &sThunk1, &sThunk2, };
        return t;
    }
};
struct SkeletonJFactory : public vesk::ISkeletonFactory {
    SkeletonJFactory() {
        vesk::RegisterSkeleton(vesk::GetIpcInterfaceName<J>(),this);
    }
    ~SkeletonJFactory() {
        vesk::UnregisterSkeleton(vesk::GetIpcInterfaceName<J>());
    }
    virtual vesk::Skeleton* CreateSkeleton() {
        return new SkeletonJ;
    }
};
void _Register_SkeletonJ() {
    static SkeletonJFactory s;
}
} // n
