#include "t.h"

//### $struct C
namespace vesk { XTarget* app_GetXTarget(); }
namespace vesk { RSN app_GetModelRsn(); }
namespace vesk {
    void app_WriteDataSourceRsn(Archive& ar);
    void app_ReadDataSourceRsn(InputArchive& ar);
}
    void C_model::EvictDgsNodes() const {vesk::DataSourceEvict(&a);}
    void C_model::VisitObjects(vesk::IObjectVisitor& _v) const {}
    void C_model::VisitPrefs(vesk::IPrefVisitor& _v) const {}
    void C_model::Serialise(vesk::Archive& _ar) const {
        _ar << this->a;
    }
    void C_model::Deserialise(vesk::InputArchive& _ar) {
        _ar >> this->a;
    }
    void C::Serialise(vesk::Archive& _ar) const {
        vesk::app_WriteDataSourceRsn(_ar);
        _model_.Serialise(_ar);
    }
    void C::Deserialise(vesk::InputArchive& _ar) {
        vesk::app_ReadDataSourceRsn(_ar);
        _model_.Deserialise(_ar);
    }
