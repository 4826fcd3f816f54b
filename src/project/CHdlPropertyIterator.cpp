#include "CHdlPropertyIterator.h"

#include "Identifiers.h"
#include "Port/InitObjects.h"

namespace Vad {

Prjrep::AutoRelease<IPropertyInstanceIterator> CHdlPropertyIterator::New(CParserConfigBase* config) {
  return Prjrep::AutoRelease<IPropertyInstanceIterator>(new CHdlPropertyIterator(config));
}

CHdlPropertyIterator::CHdlPropertyIterator(CParserConfigBase* config) : config_(config), keepAlive_(config) {
  First();
}

CitI::IInterface* CHdlPropertyIterator::QueryInterface(const Port::XUID& id) {
  if (id == IPropertyInstanceIterator::Iid() || id == CitI::IInterface::Iid()) return this;
  if (id == Prjrep::IRefCount::Iid() || id == Prjrep::IRefCountV1::Iid()) return &refs_;
  if (id == InterfaceIds::ImplementationIdentity()) return this;
  return nullptr;
}

CParserConfigBase::PropertyTable::const_iterator CHdlPropertyIterator::Settle() {
  const auto& properties = config_->Properties();
  if (atEnd_) return properties.end();
  auto it = properties.lower_bound(name_);
  if (it == properties.end()) {
    atEnd_ = true;
    name_.Empty();
  } else {
    name_ = it->first;
  }
  return it;
}

IPropertyInstance* CHdlPropertyIterator::Current() {
  auto it = Settle();
  return atEnd_ ? nullptr : it->second.Get();
}

CitI::Result CHdlPropertyIterator::First() {
  const auto& properties = config_->Properties();
  atEnd_ = properties.empty();
  name_ = atEnd_ ? Port::StringBase() : properties.begin()->first;
  return CitI::kOk;
}

CitI::Result CHdlPropertyIterator::Next() {
  Settle();
  if (atEnd_) return CitI::kFail;
  const auto& properties = config_->Properties();
  auto next = properties.upper_bound(name_);
  atEnd_ = next == properties.end();
  name_ = atEnd_ ? Port::StringBase() : next->first;
  return CitI::kOk;
}

bool CHdlPropertyIterator::IsDone() {
  Settle();
  return atEnd_;
}

Port::StringBase CHdlPropertyIterator::CurrentName() {
  Settle();
  return name_;
}

}  // namespace Vad
