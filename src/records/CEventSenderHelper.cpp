#include "CEventSenderHelper.h"

#include <algorithm>

namespace Prjrep {

CEventSenderHelper::~CEventSenderHelper() {
  closing_ = true;
  for (std::size_t i = 0; i < receivers_.size(); ++i) {
    if (receivers_[i]) RemoveReceiver(receivers_[i]);
  }
  closing_ = false;
}

CitI::IInterface* CEventSenderHelper::QueryInterface(const Port::XUID& id) {
  if (id == IEventSender::Iid()) return this;
  return owner_ ? owner_->QueryInterface(id) : nullptr;
}

bool CEventSenderHelper::IsListed(IEventReceiver* receiver) const {
  return std::find(receivers_.begin(), receivers_.end(), receiver) != receivers_.end();
}

CitI::Result CEventSenderHelper::AddReceiver(IEventReceiver* receiver) {
  if (!receiver || closing_) return CitI::kFail;
  if (IsListed(receiver)) return CitI::kOk;
  auto empty = std::find(receivers_.begin(), receivers_.end(), nullptr);
  if (empty != receivers_.end()) {
    *empty = receiver;
  } else {
    receivers_.push_back(receiver);
  }
  receiver->OnAttach(this);
  return CitI::kOk;
}

CitI::Result CEventSenderHelper::RemoveReceiver(IEventReceiver* receiver) {
  if (!receiver) return CitI::kFail;
  auto entry = std::find(receivers_.begin(), receivers_.end(), receiver);
  if (entry == receivers_.end()) return CitI::kOk;
  *entry = nullptr;
  receiver->OnDetach(this);
  return CitI::kOk;
}

bool CEventSenderHelper::SendEvent(CitI::IInterface* event) {
  if (!event) return false;
  // Indexing (not iterators) keeps the walk valid when a receiver adds another during the send.
  for (std::size_t i = 0; i < receivers_.size(); ++i) {
    if (IEventReceiver* receiver = receivers_[i]) receiver->OnEvent(event);
  }
  return true;
}

CitI::Result CEventSenderHelper::Compact() {
  std::erase(receivers_, nullptr);
  return CitI::kOk;
}

}  // namespace Prjrep
