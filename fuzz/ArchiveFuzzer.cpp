// Any input as a stored archive: every object it holds is read back.
#include <cstddef>
#include <cstdint>
#include <string_view>

#include "FuzzProject.h"
#include "Port/FileArchive.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  fuzz::SetUpOnce();
  Port::StringBase error;
  Prjrep::AutoPtr<Prjrep::IArchive> archive =
      Port::FileArchive::OpenFromBytes(std::string_view(reinterpret_cast<const char*>(data), size), &error);
  if (!archive) return 0;
  constexpr int kMaxObjects = 64;
  for (int read = 0; read < kMaxObjects; ++read) {
    Prjrep::AutoRelease<CitI::IInterface> object;
    if (archive->ReadObject(object.Out()) != CitI::kOk) break;
  }
  return 0;
}
