// The iterator over a parser configuration's properties, in name order.
#pragma once

#include "CParserConfigBase.h"
#include "HdlSets.h"
#include "Port/StringBase.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/TRefCountHelper.h"

namespace Vad {

// Holds a reference on its configuration. It stands on a name, so properties added or removed
// around it do not invalidate it: when its name is gone it moves on to the next one.
class CHdlPropertyIterator final : public IPropertyInstanceIterator {
 public:
  // A new iterator on the first property, carrying its one reference.
  static Prjrep::AutoRelease<IPropertyInstanceIterator> New(CParserConfigBase* config);

  // Answers IPropertyInstanceIterator, IInterface and the implementation identity with itself.
  CitI::IInterface* QueryInterface(const Port::XUID& id) override;
  IPropertyInstance* Current() override;
  CitI::Result First() override;
  // 0 when already past the end.
  CitI::Result Next() override;
  bool IsDone() override;

  bool Iterates(const CParserConfigBase* config) const { return config_ == config; }
  // The name the iterator stands on; empty past the end.
  Port::StringBase CurrentName();

 private:
  explicit CHdlPropertyIterator(CParserConfigBase* config);
  ~CHdlPropertyIterator() override = default;
  friend class Prjrep::TRefCountHelper<CHdlPropertyIterator>;

  // Moves a position whose name was removed on to the next name.
  CParserConfigBase::PropertyTable::const_iterator Settle();

  CParserConfigBase* config_;
  Prjrep::AutoPtr<CitI::IInterface> keepAlive_;
  Port::StringBase name_;
  bool atEnd_ = true;
  Prjrep::TRefCountHelper<CHdlPropertyIterator> refs_{this};
};

}  // namespace Vad
