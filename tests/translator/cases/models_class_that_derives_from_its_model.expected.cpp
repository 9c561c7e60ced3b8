#include "t.h"

//### $interface+ I
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ReflectedInterface const& _GetReflected(I const*) {
        static vesk::ConstStringZ I_bases[] = { "vesk::IObject", };
        static const vesk::ReflectedInterface I_interface = {
            "I",
            0,
            I_bases,1,
            0,
            0,0,
            0,0,
            0
        };
        return I_interface;
    }
    
    // Registration of $interface+ I
    void _Register_I() {
        vxVerify(vesk::RegisterReflectedInterface(&_GetReflected( (I*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }

//### $struct+ S
namespace vesk { XTarget* app_GetXTarget(); }
namespace vesk { RSN app_GetModelRsn(); }
namespace vesk {
    void app_WriteDataSourceRsn(Archive& ar);
    void app_ReadDataSourceRsn(InputArchive& ar);
}
    vesk::ptr<vesk::IObject> __stdcall S::sfnCreateInstance() {
        return static_cast<vesk::ptr<I> >(new S());
    }
    vesk::ReflectedClass const& _GetReflected(S const*) {
        static const vesk::octet_t S_p[] = { 0x42,0x21,0x00,0x00 };
        static const vesk::octet_t S_n[] = { 0x04 };
        static const vesk::ReflectedModelField S_modelFields[] = { { "p", offsetof(S,_model_.p), S_p, 0, -1 }, { "n", offsetof(S,_model_.n), S_n, 0, -1 }, };
        static vesk::ConstStringZ S_stringTable[] = { "I", };
        static vesk::ConstStringZ S_interfaces[] = { "vesk::IObject", "I", };
        static const vesk::ReflectedClass S_class = {
            4,
            "S",
            sizeof(S),
            0,
            0,0,
            S_modelFields,2,
            0,0,
            0,0,
            S_stringTable,
            S_interfaces,1,1,
            &vesk::IObject::Stubs<S>::GetTable(),
            &S::sfnCreateInstance,
            { sizeof(S), VariableEqual, VariableLess, PrintVariable, ConstructArray, CopyConstructArray, AssignArray, DestructArray, SerialiseArray, DeserialiseArray, VisitObjectsInArray, VisitPrefsInArray, BinaryLowerBound, BinaryUpperBound }
        };
        
        return S_class;
    }
    vesk::TypeOps const& _GetTypeOps(S const*) {
        return vesk::GetReflectedClass<S>().m_ops;
    }
    
    vesk::AnyInterface S::QueryInterface(const vesk::ReflectedInterface& _ri) {
        if (&_ri == &vesk::GetReflectedInterface<vesk::IObject >()) { vesk::ptr<vesk::IObject> p(this); return reinterpret_cast<vesk::AnyInterface&>(p); }
        if (&_ri == &vesk::GetReflectedInterface<I >()) { vesk::ptr<I> p(this); return reinterpret_cast<vesk::AnyInterface&>(p); }
        return vesk::AnyInterface();
    }
    vesk::ReflectedClass const* S::GetReflectedClass() const {
        return &_GetReflected( (S*) 0);
    }
    void S_model::VisitObjects(vesk::IObjectVisitor& _v) const {_v << p;}
    void S_model::VisitPrefs(vesk::IPrefVisitor& _v) const {_v << p;}
    void S_model::Serialise(vesk::Archive& _ar) const {
        _ar << this->p
           << this->n;
    }
    void S_model::Deserialise(vesk::InputArchive& _ar) {
        _ar >> this->p
           >> this->n;
    }
    void S::Serialise(vesk::Archive& _ar) const {
        vesk::app_WriteDataSourceRsn(_ar);
        _model_.Serialise(_ar);
    }
    void S::Deserialise(vesk::InputArchive& _ar) {
        vesk::app_ReadDataSourceRsn(_ar);
        _model_.Deserialise(_ar);
    }
    
    // Registration of $struct+ S
    void _Register_S() {
        vxVerify(vesk::RegisterReflectedClass(&_GetReflected( (S*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }
