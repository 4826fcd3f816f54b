// A Verilog data compiler: compiles the files of a command line and offers the result through a
// VPI access object. Create it with Hx_Vci::create_data_compiler.
//
// The files are one compilation unit, compiled in argument order, so macros defined in a file are
// known in the files after it; the access object yields the modules of the last file. Problems
// are reported as host messages (category "VerilogCompiler") and never stop the compile.
#pragma once

#include <memory>
#include <vector>

#include "vci/Hx_VpiAccess.h"
#include "vci/VerilogMessage.h"

namespace Hx_Vci {

class VerilogFileCache;

class DataCompiler {
 public:
  // Uses the cache of the process (VerilogFileCache::Shared), so that compilers made one after
  // the other share what they compiled.
  DataCompiler();
  // Uses `cache`; a null cache gives the compiler a cache of its own.
  explicit DataCompiler(std::shared_ptr<VerilogFileCache> cache);
  DataCompiler(const DataCompiler&) = delete;
  DataCompiler& operator=(const DataCompiler&) = delete;
  ~DataCompiler();

  // `argv` holds `argc` texts: the command name, the Verilog files in compile order and the
  // options (+define+, +incdir+, and others that are accepted and ignored). Answers the compiled
  // design, ready for queries, or none when it could not be compiled (no file given, or the last
  // file cannot be read). Throws nothing.
  std::unique_ptr<Hx_VpiAccess> compile(int argc, const char* const* argv);

  VerilogFileCache& cache() const { return *cache_; }

  // The messages of the last file of the last compile (the file whose modules it answered),
  // whether that file was compiled or its result came from the cache.
  const std::vector<VerilogMessage>& lastFileMessages() const { return lastFileMessages_; }

 private:
  std::unique_ptr<Hx_VpiAccess> CompileFiles(int argc, const char* const* argv);

  std::shared_ptr<VerilogFileCache> cache_;
  std::vector<VerilogMessage> lastFileMessages_;
};

}  // namespace Hx_Vci
