#include "t.h"

//### $model M
namespace vesk { XTarget* app_GetXTarget(); }
namespace vesk { RSN app_GetModelRsn(); }
    void M::EvictDgsNodes() const {vesk::DataSourceEvict(&a);}
    void M::VisitObjects(vesk::IObjectVisitor& _v) const {}
    void M::VisitPrefs(vesk::IPrefVisitor& _v) const {}
    void M::Serialise(vesk::Archive& _ar) const
    {
        _ar << this->a;
    }
    void M::Deserialise(vesk::InputArchive& _ar)
    {
        _ar >> this->a;
    }
