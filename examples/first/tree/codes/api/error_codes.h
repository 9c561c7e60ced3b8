@// The table from which everything about error codes is made: the name, its number, what it says.
@$PRODUCT = "First"
@def errorCodes =
{
    [ (NotFound, 2, The _PRODUCT_ archive was not found),
      (Denied,   5, Access to the archive is denied),
      (Full,   112, The disk is full) ]
}
enum class ErrorCode
{
    None = 0,
    @for ((name, number, text) in errorCodes) {name = number,
    }
};

constexpr const char* kTitle = "$(PRODUCT): error codes";
const char* NameOf(ErrorCode code);
const char* TextOf(ErrorCode code);
