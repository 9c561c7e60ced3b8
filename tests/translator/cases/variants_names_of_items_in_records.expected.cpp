#include "t.h"

//### $variant+ V
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ReflectedVariant const& _GetReflected(V const*) {
        static const vesk::octet_t V_tag_vesk_8__8_xmap_6_vesk_8__8_int32_vesk_8__8_string8_9_[] = { 0x51,0x04,0x10 };
        static const vesk::octet_t V_tag_vesk_8__8_int32const_ptr_[] = { 0x35,0x31,0x04 };
        static const vesk::octet_t V_tag_vesk_8__8_ptr_6_vesk_8__8_ptr_6_vesk_8__8_IObject_9__9__ref_[] = { 0x36,0x40,0x40,0x21,0x00,0x00 };
        static const vesk::ReflectedField V_fields[] = { { "vesk::xmap<vesk::int32,vesk::string8 >", 4, V_tag_vesk_8__8_xmap_6_vesk_8__8_int32_vesk_8__8_string8_9_ }, { "vesk::int32 const*", 4, V_tag_vesk_8__8_int32const_ptr_ }, { "vesk::ptr<vesk::ptr<vesk::IObject> >&", 4, V_tag_vesk_8__8_ptr_6_vesk_8__8_ptr_6_vesk_8__8_IObject_9__9__ref_ }, };
        static vesk::ConstStringZ V_stringTable[] = { "vesk::IObject", };
        static const vesk::ReflectedVariant V_variant = {
            "V",
            sizeof(V),
            0,
            V_fields,3,
            V_stringTable,
            { sizeof(V), VariableEqual, VariableLess, PrintVariable, 0, CopyConstructArray, AssignArray, DestructArray, 0, 0, VisitObjectsInArray, VisitPrefsInArray, BinaryLowerBound, BinaryUpperBound }
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
