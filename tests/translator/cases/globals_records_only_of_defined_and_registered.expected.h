#pragma once
#ifndef _app_src_t_h
#define _app_src_t_h

#include "Vesk/vxObject/IObject.h"
void f(); inline void g() { } vesk::int32 v; typedef vesk::int32 T;
inline vesk::ConstStringZ GetTypedefName_T()
{
    return "T";
}

#endif // include guard
