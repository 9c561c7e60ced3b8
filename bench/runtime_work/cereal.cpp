// The same by cereal: its binary archives over string streams.
#include <cereal/archives/binary.hpp>
#include <cereal/types/string.hpp>
#include <cereal/types/vector.hpp>
#include <sstream>

#include "timing.h"

struct Place {
  int x, y;
  template <typename A>
  void serialize(A& ar) {
    ar(x, y);
  }
};

struct Entry {
  int id;
  std::string name;
  double price;
  bool active;
  Place place;
  std::vector<int> tags;
  template <typename A>
  void serialize(A& ar) {
    ar(id, name, price, active, place, tags);
  }
};

template <typename T>
void Both(const char* name, std::vector<T> const& items) {
  std::string bytes;
  char line[40];
  std::snprintf(line, sizeof(line), "%s_write", name);
  Measure(line, [&] {
    std::ostringstream stream;
    cereal::BinaryOutputArchive ar(stream);
    ar(items);
    bytes = std::move(stream).str();
    g_kept = bytes.data();
  });
  std::snprintf(line, sizeof(line), "%s_read", name);
  Measure(line, [&] {
    std::istringstream stream(bytes);
    cereal::BinaryInputArchive ar(stream);
    std::vector<T> read;
    ar(read);
    g_kept = read.data();
  });
}

int main() {
  std::vector<int> ints(kInts);
  std::vector<double> doubles(kInts);
  for (int i = 0; i < kInts; ++i) doubles[i] = ints[i] = i;
  std::vector<Entry> entries(kRecords);
  for (int i = 0; i < kRecords; ++i) {
    entries[i] = {i, "entry number " + std::to_string(i), i * 0.25, i % 2 != 0, {i, -i}, {i, i + 1, i + 2, i + 3}};
  }
  Both("ints", ints);
  Both("doubles", doubles);
  Both("records", entries);
}
