// The designs of one netlist database.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "xdm/Xdm_Design.h"
#include "xdm/Xdm_Itr.h"

using Xdm_DesignItr = Xdm_Itr<Xdm_Design>;

class Xdm_DesignMgr {
 public:
  Xdm_DesignMgr();
  Xdm_DesignMgr(const Xdm_DesignMgr&) = delete;
  Xdm_DesignMgr& operator=(const Xdm_DesignMgr&) = delete;
  ~Xdm_DesignMgr();

  // The designs in database order; valid while the manager lives.
  Xdm_DesignItr GetDesignItr() const { return Xdm_DesignItr(designs_); }

  // Creates a design owned by the manager, after the existing ones.
  Xdm_Design* AddDesign(std::string name);
  // Destroys every design, with all that it holds.
  void Clear();

 private:
  std::vector<std::unique_ptr<Xdm_Design>> designs_;
};
