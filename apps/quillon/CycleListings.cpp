#include "CycleListings.h"

#include <string_view>

namespace quillon {

namespace {

// The module's texts (its compile order's message table).
constexpr std::string_view kListingHeader = "Found circular dependency consisting of the following files:\n";
constexpr std::string_view kListingFilePrefix = "          ";
constexpr std::string_view kListingEnd = "\n";
constexpr std::string_view kOrderCut =
    "Due to the above cyclic loop(s) a valid compile order could not be generated.\n";

}  // namespace

void CycleListings::Take(const Port_MsgRecord& record, std::vector<Port_MsgRecord>& ready) {
  if (record.type == Port_MsgMan::kWarning && record.text == kOrderCut) orderWasCut_ = true;
  bool listingLine = record.type == Port_MsgMan::kWarning &&
                     (record.text == kListingHeader || record.text == kListingEnd ||
                      (!listing_.empty() && record.text.starts_with(kListingFilePrefix)));
  if (!listingLine) {
    Release(ready);  // a listing cut short is passed on as it is
    ready.push_back(record);
    return;
  }
  if (record.text == kListingHeader) Release(ready);
  listing_.push_back(record);
  if (record.text != kListingEnd) return;
  std::string files;
  for (const Port_MsgRecord& line : listing_) files += line.text;
  if (listed_.insert(files).second) Release(ready);
  listing_.clear();
}

void CycleListings::Release(std::vector<Port_MsgRecord>& ready) {
  ready.insert(ready.end(), listing_.begin(), listing_.end());
  listing_.clear();
}

}  // namespace quillon
