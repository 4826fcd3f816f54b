// The parser configuration: project properties by name, which parsers read through the holder.
#pragma once

#include <map>

#include "CitI.h"
#include "HdlSets.h"
#include "IHdlParserConfig.h"
#include "IPropertyInstance.h"
#include "Port/StringBase.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/TFace.h"
#include "Prjrep/TRefCountHelper.h"

namespace Vad {

class CParserConfigBase final : public CitI::IInterface {
 public:
  // Name (byte order) -> instance, one reference each.
  using PropertyTable = std::map<Port::StringBase, Prjrep::AutoPtr<IPropertyInstance>>;

  CParserConfigBase() = default;
  // Public for the class factory; the object is otherwise ended by its reference count.
  ~CParserConfigBase() override = default;

  // Answers IRefCount, IHdlParserConfig, IPropertyInstanceSet, its class identifier and
  // IInterface (these two with the object itself).
  CitI::IInterface* QueryInterface(const Port::XUID& id) override;

  // The value text of the named property; empty when it is absent. Always 1.
  CitI::Result GetPropertyValue(const Port::StringBase& name, Port::StringBase& value) const;
  // "****name=value****" for every property in name order, concatenated.
  void GetSignature(Port::StringBase& signature) const;

  // The property set: an instance is filed under the name it reports, replacing an instance of
  // the same name. 0 for a null instance.
  CitI::Result AddProperty(IPropertyInstance* instance);
  // Removes the instance the iterator stands on and moves the iterator on. 0 for a null, foreign
  // or finished iterator.
  CitI::Result RemoveProperty(IPropertyInstanceIterator* position);
  CitI::Result CreatePropertyIterator(IPropertyInstanceIterator** out);
  std::uint32_t GetPropertyCount() const { return static_cast<std::uint32_t>(properties_.size()); }
  CitI::Result ClearProperties();

  const PropertyTable& Properties() const { return properties_; }

 private:
  class XIHdlParserConfig final : public Prjrep::TFace<IHdlParserConfig, CParserConfigBase> {
   public:
    using TFace::TFace;
    CitI::Result Reserved2() override { return CitI::kNotImpl; }
    CitI::Result Reserved3() override { return CitI::kNotImpl; }
    CitI::Result Reserved4() override { return CitI::kNotImpl; }
  };

  class XIPropertyInstanceSet final : public Prjrep::TFace<IPropertyInstanceSet, CParserConfigBase> {
   public:
    using TFace::TFace;
    CitI::Result Add(IPropertyInstance* instance) override { return owner()->AddProperty(instance); }
    CitI::Result Remove(IPropertyInstanceIterator* position) override {
      return owner()->RemoveProperty(position);
    }
    CitI::Result CreateIterator(IPropertyInstanceIterator** out) override {
      return owner()->CreatePropertyIterator(out);
    }
    std::uint32_t GetCount() override { return owner()->GetPropertyCount(); }
    CitI::Result Clear() override { return owner()->ClearProperties(); }
  };

  PropertyTable properties_;
  Prjrep::TRefCountHelper<CParserConfigBase> refs_{this};
  XIHdlParserConfig parserConfigFace_{this};
  XIPropertyInstanceSet propertySetFace_{this};
};

}  // namespace Vad
