
vesk::ReflectedClass const& _GetReflected(A const*);
vesk::TypeOps const& _GetTypeOps(A const*);

inline void __stdcall f(A* _self) { _self->f(); }
