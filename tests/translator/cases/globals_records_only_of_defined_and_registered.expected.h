void f(); inline void g() { } vesk::int32 v; typedef vesk::int32 T;
inline vesk::ConstStringZ GetTypedefName_T() {
    return "T";
}
