// The host's project archive: a binary file (or a memory buffer) of tagged values and nested
// persistent objects, handed to IPersist::Load and IPersist::Save.
//
// Layout (Port/ArchiveCodec.h): an 8-byte magic and the format version (int32), then the values in
// the order they were written, each led by a one-byte tag. Integers are little endian of fixed
// width, a bool is one byte 0 or 1, a string is a 32-bit length and its bytes, an identifier is 16
// bytes (high word, then low word). An owned object is its class identifier, its instance
// identifier, whatever its Save wrote, and an end tag. A reference is a null tag, or the instance
// identifier and the class identifier of the object referred to.
//
// A reader re-creates objects through the factory registry (RavA::Factory) and keeps one reference
// on each, by instance identifier, until Close or destruction; references read before the owned
// record of their object (forward references) create the object early and the record later loads
// into it. The first failure stops the archive: every later operation fails too, and LastError
// keeps the reason of the first one.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <set>
#include <string>
#include <string_view>
#include <vector>

#include "IPersist.h"
#include "Port/ArchiveCodec.h"
#include "Port/StringBase.h"
#include "Port/XUID.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/TRefCountHelper.h"

namespace Port {

class ReplacingFileWriter;

class FileArchive final : public Prjrep::IArchive {
 public:
  static constexpr std::int32_t kCurrentVersion = 9;
  // Objects nest as deep as Save and Load calls do on the stack; this bound keeps a corrupted or
  // hostile archive far from the end of a default thread stack, even in a sanitizer build.
  static constexpr int kDefaultMaxDepth = 1024;

  // A writer whose bytes replace the file at `path` on a successful Close. Null, with the reason
  // in `error` (when given), for a version below 1 or when no file can be created beside `path`.
  static Prjrep::AutoPtr<Prjrep::IArchive> CreateForWrite(const char* path,
                                                          std::int32_t version = kCurrentVersion,
                                                          StringBase* error = nullptr);
  // A reader of the file at `path`. Null, with the reason in `error` (when given), for a missing or
  // unreadable file and for a missing or corrupted header.
  static Prjrep::AutoPtr<Prjrep::IArchive> OpenForRead(const char* path, StringBase* error);
  // The same two without a file: the writer's bytes are read with Bytes(), the reader reads a copy
  // of `bytes`.
  static Prjrep::AutoPtr<Prjrep::IArchive> CreateInMemory(std::int32_t version = kCurrentVersion,
                                                          StringBase* error = nullptr);
  static Prjrep::AutoPtr<Prjrep::IArchive> OpenFromBytes(std::string_view bytes, StringBase* error);

  // Reach these through Prjrep::ObjectCast<Port::FileArchive>(archive).
  //
  // Ends the archive; later operations fail. A writer of a file replaces the file, unless an
  // operation failed before, in which case the file is left as it was. A reader releases every
  // object it kept and fails when a reference was read whose object never appeared. 1 when the
  // whole session succeeded; calling it again returns the same result.
  CitI::Result Close();
  // The reason of the first failure; empty while everything succeeded.
  const StringBase& LastError() const { return lastError_; }
  // All bytes of the archive: what a writer wrote so far, or what a reader reads.
  std::string_view Bytes() const;
  // How deep owned objects may nest, for writing and reading (at least 1).
  void SetMaxDepth(int depth) { maxDepth_ = depth < 1 ? 1 : depth; }

  // CitI::IInterface: IInterface and IArchive answer the archive, IRefCount its counter.
  CitI::IInterface* QueryInterface(const XUID& id) override;

  // Prjrep::IArchive. Null out-parameters give kInvalidArg and change nothing.
  CitI::Result GetVersion(std::int32_t* version) override;
  CitI::Result ReadObject(CitI::IInterface** object) override;
  // Fails for null, for an instance identifier written as an owned object before, and for nesting
  // deeper than the limit; a failure result of the object's Save is returned unchanged.
  CitI::Result WriteObject(Prjrep::IPersist* object) override;
  CitI::Result ReadObjectRef(CitI::IInterface** object) override;
  CitI::Result WriteObjectRef(Prjrep::IPersist* object) override;
  CitI::Result ReadInt(std::int32_t* value) override;
  CitI::Result WriteInt(std::int32_t value) override;
  CitI::Result ReadInt64(std::int64_t* value) override;
  CitI::Result WriteInt64(std::int64_t value) override;
  CitI::Result ReadBool(bool* value) override;
  CitI::Result WriteBool(bool value) override;
  CitI::Result ReadString(StringBase* value) override;
  CitI::Result WriteString(const StringBase& value) override;
  CitI::Result ReadXUID(XUID* value) override;
  CitI::Result WriteXUID(const XUID& value) override;

 private:
  enum class Direction { kWrite, kRead };
  enum class RecordState { kReferencedOnly, kLoading, kLoaded };
  struct KeptObject {
    Prjrep::AutoPtr<CitI::IInterface> object;
    XUID classId;
    RecordState state;
  };

  friend class Prjrep::TRefCountHelper<FileArchive>;
  FileArchive(Direction direction, std::int32_t version);
  ~FileArchive() override;

  static Prjrep::AutoPtr<Prjrep::IArchive> Adopt(FileArchive* archive);
  static Prjrep::AutoPtr<Prjrep::IArchive> OpenReader(std::string bytes, StringBase* error);
  bool ReadHeader(StringBase* error);

  // Records the first failure and its reason; returns `code` (kFail in place of kOk).
  CitI::Result Fail(CitI::Result code, const char* format, ...) __attribute__((format(printf, 3, 4)));
  // kOk when the archive is open in that direction and nothing has failed yet.
  CitI::Result Usable(Direction wanted);
  CitI::Result StartWrite(ArchiveTag tag);
  CitI::Result StartRead(ArchiveTag tag);
  CitI::Result TakeTag(std::uint8_t* tag);
  CitI::Result Truncated(const char* what);

  CitI::Result IdentifiersOf(Prjrep::IPersist* object, XUID* classId, XUID* instanceId);
  KeptObject* CreateKept(const XUID& classId, const XUID& instanceId, RecordState state);
  bool ClassAgrees(const KeptObject& kept, const XUID& classId, const XUID& instanceId);
  KeptObject* KeptForRecord(const XUID& classId, const XUID& instanceId);
  KeptObject* KeptForReference(const XUID& classId, const XUID& instanceId);
  CitI::Result LoadRecord(KeptObject* kept);
  void ReleaseKeptObjects();
  CitI::Result CloseWriter();
  CitI::Result CloseReader();

  Prjrep::TRefCountHelper<FileArchive> refCount_{this};
  Direction direction_;
  std::int32_t version_;
  int maxDepth_ = kDefaultMaxDepth;
  int depth_ = 0;
  bool failed_ = false;
  bool closed_ = false;
  CitI::Result closeResult_ = CitI::kOk;
  StringBase lastError_;

  ArchiveEncoder encoder_;
  std::unique_ptr<ReplacingFileWriter> file_;
  std::set<XUID> ownedWritten_;

  std::string input_;
  ArchiveDecoder decoder_;
  std::map<XUID, KeptObject> kept_;
  std::vector<XUID> keptOrder_;
};

}  // namespace Port
