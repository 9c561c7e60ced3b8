#include "translator/kinds/enum_def.h"

#include <algorithm>

namespace qrex {

bool EnumDef::HasDisabledLabel() const {
  return std::find(m_enabled.begin(), m_enabled.end(), false) != m_enabled.end();
}

}  // namespace qrex
