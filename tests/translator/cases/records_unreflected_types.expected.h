#pragma once
#ifndef _app_src_t_h
#define _app_src_t_h

#include "Vesk/vxObject/IObject.h"
vesk::ReflectionByteCode _GetReflected(int const*);
vesk::TypeOps const& _GetTypeOps(int const*);
vesk::ReflectionByteCode _GetReflected(std::vector<int>* const*);
vesk::TypeOps const& _GetTypeOps(std::vector<int>* const*);

#endif // include guard
