int f(int a=1,char const* b=g(2, 3));
inline vesk::int32 g() { if (x) { y(); } return $x$ + '}'; } // rest
inline C* h() {
    vesk::DollarNew(new C(1, $new D) ); return vesk::DollarNew(new a::B<int>(2))->c;
}
int x[3] = {1,2,3};
vesk::DynArray<vesk::int32> a; vesk::xvector<vesk::int32> b[2][] = f(); vesk::string8 const& c = d;
namespace n { typedef vesk::int32 T[2];
inline vesk::ConstStringZ GetTypedefName_T() {
    return "n::T";
}
 }
vesk::pref<vesk::IObject> p[3];
;
inline vesk::ConstStringZ GetTypedefName_T() {
    return "T";
}

