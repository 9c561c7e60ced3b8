// The releases of projects: what archives say of them, and what a project may write.

@import "Vesk/vxObject/IObject.h"

namespace vesk {

RSN LastRelease(ReflectedClass const& record) {
  RSN last = 0;
  for (ssize_t i = 0; i < record.m_numModelFields; ++i) {
    last = std::max({last, record.m_modelFields[i].m_added, record.m_modelFields[i].m_dropped});
  }
  return last;
}

void CheckRelease(XTarget const& target) {
  if (!target.m_latestModel) return;
  const RSN last = LastRelease(*target.m_latestModel);
  if (last <= target.m_rsn) return;
  throw ArchiveError(vxMakeString("vxDefineTarget(" << target.m_name << ", " << target.m_rsn << "): the $schema of "
                                                    << target.m_latestModel->m_name << " ends with release " << last));
}

void CheckModel(ModelKind& kind) {
  ReflectedClass const* record = kind.m_record();
  XTarget const* target = record ? TargetOf(*record) : nullptr;
  if (target) CheckRelease(*target);
  kind.m_isChecked = true;
}

namespace {

void CheckNotLater(XTarget const& target, RSN release) {
  if (release <= target.m_rsn) return;
  throw ArchiveError(vxMakeString("archive of release " << release << " of " << target.m_name << ", this is release "
                                                        << target.m_rsn));
}

void SetRelease(InputArchive& ar, XTarget const& target, RSN release) {
  for (auto& [project, known] : ar.m_releases) {
    if (project == &target) {
      known = release;
      return;
    }
  }
  ar.m_releases.push_back({&target, release});
}

}  // namespace

// --- Of a class with a model

void WriteRsn(XTarget const& target, Archive& ar) {
  CheckRelease(target);
  if (ar.m_models) ar.m_models->Add(target);
  SerialiseVariableLengthUint(ar, target.m_rsn);
}

void ReadRsn(XTarget const& target, InputArchive& ar) {
  const RSN release = ReadCompact(ar);
  CheckNotLater(target, release);
  SetRelease(ar, target, release);
  // A class that is not read by `>>`: its model asks next.
  if (t_reading.m_archive != &ar) {
    t_reading.m_target = &target;
    t_reading.m_release = release;
  }
}

RSN ReleaseBeingRead(XTarget const& target) {
  if (t_reading.m_asked) {
    *t_reading.m_asked = &target;
    throw ReleaseAsked();
  }
  if (std::exchange(t_reading.m_target, nullptr) == &target) return t_reading.m_release;
  if (!t_reading.m_archive) return target.m_rsn;
  for (auto const& [project, release] : t_reading.m_archive->m_releases) {
    if (project != &target) continue;
    CheckNotLater(target, release);
    return release;
  }
  return target.m_rsn;
}

// --- Of an archive of objects

void WrittenModels::Add(XTarget const& project) {
  if (std::find(m_projects.begin(), m_projects.end(), &project) == m_projects.end()) m_projects.push_back(&project);
}

void WrittenModels::AddNew(ModelKind& kind) {
  if (kind.m_ask && !kind.m_isAsked) {
    kind.m_asked = kind.m_ask();
    kind.m_isAsked = true;
  }
  XTarget const* project = kind.m_asked;
  if (!project) {
    if (ReflectedClass const* record = kind.m_record()) project = TargetOf(*record);
  }
  if (project) Add(*project);
}

void WrittenModels::Add(ReflectedClass const& record) {
  if (!(record.m_flags & CF_REFERENCES_MODEL)) return;
  ReflectedClass const* model = Find<ReflectedClass>(record.m_modelFields[record.m_numModelFields - 1].m_name);
  XTarget const* project = model ? TargetOf(*model) : nullptr;
  if (project) Add(*project);
}

void WrittenModels::WriteHead(Archive& ar) const {
  // By name: modules of the process may have copies of a project. The library itself has no models.
  std::map<std::string_view, RSN> occurring, others;
  for (XTarget const* project : m_projects) {
    CheckRelease(*project);
    occurring[project->m_name] = std::max(occurring[project->m_name], project->m_rsn);
  }
  for (XTarget const* project : AllTargets()) {
    const std::string_view name = project->m_name;
    if (name != "Vesk_vxObject" && occurring.count(name) == 0) others[name] = std::max(others[name], project->m_rsn);
  }
  for (auto const* releases : {&occurring, &others}) {
    SerialiseVariableLengthUint(ar, releases->size());
    for (auto const& [name, release] : *releases) {
      ar << xstring(std::string(name));
      SerialiseVariableLengthUint(ar, release);
    }
  }
}

void ReadReleases(InputArchive& ar) {
  const xvector<XTarget const*> targets = AllTargets();
  for (bool occurs : {true, false}) {
    for (std::size_t count = ReadCount(ar, 2); count > 0; --count) {
      xstring name;
      ar >> name;
      const RSN release = ReadCompact(ar);
      bool isKnown = false;
      for (XTarget const* target : targets) {
        if (name != target->m_name) continue;
        if (occurs) CheckNotLater(*target, release);
        SetRelease(ar, *target, release);
        isKnown = true;
      }
      if (occurs && !isKnown) throw ArchiveError("archive of a project that is not defined here: " + name);
    }
  }
  // A project that is not named had models with one release alone where the archive was written: the first.
  for (XTarget const* target : targets) {
    const bool isNamed = std::any_of(ar.m_releases.begin(), ar.m_releases.end(),
                                     [target](auto const& project) { return project.first == target; });
    if (!isNamed) SetRelease(ar, *target, 0);
  }
}

// Those of before name no releases: models of other projects than that of their class are read as of the current one.
void ReadObjectHead(InputArchive& ar) {
  if (ar.Remaining() == 0 || ar.m_bytes[ar.m_position] != ObjectMark[0]) return;
  octet_t const* mark = ar.Take(sizeof(ObjectMark));
  if (!std::equal(mark, mark + 3, ObjectMark)) throw ArchiveError("not the archive of an object");
  if (mark[3] > ObjectMark[3]) throw ArchiveError("archive in a later form than is known here");
  if (mark[3] > 1) ReadReleases(ar);
}

xvector<octet_t> WithObjectHead(Archive const& objects) {
  Archive head;
  head.Write(ObjectMark, sizeof(ObjectMark));
  objects.m_models->WriteHead(head);
  xvector<octet_t> bytes;
  bytes.reserve(head.m_bytes.size() + objects.m_bytes.size());
  bytes.assign(head.m_bytes.begin(), head.m_bytes.end());
  bytes.insert(bytes.end(), objects.m_bytes.begin(), objects.m_bytes.end());
  return bytes;
}

void WriteClassOf(Archive& ar, ReflectedClass const& record) {
  if (ar.m_objects.m_record != &record) {
    if (!Find<ReflectedClass>(record.m_name)) throw ArchiveError(NotRegistered("class", record.m_name));
    if (ar.m_models) ar.m_models->Add(record);
    ar.m_objects.m_record = &record;
  }
  ar << xstring(record.m_name);
}

}  // namespace vesk
