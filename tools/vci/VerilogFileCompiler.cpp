#include "vci/VerilogFileCompiler.h"

#include <utility>

#include "vci/VerilogMacroState.h"
#include "vci/VerilogMessageLog.h"
#include "vci/VerilogMessageText.h"
#include "vci/VerilogModuleParser.h"
#include "vci/VerilogPreprocessor.h"
#include "vci/VerilogSourceFile.h"

namespace Hx_Vci {

VerilogFileCompiler::Compiled VerilogFileCompiler::Compile(
    const std::string& path, std::shared_ptr<const VerilogMacroTable> macros) const {
  Compiled compiled;
  auto result = std::make_shared<VerilogFileResult>();
  VerilogMessageLog log;
  std::string text;
  const VerilogSourceFile::ReadStatus status = VerilogSourceFile::Read(path, &text, &compiled.stamp);
  if (status != VerilogSourceFile::ReadStatus::kOk) {
    if (status == VerilogSourceFile::ReadStatus::kTooLarge) {
      log.Error(path, 0, VerilogMessageText::kFileTooLarge, VerilogMessageLog::Quote(path).c_str(),
                static_cast<unsigned long long>(VerilogSourceFile::kMaxSize));
    } else {
      log.Error(path, 0, VerilogMessageText::kCannotOpen, VerilogMessageLog::Quote(path).c_str());
    }
    result->macrosAfter = std::move(macros);
    result->messages = log.Take();
    compiled.result = std::move(result);
    return compiled;
  }

  VerilogMacroState macroState(std::move(macros));
  VerilogPreprocessor preprocessor(macroState, includeDirs_, log);
  const VerilogPreprocessedText preprocessed = preprocessor.Run(path, text);
  text = std::string();  // the source is no longer needed; free it before parsing

  VerilogModuleParser parser(preprocessed, log);
  result->readable = true;
  result->modules = parser.Parse();
  result->primitives = parser.TakePrimitives();
  result->macrosAfter = macroState.Snapshot();
  result->dependencies = preprocessor.TakeDependencies();
  result->messages = log.Take();
  compiled.result = std::move(result);
  return compiled;
}

}  // namespace Hx_Vci
