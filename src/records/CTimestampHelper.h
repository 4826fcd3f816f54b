// The timestamp of design-unit elements.
#pragma once

#include <cstdint>

#include "ITimestamp.h"

namespace Prjrep {

class CTimestampHelper final : public ITimestamp {
 public:
  explicit CTimestampHelper(CitI::IInterface* owner) : owner_(owner) {}
  CTimestampHelper(const CTimestampHelper&) = delete;
  CTimestampHelper& operator=(const CTimestampHelper&) = delete;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;
  CitI::Result SetToNow() override;
  CitI::Result SetTime(std::int64_t seconds, std::int64_t microseconds) override;
  CitI::Result GetTime(std::int64_t* seconds, std::int64_t* microseconds) override;
  CitI::Result GetText(Port::StringBase* text) override;
  CitI::Result Compare(ITimestamp* other, std::int32_t* order) override;
  CitI::Result IsNewerThan(ITimestamp* other, bool* newer) override;
  CitI::Result IsOlderThan(ITimestamp* other, bool* older) override;
  CitI::Result Load(IArchive* archive) override;
  CitI::Result Save(IArchive* archive) override;

 private:
  // -1, 0 or 1 as this timestamp is earlier than, equal to or later than `other`; false when
  // `other` cannot tell its time.
  bool OrderAgainst(ITimestamp* other, std::int32_t& order);

  CitI::IInterface* owner_;
  std::int64_t seconds_ = 0;
  std::int64_t microseconds_ = 0;
};

}  // namespace Prjrep
