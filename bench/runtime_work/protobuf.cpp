// The same records by protobuf.
#include <string>

#include "records.pb.h"
#include "timing.h"

int main() {
  Entries entries;
  for (int i = 0; i < kRecords; ++i) {
    Entry& entry = *entries.add_entries();
    entry.set_id(i);
    entry.set_name("entry number " + std::to_string(i));
    entry.set_price(i * 0.25);
    entry.set_active(i % 2);
    entry.mutable_place()->set_x(i);
    entry.mutable_place()->set_y(-i);
    for (int k = 0; k < 4; ++k) entry.add_tags(i + k);
  }
  std::string bytes;
  Measure("records_write", [&] {
    bytes = entries.SerializeAsString();
    g_kept = bytes.data();
  });
  Measure("records_read", [&] {
    Entries read;
    read.ParseFromString(bytes);
    g_kept = &read;
  });
}
