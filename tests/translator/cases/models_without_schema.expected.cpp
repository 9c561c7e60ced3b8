#include "t.h"

//### $model Point
namespace vesk { XTarget* app_GetXTarget(); }
namespace vesk { RSN app_GetModelRsn(); }
    void Point::EvictDgsNodes() const {vesk::DataSourceEvict(&name);}
    void Point::VisitObjects(vesk::IObjectVisitor& _v) const {}
    void Point::VisitPrefs(vesk::IPrefVisitor& _v) const {}
    void Point::Serialise(vesk::Archive& _ar) const
    {
        _ar << this->name;
    }
    void Point::Deserialise(vesk::InputArchive& _ar)
    {
        _ar >> this->name;
    }
