#include "t.h"

//### $model M
namespace vesk { XTarget* app_GetXTarget(); }
    void M::EvictDgsNodes() const {vesk::DataSourceEvict(&flag);vesk::DataSourceEvict(&kind);vesk::DataSourceEvict(&n);vesk::DataSourceEvict(&v);}
    void M::VisitObjects(vesk::IObjectVisitor& _v) const {_v << flag << v;}
    void M::VisitPrefs(vesk::IPrefVisitor& _v) const {_v << v;}
