// The same records by Cap'n Proto: written is built and flattened, read is walked, as it keeps values in their bytes.
#include <capnp/message.h>
#include <capnp/serialize.h>

#include <string>

#include "records.capnp.h"
#include "timing.h"

int main() {
  kj::Array<capnp::word> words;
  Measure("records_write", [&] {
    capnp::MallocMessageBuilder message;
    auto entries = message.initRoot<Entries>().initEntries(kRecords);
    std::string name;
    for (int i = 0; i < kRecords; ++i) {
      auto entry = entries[i];
      entry.setId(i);
      name = "entry number " + std::to_string(i);
      entry.setName(name);
      entry.setPrice(i * 0.25);
      entry.setActive(i % 2);
      auto place = entry.initPlace();
      place.setX(i);
      place.setY(-i);
      auto tags = entry.initTags(4);
      for (int k = 0; k < 4; ++k) tags.set(k, i + k);
    }
    words = capnp::messageToFlatArray(message);
    g_kept = words.begin();
  });
  Measure("records_read", [&] {
    capnp::ReaderOptions options;
    options.traversalLimitInWords = words.size() * 2;
    capnp::FlatArrayMessageReader message(words, options);
    double sum = 0;
    for (auto entry : message.getRoot<Entries>().getEntries()) {
      sum += entry.getId() + entry.getName().size() + entry.getPrice() + entry.getActive();
      sum += entry.getPlace().getX() + entry.getPlace().getY();
      for (int tag : entry.getTags()) sum += tag;
    }
    volatile double kept = sum;
    (void)kept;
  });
}
