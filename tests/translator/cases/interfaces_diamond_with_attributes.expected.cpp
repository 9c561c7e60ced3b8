#include "t.h"

//### $interface+ A
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ReflectedInterface const& _GetReflected(A const*) {
        static const vesk::octet_t A_a_i[] = { 0x04 };
        static const vesk::ReflectedArg A_a_args[] = { { "i", A_a_i }, };
        static const vesk::ReflectedInterfaceMethod A_methods[] = { {"a",{0},A_a_args,1,0}, };
        static const vesk::ReflectedInterface A_interface = {
            "A",
            0,
            0,0,
            0,
            A_methods,1,
            0,0,
            0
        };
        return A_interface;
    }
    
    // Registration of $interface+ A
    void _Register_A() {
        vxVerify(vesk::RegisterReflectedInterface(&_GetReflected( (A*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }

//### $interface+ D
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ReflectedInterface const& _GetReflected(D const*) {
        static const vesk::octet_t D_metadata[] = { 0xe1,0xa4,0x00,0x00 };
        static vesk::ConstStringZ D_bases[] = { "K", "L", };
        static const vesk::octet_t D_d_metadata[] = { 0xe1,0xa4,0x01,0x00 };
        static const vesk::octet_t D_d_s[] = { 0x36,0x31,0x10 };
        static const vesk::octet_t D_d_n[] = { 0x04 };
        static const vesk::ReflectedArg D_d_args[] = { { "s", D_d_s }, { "n", D_d_n }, };
        static const vesk::octet_t D_Getv_return[] = { 0x04 };
        static const vesk::octet_t D_Setv_v[] = { 0x04 };
        static const vesk::ReflectedArg D_Setv_args[] = { { "v", D_Setv_v }, };
        static const vesk::octet_t D_Getw_return[] = { 0x01 };
        static const vesk::octet_t D_v[] = { 0x04 };
        static const vesk::octet_t D_w[] = { 0x31,0x01 };
        static const vesk::ReflectedAttribute D_attributes[] = { { "v",D_v }, { "w",D_w }, };
        static vesk::ConstStringZ D_stringTable[] = { "doc", "m", };
        static const vesk::ReflectedInterfaceMethod D_methods[] = { {"d",{0},D_d_args,2,D_d_metadata}, {"Getv",{D_Getv_return},0,0,0}, {"Setv",{0},D_Setv_args,1,0}, {"Getw",{D_Getw_return},0,0,0}, };
        static const vesk::ReflectedInterface D_interface = {
            "D",
            D_metadata,
            D_bases,2,
            3,
            D_methods,4,
            D_attributes,2,
            D_stringTable
        };
        return D_interface;
    }
    
    // Registration of $interface+ D
    void _Register_D() {
        vxVerify(vesk::RegisterReflectedInterface(&_GetReflected( (D*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }

//### $interface+ K
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ReflectedInterface const& _GetReflected(K const*) {
        static vesk::ConstStringZ K_bases[] = { "A", };
        static const vesk::octet_t K_k_return[] = { 0x04 };
        static const vesk::ReflectedInterfaceMethod K_methods[] = { {"k",{K_k_return},0,0,0}, };
        static const vesk::ReflectedInterface K_interface = {
            "K",
            0,
            K_bases,1,
            1,
            K_methods,1,
            0,0,
            0
        };
        return K_interface;
    }
    
    // Registration of $interface+ K
    void _Register_K() {
        vxVerify(vesk::RegisterReflectedInterface(&_GetReflected( (K*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }

//### $interface+ L
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ReflectedInterface const& _GetReflected(L const*) {
        static vesk::ConstStringZ L_bases[] = { "A", };
        static const vesk::ReflectedInterface L_interface = {
            "L",
            0,
            L_bases,1,
            1,
            0,0,
            0,0,
            0
        };
        return L_interface;
    }
    
    // Registration of $interface+ L
    void _Register_L() {
        vxVerify(vesk::RegisterReflectedInterface(&_GetReflected( (L*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }
