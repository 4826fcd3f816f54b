// What quillon hands the Verilog compiler: the order of the files, macros and include
// directories.
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "CliRun.h"

namespace cli_test {
namespace {

// The design-unit keys of every file, in file order.
// A missing include file is an error of the compiler: `status` 1.
std::vector<std::string> UnitKeys(const std::vector<std::string>& args, const std::string& workDir = {},
                                  int status = 0) {
  std::vector<std::string> all{"--format", "json", "units"};
  all.insert(all.end(), args.begin(), args.end());
  CliResult result = RunQuillon(CliRun{all, workDir, {}});
  EXPECT_EQ(result.status, status) << result.err;
  nlohmann::json answer = nlohmann::json::parse(result.out, nullptr, false);
  std::vector<std::string> keys;
  if (answer.is_discarded()) return keys;
  for (const auto& file : answer["files"]) {
    for (const auto& unit : file["units"]) keys.push_back(unit["key"]);
  }
  return keys;
}

TEST(Verilog, FilesAreCompiledInTheOrderGiven) {
  const std::string first = DataPath("verilog/first.v"), second = DataPath("verilog/second.v");
  // first.v defines the macro that second.v tests.
  EXPECT_EQ(UnitKeys({first, second}), (std::vector<std::string>{"Module|first", "Module|second"}));
  EXPECT_EQ(UnitKeys({second, first}), (std::vector<std::string>{"Module|first"}));
}

TEST(Verilog, MacrosAndIncludeDirectoriesReachTheCompiler) {
  const std::string gated = DataPath("verilog/gated.v");
  // A file's units come in store-key order.
  const std::vector<std::string> both{"Module|from_command_line", "Module|from_include"};
  EXPECT_EQ(UnitKeys({gated}, {}, 1), std::vector<std::string>{});
  EXPECT_EQ(UnitKeys({"-D", "FROM_COMMAND_LINE", gated}, {}, 1),
            std::vector<std::string>{"Module|from_command_line"});
  EXPECT_EQ(UnitKeys({"-I", DataPath("verilog/include"), gated}),
            std::vector<std::string>{"Module|from_include"});
  EXPECT_EQ(UnitKeys({"-D", "FROM_COMMAND_LINE", "-I", DataPath("verilog/include"), gated}), both);
  EXPECT_EQ(UnitKeys({"-f", "gated.f"}, DataPath("verilog")), both);
}

}  // namespace
}  // namespace cli_test
