@import "compilable/empty_items.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace empty_items
{

ROW
{
    Command command{Command::stop()}, read;
    Copy(command, read);
    CHECK(read.is<Command::stop>(), true);
}

}
