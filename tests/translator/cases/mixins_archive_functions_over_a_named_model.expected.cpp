#include "t.h"

//### $struct K
namespace vesk { XTarget* app_GetXTarget(); }
namespace vesk
{
    void app_WriteDataSourceRsn(Archive& ar);
    void app_ReadDataSourceRsn(InputArchive& ar);
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

//### $model R
namespace vesk { XTarget* app_GetXTarget(); }
namespace vesk { RSN app_GetModelRsn(); }
    void R::EvictDgsNodes() const {vesk::DataSourceEvict(&a);}
    void R::VisitObjects(vesk::IObjectVisitor& _v) const {}
    void R::VisitPrefs(vesk::IPrefVisitor& _v) const {}
    void R::Serialise(vesk::Archive& _ar) const
    {
        _ar << this->a;
    }
    void R::Deserialise(vesk::InputArchive& _ar)
    {
        _ar >> this->a;
    }
