#include "t.h"

//### $struct+ S
namespace vesk { XTarget* app_GetXTarget(); }
namespace vesk { RSN app_GetModelRsn(); }
    vesk::ReflectedClass const& _GetReflected(S const*) {
        static const vesk::octet_t S_n[] = { 0x04 };
        static const vesk::ReflectedField S_fields[] = { { "n", offsetof(S,n), S_n }, };
        static const vesk::octet_t S_m[] = { 0x51,0x04,0x47,0x01 };
        static const vesk::PtrMapOrSetFns S_m_mapOrSetfns[] =  { {&vesk::IXMap::Stubs<vesk::xmap<vesk::int32,vesk::xset<bool> > >::GetTable()}, {(const vesk::XMapFns*) &vesk::IXSet::Stubs<vesk::xset<bool> >::GetTable()}, };
        static const vesk::octet_t S_s[] = { 0x50,0x02,0x00,0x00,0x00,0x32,0x47,0x02 };
        static const vesk::PtrMapOrSetFns S_s_mapOrSetfns[] =  { {(const vesk::XMapFns*) &vesk::IXSet::Stubs<vesk::xset<vesk::int8> >::GetTable()}, };
        static const vesk::ReflectedModelField S_modelFields[] = { { "m", offsetof(S,m), S_m, 0, -1,S_m_mapOrSetfns }, { "s", offsetof(S,s), S_s, 0, -1,S_s_mapOrSetfns }, };
        static const vesk::ReflectedClass S_class = {
            4,
            "S",
            sizeof(S),
            0,
            S_fields,1,
            S_modelFields,2,
            0,0,
            0,0,
            0,
            0,0,0,
            0,
            0,
            { sizeof(S), 0, 0, 0, ConstructArray, CopyConstructArray, AssignArray, DestructArray, SerialiseArray, DeserialiseArray, VisitObjectsInArray, VisitPrefsInArray, 0, 0 }
        };
        
        return S_class;
    }
    vesk::TypeOps const& _GetTypeOps(S const*) {
        return vesk::GetReflectedClass<S>().m_ops;
    }
    void S::EvictDgsNodes() const {vesk::DataSourceEvict(&m);vesk::DataSourceEvict(&s);}
    void S::VisitObjects(vesk::IObjectVisitor& _v) const {_v << m << s;}
    void S::VisitPrefs(vesk::IPrefVisitor& _v) const {_v << m << s;}
    void S::Serialise(vesk::Archive& _ar) const {
        _ar << this->m
           << this->s;
    }
    void S::Deserialise(vesk::InputArchive& _ar) {
        _ar >> this->m
           >> this->s;
    }
    
    // Registration of $struct+ S
    void _Register_S() {
        vxVerify(vesk::RegisterReflectedClass(&_GetReflected( (S*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }
