namespace vesk {
    RSN app_GetModelRsn();
    void app_WriteDataSourceRsn(Archive& ar);
    void app_ReadDataSourceRsn(InputArchive& ar);
}
template <typename T> struct S;
template <typename T> struct S_model {
    
    S_model() {}
    explicit S_model(vesk::Array<vesk::Array<vesk::int32,2>,2> const& grid_) : grid(grid_) {}
    template<typename Archive> void Serialise(Archive& _ar) const {
        _ar << this->grid;
    }
    template<typename Archive> void Deserialise(Archive& _ar) {
        _ar >> this->grid;
    }
    void EvictDgsNodes() const {vesk::DataSourceEvict(&grid);}
    void VisitObjects(vesk::IObjectVisitor& _v) const {}
    void VisitPrefs(vesk::IPrefVisitor& _v) const {}
    bool operator<(S_model const& _rhs) const {
        return (grid < _rhs.grid);
    }
    bool operator==(S_model const& _rhs) const {
        return grid == _rhs.grid;
    }
    bool operator!=(S_model const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(S_model const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(S_model const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(S_model const& _rhs) const { return !operator<(_rhs); }
    
    static void GetgridPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetgridPath() { vesk::Path _path; GetgridPath(_path); return _path; }
    vesk::Array<vesk::Array<vesk::int32,2>,2> const& _model__grid() const { return grid; }
    vesk::Array<vesk::Array<vesk::int32,2>,2>& _model__grid() { return grid; }
    vesk::Array<vesk::Array<vesk::int32,2>,2> const& Getgrid() const { return grid; }
    vesk::Array<vesk::Array<vesk::int32,2>,2>& Writegrid() {  return grid; }
    
    static void GetgridElementPath(vesk::Path& _path,vesk::ssize_t _k0) { vxAssert(0 <= _k0 && _k0 < 2); vesk::octet_t* p=_path.InitLocalBuffer(2); p[0]=0; p[1]=(vesk::octet_t)_k0; }
    static vesk::Path GetgridElementPath(vesk::ssize_t _k0) { vesk::Path _path; GetgridElementPath(_path,_k0); return _path; }
    vesk::Array<vesk::int32,2> const& _model__gridElement(vesk::ssize_t _k0) const { return grid[_k0]; }
    vesk::Array<vesk::int32,2>& _model__gridElement(vesk::ssize_t _k0) { return grid[_k0]; }
    vesk::Array<vesk::int32,2> const& GetgridElement(vesk::ssize_t _k0) const { return grid[_k0]; }
    vesk::Array<vesk::int32,2>& WritegridElement(vesk::ssize_t _k0) {  return grid[_k0]; }
    
    static void GetgridElementElementPath(vesk::Path& _path,vesk::ssize_t _k0,vesk::ssize_t _k1) { vxAssert(0 <= _k0 && _k0 < 2); vxAssert(0 <= _k1 && _k1 < 2); vesk::octet_t* p=_path.InitLocalBuffer(3); p[0]=0; p[1]=(vesk::octet_t)_k0; p[2]=(vesk::octet_t)_k1; }
    static vesk::Path GetgridElementElementPath(vesk::ssize_t _k0,vesk::ssize_t _k1) { vesk::Path _path; GetgridElementElementPath(_path,_k0,_k1); return _path; }
    vesk::int32 const& _model__gridElementElement(vesk::ssize_t _k0,vesk::ssize_t _k1) const { return grid[_k0][_k1]; }
    vesk::int32& _model__gridElementElement(vesk::ssize_t _k0,vesk::ssize_t _k1) { return grid[_k0][_k1]; }
    vesk::int32 const& GetgridElementElement(vesk::ssize_t _k0,vesk::ssize_t _k1) const { return grid[_k0][_k1]; }
    vesk::int32& WritegridElementElement(vesk::ssize_t _k0,vesk::ssize_t _k1) {  return grid[_k0][_k1]; }
    void SetgridElementElement(vesk::ssize_t _k0,vesk::ssize_t _k1,vesk::int32 const& _v) { grid[_k0][_k1] = _v; }
    
    vesk::Array<vesk::Array<vesk::int32,2>,2> grid;
};
template <typename BC,typename T>
struct S_model_mixin : public BC {
    using typename BC::FinalClass;
    
    bool operator<(S_model_mixin const& _rhs) const {return _model_ < _rhs._model_;}
    bool operator==(S_model_mixin const& _rhs) const {return _model_ == _rhs._model_;}
    bool operator!=(S_model_mixin const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(S_model_mixin const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(S_model_mixin const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(S_model_mixin const& _rhs) const { return !operator<(_rhs); }
    void EvictDgsNodes() const {BC::EvictDgsNodes();_model_.EvictDgsNodes();}
    void VisitObjects(vesk::IObjectVisitor& _v) const {BC::VisitObjects(_v); _model_.VisitObjects(_v);}
    void VisitPrefs(vesk::IPrefVisitor& _v) const {BC::VisitPrefs(_v); _model_.VisitPrefs(_v);}
    
    static void GetgridPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetgridPath() { vesk::Path _path; GetgridPath(_path); return _path; }
    vesk::Array<vesk::Array<vesk::int32,2>,2> const& _model__grid() const { return _model_.grid; }
    vesk::Array<vesk::Array<vesk::int32,2>,2>& _model__grid() { return _model_.grid; }
    vesk::Array<vesk::Array<vesk::int32,2>,2> const& Getgrid() const { vesk::DataSourceReadBarrier(&_model_.grid,vesk::null,"S::_model_.grid"); return _model_.grid; }
    vesk::Array<vesk::Array<vesk::int32,2>,2>& Writegrid() { vesk::DataSourceWriteBarrier(&_model_.grid,vesk::null,"S::_model_.grid");  return _model_.grid; }
    
    static void GetgridElementPath(vesk::Path& _path,vesk::ssize_t _k0) { vxAssert(0 <= _k0 && _k0 < 2); vesk::octet_t* p=_path.InitLocalBuffer(2); p[0]=0; p[1]=(vesk::octet_t)_k0; }
    static vesk::Path GetgridElementPath(vesk::ssize_t _k0) { vesk::Path _path; GetgridElementPath(_path,_k0); return _path; }
    vesk::Array<vesk::int32,2> const& _model__gridElement(vesk::ssize_t _k0) const { return _model_.grid[_k0]; }
    vesk::Array<vesk::int32,2>& _model__gridElement(vesk::ssize_t _k0) { return _model_.grid[_k0]; }
    vesk::Array<vesk::int32,2> const& GetgridElement(vesk::ssize_t _k0) const { vesk::DataSourceReadBarrier(&_model_.grid[_k0],vesk::null,"S::_model_.grid[_k0]"); return _model_.grid[_k0]; }
    vesk::Array<vesk::int32,2>& WritegridElement(vesk::ssize_t _k0) { vesk::DataSourceWriteBarrier(&_model_.grid[_k0],vesk::null,"S::_model_.grid[_k0]");  return _model_.grid[_k0]; }
    
    static void GetgridElementElementPath(vesk::Path& _path,vesk::ssize_t _k0,vesk::ssize_t _k1) { vxAssert(0 <= _k0 && _k0 < 2); vxAssert(0 <= _k1 && _k1 < 2); vesk::octet_t* p=_path.InitLocalBuffer(3); p[0]=0; p[1]=(vesk::octet_t)_k0; p[2]=(vesk::octet_t)_k1; }
    static vesk::Path GetgridElementElementPath(vesk::ssize_t _k0,vesk::ssize_t _k1) { vesk::Path _path; GetgridElementElementPath(_path,_k0,_k1); return _path; }
    vesk::int32 const& _model__gridElementElement(vesk::ssize_t _k0,vesk::ssize_t _k1) const { return _model_.grid[_k0][_k1]; }
    vesk::int32& _model__gridElementElement(vesk::ssize_t _k0,vesk::ssize_t _k1) { return _model_.grid[_k0][_k1]; }
    vesk::int32 const& GetgridElementElement(vesk::ssize_t _k0,vesk::ssize_t _k1) const { vesk::DataSourceReadBarrier(&_model_.grid[_k0][_k1],vesk::null,"S::_model_.grid[_k0][_k1]"); return _model_.grid[_k0][_k1]; }
    vesk::int32& WritegridElementElement(vesk::ssize_t _k0,vesk::ssize_t _k1) { vesk::DataSourceWriteBarrier(&_model_.grid[_k0][_k1],vesk::null,"S::_model_.grid[_k0][_k1]");  return _model_.grid[_k0][_k1]; }
    void SetgridElementElement(vesk::ssize_t _k0,vesk::ssize_t _k1,vesk::int32 const& _v) { vesk::DataSourceWriteBarrier(&_model_.grid[_k0][_k1],vesk::null,"S::_model_.grid[_k0][_k1]"); _model_.grid[_k0][_k1] = _v; }
    union {
        struct {
            operator vesk::Array<vesk::Array<vesk::int32,2>,2> const&() const { return CONST_ATTRIB_CAST(S_model_mixin,grid)->Getgrid(); }
            vesk::Array<vesk::Array<vesk::int32,2>,2> const& read() const { return CONST_ATTRIB_CAST(S_model_mixin,grid)->Getgrid(); }
            vesk::Array<vesk::Array<vesk::int32,2>,2> & write() { return ATTRIB_CAST(S_model_mixin,grid)->Writegrid(); }
            vesk::Array<vesk::Array<vesk::int32,2>,2> const& model() const { return CONST_ATTRIB_CAST(S_model_mixin,grid)->_model__grid(); }
            vesk::Array<vesk::Array<vesk::int32,2>,2>& model() { return ATTRIB_CAST(S_model_mixin,grid)->_model__grid(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(S_model_mixin,grid)->GetgridPath(); }
            struct gridElement {
                gridElement(S_model_mixin* _self, vesk::ssize_t _k) : _self(_self),_k0(_k) {}
                vesk::Path GetgridElementPath() const { return _self->GetgridElementPath(_k0); }
                vesk::Array<vesk::int32,2> const& _model__gridElement() const { return _self->_model__gridElement(_k0); }
                vesk::Array<vesk::int32,2>& _model__gridElement() { return _self->_model__gridElement(_k0); }
                vesk::Array<vesk::int32,2> const& GetgridElement() const { return _self->GetgridElement(_k0); }
                vesk::Array<vesk::int32,2>& WritegridElement() { return _self->WritegridElement(_k0); }
                vesk::ssize_t GetgridElementSize() const { return _self->GetgridElementSize(_k0); }
                vesk::Path GetgridElementElementPath(vesk::ssize_t _k1) const { return _self->GetgridElementElementPath(_k0,_k1); }
                vesk::int32 const& _model__gridElementElement(vesk::ssize_t _k1) const { return _self->_model__gridElementElement(_k0,_k1); }
                vesk::int32& _model__gridElementElement(vesk::ssize_t _k1) { return _self->_model__gridElementElement(_k0,_k1); }
                vesk::int32 const& GetgridElementElement(vesk::ssize_t _k1) const { return _self->GetgridElementElement(_k0,_k1); }
                vesk::int32& WritegridElementElement(vesk::ssize_t _k1) { return _self->WritegridElementElement(_k0,_k1); }
                void SetgridElementElement(vesk::ssize_t _k1,vesk::int32 const& _v) { _self->SetgridElementElement(_k0,_k1,_v); }
                operator vesk::Array<vesk::int32,2> const&() const { return _self->GetgridElement(_k0); }
                vesk::Array<vesk::int32,2> const& read() const { return _self->GetgridElement(_k0); }
                vesk::Array<vesk::int32,2> & write() { return _self->WritegridElement(_k0); }
                vesk::Array<vesk::int32,2> const& model() const { return _self->_model__gridElement(_k0); }
                vesk::Array<vesk::int32,2>& model() { return _self->_model__gridElement(_k0); }
                vesk::Path path() const { return _self->GetgridElementPath(_k0); }
                struct gridElementElement {
                    gridElementElement(gridElement* _self, vesk::ssize_t _k) : _self(_self),_k1(_k) {}
                    operator vesk::int32 const&() const { return _self->GetgridElementElement(_k1); }
                    vesk::int32 const& read() const { return _self->GetgridElementElement(_k1); }
                    vesk::int32 & write() { return _self->WritegridElementElement(_k1); }
                    vesk::int32 const& model() const { return _self->_model__gridElementElement(_k1); }
                    vesk::int32& model() { return _self->_model__gridElementElement(_k1); }
                    vesk::Path path() const { return _self->GetgridElementElementPath(_k1); }
                    void operator=(vesk::int32 const& _v) { _self->SetgridElementElement(_k1,_v); }
                    gridElement* _self;
                    vesk::ssize_t _k1;
                };
                gridElementElement operator[](vesk::ssize_t _k1) {
                    return gridElementElement(this,_k1);
                }
                gridElementElement const operator[](vesk::ssize_t _k1) const {
                    return gridElementElement(const_cast<gridElement*>(this),_k1);
                }
                S_model_mixin* _self;
                vesk::ssize_t _k0;
            };
            gridElement operator[](vesk::ssize_t _k0) {
                return gridElement(ATTRIB_CAST(S_model_mixin,grid),_k0);
            }
            gridElement const operator[](vesk::ssize_t _k0) const {
                return gridElement(const_cast<S_model_mixin*>(CONST_ATTRIB_CAST(S_model_mixin,grid)),_k0);
            }
        } grid;
    };
    typedef S_model<T> model_type;
    S_model<T> const& model() const { return _model_; }
    S_model<T>& model() { return _model_; }
    S_model<T> const& read() const { vesk::DataSourceReadBarrier(static_cast<const typename BC::FinalClass*>(this), vesk::null,"S"); return _model_; }
    S_model<T> & write() { vesk::DataSourceWriteBarrier(static_cast<typename BC::FinalClass*>(this), vesk::null,"S"); return _model_; }
    S_model<T> _model_;
};
template <typename T>
struct S : public S_model_mixin<vesk::BaseMixin<S<T>,vesk::EmptyBase>,T> {
    typedef S_model_mixin<vesk::BaseMixin<S<T>,vesk::EmptyBase>,T> BaseClass;

    int32 f(int32 b) const { return b; }
    void g() { }

public:
    
    void Serialise(vesk::Archive& _ar) const {
        vesk::app_WriteDataSourceRsn(_ar);
        this->_model_.Serialise(_ar);
    }
    void Deserialise(vesk::InputArchive& _ar) {
        vesk::app_ReadDataSourceRsn(_ar);
        this->_model_.Deserialise(_ar);
    }
    friend vesk::ReflectedClass const& _GetReflected(S const*) {
        static const vesk::octet_t S_grid[] = { 0x50,0x02,0x00,0x00,0x00,0x50,0x02,0x00,0x00,0x00,0x04 };
        static const vesk::ReflectedModelField S_modelFields[] = { { "grid", offsetof(S,_model_.grid), S_grid, 0, -1 }, };
        static const vesk::octet_t S_f_return[] = { 0x04 };
        static const vesk::octet_t S_f_b[] = { 0x04 };
        static const vesk::ReflectedArg S_f_args[] = { { "b", S_f_b }, };
        static const vesk::ReflectedClassMethod S_methods[] = { {"f",{S_f_return},S_f_args,1,0,true,(vesk::FunctionPointer)(vesk::int32 (__stdcall *)(S const* _self,vesk::int32 b))[](S const* _self,vesk::int32 b) -> vesk::int32 { return _self->f(b); }}, {"g",{0},0,0,0,false,(vesk::FunctionPointer)(void (__stdcall *)(S* _self))[](S* _self) -> void { _self->g(); }}, };
        static const vesk::ReflectedClass S_class = {
            4,
            "S",
            sizeof(S<T>),
            0,
            0,0,
            S_modelFields,1,
            0,0,
            S_methods,2,
            0,
            0,0,0,
            0,
            0,
            { sizeof(S), VariableEqual, VariableLess, PrintVariable, ConstructArray, CopyConstructArray, AssignArray, DestructArray, SerialiseArray, DeserialiseArray, 0, 0, BinaryLowerBound, BinaryUpperBound }
        };
        
        return S_class;
    }
};

template <typename T> vesk::TypeOps const& _GetTypeOps(S<T> const*) {
    return vesk::GetReflectedClass<S<T>>().m_ops;
}

template <typename T> inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,S<T> const& _x) { _x.VisitObjects(_v); return _v; }
template <typename T> inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,S<T> const*) { return _v; }
template <typename T> inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,S<T> const& _x) { _x.VisitPrefs(_v); return _v; }
template<typename Archive,typename T> inline void Serialise(Archive& _ar,S<T> const& _x) { _x.Serialise(_ar); }
template<typename Archive,typename T> inline void Deserialise(Archive& _ar,S<T>& _x) { _x.Deserialise(_ar); }
template <typename T> inline vesk::xostream& operator<<(vesk::xostream& _os,S<T> const& _x) {
    _os << "S(" << _x._model_.grid << ')';
    return _os;
}

template <typename T> inline vesk::int32 __stdcall f(S<T> const* _self,vesk::int32 b) { return _self->f(b); }
template <typename T> inline void __stdcall g(S<T>* _self) { _self->g(); }
struct C;
struct C_model {
    
    C_model() : a(0) {}
    explicit C_model(bool const& a_) : a(a_) {}
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
    void EvictDgsNodes() const;
    void VisitObjects(vesk::IObjectVisitor& _v) const;
    void VisitPrefs(vesk::IPrefVisitor& _v) const;
    bool operator<(C_model const& _rhs) const {
        return (a < _rhs.a);
    }
    bool operator==(C_model const& _rhs) const {
        return a == _rhs.a;
    }
    bool operator!=(C_model const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(C_model const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(C_model const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(C_model const& _rhs) const { return !operator<(_rhs); }
    
    static void GetaPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetaPath() { vesk::Path _path; GetaPath(_path); return _path; }
    bool const& _model__a() const { return a; }
    bool& _model__a() { return a; }
    bool const& Geta() const { return a; }
    bool& Writea() {  return a; }
    void Seta(bool const& _v) { a = _v; }
    
    bool a;
};
template <typename BC>
struct C_model_mixin : public BC {
    using typename BC::FinalClass;
    
    bool operator<(C_model_mixin const& _rhs) const {return _model_ < _rhs._model_;}
    bool operator==(C_model_mixin const& _rhs) const {return _model_ == _rhs._model_;}
    bool operator!=(C_model_mixin const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(C_model_mixin const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(C_model_mixin const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(C_model_mixin const& _rhs) const { return !operator<(_rhs); }
    void EvictDgsNodes() const {BC::EvictDgsNodes();_model_.EvictDgsNodes();}
    void VisitObjects(vesk::IObjectVisitor& _v) const {BC::VisitObjects(_v); _model_.VisitObjects(_v);}
    void VisitPrefs(vesk::IPrefVisitor& _v) const {BC::VisitPrefs(_v); _model_.VisitPrefs(_v);}
    
    static void GetaPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetaPath() { vesk::Path _path; GetaPath(_path); return _path; }
    bool const& _model__a() const { return _model_.a; }
    bool& _model__a() { return _model_.a; }
    bool const& Geta() const { vesk::DataSourceReadBarrier(&_model_.a,vesk::null,"C::_model_.a"); return _model_.a; }
    bool& Writea() { vesk::DataSourceWriteBarrier(&_model_.a,vesk::null,"C::_model_.a");  return _model_.a; }
    void Seta(bool const& _v) { vesk::DataSourceWriteBarrier(&_model_.a,vesk::null,"C::_model_.a"); _model_.a = _v; }
    union {
        struct {
            operator bool const&() const { return CONST_ATTRIB_CAST(C_model_mixin,a)->Geta(); }
            bool const& read() const { return CONST_ATTRIB_CAST(C_model_mixin,a)->Geta(); }
            bool & write() { return ATTRIB_CAST(C_model_mixin,a)->Writea(); }
            bool const& model() const { return CONST_ATTRIB_CAST(C_model_mixin,a)->_model__a(); }
            bool& model() { return ATTRIB_CAST(C_model_mixin,a)->_model__a(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(C_model_mixin,a)->GetaPath(); }
            void operator=(bool const& _v) { ATTRIB_CAST(C_model_mixin,a)->Seta(_v); }
        } a;
    };
    typedef C_model model_type;
    C_model const& model() const { return _model_; }
    C_model& model() { return _model_; }
    C_model const& read() const { vesk::DataSourceReadBarrier(static_cast<const typename BC::FinalClass*>(this), vesk::null,"C"); return _model_; }
    C_model & write() { vesk::DataSourceWriteBarrier(static_cast<typename BC::FinalClass*>(this), vesk::null,"C"); return _model_; }
    C_model _model_;
};

namespace vesk {
template<> struct TypeTraits<C> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_struct; static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<C> {
    static const bool has_reflected_default_ctor = 0; static const bool has_reflected_dtor = 0; static const bool has_reflected_copy_ctor = 0; static const bool has_reflected_equality = 0; static const bool has_reflected_compare = 0; static const bool has_reflected_write_xostream = 0; static const bool has_reflected_serialise = 0; static const bool has_reflected_visit_IObjects = 0; static const bool has_reflected_visit_Prefs = 0; static const bool implements_IObject = 0; static const bool implements_IPersistable = 0; static const bool can_serialise_model = 1; static const bool has_model = 1; static const bool using_model_base_class = 1;
};
} // namespace vesk
struct C : public C_model_mixin<vesk::BaseMixin<C,vesk::EmptyBase>> {
    typedef C_model_mixin<vesk::BaseMixin<C,vesk::EmptyBase>> BaseClass;
 C() : c(1) {} vesk::int32 const c; 
public:
    vesk::int32 Getc() const { return c; }
    
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
};


inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,C const& _x) { _x.VisitObjects(_v); return _v; }
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,C const*) { return _v; }
inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,C const& _x) { _x.VisitPrefs(_v); return _v; }

template<typename Archive> inline void Serialise(Archive& _ar,C const& _x) { _x.Serialise(_ar); }

template<typename Archive> inline void Deserialise(Archive& _ar,C& _x) { _x.Deserialise(_ar); }

