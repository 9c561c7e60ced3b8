#include "t.h"

//### $struct S
namespace vesk { XTarget* app_GetXTarget(); }
namespace vesk { RSN app_GetModelRsn(); }
namespace vesk
{
    void app_WriteDataSourceRsn(Archive& ar);
    void app_ReadDataSourceRsn(InputArchive& ar);
}
    void S_model::EvictDgsNodes() const {vesk::DataSourceEvict(&grid);}
    void S_model::VisitObjects(vesk::IObjectVisitor& _v) const {}
    void S_model::VisitPrefs(vesk::IPrefVisitor& _v) const {}
    void S_model::Serialise(vesk::Archive& _ar) const
    {
        _ar << this->grid;
    }
    void S_model::Deserialise(vesk::InputArchive& _ar)
    {
        _ar >> this->grid;
    }
    void S::Serialise(vesk::Archive& _ar) const
    {
        vesk::app_WriteDataSourceRsn(_ar);
        _model_.Serialise(_ar);
    }
    void S::Deserialise(vesk::InputArchive& _ar)
    {
        vesk::app_ReadDataSourceRsn(_ar);
        _model_.Deserialise(_ar);
    }
