#include "ParseResultsArchive.h"

#include <set>

#include "CHdlElement.h"
#include "CVhdlDU.h"
#include "IHdlDesignUnit.h"
#include "Port/MsgManData.h"
#include "Prjrep/Casts.h"

namespace Vad {

namespace {

// Far above any real file; a damaged count cannot make the reader reserve memory for it.
constexpr std::int32_t kMaxRecords = 1 << 22;

std::vector<CHdlElement*> RecordsOf(IHdlDesignUnitSet* units) {
  std::vector<CHdlElement*> records;
  Prjrep::AutoRelease<IHdlDesignUnitIterator> unit;
  if (!units || units->CreateIterator(unit.Out()) != CitI::kOk || !unit) return records;
  for (; !unit->IsDone(); unit->Next())
    records.push_back(Prjrep::ImplementationCast<CHdlElement>(unit->Current()));
  return records;
}

// Every object of the trees below `roots`, roots included.
std::set<const DbObject*> TreesBelow(const std::vector<DbObject*>& roots) {
  std::set<const DbObject*> reached(roots.begin(), roots.end());
  std::vector<const DbObject*> pending(roots.begin(), roots.end());
  while (!pending.empty()) {
    const DbObject* object = pending.back();
    pending.pop_back();
    for (DbObject* child : object->GetChildren()) {
      if (reached.insert(child).second) pending.push_back(child);
    }
  }
  return reached;
}

std::vector<DbObject*> UsesOf(const CHdlElement* record) {
  std::vector<DbObject*> uses;
  if (auto* unit = dynamic_cast<const CVhdlDU*>(record)) unit->GetUses(uses);
  return uses;
}

CitI::Result WriteReference(Prjrep::IArchive* archive, DbObject* object) {
  auto* persist = Prjrep::QueryAs<Prjrep::IPersist>(object);
  return persist ? archive->WriteObjectRef(persist) : CitI::kFail;
}

// A record of the trees read, or null.
DbObject* ReadReference(Prjrep::IArchive* archive, const std::set<const DbObject*>& loaded,
                        CitI::Result& result) {
  CitI::IInterface* object = nullptr;
  result = archive->ReadObjectRef(&object);
  auto* record = Prjrep::ImplementationCast<DbObject>(object);
  if (result == CitI::kOk && (!record || !loaded.count(record))) result = CitI::kFail;
  return result == CitI::kOk ? record : nullptr;
}

CitI::Result ReadCount(Prjrep::IArchive* archive, std::int32_t& count) {
  CitI::Result result = archive->ReadInt(&count);
  if (result == CitI::kOk && (count < 0 || count > kMaxRecords)) return CitI::kFail;
  return result;
}

}  // namespace

CitI::Result ParseResultsArchive::Save(IHdlDesignUnitSet* units, Prjrep::IArchive* archive) {
  if (!archive) return CitI::kInvalidArg;
  std::vector<CHdlElement*> records = RecordsOf(units);
  std::vector<DbObject*> roots;
  for (CHdlElement* record : records) {
    if (!record) return CitI::kFail;
    if (!record->GetParent()) roots.push_back(record);
  }
  std::set<const DbObject*> written = TreesBelow(roots);
  for (CHdlElement* record : records) {
    if (!written.count(record)) return CitI::kFail;
    for (DbObject* use : UsesOf(record))
      if (!written.count(use)) return CitI::kFail;
  }

  // The design objects complain about a missing parent when a top-level record is saved, which
  // is its normal state here.
  Port_MsgManData::DebugSink previous = Port_MsgManData::setDebugSink([](std::string_view) {});
  CitI::Result result = archive->WriteInt(static_cast<std::int32_t>(records.size()));
  for (std::size_t i = 0; result == CitI::kOk && i < records.size(); ++i)
    result = WriteReference(archive, records[i]);
  if (result == CitI::kOk) result = archive->WriteInt(static_cast<std::int32_t>(roots.size()));
  for (std::size_t i = 0; result == CitI::kOk && i < roots.size(); ++i)
    result = archive->WriteObject(Prjrep::QueryAs<Prjrep::IPersist>(roots[i]));
  for (std::size_t i = 0; result == CitI::kOk && i < records.size(); ++i) {
    std::vector<DbObject*> uses = UsesOf(records[i]);
    result = archive->WriteInt(static_cast<std::int32_t>(uses.size()));
    for (std::size_t u = 0; result == CitI::kOk && u < uses.size(); ++u)
      result = WriteReference(archive, uses[u]);
  }
  Port_MsgManData::setDebugSink(std::move(previous));
  return result;
}

CitI::Result ParseResultsArchive::Load(Prjrep::IArchive* archive, Records& records) {
  records.clear();
  if (!archive) return CitI::kInvalidArg;
  std::int32_t count = 0;
  CitI::Result result = ReadCount(archive, count);
  // The references come before their objects: keep the raw pointers, check them once all trees
  // are read.
  std::vector<CitI::IInterface*> referenced;
  for (std::int32_t i = 0; result == CitI::kOk && i < count; ++i) {
    CitI::IInterface* object = nullptr;
    result = archive->ReadObjectRef(&object);
    referenced.push_back(object);
  }
  std::int32_t rootCount = 0;
  if (result == CitI::kOk) result = ReadCount(archive, rootCount);
  Records roots;
  std::vector<DbObject*> rootObjects;
  for (std::int32_t i = 0; result == CitI::kOk && i < rootCount; ++i) {
    Prjrep::AutoRelease<CitI::IInterface> root;
    result = archive->ReadObject(root.Out());
    auto* object = Prjrep::ImplementationCast<DbObject>(root.Get());
    if (result == CitI::kOk && !object) result = CitI::kFail;
    if (result != CitI::kOk) break;
    rootObjects.push_back(object);
    roots.emplace_back(root.Get());
  }
  if (result != CitI::kOk) return result;

  std::set<const DbObject*> loaded = TreesBelow(rootObjects);
  std::vector<CVhdlDU*> units;
  for (CitI::IInterface* object : referenced) {
    auto* record = Prjrep::ImplementationCast<CHdlElement>(object);
    if (!record || !loaded.count(record)) return CitI::kFail;
    records.emplace_back(object);
    units.push_back(dynamic_cast<CVhdlDU*>(record));
  }
  for (std::size_t i = 0; result == CitI::kOk && i < units.size(); ++i) {
    std::int32_t useCount = 0;
    result = ReadCount(archive, useCount);
    std::vector<DbObject*> uses;
    for (std::int32_t u = 0; result == CitI::kOk && u < useCount; ++u)
      uses.push_back(ReadReference(archive, loaded, result));
    if (result == CitI::kOk && !uses.empty() && !units[i]) result = CitI::kFail;
    if (result == CitI::kOk && units[i]) units[i]->SetUses(uses);
  }
  if (result != CitI::kOk) records.clear();
  return result;
}

}  // namespace Vad
