#include "ArchitectureCheck.h"

#include <algorithm>
#include <cstddef>
#include <map>

#include "Host/VhdlName.h"

namespace quillon {

namespace {

struct Candidate {
  std::string name;
  std::string path;
  std::uint32_t line = 0;
  std::size_t position = 0;  // in the compile order
};

bool AnalysedAfter(const Candidate& a, const Candidate& b) {
  if (a.position != b.position) return a.position > b.position;
  return a.line > b.line;
}

// The candidates in the order they are analysed, so the one bound by default comes last; the
// diagnostic stands at that one.
Diagnostic Describe(const std::string& entity, const std::string& library, std::vector<Candidate> candidates,
                    const ShownPaths* shown) {
  std::stable_sort(candidates.begin(), candidates.end(),
                   [](const Candidate& a, const Candidate& b) { return AnalysedAfter(b, a); });
  std::string text = "entity " + entity + " (library " + library + ") has " +
                     std::to_string(candidates.size()) + " architectures:";
  for (const Candidate& candidate : candidates) {
    text += (&candidate == &candidates.front() ? " " : ", ") + candidate.name + " (" +
            (shown ? shown->Of(candidate.path) : candidate.path) + ":" + std::to_string(candidate.line) + ")";
  }
  const Candidate& chosen = candidates.back();
  text += "; an instance that names none is bound to " + chosen.name + ", the one analysed last";
  return {Diagnostic::Severity::kWarning, DiagnosticCode::kAmbiguousArchitecture, std::move(text),
          chosen.path, chosen.line};
}

}  // namespace

std::vector<Diagnostic> ArchitectureCheck::Find(const std::vector<FileInfo>& files,
                                                const std::vector<OrderEntry>& order,
                                                const ShownPaths* shown) {
  std::map<std::string, std::size_t> position;
  for (std::size_t i = 0; i < order.size(); ++i) position.emplace(order[i].path, i);

  struct Entity {
    std::string name;
    std::string library;
    std::vector<Candidate> candidates;
  };
  std::map<std::string, Entity, Host::VhdlNameLess> entities;
  for (const FileInfo& file : files) {
    auto placed = position.find(file.path);
    for (const UnitInfo& unit : file.units) {
      if (unit.type != "Architecture" || !unit.entity || !unit.architecture) continue;
      Entity& entity = entities[file.library + ":" + *unit.entity];
      if (entity.candidates.empty()) entity = {*unit.entity, file.library, {}};
      entity.candidates.push_back(
          {*unit.architecture, file.path, unit.line, placed == position.end() ? 0 : placed->second});
    }
  }
  std::vector<Diagnostic> diagnostics;
  for (const auto& [key, entity] : entities) {
    if (entity.candidates.size() > 1)
      diagnostics.push_back(Describe(entity.name, entity.library, entity.candidates, shown));
  }
  return diagnostics;
}

}  // namespace quillon
