@import "api/error_codes.h"

#include <cstdio>

@def caseOf(name, value) =
{
    case ErrorCode::name: return value;
}

const char* NameOf(ErrorCode code)
{
    switch (code)
    {
        case ErrorCode::None: return "None";
        @for ((name, number, text) in errorCodes) {caseOf(name, @str(name))
        }
    }
    return "unknown";
}

const char* TextOf(ErrorCode code)
{
    @if (@str(@config) == "Debug")
    {
        std::printf("[%s] ", NameOf(code));
    }
    switch (code)
    {
        case ErrorCode::None: return "";
        @for ((name, number, text) in errorCodes) {caseOf(name, @str(text))
        }
    }
    return "unknown error";
}
