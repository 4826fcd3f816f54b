#include "CPepPort.h"

#include <algorithm>
#include <cstdlib>
#include <limits>

#include "Port/SafeCount.h"
#include "pep/PepPort.h"

namespace Vad {

CPepPort::CPepPort(const PepPort* record, const PepExtractor* extractor, std::uint32_t position)
    : record_(record), extractor_(extractor), position_(position) {
  Port::NoteObjectCreated();
}

CPepPort::~CPepPort() { Port::NoteObjectDestroyed(); }

CitI::IInterface* CPepPort::QueryInterface(const Port::XUID& id) {
  if (id == IHdlPort::Iid() || id == CitI::IInterface::Iid()) return &face_;
  return nullptr;
}

CitI::Result CPepPort::GetName(Port::StringBase* out) const {
  if (!out) return CitI::kInvalidArg;
  *out = record_->name;
  return CitI::kOk;
}

CitI::Result CPepPort::GetTypeName(Port::StringBase* out) const {
  if (!out) return CitI::kInvalidArg;
  *out = record_->typeName;
  return CitI::kOk;
}

std::int32_t CPepPort::GetDirection() const {
  switch (record_->direction) {
    case PepPort::kDirectionIn:
      return IHdlPort::kDirectionIn;
    case PepPort::kDirectionOut:
      return IHdlPort::kDirectionOut;
    default:
      return IHdlPort::kDirectionOther;
  }
}

// Bounds far apart would overflow a signed 32-bit distance; such a span is reported as the
// largest one there is.
std::int32_t CPepPort::GetRangeSpan() const {
  auto [left, right] = Bounds();
  std::int64_t span = std::llabs(static_cast<std::int64_t>(left) - right);
  return static_cast<std::int32_t>(std::min<std::int64_t>(span, std::numeric_limits<std::int32_t>::max()));
}

bool CPepPort::HasRange() const { return record_->hasRange; }

std::int32_t CPepPort::GetRangeLow() const {
  auto [left, right] = Bounds();
  return std::min(left, right);
}

std::int32_t CPepPort::GetRangeHigh() const {
  auto [left, right] = Bounds();
  return std::max(left, right);
}

std::pair<std::int32_t, std::int32_t> CPepPort::Bounds() const { return {record_->left, record_->right}; }

}  // namespace Vad
