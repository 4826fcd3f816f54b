#include "ListingFilter.h"

#include <algorithm>
#include <cwctype>

namespace quillon {

namespace {

bool IsBlank(const ListingFilter::Message& message) {
  return std::all_of(message.lines.begin(), message.lines.end(), [](const std::wstring& line) {
    return std::all_of(line.begin(), line.end(), [](wchar_t c) { return std::iswspace(c) != 0; });
  });
}

bool OpensListing(const ListingFilter::Message& message) {
  return !message.lines.empty() && !message.lines.back().empty() && message.lines.back().back() == L':';
}

bool IsIndented(const ListingFilter::Message& message) {
  return !message.lines.empty() && !message.lines.front().empty() && message.lines.front().front() == L' ';
}

}  // namespace

std::vector<ListingFilter::Message> ListingFilter::Take(Message message) {
  if (IsBlank(message)) return {};
  if (!listing_.empty() && IsIndented(message)) {
    listing_.push_back(std::move(message));
    return {};
  }
  std::vector<Message> ready = Flush();
  if (OpensListing(message)) {
    listing_.push_back(std::move(message));
  } else {
    ready.push_back(std::move(message));
  }
  return ready;
}

std::vector<ListingFilter::Message> ListingFilter::Flush() {
  std::vector<Message> listing;
  listing.swap(listing_);
  std::vector<std::wstring> text;
  for (const Message& message : listing) text.insert(text.end(), message.lines.begin(), message.lines.end());
  if (listing.size() > 1 && !printed_.insert(text).second) return {};
  return listing;
}

}  // namespace quillon
