// The limits that bound the work done on hostile input, each with the message that reports it.
// Every reader that enforces one takes it from here.
#pragma once

#include <cstddef>
#include <cstdint>

namespace Port::InputLimits {

// Project files and file lists are read whole into memory.
inline constexpr std::uint64_t kMaxListBytes = std::uint64_t{64} << 20;
inline constexpr const char* kListTooLarge =
    "%s is larger than the %llu bytes a project file or file list may hold";

// A source file the command line accepts.
inline constexpr std::uint64_t kMaxSourceBytes = std::uint64_t{1} << 30;
inline constexpr const char* kSourceTooLarge = "%s is larger than the %llu bytes a source file may hold";

// Sources, project files and lists are regular files; a device, pipe or socket could block or
// never end.
inline constexpr const char* kNotRegularFile = "%s is not a regular file";

// The project property that sets the converters' time limit in seconds (0: none).
inline constexpr const char* kConverterTimeoutProperty = "PROP_QuillonConverterTimeout";
// Seconds a converter may run before its whole process group is ended.
inline constexpr unsigned kDefaultConverterSeconds = 300;
inline constexpr const char* kConverterTimedOut = "%s did not finish within %u seconds and was stopped";

// Hierarchy descriptions: one instance range, and all the ranges of one file, make at most so
// many labels.
inline constexpr std::uint32_t kMaxRangeLabels = 65536;
inline constexpr const char* kRangeTooWide = "Syntax error: instance range %s(%u:%u) too wide";
inline constexpr std::uint64_t kMaxHierarchyLabels = std::uint64_t{1} << 17;
inline constexpr const char* kTooManyLabels =
    "the instance ranges of this file make more than %llu labels; further ranges are ignored";

// The Verilog preprocessor, per compiled file; the compiler reports them with its own texts in
// vci/VerilogMessageText.h (kIncludeTooDeep, kMacroTooDeep, kMacroTooLarge, kExpansionBudgetSpent,
// kTooManyIncludes).
inline constexpr int kMaxIncludeDepth = 64;
inline constexpr int kMaxMacroDepth = 64;
inline constexpr std::size_t kMaxMacroExpansionBytes = std::size_t{16} << 20;
inline constexpr std::size_t kMaxExpansionBytes = std::size_t{128} << 20;
inline constexpr std::size_t kMaxIncludesPerFile = 4096;

}  // namespace Port::InputLimits
