#pragma once
#ifndef _app_src_t_h
#define _app_src_t_h

#include "Vesk/vxObject/IObject.h"

vesk::ReflectedClass const& _GetReflected(A const*);
vesk::TypeOps const& _GetTypeOps(A const*);

inline void __stdcall f(A* _self) { _self->f(); }

#endif // include guard
