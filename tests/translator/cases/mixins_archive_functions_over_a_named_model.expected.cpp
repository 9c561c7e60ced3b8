#include "t.h"

//### $model R
namespace vesk { XTarget* app_GetXTarget(); }
namespace vesk { RSN app_GetModelRsn(); }
    void R::EvictDgsNodes() const {}
    void R::VisitObjects(vesk::IObjectVisitor& _v) const {}
    void R::VisitPrefs(vesk::IPrefVisitor& _v) const {}
    void R::Serialise(vesk::Archive& _ar) const {
    }
    void R::Deserialise(vesk::InputArchive& _ar) {
    }
