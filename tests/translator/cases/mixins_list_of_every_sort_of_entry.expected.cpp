#include "t.h"

//### $class+ K
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ReflectedClass const& _GetReflected(K const*) {
        static const vesk::octet_t K_a[] = { 0x04 };
        static const vesk::ReflectedField K_fields[] = { { "a", offsetof(K,a), K_a }, };
        static const vesk::octet_t K_y[] = { 0x01 };
        static const vesk::octet_t K_z[] = { 0x02 };
        static const vesk::ReflectedModelField K_modelFields[] = { { "y", offsetof(K,_model_.y), K_y, 0, -1 }, { "z", offsetof(K,_model_.z), K_z, 0, -1 }, };
        static const vesk::ReflectedClass K_class = {
            1,
            "K",
            sizeof(K),
            0,
            K_fields,1,
            K_modelFields,2,
            0,0,
            0,0,
            0,
            0,0,0,
            0,
            0,
            { sizeof(K), 0, 0, 0, ConstructArray, CopyConstructArray, AssignArray, DestructArray, 0, 0, 0, 0, 0, 0 }
        };
        
        return K_class;
    }
    vesk::TypeOps const& _GetTypeOps(K const*) {
        return vesk::GetReflectedClass<K>().m_ops;
    }
    
    // Registration of $class+ K
    void _Register_K() {
        vxVerify(vesk::RegisterReflectedClass(&_GetReflected( (K*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }

//### $model Pos
namespace vesk { XTarget* app_GetXTarget(); }
namespace vesk { RSN app_GetModelRsn(); }
    void Pos::EvictDgsNodes() const {vesk::DataSourceEvict(&y);}
    void Pos::VisitObjects(vesk::IObjectVisitor& _v) const {}
    void Pos::VisitPrefs(vesk::IPrefVisitor& _v) const {}
    void Pos::Serialise(vesk::Archive& _ar) const {
        _ar << this->y;
    }
    void Pos::Deserialise(vesk::InputArchive& _ar) {
        _ar >> this->y;
    }
