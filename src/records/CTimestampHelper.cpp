#include "CTimestampHelper.h"

#include "Port/Time.h"

namespace Prjrep {

CitI::IInterface* CTimestampHelper::QueryInterface(const Port::XUID& id) {
  if (id == ITimestamp::Iid()) return this;
  return owner_ ? owner_->QueryInterface(id) : nullptr;
}

CitI::Result CTimestampHelper::SetToNow() {
  std::int64_t seconds = 0;
  std::int64_t microseconds = 0;
  if (!UT_CPUTIME::GetCurrTime(&seconds, &microseconds)) return CitI::kFail;
  seconds_ = seconds;
  microseconds_ = microseconds;
  return CitI::kOk;
}

CitI::Result CTimestampHelper::SetTime(std::int64_t seconds, std::int64_t microseconds) {
  UT_CPUTIME::normalize(&seconds, &microseconds);
  seconds_ = seconds;
  microseconds_ = microseconds;
  return CitI::kOk;
}

CitI::Result CTimestampHelper::GetTime(std::int64_t* seconds, std::int64_t* microseconds) {
  if (!microseconds || !seconds) return CitI::kInvalidArg;
  *seconds = seconds_;
  *microseconds = microseconds_;
  return CitI::kOk;
}

CitI::Result CTimestampHelper::GetText(Port::StringBase* text) {
  if (!text) return CitI::kInvalidArg;
  *text = UT_TIME::CTime(seconds_);
  text->TrimRight("\n");
  return CitI::kOk;
}

bool CTimestampHelper::OrderAgainst(ITimestamp* other, std::int32_t& order) {
  std::int64_t seconds = 0;
  std::int64_t microseconds = 0;
  if (!other || other->GetTime(&seconds, &microseconds) != CitI::kOk) return false;
  if (seconds_ != seconds) {
    order = seconds_ < seconds ? -1 : 1;
  } else if (microseconds_ != microseconds) {
    order = microseconds_ < microseconds ? -1 : 1;
  } else {
    order = 0;
  }
  return true;
}

CitI::Result CTimestampHelper::Compare(ITimestamp* other, std::int32_t* order) {
  if (!order) return CitI::kInvalidArg;
  return OrderAgainst(other, *order) ? CitI::kOk : CitI::kInvalidArg;
}

CitI::Result CTimestampHelper::IsNewerThan(ITimestamp* other, bool* newer) {
  std::int32_t order = 0;
  if (!newer || !OrderAgainst(other, order)) return CitI::kInvalidArg;
  *newer = order > 0;
  return CitI::kOk;
}

CitI::Result CTimestampHelper::IsOlderThan(ITimestamp* other, bool* older) {
  std::int32_t order = 0;
  if (!older || !OrderAgainst(other, order)) return CitI::kInvalidArg;
  *older = order < 0;
  return CitI::kOk;
}

CitI::Result CTimestampHelper::Save(IArchive* archive) {
  CitI::Result result = archive->WriteInt64(seconds_);
  return result == CitI::kOk ? archive->WriteInt64(microseconds_) : result;
}

CitI::Result CTimestampHelper::Load(IArchive* archive) {
  CitI::Result result = archive->ReadInt64(&seconds_);
  return result == CitI::kOk ? archive->ReadInt64(&microseconds_) : result;
}

}  // namespace Prjrep
