@import "Vesk/vxObject/IObject.h"
$enum E { a }; namespace n { $typedef xvector<int32> T; }
$variant V { E; n::T t; xmap<int32,bool> m; std::map<int, std::string> s; A<b::C>::D d; int8; };