#include "text/spelling.h"

#include <algorithm>
#include <iterator>
#include <string>

namespace qrex {

bool IsAlmost(std::string_view word, std::string_view other) {
  std::string a(word), b(other);
  std::sort(a.begin(), a.end());
  std::sort(b.begin(), b.end());
  std::string apart;
  std::set_symmetric_difference(a.begin(), a.end(), b.begin(), b.end(), std::back_inserter(apart));
  return apart.size() <= 2;
}

}  // namespace qrex
