template <class T>
struct A
{ T* f(T t, xmap<T,T> m); 
public:
    
};

template <class T> 
template<typename Archive> inline void Serialise(Archive& _ar,A<T> const& _x) { _x.Serialise(_ar); }
template <class T> 
template<typename Archive> inline void Deserialise(Archive& _ar,A<T>& _x) { _x.Deserialise(_ar); }

template <class T> inline vesk::xostream& operator<<(vesk::xostream& _os,A<T> const& _x) { ((A<T>&)_x).Write(_os); return _os; }

inline T* __stdcall f(A* _self,T t,vesk::xmap<T,T > m) { return _self->f(t,m); }
