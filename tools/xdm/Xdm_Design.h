// A design of a netlist database with its views.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "xdm/Xdm_Itr.h"
#include "xdm/Xdm_PropertyHolder.h"
#include "xdm/Xdm_View.h"

using Xdm_ViewItr = Xdm_Itr<Xdm_View>;

class Xdm_Design : public Xdm_PropertyHolder {
 public:
  explicit Xdm_Design(std::string name);
  ~Xdm_Design() override;

  const std::string& GetName() const { return name_; }
  // The views in the order they were added; valid while the design lives.
  Xdm_ViewItr GetViewItr() const { return Xdm_ViewItr(views_); }
  // The first view of that exact name; null when there is none or `name` is null.
  Xdm_View* GetViewByName(const char* name) const;

  // Creates a view owned by the design.
  Xdm_View* AddView(std::string name);

 private:
  std::string name_;
  std::vector<std::unique_ptr<Xdm_View>> views_;
};
