// Helpers of the Verilog compiler tests: source files in a temporary directory, a message capture
// and a walk of the compiled design the way the Verilog parser walks it.
#pragma once

#include <gtest/gtest.h>

#include <fstream>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "IsolatedDispatcher.h"
#include "Port/MsgCollector.h"
#include "Port/MsgDispatcher.h"
#include "ScopedTempDir.h"
#include "vci/Hx_Vci.h"
#include "vci/VerilogFileCache.h"
#include "vci/VerilogMessageLog.h"

namespace vci_test {

// Collects the messages instead of the managers of the dispatcher.
class MessageCapture {
 public:
  MessageCapture() { Port_MsgDispatcher::addMsgMan(&collector_); }

  const std::vector<Port_MsgRecord>& records() const { return collector_.records(); }
  void clear() { collector_.clearRecords(); }
  // The messages whose text is `text` (as VerilogMessageLog::Format makes it).
  std::vector<Port_MsgRecord> With(const std::string& text) const {
    std::vector<Port_MsgRecord> found;
    for (const Port_MsgRecord& record : records()) {
      if (record.text == text + "\n") found.push_back(record);
    }
    return found;
  }
  bool Has(const std::string& text) const { return !With(text).empty(); }
  std::string All() const {
    std::string all;
    for (const Port_MsgRecord& record : records()) {
      all += record.sourceFile + ":" + std::to_string(record.line) + ": " + record.text;
    }
    return all;
  }
  // "<line>: <text>" per message.
  std::vector<std::string> Lines() const {
    std::vector<std::string> lines;
    for (const Port_MsgRecord& record : records()) {
      lines.push_back(std::to_string(record.line) + ": " + record.text.substr(0, record.text.size() - 1));
    }
    return lines;
  }

 private:
  IsolatedDispatcher isolation_;
  Port_MsgCollector collector_;
};

struct Instance {
  std::string defName;
  std::string name;
  int line = 0;
};

struct Module {
  std::string name;
  int line = 0;
  std::vector<std::string> lowConnections;  // the low-connection name of every port
  std::vector<Instance> instances;
};

// Walks the design with the access operations only, as the Verilog parser does.
inline std::vector<Module> Walk(const Hx_VpiAccess& access) {
  std::vector<Module> modules;
  Hx_VpiIteratorPtr moduleIterator = access.iterate(vpiModule, nullptr);
  while (Hx_VpiHandlePtr module = access.scan(moduleIterator)) {
    Module walked;
    walked.name = access.get_str(vpiName, module);
    walked.line = access.get(vpiLineNo, module);
    Hx_VpiIteratorPtr ports = access.iterate(vpiPort, module);
    while (Hx_VpiHandlePtr port = access.scan(ports)) {
      walked.lowConnections.push_back(access.get_str(vpiName, access.handle(vpiLowConn, port)));
    }
    Hx_VpiIteratorPtr instances = access.iterate(vpiModule, module);
    while (Hx_VpiHandlePtr instance = access.scan(instances)) {
      walked.instances.push_back({access.get_str(vpiDefName, instance), access.get_str(vpiName, instance),
                                  access.get(vpiLineNo, instance)});
    }
    modules.push_back(std::move(walked));
  }
  return modules;
}

inline std::vector<std::string> NamesOf(const std::vector<Module>& modules) {
  std::vector<std::string> names;
  for (const Module& module : modules) names.push_back(module.name);
  return names;
}

// "name:line(low connections)" and " type instance:line" per instance, for each module.
inline std::vector<std::string> Describe(const std::vector<Module>& modules) {
  std::vector<std::string> described;
  for (const Module& module : modules) {
    std::string text = module.name + ":" + std::to_string(module.line) + "(";
    for (std::size_t i = 0; i < module.lowConnections.size(); ++i) {
      text += (i ? "," : "") + module.lowConnections[i];
    }
    text += ")";
    for (const Instance& instance : module.instances) {
      text += " " + instance.defName + " " + instance.name + ":" + std::to_string(instance.line);
    }
    described.push_back(text);
  }
  return described;
}

inline std::vector<std::string> InstanceNamesOf(const Module& module) {
  std::vector<std::string> names;
  for (const Instance& instance : module.instances) names.push_back(instance.defName + " " + instance.name);
  return names;
}

// A temporary directory of Verilog files and a compiler with a cache of its own.
class Project {
 public:
  Project() : cache_(std::make_shared<Hx_Vci::VerilogFileCache>()) {}
  explicit Project(Hx_Vci::VerilogFileCache::Limits limits)
      : cache_(std::make_shared<Hx_Vci::VerilogFileCache>(limits)) {}

  std::string Write(std::string_view name, std::string_view text) const {
    std::string path = dir_.Path(name);
    std::ofstream out(path, std::ios::binary | std::ios::trunc);
    out << text;
    return path;
  }
  std::string Path(std::string_view name) const { return dir_.Path(name); }
  const std::string& dir() const { return dir_.path(); }
  const std::shared_ptr<Hx_Vci::VerilogFileCache>& cache() const { return cache_; }

  // Compiles "commandname" and `arguments` with a fresh compiler on the project's cache; empty
  // when nothing was compiled.
  std::vector<Module> Compile(const std::vector<std::string>& arguments, bool* compiled = nullptr) const {
    std::vector<const char*> argv{"commandname"};
    for (const std::string& argument : arguments) argv.push_back(argument.c_str());
    Hx_Vci::DataCompiler compiler(cache_);
    std::unique_ptr<Hx_VpiAccess> access = compiler.compile(static_cast<int>(argv.size()), argv.data());
    if (compiled != nullptr) *compiled = access != nullptr;
    return access ? Walk(*access) : std::vector<Module>();
  }
  // Compiles the single text `source` as the file `name`.
  std::vector<Module> CompileText(std::string_view name, std::string_view source) const {
    return Compile({Write(name, source)});
  }

 private:
  ScopedTempDir dir_;
  std::shared_ptr<Hx_Vci::VerilogFileCache> cache_;
};

// A capture of the messages and a project, for each test.
class CompilerTest : public testing::Test {
 protected:
  // Compiles `source` alone and compares the modules (as Describe gives them) and the messages.
  void ExpectCompiled(const std::string& source, const std::vector<std::string>& modules,
                      const std::vector<std::string>& messageLines = {}) {
    messages.clear();
    EXPECT_EQ(Describe(project.CompileText("source.v", source)), modules) << source;
    EXPECT_EQ(messages.Lines(), messageLines) << source;
  }

  MessageCapture messages;
  Project project;
};

inline std::string Format(const char* format, const std::string& argument) {
  return Hx_Vci::VerilogMessageLog::Format(format, argument.c_str());
}

}  // namespace vci_test
