// Archives as they are shown.
@import "rows/rows.h"
@import "kinds/models.h"
@import "kinds/kinds.h"

@import "Vesk/vxObject/DumpArchive.h"

using namespace kinds;

ROW(Dumps) {
    Doc doc, next;
    doc.title = "title";
    doc.next = &next;
    next.next = &doc;
    doc.count = 7;
    doc.lines.push_back(3);
    doc.notes[300].push_back('n');
    doc.size.colour = shapes::Green;
    std::printf("%s", vesk::DumpArchive(vesk::WriteObject(vesk::ptr<IDoc>(&doc))).c_str());
    std::printf("%s", vesk::DumpArchiveOf<Doc>({1, 1, 'T', 2, 0, 0, 0, 9, 0, 0, 0}).c_str());
    std::printf("%s", vesk::DumpArchiveOf<Doc>({1, 1, 'T', 2, 0, 0, 0, 9, 0, 0}).c_str());
}
