#include "VerilogParser.h"

#include <cstdint>
#include <new>

#include "CHdlFile.h"
#include "CParserConfigHolder.h"
#include "MsgCapture.h"
#include "PortExtraction.h"
#include "VerilogArguments.h"
#include "pep/PepExtractor.h"
#include "vci/Hx_Vci.h"
#include "vci/Hx_VciDataCompiler.h"
#include "vci/VerilogMessageLog.h"

namespace Vad {
namespace {

std::uint32_t LineOf(const Hx_VpiAccess& access, const Hx_VpiHandlePtr& object) {
  const int line = access.get(vpiLineNo, object);
  return line > 0 ? static_cast<std::uint32_t>(line) : 0;
}

Port::StringBase NameOf(const Hx_VpiAccess& access, int property, const Hx_VpiHandlePtr& object) {
  return Port::StringBase(access.get_str(property, object));
}

// True when the module's first port is connected inside the module to something with a name.
bool FirstPortIsNamed(const Hx_VpiAccess& access, const Hx_VpiHandlePtr& module) {
  const Hx_VpiHandlePtr firstPort = access.scan(access.iterate(vpiPort, module));
  return !access.get_str(vpiName, access.handle(vpiLowConn, firstPort)).empty();
}

void RecordInstances(const Hx_VpiAccess& access, const Hx_VpiHandlePtr& module, CParserConfigHolder& holder) {
  const Hx_VpiIteratorPtr instances = access.iterate(vpiModule, module);
  while (const Hx_VpiHandlePtr instance = access.scan(instances)) {
    const std::uint32_t line = LineOf(access, instance);
    holder.AddCompInst(NameOf(access, vpiName, instance), NameOf(access, vpiDefName, instance), line,
                       VerilogTypeIds::ModuleInstance(), Port::StringBase());
  }
}

}  // namespace

VerilogParser::VerilogParser() {
  try {
    compiler_ = Hx_Vci::create_data_compiler();
  } catch (const std::bad_alloc&) {
    compiler_.reset();
  }
}

VerilogParser::~VerilogParser() = default;

int VerilogParser::Parse(CParserConfigHolder& holder) {
  capturedMessages_.Empty();
  if (!compiler_) return 0;
  try {
    const VerilogArguments arguments(holder);
    {
      MsgCapture capture;
      std::unique_ptr<Hx_VpiAccess> access = compiler_->compile(arguments.Count(), arguments.Vector());
      if (access) RecordModules(*access, holder);
      capturedMessages_ = capture.CapturedText();
    }
    // The compile repeats the messages of the files before this one; the user sees each file's
    // own messages once, when that file is parsed.
    Hx_Vci::VerilogMessageLog::Issue(compiler_->lastFileMessages(), true);
  } catch (const std::bad_alloc&) {
    // Running out of memory ends this file's parse early; what was recorded stays.
  }
  return 0;
}

void VerilogParser::RecordModules(const Hx_VpiAccess& access, CParserConfigHolder& holder) {
  const Hx_VpiIteratorPtr modules = access.iterate(vpiModule, nullptr);
  while (const Hx_VpiHandlePtr module = access.scan(modules)) {
    const std::uint32_t line = LineOf(access, module);
    const bool portFlag = FirstPortIsNamed(access, module);
    holder.AddModule(NameOf(access, vpiName, module), line, portFlag, VerilogTypeIds::Module(),
                     Port::StringBase());
    RecordInstances(access, module, holder);
  }
}

CitI::Result VerilogParser::ExtractPorts(CParserConfigHolder& holder, IHdlDesignUnit* unit,
                                         IHdlPortIterator** ports) {
  auto listOwnFile = [&](std::vector<PortExtraction::DesignFile>& files) {
    PortExtraction::DesignFile file{{}, PepExtractor::kVerilog};
    auto* hdlFile = holder.GetFile() ? Prjrep::QueryAs<IHdlFile>(holder.GetFile()) : nullptr;
    if (!PortExtraction::ExtractorPathOf(hdlFile, file.path)) return false;
    files.push_back(std::move(file));
    return true;
  };
  return PortExtraction::Extract(unit, listOwnFile, ports);
}

}  // namespace Vad
