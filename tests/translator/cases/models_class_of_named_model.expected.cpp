#include "t.h"

//### $class+ K
namespace vesk { XTarget* app_GetXTarget(); }
namespace vesk
{
    void app_WriteDataSourceRsn(Archive& ar);
    void app_ReadDataSourceRsn(InputArchive& ar);
}
    vesk::ReflectedClass const& _GetReflected(K const*)
    {
        static const vesk::ReflectedModelField K_modelFields[] =
        {
            { "M", offsetof(K,_model_), NULL, -1, -1 }
        };
        static const vesk::ReflectedClass K_class =
        {
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
            {
                sizeof(K),
                (vesk::CompareVariableFn) (bool (*)(K const*, K const*)) vesk::VariableEqual<K>,
                (vesk::CompareVariableFn) (bool (*)(K const*, K const*)) vesk::VariableLess<K>,
                (vesk::PrintVariableFn) (void (*)(vesk::xostream&, K const*)) vesk::PrintVariable<K>,
                (vesk::ConstructArrayFn) (void (*)( K*, vesk::ssize_t, vesk::ssize_t)) vesk::ConstructArray<K>,
                (vesk::CopyConstructArrayFn) (void (*)(K*, vesk::ssize_t, K const*, vesk::ssize_t, vesk::ssize_t)) vesk::CopyConstructArray<K>,
                (vesk::AssignArrayFn) (void (*)(K*, vesk::ssize_t, K const*, vesk::ssize_t, vesk::ssize_t)) vesk::AssignArray<K>,
                (vesk::DestructArrayFn) (void (*)( K*, vesk::ssize_t, vesk::ssize_t)) vesk::DestructArray<K>,
                (vesk::SerialiseArrayFn) (void (*)(vesk::Archive&, K const*, vesk::ssize_t, vesk::ssize_t)) vesk::SerialiseArray<K>,
                (vesk::DeserialiseArrayFn) (void (*)(vesk::InputArchive&, K*, vesk::ssize_t, vesk::ssize_t)) vesk::DeserialiseArray<K>,
                0,
                0,
                (vesk::FindInArrayFn) (vesk::ssize_t (*)(K const*, vesk::ssize_t, vesk::ssize_t, K const*)) vesk::BinaryLowerBound<K>,
                (vesk::FindInArrayFn) (vesk::ssize_t (*)(K const*, vesk::ssize_t, vesk::ssize_t, K const*)) vesk::BinaryUpperBound<K>
            }
        };
        
        return K_class;
    }
    vesk::TypeOps const& _GetTypeOps(K const*)
    {
        return vesk::GetReflectedClass<K>().m_ops;
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
    
    // Registration of $class+ K
    void _Register_K()
    {
        vxVerify(vesk::RegisterReflectedClass(&_GetReflected( (K*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
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
