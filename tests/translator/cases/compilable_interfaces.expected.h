typedef vesk::Array<vesk::int32,3> Three;
inline vesk::ConstStringZ GetTypedefName_Three() {
    return "Three";
}

struct I {
    struct FnTable {
        void (__stdcall *Get)(void* _self,vesk::int32& n);
    };
    I(void* _self, const FnTable* table) : m_self(_self), m_table(table) {}
    
    void AssignFrom(I& _rhs) { m_self = _rhs.m_self; m_table = _rhs.m_table; }
    void AssignFrom(I const& _rhs) const { const_cast<I*>(this)->m_self = _rhs.m_self; const_cast<I*>(this)->m_table = _rhs.m_table; }
    
    template<typename T> struct Stubs {
        static void __stdcall Get(void* _self,vesk::int32& n) { ((T*)_self)->Get(n); }
        static const FnTable& GetTable() {
            static const FnTable t = {
                &Get
            };
            return t;
        }
    };
    
    template<typename T> void CoerceFrom(T* _rhs) { m_self = _rhs; m_table = &Stubs<T>::GetTable(); }
    template<typename T> void CoerceFrom(const T* _rhs) const { const_cast<I*>(this)->m_self = const_cast<T*>(_rhs); const_cast<I*>(this)->m_table = &Stubs<T>::GetTable(); }
    
    void Get(vesk::int32& n) { m_table->Get(m_self,n); }
    
    union {
        void* m_self;
    };
    FnTable const* m_table;
};
template <typename BC>
struct IDelegatorMixin : public BC {
    void Get(vesk::int32& n) { BC::GetI().Get(n); }
};

inline vesk::ConstStringZ _GetIpcInterfaceName(I const*) { return "I"; }

namespace vesk {
template<> struct TypeTraits<I> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_interface; static const bool has_metadata = 0;
};
template<> struct InterfaceTypeTraits<I> {
    static const bool is_ipc = true; static const bool is_rmi = false;
};
} // namespace vesk

struct J {
    struct FnTable {
        vesk::string8 (__stdcall *Gets)(void const* _self);
        void (__stdcall *Sets)(void* _self,vesk::string8 s);
        Three (__stdcall *Gett)(void const* _self);
        vesk::int32 (__stdcall *GetvSize)(void const* _self);
        void (__stdcall *DeleteFromv)(void* _self,vesk::int32 i1,vesk::int32 i2);
        void (__stdcall *RecordExtractFromv)(void* _self,vesk::int32 si1,vesk::int32 si2,vesk::xvector<vesk::int32>& dst,vesk::int32 di);
        void (__stdcall *InsertIntov)(void* _self,vesk::int32 di,vesk::xvector<vesk::int32>& src,vesk::int32 si1,vesk::int32 si2);
        vesk::int32 (__stdcall *GetvElement)(void const* _self,vesk::int32 _k0);
        void (__stdcall *SetvElement)(void* _self,vesk::int32 _k0,vesk::int32 e);
    };
    J(void* _self, const FnTable* table) : m_self(_self), m_table(table) {}
    
    void AssignFrom(J& _rhs) { m_self = _rhs.m_self; m_table = _rhs.m_table; }
    void AssignFrom(J const& _rhs) const { const_cast<J*>(this)->m_self = _rhs.m_self; const_cast<J*>(this)->m_table = _rhs.m_table; }
    
    template<typename T> struct Stubs {
        static vesk::string8 __stdcall Gets(void const* _self) { return ((const T*)_self)->Gets(); }
        static void __stdcall Sets(void* _self,vesk::string8 s) { ((T*)_self)->Sets(s); }
        static Three __stdcall Gett(void const* _self) { return ((const T*)_self)->Gett(); }
        static vesk::int32 __stdcall GetvSize(void const* _self) { return ((const T*)_self)->GetvSize(); }
        static void __stdcall DeleteFromv(void* _self,vesk::int32 i1,vesk::int32 i2) { ((T*)_self)->DeleteFromv(i1,i2); }
        static void __stdcall RecordExtractFromv(void* _self,vesk::int32 si1,vesk::int32 si2,vesk::xvector<vesk::int32>& dst,vesk::int32 di) { ((T*)_self)->RecordExtractFromv(si1,si2,dst,di); }
        static void __stdcall InsertIntov(void* _self,vesk::int32 di,vesk::xvector<vesk::int32>& src,vesk::int32 si1,vesk::int32 si2) { ((T*)_self)->InsertIntov(di,src,si1,si2); }
        static vesk::int32 __stdcall GetvElement(void const* _self,vesk::int32 _k0) { return ((const T*)_self)->GetvElement(_k0); }
        static void __stdcall SetvElement(void* _self,vesk::int32 _k0,vesk::int32 e) { ((T*)_self)->SetvElement(_k0,e); }
        static const FnTable& GetTable() {
            static const FnTable t = {
                &Gets,
                &Sets,
                &Gett,
                &GetvSize,
                &DeleteFromv,
                &RecordExtractFromv,
                &InsertIntov,
                &GetvElement,
                &SetvElement
            };
            return t;
        }
    };
    
    template<typename T> void CoerceFrom(T* _rhs) { m_self = _rhs; m_table = &Stubs<T>::GetTable(); }
    template<typename T> void CoerceFrom(const T* _rhs) const { const_cast<J*>(this)->m_self = const_cast<T*>(_rhs); const_cast<J*>(this)->m_table = &Stubs<T>::GetTable(); }
    
    vesk::string8 Gets() const { return m_table->Gets(m_self); }
    void Sets(vesk::string8 s) { m_table->Sets(m_self,s); }
    Three Gett() const { return m_table->Gett(m_self); }
    vesk::int32 GetvSize() const { return m_table->GetvSize(m_self); }
    void DeleteFromv(vesk::int32 i1,vesk::int32 i2) { m_table->DeleteFromv(m_self,i1,i2); }
    void RecordExtractFromv(vesk::int32 si1,vesk::int32 si2,vesk::xvector<vesk::int32>& dst,vesk::int32 di) { m_table->RecordExtractFromv(m_self,si1,si2,dst,di); }
    void InsertIntov(vesk::int32 di,vesk::xvector<vesk::int32>& src,vesk::int32 si1,vesk::int32 si2) { m_table->InsertIntov(m_self,di,src,si1,si2); }
    vesk::int32 GetvElement(vesk::int32 _k0) const { return m_table->GetvElement(m_self,_k0); }
    void SetvElement(vesk::int32 _k0,vesk::int32 e) { m_table->SetvElement(m_self,_k0,e); }
    
    union {
        struct {
            operator vesk::string8() const { return CONST_ATTRIB_CAST(J,s)->Gets(); }
            void operator=(vesk::string8 const& _v) { ATTRIB_CAST(J,s)->Sets(_v); }
        } s;
        struct {
            operator vesk::Array<vesk::int32,3>() const { return CONST_ATTRIB_CAST(J,t)->Gett(); }
        } t;
        void* m_self;
    };
    FnTable const* m_table;
};
template <typename BC>
struct JDelegatorMixin : public BC {
    vesk::string8 Gets() const { return BC::GetJ().Gets(); }
    void Sets(vesk::string8 s) { BC::GetJ().Sets(s); }
    Three Gett() const { return BC::GetJ().Gett(); }
    vesk::int32 GetvSize() const { return BC::GetJ().GetvSize(); }
    void DeleteFromv(vesk::int32 i1,vesk::int32 i2) { BC::GetJ().DeleteFromv(i1,i2); }
    void RecordExtractFromv(vesk::int32 si1,vesk::int32 si2,vesk::xvector<vesk::int32>& dst,vesk::int32 di) { BC::GetJ().RecordExtractFromv(si1,si2,dst,di); }
    void InsertIntov(vesk::int32 di,vesk::xvector<vesk::int32>& src,vesk::int32 si1,vesk::int32 si2) { BC::GetJ().InsertIntov(di,src,si1,si2); }
    vesk::int32 GetvElement(vesk::int32 _k0) const { return BC::GetJ().GetvElement(_k0); }
    void SetvElement(vesk::int32 _k0,vesk::int32 e) { BC::GetJ().SetvElement(_k0,e); }
};

namespace vesk {
template<> struct TypeTraits<J> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_interface; static const bool has_metadata = 0;
};
template<> struct InterfaceTypeTraits<J> {
    static const bool is_ipc = false; static const bool is_rmi = false;
};
} // namespace vesk

