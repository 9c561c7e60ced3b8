#include "t.h"

//### $variant+ V
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ReflectedVariant const& _GetReflected(V const*) {
        static const vesk::octet_t V_metadata[] = { 0xe1,0xa2,0x07,0x00,0x00,0x00 };
        static const vesk::octet_t V_tag_vesk_8__8_int32[] = { 0x04 };
        static const vesk::octet_t V_tag_x[] = { 0x10 };
        static const vesk::octet_t V_tag_none[] = { 0x00 };
        static const vesk::octet_t V_tag_ref[] = { 0x42,0x21,0x00,0x00 };
        // todo : byte code for anonymous struct
        // todo : byte code for anonymous struct
        static const vesk::ReflectedField V_fields[] = { { "vesk::int32", 4, V_tag_vesk_8__8_int32 }, { "x", 4, V_tag_x }, { "none", 4, V_tag_none }, { "ref", 4, V_tag_ref }, { "s", 4, NULL }, { "h", 4, NULL }, };
        static vesk::ConstStringZ V_stringTable[] = { "vesk::IObject", };
        static const vesk::ReflectedVariant V_variant = {
            "V",
            sizeof(V),
            V_metadata,
            V_fields,6,
            V_stringTable,
            { sizeof(V), 0, 0, PrintVariable, ConstructArray, CopyConstructArray, AssignArray, DestructArray, SerialiseArray, DeserialiseArray, VisitObjectsInArray, VisitPrefsInArray, 0, 0 }
        };
        return V_variant;
    }
    vesk::TypeOps const& _GetTypeOps(V const*) {
        return vesk::GetReflectedVariant<V>().m_ops;
    }
    
    // Registration of $variant+ V
    void _Register_V() {
        vxVerify(vesk::RegisterReflectedVariant(&_GetReflected( (V*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }
