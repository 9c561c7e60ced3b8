#include "t.h"

//### Registration of stub/scion of $interface J
namespace 
{
struct StubJ : vesk::Stub
{
    StubJ() : Stub(vesk::ptr<J>(this),0) {}
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
    ScionJ() : vesk::Scion(GetScionThunkFnTable(),0) {}
    J& Invoke()
    {
        return reinterpret_cast<J&>(m_delegate);
    }
    static const vesk::ScionThunkFn* GetScionThunkFnTable()
    {
        static const vesk::ScionThunkFn t[] =
        {
        };
        return t;
    }
};
struct ScionJFactory : public vesk::IScionFactory
{
    ScionJFactory()
    {
        vesk::RegisterScion(vesk::GetIpcInterfaceName<J>(),this);
    }
    ~ScionJFactory()
    {
        vesk::UnregisterScion(vesk::GetIpcInterfaceName<J>());
    }
    virtual vesk::Scion* CreateScion()
    {
        return new ScionJ;
    }
};
void _Register_ScionJ()
{
    static ScionJFactory s;
}
} // 

//### Registration of stub/scion of $interface n::K
namespace 
{
namespace n
{
struct StubK : vesk::Stub
{
    StubK() : Stub(vesk::ptr<K>(this),0) {}
};
struct StubKFactory : public vesk::IStubFactory
{
    StubKFactory()
    {
        vesk::RegisterStub(vesk::GetIpcInterfaceName<K>(),this);
    }
    ~StubKFactory()
    {
        vesk::UnregisterStub(vesk::GetIpcInterfaceName<K>());
    }
    virtual vesk::Stub* CreateStub()
    {
        return new StubK;
    }
};
void _Register_StubK()
{
    static StubKFactory s;
}
struct SkeletonK : vesk::Skeleton
{
    SkeletonK() : vesk::Skeleton(GetSkeletonThunkFnTable(),0) {}
    vesk::ptr<K> Invoke()
    {
        return vesk::ptr<K>(m_delegate.m_self, m_delegate.m_table);
    }
    static const vesk::SkeletonThunkFn* GetSkeletonThunkFnTable()
    {
        static const vesk::SkeletonThunkFn t[] =
        {
        };
        return t;
    }
};
struct SkeletonKFactory : public vesk::ISkeletonFactory
{
    SkeletonKFactory()
    {
        vesk::RegisterSkeleton(vesk::GetIpcInterfaceName<K>(),this);
    }
    ~SkeletonKFactory()
    {
        vesk::UnregisterSkeleton(vesk::GetIpcInterfaceName<K>());
    }
    virtual vesk::Skeleton* CreateSkeleton()
    {
        return new SkeletonK;
    }
};
void _Register_SkeletonK()
{
    static SkeletonKFactory s;
}
} // n
} // 
