#include "RecordingArchive.h"

#include <utility>

namespace quillon {

CitI::IInterface* RecordingArchive::QueryInterface(const Port::XUID& id) {
  if (id == CitI::IInterface::Iid() || id == Prjrep::IArchive::Iid()) return this;
  return nullptr;
}

CitI::Result RecordingArchive::GetVersion(std::int32_t* version) {
  if (!version) return CitI::kInvalidArg;
  *version = kVersion;
  return CitI::kOk;
}

CitI::Result RecordingArchive::Keep(Value value) {
  values_.push_back(std::move(value));
  return CitI::kOk;
}

CitI::Result RecordingArchive::WriteObject(Prjrep::IPersist* object) { return Keep(OwnedObject{object}); }
CitI::Result RecordingArchive::WriteObjectRef(Prjrep::IPersist* object) {
  return Keep(ObjectReference{object});
}
CitI::Result RecordingArchive::WriteInt(std::int32_t value) { return Keep(value); }
CitI::Result RecordingArchive::WriteInt64(std::int64_t value) { return Keep(value); }
CitI::Result RecordingArchive::WriteBool(bool value) { return Keep(value); }
CitI::Result RecordingArchive::WriteString(const Port::StringBase& value) { return Keep(value.str()); }
CitI::Result RecordingArchive::WriteXUID(const Port::XUID& value) { return Keep(value); }

CitI::Result RecordingArchive::ReadObject(CitI::IInterface**) { return CitI::kFail; }
CitI::Result RecordingArchive::ReadObjectRef(CitI::IInterface**) { return CitI::kFail; }
CitI::Result RecordingArchive::ReadInt(std::int32_t*) { return CitI::kFail; }
CitI::Result RecordingArchive::ReadInt64(std::int64_t*) { return CitI::kFail; }
CitI::Result RecordingArchive::ReadBool(bool*) { return CitI::kFail; }
CitI::Result RecordingArchive::ReadString(Port::StringBase*) { return CitI::kFail; }
CitI::Result RecordingArchive::ReadXUID(Port::XUID*) { return CitI::kFail; }

}  // namespace quillon
