template <typename BC>
struct S : public BC {
    typedef BC BaseClass;
//

void VisitObjects(vesk::IObjectVisitor& v) const {
    BaseClass::VisitObjects(v);
    v << x;
}

int end;

public:
    
};


template <typename BC> inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,S const& _x) { _x.VisitObjects(_v); return _v; }

