struct I {
    struct FnTable {
        vesk::xmap<vesk::string8,vesk::string8 > (__stdcall *Getm)(void const* _self);
        vesk::xmap<vesk::int32,vesk::xset<vesk::int8> > (__stdcall *Gets)(void const* _self);
    };
    I(void* _self, const FnTable* table) : m_self(_self), m_table(table) {}
    
    void AssignFrom(I& _rhs) { m_self = _rhs.m_self; m_table = _rhs.m_table; }
    void AssignFrom(I const& _rhs) const { const_cast<I*>(this)->m_self = _rhs.m_self; const_cast<I*>(this)->m_table = _rhs.m_table; }
    
    template<typename T> struct Stubs {
        static vesk::xmap<vesk::string8,vesk::string8 > __stdcall Getm(void const* _self) { return ((const T*)_self)->Getm(); }
        static vesk::xmap<vesk::int32,vesk::xset<vesk::int8> > __stdcall Gets(void const* _self) { return ((const T*)_self)->Gets(); }
        static const FnTable& GetTable() {
            static const FnTable t = {
                &Getm,
                &Gets
            };
            return t;
        }
    };
    
    template<typename T> void CoerceFrom(T* _rhs) { m_self = _rhs; m_table = &Stubs<T>::GetTable(); }
    template<typename T> void CoerceFrom(const T* _rhs) const { const_cast<I*>(this)->m_self = const_cast<T*>(_rhs); const_cast<I*>(this)->m_table = &Stubs<T>::GetTable(); }
    
    vesk::xmap<vesk::string8,vesk::string8 > Getm() const { return m_table->Getm(m_self); }
    vesk::xmap<vesk::int32,vesk::xset<vesk::int8> > Gets() const { return m_table->Gets(m_self); }
    
    union {
        struct {
            operator vesk::xmap<vesk::string8,vesk::string8 > const() const { return CONST_ATTRIB_CAST(I,m)->Getm(); }
            struct mElement {
                mElement(I* _self, vesk::string8 _k) : _self(_self),_k0(_k) {}
                vesk::Path GetmElementPath() const { return _self->GetmElementPath(_k0); }
                vesk::string8 const& _model__mElement() const { return _self->_model__mElement(_k0); }
                vesk::string8& _model__mElement() { return _self->_model__mElement(_k0); }
                vesk::string8 const& GetmElement() const { return _self->GetmElement(_k0); }
                operator vesk::string8() const { return _self->GetmElement(_k0); }
                I* _self;
                vesk::string8 _k0;
            };
            mElement const operator[](vesk::string8 _k0) const {
                return mElement(const_cast<I*>(CONST_ATTRIB_CAST(I,m)),_k0);
            }
        } m;
        struct {
            operator vesk::xmap<vesk::int32,vesk::xset<vesk::int8> > const() const { return CONST_ATTRIB_CAST(I,s)->Gets(); }
            struct sElement {
                sElement(I* _self, vesk::int32 _k) : _self(_self),_k0(_k) {}
                operator vesk::xset<vesk::int8>() const { return _self->GetsElement(_k0); }
                I* _self;
                vesk::int32 _k0;
            };
            sElement const operator[](vesk::int32 _k0) const {
                return sElement(const_cast<I*>(CONST_ATTRIB_CAST(I,s)),_k0);
            }
        } s;
        void* m_self;
    };
    FnTable const* m_table;
};
template <typename BC>
struct IDelegatorMixin : public BC {
    vesk::xmap<vesk::string8,vesk::string8 > Getm() const { return BC::GetI().Getm(); }
    vesk::xmap<vesk::int32,vesk::xset<vesk::int8> > Gets() const { return BC::GetI().Gets(); }
};

namespace vesk {
template<> struct TypeTraits<I> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_interface; static const bool has_metadata = 0;
};
template<> struct InterfaceTypeTraits<I> {
    static const bool is_ipc = false; static const bool is_rmi = false;
};
} // namespace vesk

