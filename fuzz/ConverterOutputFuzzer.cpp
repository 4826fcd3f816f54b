// Any input as the hierarchy description a converter wrote, read by the hierarchy grammar.
#include <cstddef>
#include <cstdint>

#include "FuzzProject.h"
#include "qhParser.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  fuzz::SetUpOnce();
  const std::string path = fuzz::WriteInput(data, size, ".hrf");
  fuzz::OneFileProject one(path, "PLUGIN_Abel");
  Vad::CParserConfigHolder* holder = one.holder();
  holder->BeginParse(nullptr);
  Vad::qhParser(Port::StringBase(path), *holder).Parse();
  holder->EndParse();
  return 0;
}
