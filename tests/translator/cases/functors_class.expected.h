#pragma once
#ifndef _app_src_t_h
#define _app_src_t_h

#include "Vesk/vxObject/IObject.h"
class F
{
public:
    typedef bool (__stdcall *STUB_FN)(void* _self,vesk::int32 a,vesk::string8 const& b);
    F() : m_self(nullptr), m_stubFn(nullptr) {}
    F(void* _self, STUB_FN _stubFn) : m_self(_self), m_stubFn(_stubFn) {}
    F(F const& _rhs) : m_self(_rhs.m_self), m_stubFn(_rhs.m_stubFn) {}
    F& operator=(F const& _rhs) { m_self = _rhs.m_self; m_stubFn = _rhs.m_stubFn; return *this; }
    bool operator==(F const& _rhs) const { return m_self == _rhs.m_self && m_stubFn == _rhs.m_stubFn; }
    bool operator<(F const& _rhs) const { return m_self < _rhs.m_self || (m_self == _rhs.m_self && m_stubFn < _rhs.m_stubFn); }
    bool operator<=(F const& _rhs) const { return m_self < _rhs.m_self || (m_self == _rhs.m_self && m_stubFn <= _rhs.m_stubFn); }
    bool operator!=(F const& _rhs) const { return !operator==(_rhs); }
    bool operator>(F const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(F const& _rhs) const { return _rhs.operator<=(*this); }
    typedef void (F::*bool_type)() const;
    void bool_type_mem_fn() const {}
    operator bool_type() const { return m_stubFn ? &F::bool_type_mem_fn : 0; }
    F& operator=(vesk::NullInterface) { m_self = nullptr; m_stubFn = nullptr; return *this; }
    bool operator()(vesk::int32 a=1,vesk::string8 const& b) { return m_stubFn(m_self,a,b); }
    void write(vesk::xostream& os) const { os << "F(" << m_self << ',' << (void*)m_stubFn << ')'; }
private:
    void* m_self;
    STUB_FN m_stubFn;
};
inline vesk::xostream& operator<<(vesk::xostream& os, F f) { f.write(os); return os; }

namespace vesk
{
template<> struct TypeTraits<F>
{
    static const bool is_exported = 1;
    static const bool is_reflected = 1;
    static const bool is_registered = 1;
    static const vesk::ETypeTraitKind kind = vesk::TTK_functor;
    static const bool has_metadata = 1;
};
} // namespace vesk
;

#endif // include guard
