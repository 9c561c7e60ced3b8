#include "t.h"

//### $class+ K
namespace vesk { XTarget* app_GetXTarget(); }
namespace vesk {
    void app_WriteDataSourceRsn(Archive& ar);
    void app_ReadDataSourceRsn(InputArchive& ar);
}
    vesk::ReflectedClass const& _GetReflected(K const*) {
        static const vesk::ReflectedModelField K_modelFields[] = { { "M", offsetof(K,_model_), NULL, -1, -1 } };
        static const vesk::ReflectedClass K_class = {
            9,
            "K",
            sizeof(K),
            0,
            0,0,
            K_modelFields,1,
            0,0,
            0,0,
            0,
            0,0,0,
            0,
            0,
            { sizeof(K), VariableEqual, VariableLess, PrintVariable, ConstructArray, CopyConstructArray, AssignArray, DestructArray, SerialiseArray, DeserialiseArray, 0, 0, BinaryLowerBound, BinaryUpperBound }
        };
        
        return K_class;
    }
    vesk::TypeOps const& _GetTypeOps(K const*) {
        return vesk::GetReflectedClass<K>().m_ops;
    }
    void K::Serialise(vesk::Archive& _ar) const {
        vesk::app_WriteDataSourceRsn(_ar);
        _model_.Serialise(_ar);
    }
    void K::Deserialise(vesk::InputArchive& _ar) {
        vesk::app_ReadDataSourceRsn(_ar);
        _model_.Deserialise(_ar);
    }
    
    // Registration of $class+ K
    void _Register_K() {
        vxVerify(vesk::RegisterReflectedClass(&_GetReflected( (K*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }

//### $model M
namespace vesk { XTarget* app_GetXTarget(); }
namespace vesk { RSN app_GetModelRsn(); }
    void M::EvictDgsNodes() const {vesk::DataSourceEvict(&s);}
    void M::VisitObjects(vesk::IObjectVisitor& _v) const {_v << s;}
    void M::VisitPrefs(vesk::IPrefVisitor& _v) const {_v << s;}
    void M::Serialise(vesk::Archive& _ar) const {
        _ar << this->s;
    }
    void M::Deserialise(vesk::InputArchive& _ar) {
        _ar >> this->s;
    }
