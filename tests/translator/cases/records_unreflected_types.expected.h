vesk::ReflectionByteCode _GetReflected(int const*);
vesk::TypeOps const& _GetTypeOps(int const*);
vesk::ReflectionByteCode _GetReflected(std::vector<int>* const*);
vesk::TypeOps const& _GetTypeOps(std::vector<int>* const*);
