// An object of the compiled design (a module, port, net, ...) reached through a VPI handle: its
// type, integer and text properties, one-to-one relations and the objects it contains.
//
// An object holds references only on objects below it in the design (contained objects, and
// relations such as a port's low connection); a reference back up would keep both alive forever.
#pragma once

#include <string>
#include <vector>

#include "vci/Hx_VpiProperties.h"
#include "vci/Hx_VpiPtr.h"

class Hx_VpiObject;
using Hx_VpiHandlePtr = Hx_VpiPtr<Hx_VpiObject>;

class Hx_VpiObject : public Hx_VpiCounted {
 public:
  explicit Hx_VpiObject(int type);

  int GetType() const { return type_; }

  // vpiUndefined when the property was never set.
  int GetInt(int property) const;
  void SetInt(int property, int value);
  // Empty when the property was never set.
  std::string GetStr(int property) const;
  void SetStr(int property, std::string value);

  // None when the relation was never set; setting none removes it.
  Hx_VpiHandlePtr GetRelated(int relation) const;
  void SetRelated(int relation, Hx_VpiHandlePtr target);

  // Contained objects are kept in the order added and selected by their own type, so that a
  // module's instances are its contained objects of type vpiModule. A null child is ignored.
  void AddChild(Hx_VpiHandlePtr child);
  std::vector<Hx_VpiHandlePtr> GetChildren(int type) const;

 protected:
  ~Hx_VpiObject() override;

 private:
  int type_;
  Hx_VpiProperties<int, 1> ints_;
  Hx_VpiProperties<std::string, 2> strs_;
  Hx_VpiProperties<Hx_VpiHandlePtr, 1> relations_;
  std::vector<Hx_VpiHandlePtr> children_;
};
