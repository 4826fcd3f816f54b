// The base of the VHDL design units that carry a context clause (entity, architecture, package,
// package body): the use clauses in effect for the unit.
#pragma once

#include <string_view>
#include <vector>

#include "CHdlElement.h"
#include "IHdlUseClauses.h"
#include "Prjrep/TFace.h"

namespace Vad {

class CVhdlDU : public CHdlElement {
 public:
  CVhdlDU(std::string_view name, DbObject* parent);
  // Empties the use list only: the use records are owned elsewhere.
  ~CVhdlDU() override = default;

  // Replaces `out` with the use records in source order (no references).
  void GetUses(std::vector<DbObject*>& out) const { out = uses_; }
  void SetUses(const std::vector<DbObject*>& uses) { uses_ = uses; }

  // Also answers IHdlUseClauses.
  CitI::IInterface* QueryInterface(const Port::XUID& id) override;

  // The use list is never persisted: Save writes a count of 0, and Load reads the references it
  // finds and drops them, leaving the list empty.
  CitI::Result Load(Prjrep::IArchive* archive) override;
  CitI::Result Save(Prjrep::IArchive* archive) override;

 private:
  class CVhdlDU_IHdlUseClauses final : public Prjrep::TFace<IHdlUseClauses, CVhdlDU> {
   public:
    using TFace::TFace;
    CitI::Result GetUseCount(std::uint32_t* count) override;
    CitI::Result GetUseStoreKey(std::uint32_t index, Port::StringBase* key) override;
  };

  std::vector<DbObject*> uses_;  // owned by the parse results, no references
  CVhdlDU_IHdlUseClauses useClausesFace_{this};
};

}  // namespace Vad
