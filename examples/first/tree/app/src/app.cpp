@import "codes/api/error_codes.h"
@import "platform.h"

#include <initializer_list>

int main()
{
    std::printf("%s\n", kTitle);
    PrintPlatform();
    for (ErrorCode code : {ErrorCode::NotFound, ErrorCode::Denied, ErrorCode::Full})
    {
        std::printf("%d %s\n", static_cast<int>(code), TextOf(code));
    }
}
