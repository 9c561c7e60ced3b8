#include "t.h"
namespace n
{
app_API vesk::string8 Find(vesk::int32 key,vesk::string8 const& more="") { return more; }
app_API void Stop();
app_API void Stop() { }
}

//### $function+ n::Find
namespace vesk { XTarget* app_GetXTarget(); }
namespace n
{
    void _Register_Find()
    {
        static const vesk::octet_t Find_metadata[] =
        {
            0xe1,0xa2,0x07,0x00,0x00,0x00
        };
        static const vesk::octet_t Find_return[] =
        {
            0x10
        };
        static const vesk::octet_t Find_arg_key[] =
        {
            0xe1,0xa4,0x00,0x00,0x04
        };
        static const vesk::octet_t Find_arg_more[] =
        {
            0x36,0x31,0x10
        };
        static const vesk::ReflectedArg Find_args[] =
        {
            { "key", Find_arg_key },
            { "more", Find_arg_more },
        };
        static vesk::ConstStringZ Find_stringTable[] =
        {
            "k",
        };
        static const vesk::ReflectedGlobalFunction Find_function =
        {
            "n::Find",
            {Find_return},
            Find_args,2,
            Find_metadata,
            Find_stringTable,
            (vesk::FunctionPointer)(vesk::string8 (*)(vesk::int32 key,vesk::string8 const& more))&n::Find
        };
        vxVerify(vesk::RegisterReflectedGlobalFunction(&Find_function,vesk::app_GetXTarget()) == vesk::NSE_OK);
    }
} // n

//### $function+ n::Stop
namespace vesk { XTarget* app_GetXTarget(); }
namespace n
{
    void _Register_Stop()
    {
        static const vesk::ReflectedGlobalFunction Stop_function =
        {
            "n::Stop",
            {0},
            0,0,
            0,
            0,
            (vesk::FunctionPointer)(void (*)())&n::Stop
        };
        vxVerify(vesk::RegisterReflectedGlobalFunction(&Stop_function,vesk::app_GetXTarget()) == vesk::NSE_OK);
    }
} // n
