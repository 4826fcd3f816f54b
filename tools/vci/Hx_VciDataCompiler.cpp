#include "vci/Hx_VciDataCompiler.h"

#include <exception>
#include <functional>
#include <string>
#include <utility>
#include <vector>

#include "vci/VerilogCommandLine.h"
#include "vci/VerilogDesignBuilder.h"
#include "vci/VerilogFileCache.h"
#include "vci/VerilogFileCompiler.h"
#include "vci/VerilogMacroTable.h"
#include "vci/VerilogMessageLog.h"
#include "vci/VerilogMessageText.h"

namespace Hx_Vci {

namespace {

std::shared_ptr<const VerilogMacroTable> MacrosOf(
    const std::vector<std::pair<std::string, std::string>>& defines) {
  auto macros = std::make_shared<VerilogMacroTable>();
  for (const auto& [name, value] : defines) {
    VerilogMacro macro;
    macro.body = value;
    macros->Define(name, std::move(macro));
  }
  return macros;
}

std::uint64_t HashOf(const std::vector<std::string>& texts) {
  std::uint64_t hash = 0x84222325CBF29CE4ull;
  for (const std::string& text : texts) {
    hash = (hash ^ std::hash<std::string>()(text)) * 0x100000001B3ull;
    hash ^= hash >> 29;
  }
  return hash;
}

void ReportError(const std::string& text) noexcept {
  try {
    VerilogMessageLog::Issue({{VerilogSeverity::kError, "", 0, text}});
  } catch (...) {
    // nothing more can be done; the caller still gets no access object
  }
}

}  // namespace

DataCompiler::DataCompiler() : DataCompiler(VerilogFileCache::Shared()) {}

DataCompiler::DataCompiler(std::shared_ptr<VerilogFileCache> cache)
    : cache_(cache ? std::move(cache) : std::make_shared<VerilogFileCache>()) {}

DataCompiler::~DataCompiler() = default;

std::unique_ptr<Hx_VpiAccess> DataCompiler::compile(int argc, const char* const* argv) {
  try {
    return CompileFiles(argc, argv);
  } catch (const std::exception& e) {
    ReportError(VerilogMessageLog::Format(VerilogMessageText::kInternalError, e.what()));
  } catch (...) {
    ReportError(VerilogMessageLog::Format(VerilogMessageText::kInternalError, "unknown failure"));
  }
  return nullptr;
}

// Each file starts from the macro state that the files before it left; the cache compiles only
// the files it keeps no current result for.
std::unique_ptr<Hx_VpiAccess> DataCompiler::CompileFiles(int argc, const char* const* argv) {
  lastFileMessages_.clear();
  const VerilogCommandLine commandLine(argc, argv);
  VerilogMessageLog::Issue(commandLine.messages());
  const std::vector<std::string_view>& files = commandLine.files();
  if (files.empty()) {
    ReportError(VerilogMessageText::kNoSourceFile);
    return nullptr;
  }
  const VerilogFileCompiler fileCompiler(commandLine.includeDirs());
  bool lastCompiled = false;
  auto compile = [&](std::size_t index, const std::string& path,
                     const std::shared_ptr<const VerilogMacroTable>& macros) {
    VerilogFileCompiler::Compiled compiled = fileCompiler.Compile(path, macros);
    VerilogMessageLog::Issue(compiled.result->messages);
    lastCompiled = index + 1 == files.size();
    return compiled;
  };
  const VerilogFileCache::ChainResult chain = cache_->CompileChain(
      files, MacrosOf(commandLine.defines()), HashOf(commandLine.includeDirs()), compile);
  const VerilogFileResult& result = *chain.result;
  lastFileMessages_ = result.messages;
  if (!lastCompiled) {
    VerilogMessageLog::Issue(result.messages);  // the file compiled is reported in full every time
  }
  if (!result.readable) {
    return nullptr;
  }
  return std::make_unique<Hx_VpiAccess>(VerilogDesignBuilder::Build(result.modules, *chain.primitives));
}

}  // namespace Hx_Vci
