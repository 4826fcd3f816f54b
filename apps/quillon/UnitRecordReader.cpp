#include "UnitRecordReader.h"

#include <optional>
#include <utility>
#include <variant>
#include <vector>

#include "IHdlUseClauses.h"
#include "IName.h"
#include "Port/MsgManData.h"
#include "Prjrep/AutoPtr.h"
#include "RecordingArchive.h"

namespace quillon {

namespace {

constexpr std::uint32_t kEntity = 2, kArchitecture = 4, kComponentInst = 8, kEntityInst = 16, kLibrary = 32,
                        kPackageDecl = 64, kPackageBody = 128, kUse = 256;

// Walks the recorded values in the order the record wrote them, moving each out once.
class ValueCursor {
 public:
  explicit ValueCursor(std::vector<RecordingArchive::Value>& values) : values_(values) {}

  template <class T>
  bool Take(T& out) {
    if (next_ >= values_.size() || !std::holds_alternative<T>(values_[next_])) return false;
    out = std::move(std::get<T>(values_[next_++]));
    return true;
  }
  template <class T>
  bool Skip(std::size_t count = 1) {
    T ignored{};
    for (std::size_t i = 0; i < count; ++i) {
      if (!Take(ignored)) return false;
    }
    return true;
  }
  template <class T>
  bool NextIs() const {
    return next_ < values_.size() && std::holds_alternative<T>(values_[next_]);
  }

 private:
  std::vector<RecordingArchive::Value>& values_;
  std::size_t next_ = 0;
};

// The fields that every record writes, in the order it writes them.
struct RecordFields {
  std::uint32_t type = 0;
  Prjrep::IPersist* parent = nullptr;
  std::string name;
  std::string storeKey;
  std::uint32_t line = 0;
  bool unitFlag = false;
  std::string partition;
  bool inGenerate = false;
  std::vector<std::string> ownTexts;  // the strings of the record's own kind
};

bool TakeText(ValueCursor& cursor, std::string& out) { return cursor.Take(out); }

bool TakeObjectPart(ValueCursor& cursor, RecordFields& fields) {
  std::int32_t type = 0, children = 0;
  RecordingArchive::ObjectReference parent{};
  if (!cursor.Skip<std::int64_t>(2) || !cursor.Take(type) || !cursor.Take(parent) || !cursor.Take(children) ||
      children < 0 || !cursor.Skip<RecordingArchive::OwnedObject>(static_cast<std::size_t>(children))) {
    return false;
  }
  fields.type = static_cast<std::uint32_t>(type);
  fields.parent = parent.object;
  return TakeText(cursor, fields.name) && TakeText(cursor, fields.storeKey) && cursor.Skip<bool>();
}

bool TakeProperties(ValueCursor& cursor, RecordFields& fields) {
  std::int32_t count = 0;
  if (!cursor.Take(count) || count < 0) return false;
  for (std::int32_t i = 0; i < count; ++i) {
    std::string key, value;
    if (!TakeText(cursor, key) || !TakeText(cursor, value)) return false;
    if (key == "PARTITION") fields.partition = value;
  }
  return true;
}

bool TakeElementPart(ValueCursor& cursor, RecordFields& fields) {
  std::int32_t line = 0;
  if (!cursor.Skip<Port::XUID>() || !cursor.Take(line) || !cursor.Skip<std::int32_t>(4) ||
      !cursor.Take(fields.unitFlag) || !cursor.Skip<RecordingArchive::ObjectReference>()) {
    return false;
  }
  fields.line = static_cast<std::uint32_t>(line);
  return TakeProperties(cursor, fields) && cursor.Take(fields.inGenerate);
}

// The VHDL units write a count of use references before their own strings.
bool TakeOwnPart(ValueCursor& cursor, RecordFields& fields) {
  std::int32_t uses = 0;
  if (cursor.NextIs<std::int32_t>() &&
      (!cursor.Take(uses) || uses < 0 || !cursor.Skip<RecordingArchive::ObjectReference>(uses))) {
    return false;
  }
  std::string text;
  while (TakeText(cursor, text)) fields.ownTexts.push_back(std::move(text));
  return true;
}

bool ReadFields(Prjrep::IPersist* record, RecordingArchive& archive, RecordFields& fields) {
  if (!record) return false;
  archive.Clear();
  {
    // Saving a unit without a parent is reported as a developer text, which says nothing here.
    Port_DebugCapture silence;
    if (record->Save(&archive) != CitI::kOk) return false;
  }
  ValueCursor cursor(archive.values());
  return TakeObjectPart(cursor, fields) && TakeElementPart(cursor, fields) && TakeOwnPart(cursor, fields);
}

std::optional<std::string> OwnText(RecordFields& fields, std::size_t index) {
  if (index >= fields.ownTexts.size()) return std::nullopt;
  return std::move(fields.ownTexts[index]);
}

void TakeKindFields(RecordFields& fields, UnitInfo& info) {
  switch (fields.type) {
    case kEntity:
      info.entity = OwnText(fields, 0);
      break;
    case kArchitecture:
      info.architecture = OwnText(fields, 1);
      info.entity = OwnText(fields, 3);
      break;
    case kComponentInst:
      info.component = OwnText(fields, 1);
      break;
    case kEntityInst:
      info.entity = OwnText(fields, 1);
      info.architecture = OwnText(fields, 3);
      break;
    case kLibrary:
      info.library = OwnText(fields, 0);
      break;
    case kPackageDecl:
    case kPackageBody:
      info.package = OwnText(fields, 0);
      break;
    case kUse:
      info.library = OwnText(fields, 0);
      info.package = OwnText(fields, 1);
      info.item = OwnText(fields, 2);
      break;
    default:
      break;
  }
}

// The records do not persist their use lists; the VHDL units tell them through IHdlUseClauses.
std::optional<std::vector<std::string>> UseStoreKeysOf(CitI::IInterface* unit) {
  auto* useClauses = Prjrep::QueryAs<Vad::IHdlUseClauses>(unit);
  std::uint32_t count = 0;
  if (!useClauses || useClauses->GetUseCount(&count) != CitI::kOk) return std::nullopt;
  std::vector<std::string> keys;
  for (std::uint32_t index = 0; index < count; ++index) {
    Port::StringBase key;
    if (useClauses->GetUseStoreKey(index, &key) == CitI::kOk) keys.push_back(key.str());
  }
  return keys;
}

std::string DesignUnitKeyOf(CitI::IInterface* unit) {
  Port::StringBase key;
  auto* name = Prjrep::QueryAs<Prjrep::IName>(unit);
  if (name) name->GetName(&key);
  return key.str();
}

}  // namespace

std::string UnitRecordReader::TypeName(std::uint32_t typeCode) {
  static constexpr std::pair<std::uint32_t, const char*> kTypeNames[] = {
      {1, "File"},
      {2, "Entity"},
      {4, "Architecture"},
      {8, "ComponentInstantiation"},
      {16, "EntityInstantiation"},
      {32, "Library"},
      {64, "PackageDecl"},
      {128, "PackageBody"},
      {256, "Use"},
      {512, "Include"},
      {1024, "Project"},
      {2048, "IncludedFile"},
      {4096, "ParserConfigHolder"},
      {8192, "Module"},
      {16384, "Generic"},
  };
  for (const auto& [code, name] : kTypeNames) {
    if (code == typeCode) return name;
  }
  return "Unknown";
}

const std::optional<std::string>& UnitRecordReader::ParentKeyOf(Prjrep::IPersist* parent) {
  auto [entry, added] = parentKeys_.try_emplace(parent);
  if (added) {
    RecordFields fields;
    if (ReadFields(parent, archive_, fields) || !fields.storeKey.empty())
      entry->second = std::move(fields.storeKey);
  }
  return entry->second;
}

bool UnitRecordReader::Read(CitI::IInterface* unit, UnitInfo& info) {
  info.key = DesignUnitKeyOf(unit);
  RecordFields fields;
  bool complete = ReadFields(Prjrep::QueryAs<Prjrep::IPersist>(unit), archive_, fields);
  info.type = TypeName(fields.type);
  info.name = std::move(fields.name);
  info.storeKey = std::move(fields.storeKey);
  info.line = fields.line;
  info.unitFlag = fields.unitFlag;
  info.inGenerate = fields.inGenerate;
  info.partition = std::move(fields.partition);
  if (withLinks_) {
    if (fields.parent) info.parent = ParentKeyOf(fields.parent);
    info.uses = UseStoreKeysOf(unit);
  }
  TakeKindFields(fields, info);
  return complete;
}

}  // namespace quillon
