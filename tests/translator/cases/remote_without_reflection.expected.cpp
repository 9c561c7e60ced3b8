#include "t.h"

//### Registration of stub/scion of $interface J
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
struct SkeletonJ : vesk::Skeleton
{
    SkeletonJ() : vesk::Skeleton(GetSkeletonThunkFnTable(),0) {}
    vesk::ptr<J> Invoke()
    {
        return vesk::ptr<J>(m_delegate.m_self, m_delegate.m_table);
    }
    static const vesk::SkeletonThunkFn* GetSkeletonThunkFnTable()
    {
        static const vesk::SkeletonThunkFn t[] =
        {
        };
        return t;
    }
};
struct SkeletonJFactory : public vesk::ISkeletonFactory
{
    SkeletonJFactory()
    {
        vesk::RegisterSkeleton(vesk::GetIpcInterfaceName<J>(),this);
    }
    ~SkeletonJFactory()
    {
        vesk::UnregisterSkeleton(vesk::GetIpcInterfaceName<J>());
    }
    virtual vesk::Skeleton* CreateSkeleton()
    {
        return new SkeletonJ;
    }
};
void _Register_SkeletonJ()
{
    static SkeletonJFactory s;
}
