// The host's file-type component (Vad::IFileType).
#pragma once

#include <initializer_list>
#include <string_view>
#include <vector>

#include "IFileType.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/TRefCountHelper.h"

namespace Host {

class FileType final : public Vad::IFileType {
 public:
  // A file type with the given name and extensions (e.g. "VHDL", {"vhd", "vhdl"}); extensions
  // that AddExtension refuses are left out. The factory makes one with no name and no extension.
  static Prjrep::AutoPtr<Vad::IFileType> Create(std::string_view name = {},
                                                std::initializer_list<std::string_view> extensions = {});

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;

  CitI::Result GetName(Port::StringBase* out) override;
  // kInvalidArg for an empty name.
  CitI::Result SetName(const Port::StringBase& name) override;
  CitI::Result GetExtensionCount(std::uint32_t* count) override;
  CitI::Result GetExtension(std::uint32_t index, Port::StringBase* out) override;
  CitI::Result AddExtension(const Port::StringBase& extension) override;
  CitI::Result MatchesPath(const Port::StringBase& path, bool* out) override;

 private:
  explicit FileType(std::string_view name) : name_(name) {}
  bool HasExtension(std::string_view extension) const;

  Prjrep::TRefCountHelper<> refCount_{this};
  Port::StringBase name_;
  std::vector<Port::StringBase> extensions_;
};

}  // namespace Host
