#include "xdm/Xdm_DesignMgr.h"

#include <utility>

Xdm_DesignMgr::Xdm_DesignMgr() = default;

Xdm_DesignMgr::~Xdm_DesignMgr() = default;

Xdm_Design* Xdm_DesignMgr::AddDesign(std::string name) {
  designs_.push_back(std::make_unique<Xdm_Design>(std::move(name)));
  return designs_.back().get();
}

void Xdm_DesignMgr::Clear() { designs_.clear(); }
