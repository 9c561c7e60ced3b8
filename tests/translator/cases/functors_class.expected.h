class F {
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

namespace vesk {
template<> struct TypeTraits<F> {
    static const bool is_exported = 1; static const bool is_reflected = 1; static const bool is_registered = 1; static const vesk::ETypeTraitKind kind = vesk::TTK_functor; static const bool has_metadata = 1;
};
} // namespace vesk
;
class G {
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

namespace vesk {
template<> struct TypeTraits<G> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_functor; static const bool has_metadata = 0;
};
} // namespace vesk
;
// A tab counts 4; a shallower line loses its blanks alone.
void use() {
    struct f_delegator {
    static bool __stdcall static_delegate(void* _self,vesk::int32 a,vesk::string8 const& b) {
        if (a)
            return 1;
        return 2;
    }
};

F f(NULL,f_delegator::static_delegate);
    f(1, "");
}
struct g_delegator {
    static void __stdcall static_delegate(void* _self) {
        go();
    }
};

G g(NULL,g_delegator::static_delegate);
struct bound_delegator : public Base<int, char> {
    bool member_delegate(vesk::int32 a,vesk::string8 const& b) {
        return a + m_n;
    }
    static bool __stdcall static_delegate(void* _self,vesk::int32 a,vesk::string8 const& b) {
        return static_cast<bound_delegator*>(_self)->member_delegate(a,b);
    }
};

F bound(find(x, y),bound_delegator::static_delegate);;
struct constant_delegator : public Base {
    void member_delegate() const {
        go();
    }
    static void __stdcall static_delegate(void* _self) {
        static_cast<constant_delegator*>(_self)->member_delegate();
    }
};

G constant(const_cast<Base*>(this),constant_delegator::static_delegate);
