#pragma once
#ifndef _app_src_t_h
#define _app_src_t_h

#include "Vesk/vxObject/IObject.h"
class G
{
public:
    typedef void (__stdcall *STUB_FN)(void* _self);
    G() : m_self(nullptr), m_stubFn(nullptr) {}
    G(void* _self, STUB_FN _stubFn) : m_self(_self), m_stubFn(_stubFn) {}
    G(G const& _rhs) : m_self(_rhs.m_self), m_stubFn(_rhs.m_stubFn) {}
    G& operator=(G const& _rhs) { m_self = _rhs.m_self; m_stubFn = _rhs.m_stubFn; return *this; }
    bool operator==(G const& _rhs) const { return m_self == _rhs.m_self && m_stubFn == _rhs.m_stubFn; }
    bool operator<(G const& _rhs) const { return m_self < _rhs.m_self || (m_self == _rhs.m_self && m_stubFn < _rhs.m_stubFn); }
    bool operator<=(G const& _rhs) const { return m_self < _rhs.m_self || (m_self == _rhs.m_self && m_stubFn <= _rhs.m_stubFn); }
    bool operator!=(G const& _rhs) const { return !operator==(_rhs); }
    bool operator>(G const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(G const& _rhs) const { return _rhs.operator<=(*this); }
    typedef void (G::*bool_type)() const;
    void bool_type_mem_fn() const {}
    operator bool_type() const { return m_stubFn ? &G::bool_type_mem_fn : 0; }
    G& operator=(vesk::NullInterface) { m_self = nullptr; m_stubFn = nullptr; return *this; }
    void operator()() { m_stubFn(m_self); }
    void write(vesk::xostream& os) const { os << "G(" << m_self << ',' << (void*)m_stubFn << ')'; }
private:
    void* m_self;
    STUB_FN m_stubFn;
};
inline vesk::xostream& operator<<(vesk::xostream& os, G f) { f.write(os); return os; }

namespace vesk
{
template<> struct TypeTraits<G>
{
    static const bool is_exported = 0;
    static const bool is_reflected = 0;
    static const bool is_registered = 0;
    static const vesk::ETypeTraitKind kind = vesk::TTK_functor;
    static const bool has_metadata = 0;
};
} // namespace vesk
;

#endif // include guard
