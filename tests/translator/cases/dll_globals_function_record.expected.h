#pragma once
#ifndef _app_src_t_h
#define _app_src_t_h

#include "Vesk/vxObject/IObject.h"

#endif // include guard
