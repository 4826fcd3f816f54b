#include "vci/VerilogKeywords.h"

#include <array>
#include <cstddef>
#include <vector>

namespace Hx_Vci {

namespace {

using namespace VerilogKeywordRole;

struct KeywordInfo {
  VerilogKeyword keyword;
  std::string_view text;
  std::uint8_t roles;
};

constexpr KeywordInfo kKeywords[] = {
#define HX_VCI_KEYWORD_INFO(id, text, roles) {VerilogKeyword::id, text, static_cast<std::uint8_t>(roles)},
    HX_VCI_VERILOG_KEYWORDS(HX_VCI_KEYWORD_INFO)
#undef HX_VCI_KEYWORD_INFO
};

constexpr std::size_t kLongest = 24;

// Keywords grouped by first letter and length: a lookup compares at most a handful of words.
class KeywordIndex {
 public:
  KeywordIndex() {
    for (const KeywordInfo& info : kKeywords) {
      buckets_[Bucket(info.text[0], info.text.size())].push_back(&info);
    }
  }
  VerilogKeyword Find(std::string_view word) const {
    if (word.size() < 2 || word.size() >= kLongest || word[0] < 'a' || word[0] > 'z') {
      return VerilogKeyword::kNone;
    }
    for (const KeywordInfo* info : buckets_[Bucket(word[0], word.size())]) {
      if (info->text == word) {
        return info->keyword;
      }
    }
    return VerilogKeyword::kNone;
  }

 private:
  static std::size_t Bucket(char first, std::size_t length) {
    return static_cast<std::size_t>(first - 'a') * kLongest + length;
  }
  std::array<std::vector<const KeywordInfo*>, 26 * kLongest> buckets_;
};

const KeywordInfo* InfoOf(VerilogKeyword keyword) {
  const auto index = static_cast<std::size_t>(keyword);
  return index >= 1 && index <= std::size(kKeywords) ? &kKeywords[index - 1] : nullptr;
}

}  // namespace

VerilogKeyword VerilogKeywords::Find(std::string_view word) {
  static const KeywordIndex index;
  return index.Find(word);
}

VerilogKeyword VerilogKeywords::ClosingOf(VerilogKeyword keyword) {
  switch (keyword) {
    case VerilogKeyword::kPrimitive:
      return VerilogKeyword::kEndprimitive;
    case VerilogKeyword::kPackage:
      return VerilogKeyword::kEndpackage;
    case VerilogKeyword::kInterface:
      return VerilogKeyword::kEndinterface;
    case VerilogKeyword::kProgram:
      return VerilogKeyword::kEndprogram;
    case VerilogKeyword::kConfig:
      return VerilogKeyword::kEndconfig;
    case VerilogKeyword::kFunction:
      return VerilogKeyword::kEndfunction;
    case VerilogKeyword::kTask:
      return VerilogKeyword::kEndtask;
    case VerilogKeyword::kSpecify:
      return VerilogKeyword::kEndspecify;
    case VerilogKeyword::kProperty:
      return VerilogKeyword::kEndproperty;
    case VerilogKeyword::kSequence:
      return VerilogKeyword::kEndsequence;
    case VerilogKeyword::kClocking:
      return VerilogKeyword::kEndclocking;
    case VerilogKeyword::kCovergroup:
      return VerilogKeyword::kEndgroup;
    case VerilogKeyword::kClass:
      return VerilogKeyword::kEndclass;
    case VerilogKeyword::kChecker:
      return VerilogKeyword::kEndchecker;
    case VerilogKeyword::kTable:
      return VerilogKeyword::kEndtable;
    default:
      return VerilogKeyword::kNone;
  }
}

std::string_view VerilogKeywords::TextOf(VerilogKeyword keyword) {
  const KeywordInfo* info = InfoOf(keyword);
  return info == nullptr ? std::string_view() : info->text;
}

}  // namespace Hx_Vci
