@import "Vesk/vxObject/IObject.h"
$type int;$type <<-reflect>> std::vector<int>*;