// The loader of the timing primitive library "timecell", read through the simulation mapping file.
#pragma once

#include "CLibLoader.h"

namespace Vad {

class CTimecellLoader final : public CLibLoader {
 public:
  CTimecellLoader();

 protected:
  Port::StringBase FamilyTestFile(const Port::StringBase& family) const override;
  Port::StringBase FamilyDirectory(const Port::StringBase& family) const override;
  Port::StringBase DefaultDirectory() const override;
  // The simulation mapping names the libraries under the fixed "nt" folder whatever the
  // platform, so the library directory does not enter it.
  Port::StringBase MappingTextFor(const Port::StringBase& libraryDirectory) const override;
};

}  // namespace Vad
