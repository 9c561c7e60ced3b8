#include "t.h"

//### $class K
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

//### $model M
namespace vesk { XTarget* app_GetXTarget(); }
namespace vesk { RSN app_GetModelRsn(); }
    void M::EvictDgsNodes() const {vesk::DataSourceEvict(&s);}
    void M::VisitObjects(vesk::IObjectVisitor& _v) const {_v << s;}
    void M::VisitPrefs(vesk::IPrefVisitor& _v) const {_v << s;}
    void M::Serialise(vesk::Archive& _ar) const
    {
        _ar << this->s;
    }
    void M::Deserialise(vesk::InputArchive& _ar)
    {
        _ar >> this->s;
    }
