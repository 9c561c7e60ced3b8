#include "t.h"

//### $model+ Record
namespace vesk { XTarget* app_GetXTarget(); }
namespace vesk { RSN app_GetModelRsn(); }
    vesk::ReflectedClass const& _GetReflected(Record const*) {
        static const vesk::octet_t Record_a[] = { 0x10 };
        static const vesk::octet_t Record_b[] = { 0x04 };
        static const vesk::octet_t Record_c[] = { 0x04 };
        static const vesk::octet_t Record_d[] = { 0x05 };
        static const vesk::octet_t Record_f[] = { 0x01 };
        static const vesk::octet_t Record_e[] = { 0x0c };
        static const vesk::ReflectedModelField Record_modelFields[] = { { "a", offsetof(Record,a), Record_a, 1, -1 }, { "b", -1, Record_b, 1, 3 }, { "c", offsetof(Record,c), Record_c, 3, -1 }, { "d", -1, Record_d, 3, 7 }, { "f", offsetof(Record,f), Record_f, 3, -1 }, { "e", offsetof(Record,e), Record_e, 7, -1 }, };
        static const vesk::ReflectedClass Record_class = {
            6,
            "Record",
            sizeof(Record),
            0,
            0,0,
            Record_modelFields,6,
            0,0,
            0,0,
            0,
            0,0,0,
            0,
            0,
            { sizeof(Record), VariableEqual, VariableLess, PrintVariable, ConstructArray, CopyConstructArray, AssignArray, DestructArray, SerialiseArray, DeserialiseArray, 0, 0, BinaryLowerBound, BinaryUpperBound }
        };
        
        return Record_class;
    }
    vesk::TypeOps const& _GetTypeOps(Record const*) {
        return vesk::GetReflectedClass<Record>().m_ops;
    }
    void Record::EvictDgsNodes() const {vesk::DataSourceEvict(&a);vesk::DataSourceEvict(&c);vesk::DataSourceEvict(&f);vesk::DataSourceEvict(&e);}
    void Record::VisitObjects(vesk::IObjectVisitor& _v) const {}
    void Record::VisitPrefs(vesk::IPrefVisitor& _v) const {}
    void Record::Serialise(vesk::Archive& _ar) const {
        _ar << this->a
           << this->c
           << this->f
           << this->e;
    }
    void Record::Deserialise(vesk::InputArchive& _ar) {
        vesk::RSN _rsn = vesk::app_GetModelRsn();
        struct EvolveCode {
            static void calc_d(vesk::int64& d,vesk::int32 const& b) { d = b * 1000; }
            static void calc_e(vesk::float32& e,vesk::int64 const& d,vesk::string8 const& a) { e = float(d);
                        Log(a); }
        };
        
        _ar >> this->a;
        
        vesk::int32 b;
        if (_rsn < 3) _ar >> b;
        
        if (_rsn <= 2) {  }
        else _ar >> this->c;
        
        vesk::int64 d;
        if (_rsn <= 2) { EvolveCode::calc_d(d,b); }
        else if (_rsn < 7) _ar >> d;
        
        if (_rsn <= 2) {  }
        else _ar >> this->f;
        
        if (_rsn <= 6) { EvolveCode::calc_e(e,d,a); }
        else _ar >> this->e;
    }
    
    // Registration of $model+ Record
    void _Register_Record() {
        vxVerify(vesk::RegisterReflectedClass(&_GetReflected( (Record*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }
