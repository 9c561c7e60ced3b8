@import "compilable/empty_items.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace empty_items
{

ROW
{
    Command command{Command::boxed()}, read;
    CHECK(read.is<Command::stop>(), true);
    Copy(command, read);
    CHECK(read.is<Command::boxed>(), true);
    CHECK(read == command, true);
    CHECK(read < command || command < read, false);
    CHECK(vxMakeString(Command(Command::stop())), "stop()");
}

}
