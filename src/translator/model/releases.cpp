#include "translator/model/releases.h"

#include <map>

namespace qrex {

std::vector<ModelRelease> ReleasesOf(const ClassDef& def) {
  std::map<int64_t, ModelRelease> releases;
  const auto at = [&releases](int64_t number) -> ModelRelease& {
    return releases.try_emplace(number, ModelRelease{number, {}, {}}).first->second;
  };
  if (def.HasEmbeddedModel() && def.m_modelFields.empty()) at(def.m_firstRsn < 0 ? 0 : def.m_firstRsn);
  for (const ModelField* field : def.m_modelFields) {
    at(field->m_rsnAdded).adds.push_back(field);
    if (field->IsDropped()) at(field->m_rsnDropped).drops.push_back(field);
  }
  std::vector<ModelRelease> ordered;
  ordered.reserve(releases.size());
  for (auto& [number, release] : releases) ordered.push_back(std::move(release));
  return ordered;
}

}  // namespace qrex
