// The loader of the unified cell library "basecell", read through the synthesis mapping file.
#pragma once

#include "CLibLoader.h"

namespace Vad {

class CBasecellLoader final : public CLibLoader {
 public:
  CBasecellLoader();

 protected:
  Port::StringBase FamilyTestFile(const Port::StringBase& family) const override;
  Port::StringBase FamilyDirectory(const Port::StringBase& family) const override;
  Port::StringBase DefaultDirectory() const override;
  Port::StringBase MappingTextFor(const Port::StringBase& libraryDirectory) const override;
};

}  // namespace Vad
