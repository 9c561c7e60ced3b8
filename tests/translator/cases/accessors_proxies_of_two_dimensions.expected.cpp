#include "t.h"

//### $interface+ I
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ReflectedInterface const& _GetReflected(I const*)
    {
        static vesk::ConstStringZ I_bases[] =
        {
            "vesk::IObject",
        };
        static const vesk::ReflectedInterface I_interface =
        {
            "I",
            0,
            I_bases,1,
            0,
            0,0,
            0,0,
            0
        };
        return I_interface;
    }
    
    // Registration of $interface+ I
    void _Register_I()
    {
        vxVerify(vesk::RegisterReflectedInterface(&_GetReflected( (I*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }

//### $model Inner
namespace vesk { XTarget* app_GetXTarget(); }
namespace vesk { RSN app_GetModelRsn(); }
    void Inner::EvictDgsNodes() const {vesk::DataSourceEvict(&y);}
    void Inner::VisitObjects(vesk::IObjectVisitor& _v) const {}
    void Inner::VisitPrefs(vesk::IPrefVisitor& _v) const {}
    void Inner::Serialise(vesk::Archive& _ar) const
    {
        _ar << this->y;
    }
    void Inner::Deserialise(vesk::InputArchive& _ar)
    {
        _ar >> this->y;
    }

//### $class K
namespace vesk { XTarget* app_GetXTarget(); }
namespace vesk { RSN app_GetModelRsn(); }
namespace vesk
{
    void app_WriteDataSourceRsn(Archive& ar);
    void app_ReadDataSourceRsn(InputArchive& ar);
}
    void K_model::EvictDgsNodes() const {vesk::DataSourceEvict(&x);}
    void K_model::VisitObjects(vesk::IObjectVisitor& _v) const {}
    void K_model::VisitPrefs(vesk::IPrefVisitor& _v) const {}
    void K_model::Serialise(vesk::Archive& _ar) const
    {
        _ar << this->x;
    }
    void K_model::Deserialise(vesk::InputArchive& _ar)
    {
        _ar >> this->x;
    }
    void K::Serialise(vesk::Archive& _ar) const
    {
        vesk::app_WriteDataSourceRsn(_ar);
        _model_.Serialise(_ar);
    }
    void K::Deserialise(vesk::InputArchive& _ar)
    {
        vesk::app_ReadDataSourceRsn(_ar);
        _model_.Deserialise(_ar);
    }
