#include "Port/FileArchive.h"

#include <cstdarg>
#include <limits>
#include <utility>

#include "ArchiveFile.h"
#include "RavA/Factory.h"

namespace Port {
namespace {

void SetError(StringBase* error, std::string_view text) {
  if (error) *error = text;
}

std::string Text(const XUID& id) { return id.ToString(); }

bool IsValidVersion(std::int32_t version, StringBase* error) {
  if (version >= 1) return true;
  SetError(error, "an archive version must be at least 1");
  return false;
}

}  // namespace

FileArchive::FileArchive(Direction direction, std::int32_t version)
    : direction_(direction), version_(version) {
  if (direction_ != Direction::kWrite) return;
  encoder_.PutBytes(kArchiveMagic);
  encoder_.PutUInt32(static_cast<std::uint32_t>(version_));
}

FileArchive::~FileArchive() { ReleaseKeptObjects(); }

Prjrep::AutoPtr<Prjrep::IArchive> FileArchive::Adopt(FileArchive* archive) {
  Prjrep::AutoPtr<Prjrep::IArchive> adopted;
  adopted.Attach(archive);
  return adopted;
}

Prjrep::AutoPtr<Prjrep::IArchive> FileArchive::CreateForWrite(const char* path, std::int32_t version,
                                                              StringBase* error) {
  if (!IsValidVersion(version, error)) return nullptr;
  auto file = std::make_unique<ReplacingFileWriter>();
  if (!file->Begin(path, error)) return nullptr;
  auto* archive = new FileArchive(Direction::kWrite, version);
  archive->file_ = std::move(file);
  SetError(error, "");
  return Adopt(archive);
}

Prjrep::AutoPtr<Prjrep::IArchive> FileArchive::CreateInMemory(std::int32_t version, StringBase* error) {
  if (!IsValidVersion(version, error)) return nullptr;
  SetError(error, "");
  return Adopt(new FileArchive(Direction::kWrite, version));
}

Prjrep::AutoPtr<Prjrep::IArchive> FileArchive::OpenForRead(const char* path, StringBase* error) {
  std::string bytes;
  if (!ReadWholeFile(path, &bytes, error)) return nullptr;
  StringBase reason;
  Prjrep::AutoPtr<Prjrep::IArchive> archive = OpenReader(std::move(bytes), &reason);
  if (!archive && error) error->Format("'%s': %s", path, reason.c_str());
  if (archive) SetError(error, "");
  return archive;
}

Prjrep::AutoPtr<Prjrep::IArchive> FileArchive::OpenFromBytes(std::string_view bytes, StringBase* error) {
  return OpenReader(std::string(bytes), error);
}

Prjrep::AutoPtr<Prjrep::IArchive> FileArchive::OpenReader(std::string bytes, StringBase* error) {
  auto* archive = new FileArchive(Direction::kRead, 0);
  Prjrep::AutoPtr<Prjrep::IArchive> adopted = Adopt(archive);
  archive->input_ = std::move(bytes);
  archive->decoder_ = ArchiveDecoder(archive->input_);
  if (!archive->ReadHeader(error)) return nullptr;
  SetError(error, "");
  return adopted;
}

bool FileArchive::ReadHeader(StringBase* error) {
  if (input_.size() < kArchiveHeaderSize) {
    if (error) error->Format("too short for an archive header (%zu bytes)", input_.size());
    return false;
  }
  std::string_view magic;
  std::uint32_t version = 0;
  decoder_.TakeBytes(kArchiveMagic.size(), &magic);
  decoder_.TakeUInt32(&version);
  if (magic != kArchiveMagic) {
    SetError(error, "not an archive (its header is wrong)");
    return false;
  }
  version_ = static_cast<std::int32_t>(version);
  if (version_ < 1) {
    if (error) error->Format("corrupted archive header (version %d)", version_);
    return false;
  }
  return true;
}

CitI::IInterface* FileArchive::QueryInterface(const XUID& id) {
  if (id == Prjrep::IRefCountV1::Iid() || id == Prjrep::IRefCount::Iid()) return &refCount_;
  if (id == Prjrep::IArchive::Iid() || id == CitI::IInterface::Iid())
    return static_cast<Prjrep::IArchive*>(this);
  return nullptr;
}

std::string_view FileArchive::Bytes() const {
  return direction_ == Direction::kWrite ? std::string_view(encoder_.Bytes()) : std::string_view(input_);
}

CitI::Result FileArchive::Fail(CitI::Result code, const char* format, ...) {
  if (!failed_) {
    failed_ = true;
    std::va_list args;
    va_start(args, format);
    lastError_.FormatV(format, args);
    va_end(args);
  }
  return code == CitI::kOk ? CitI::kFail : code;
}

CitI::Result FileArchive::Usable(Direction wanted) {
  if (failed_) return CitI::kFail;
  if (closed_) return Fail(CitI::kFail, "the archive is closed");
  if (direction_ != wanted) {
    return Fail(CitI::kFail, wanted == Direction::kRead ? "the archive is open for writing, not reading"
                                                        : "the archive is open for reading, not writing");
  }
  return CitI::kOk;
}

CitI::Result FileArchive::StartWrite(ArchiveTag tag) {
  CitI::Result result = Usable(Direction::kWrite);
  if (result == CitI::kOk) encoder_.PutTag(tag);
  return result;
}

CitI::Result FileArchive::StartRead(ArchiveTag tag) {
  CitI::Result result = Usable(Direction::kRead);
  if (result != CitI::kOk) return result;
  std::size_t at = decoder_.Position();
  std::uint8_t found = 0;
  result = TakeTag(&found);
  if (result != CitI::kOk) return result;
  if (found != static_cast<std::uint8_t>(tag)) {
    return Fail(CitI::kFail, "expected %s but found %s at offset %zu",
                ArchiveTagName(static_cast<std::uint8_t>(tag)), ArchiveTagName(found), at);
  }
  return CitI::kOk;
}

CitI::Result FileArchive::TakeTag(std::uint8_t* tag) {
  std::size_t at = decoder_.Position();
  if (!decoder_.TakeByte(tag))
    return Fail(CitI::kFail, "the archive ends at offset %zu where a value was expected", at);
  if (!ArchiveTagName(*tag)) return Fail(CitI::kFail, "unknown value tag 0x%02X at offset %zu", *tag, at);
  return CitI::kOk;
}

CitI::Result FileArchive::Truncated(const char* what) {
  return Fail(CitI::kFail, "the archive ends inside %s at offset %zu", what, decoder_.Position());
}

CitI::Result FileArchive::GetVersion(std::int32_t* version) {
  if (!version) return CitI::kInvalidArg;
  *version = version_;
  return CitI::kOk;
}

CitI::Result FileArchive::WriteInt(std::int32_t value) {
  CitI::Result result = StartWrite(ArchiveTag::kInt32);
  if (result == CitI::kOk) encoder_.PutUInt32(static_cast<std::uint32_t>(value));
  return result;
}

CitI::Result FileArchive::ReadInt(std::int32_t* value) {
  if (!value) return CitI::kInvalidArg;
  CitI::Result result = StartRead(ArchiveTag::kInt32);
  if (result != CitI::kOk) return result;
  std::uint32_t raw = 0;
  if (!decoder_.TakeUInt32(&raw)) return Truncated("an int");
  *value = static_cast<std::int32_t>(raw);
  return CitI::kOk;
}

CitI::Result FileArchive::WriteInt64(std::int64_t value) {
  CitI::Result result = StartWrite(ArchiveTag::kInt64);
  if (result == CitI::kOk) encoder_.PutUInt64(static_cast<std::uint64_t>(value));
  return result;
}

CitI::Result FileArchive::ReadInt64(std::int64_t* value) {
  if (!value) return CitI::kInvalidArg;
  CitI::Result result = StartRead(ArchiveTag::kInt64);
  if (result != CitI::kOk) return result;
  std::uint64_t raw = 0;
  if (!decoder_.TakeUInt64(&raw)) return Truncated("an int64");
  *value = static_cast<std::int64_t>(raw);
  return CitI::kOk;
}

CitI::Result FileArchive::WriteBool(bool value) {
  CitI::Result result = StartWrite(ArchiveTag::kBool);
  if (result == CitI::kOk) encoder_.PutByte(value ? 1 : 0);
  return result;
}

CitI::Result FileArchive::ReadBool(bool* value) {
  if (!value) return CitI::kInvalidArg;
  CitI::Result result = StartRead(ArchiveTag::kBool);
  if (result != CitI::kOk) return result;
  std::size_t at = decoder_.Position();
  std::uint8_t raw = 0;
  if (!decoder_.TakeByte(&raw)) return Truncated("a bool");
  if (raw > 1) return Fail(CitI::kFail, "a bool of value %u at offset %zu", raw, at);
  *value = raw == 1;
  return CitI::kOk;
}

CitI::Result FileArchive::WriteString(const StringBase& value) {
  if (value.Length() > std::numeric_limits<std::uint32_t>::max()) {
    if (CitI::Result result = Usable(Direction::kWrite); result != CitI::kOk) return result;
    return Fail(CitI::kFail, "a string of %zu bytes is too long for an archive", value.Length());
  }
  CitI::Result result = StartWrite(ArchiveTag::kString);
  if (result != CitI::kOk) return result;
  encoder_.PutUInt32(static_cast<std::uint32_t>(value.Length()));
  encoder_.PutBytes(value.view());
  return CitI::kOk;
}

CitI::Result FileArchive::ReadString(StringBase* value) {
  if (!value) return CitI::kInvalidArg;
  CitI::Result result = StartRead(ArchiveTag::kString);
  if (result != CitI::kOk) return result;
  std::uint32_t length = 0;
  if (!decoder_.TakeUInt32(&length)) return Truncated("a string length");
  // Checked before anything is allocated, so a corrupted length cannot ask for gigabytes.
  if (length > decoder_.Remaining()) {
    return Fail(CitI::kFail,
                "a string of %u bytes at offset %zu runs past the end of the archive (%zu bytes left)",
                length, decoder_.Position(), decoder_.Remaining());
  }
  std::string_view bytes;
  decoder_.TakeBytes(length, &bytes);
  *value = bytes;
  return CitI::kOk;
}

CitI::Result FileArchive::WriteXUID(const XUID& value) {
  CitI::Result result = StartWrite(ArchiveTag::kXUID);
  if (result == CitI::kOk) encoder_.PutXUID(value);
  return result;
}

CitI::Result FileArchive::ReadXUID(XUID* value) {
  if (!value) return CitI::kInvalidArg;
  CitI::Result result = StartRead(ArchiveTag::kXUID);
  if (result != CitI::kOk) return result;
  if (!decoder_.TakeXUID(value)) return Truncated("an identifier");
  return CitI::kOk;
}

CitI::Result FileArchive::IdentifiersOf(Prjrep::IPersist* object, XUID* classId, XUID* instanceId) {
  CitI::Result result = object->GetClassXUID(classId);
  if (result != CitI::kOk)
    return Fail(result, "an object did not report its class identifier (result %lld)",
                static_cast<long long>(result));
  result = object->GetInstanceXUID(instanceId);
  if (result != CitI::kOk) {
    return Fail(result, "an object of class %s did not report its instance identifier (result %lld)",
                Text(*classId).c_str(), static_cast<long long>(result));
  }
  return CitI::kOk;
}

CitI::Result FileArchive::WriteObject(Prjrep::IPersist* object) {
  CitI::Result result = Usable(Direction::kWrite);
  if (result != CitI::kOk) return result;
  if (!object) return Fail(CitI::kInvalidArg, "a null object cannot be written as an owned object");
  XUID classId;
  XUID instanceId;
  result = IdentifiersOf(object, &classId, &instanceId);
  if (result != CitI::kOk) return result;
  if (depth_ >= maxDepth_) return Fail(CitI::kFail, "owned objects nest deeper than %d", maxDepth_);
  if (!ownedWritten_.insert(instanceId).second) {
    return Fail(CitI::kFail, "instance %s of class %s is written twice as an owned object",
                Text(instanceId).c_str(), Text(classId).c_str());
  }
  encoder_.PutTag(ArchiveTag::kObjectBegin);
  encoder_.PutXUID(classId);
  encoder_.PutXUID(instanceId);
  ++depth_;
  result = object->Save(this);
  --depth_;
  if (result != CitI::kOk) {
    return Fail(result, "saving an object of class %s failed (result %lld)", Text(classId).c_str(),
                static_cast<long long>(result));
  }
  // A Save that ignored a failed write still ends here: StartWrite refuses after any failure.
  return StartWrite(ArchiveTag::kObjectEnd);
}

CitI::Result FileArchive::WriteObjectRef(Prjrep::IPersist* object) {
  CitI::Result result = Usable(Direction::kWrite);
  if (result != CitI::kOk) return result;
  if (!object) {
    encoder_.PutTag(ArchiveTag::kNullRef);
    return CitI::kOk;
  }
  XUID classId;
  XUID instanceId;
  result = IdentifiersOf(object, &classId, &instanceId);
  if (result != CitI::kOk) return result;
  encoder_.PutTag(ArchiveTag::kRef);
  encoder_.PutXUID(instanceId);
  encoder_.PutXUID(classId);
  return CitI::kOk;
}

FileArchive::KeptObject* FileArchive::CreateKept(const XUID& classId, const XUID& instanceId,
                                                 RecordState state) {
  Prjrep::AutoRelease<CitI::IInterface> created(RavA::Factory::CreateInstance(classId));
  if (!created) {
    Fail(CitI::kFail, "no factory is registered for class %s (instance %s)", Text(classId).c_str(),
         Text(instanceId).c_str());
    return nullptr;
  }
  auto* persist = Prjrep::QueryAs<Prjrep::IPersist>(created.Get());
  if (!persist) {
    Fail(CitI::kFail, "the objects of class %s are not persistent", Text(classId).c_str());
    return nullptr;
  }
  CitI::Result result = persist->SetInstanceXUID(instanceId);
  if (result != CitI::kOk) {
    Fail(result, "an object of class %s refused its instance identifier %s", Text(classId).c_str(),
         Text(instanceId).c_str());
    return nullptr;
  }
  auto [entry, inserted] =
      kept_.emplace(instanceId, KeptObject{Prjrep::AutoPtr<CitI::IInterface>(created.Get()), classId, state});
  keptOrder_.push_back(instanceId);
  return &entry->second;
}

bool FileArchive::ClassAgrees(const KeptObject& kept, const XUID& classId, const XUID& instanceId) {
  if (kept.classId == classId) return true;
  Fail(CitI::kFail, "instance %s appears both as class %s and as class %s", Text(instanceId).c_str(),
       Text(kept.classId).c_str(), Text(classId).c_str());
  return false;
}

FileArchive::KeptObject* FileArchive::KeptForRecord(const XUID& classId, const XUID& instanceId) {
  auto found = kept_.find(instanceId);
  if (found == kept_.end()) return CreateKept(classId, instanceId, RecordState::kLoading);
  KeptObject& kept = found->second;
  if (kept.state != RecordState::kReferencedOnly) {
    Fail(CitI::kFail, "instance %s has a second owned record", Text(instanceId).c_str());
    return nullptr;
  }
  if (!ClassAgrees(kept, classId, instanceId)) return nullptr;
  kept.state = RecordState::kLoading;
  return &kept;
}

FileArchive::KeptObject* FileArchive::KeptForReference(const XUID& classId, const XUID& instanceId) {
  auto found = kept_.find(instanceId);
  if (found == kept_.end()) return CreateKept(classId, instanceId, RecordState::kReferencedOnly);
  return ClassAgrees(found->second, classId, instanceId) ? &found->second : nullptr;
}

CitI::Result FileArchive::LoadRecord(KeptObject* kept) {
  auto* persist = Prjrep::QueryAs<Prjrep::IPersist>(kept->object.Get());
  ++depth_;
  CitI::Result result = persist->Load(this);
  --depth_;
  if (result != CitI::kOk) {
    return Fail(result, "loading an object of class %s failed (result %lld)", Text(kept->classId).c_str(),
                static_cast<long long>(result));
  }
  result = Usable(Direction::kRead);
  if (result != CitI::kOk) return result;
  std::size_t at = decoder_.Position();
  std::uint8_t tag = 0;
  result = TakeTag(&tag);
  if (result != CitI::kOk) return result;
  if (tag != static_cast<std::uint8_t>(ArchiveTag::kObjectEnd)) {
    return Fail(CitI::kFail, "an object of class %s did not load all of its record (%s left at offset %zu)",
                Text(kept->classId).c_str(), ArchiveTagName(tag), at);
  }
  kept->state = RecordState::kLoaded;
  return CitI::kOk;
}

CitI::Result FileArchive::ReadObject(CitI::IInterface** object) {
  Prjrep::AutoOut<CitI::IInterface> out(object);
  if (out.IsMissing()) return CitI::kInvalidArg;
  CitI::Result result = StartRead(ArchiveTag::kObjectBegin);
  if (result != CitI::kOk) return result;
  XUID classId;
  XUID instanceId;
  if (!decoder_.TakeXUID(&classId) || !decoder_.TakeXUID(&instanceId)) return Truncated("an object header");
  if (depth_ >= maxDepth_) {
    return Fail(CitI::kFail, "owned objects nest deeper than %d at offset %zu", maxDepth_,
                decoder_.Position());
  }
  KeptObject* kept = KeptForRecord(classId, instanceId);
  if (!kept) return CitI::kFail;
  result = LoadRecord(kept);
  if (result == CitI::kOk) out.Set(kept->object.Get());
  return result;
}

CitI::Result FileArchive::ReadObjectRef(CitI::IInterface** object) {
  if (!object) return CitI::kInvalidArg;
  *object = nullptr;
  CitI::Result result = Usable(Direction::kRead);
  if (result != CitI::kOk) return result;
  std::size_t at = decoder_.Position();
  std::uint8_t tag = 0;
  result = TakeTag(&tag);
  if (result != CitI::kOk) return result;
  if (tag == static_cast<std::uint8_t>(ArchiveTag::kNullRef)) return CitI::kOk;
  if (tag != static_cast<std::uint8_t>(ArchiveTag::kRef)) {
    return Fail(CitI::kFail, "expected an object reference but found %s at offset %zu", ArchiveTagName(tag),
                at);
  }
  XUID instanceId;
  XUID classId;
  if (!decoder_.TakeXUID(&instanceId) || !decoder_.TakeXUID(&classId))
    return Truncated("an object reference");
  KeptObject* kept = KeptForReference(classId, instanceId);
  if (!kept) return CitI::kFail;
  *object = kept->object.Get();
  return CitI::kOk;
}

CitI::Result FileArchive::Close() {
  if (closed_) return closeResult_;
  closeResult_ = direction_ == Direction::kWrite ? CloseWriter() : CloseReader();
  closed_ = true;
  return closeResult_;
}

CitI::Result FileArchive::CloseWriter() {
  std::unique_ptr<ReplacingFileWriter> file = std::move(file_);
  if (failed_) return CitI::kFail;  // the old file stays; `file` removes its temporary file
  if (!file) return CitI::kOk;
  StringBase error;
  if (!file->Commit(encoder_.Bytes(), &error)) return Fail(CitI::kFail, "%s", error.c_str());
  return CitI::kOk;
}

CitI::Result FileArchive::CloseReader() {
  CitI::Result result = failed_ ? CitI::kFail : CitI::kOk;
  std::size_t unresolved = 0;
  const XUID* first = nullptr;
  for (const XUID& id : keptOrder_) {
    if (kept_.at(id).state != RecordState::kReferencedOnly) continue;
    if (!first) first = &id;
    ++unresolved;
  }
  if (first) {
    result = Fail(CitI::kFail,
                  "%zu referenced object(s) never appeared in the archive, the first instance %s of class %s",
                  unresolved, Text(*first).c_str(), Text(kept_.at(*first).classId).c_str());
  }
  ReleaseKeptObjects();
  return result;
}

void FileArchive::ReleaseKeptObjects() {
  // Latest first, so that objects are released in the reverse of the order they were read.
  for (auto id = keptOrder_.rbegin(); id != keptOrder_.rend(); ++id) kept_.at(*id).object.Reset();
  kept_.clear();
  keptOrder_.clear();
}

}  // namespace Port
