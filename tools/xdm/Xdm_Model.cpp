#include "xdm/Xdm_Model.h"

#include "xdm/Xdm_Exception.h"
#include "xdm/Xdm_FileReader.h"

bool Xdm_Model::CanOpen(const char* path) {
  return path != nullptr && Xdm_FileReader::IsNetlistDatabase(path);
}

Xdm_Model::Xdm_Model(const char*, const char*, const char*, bool) {}

Xdm_Model::~Xdm_Model() = default;

void Xdm_Model::Open(const char* path, int mode) {
  Close();
  if (mode != kOpenForReading) {
    throw Xdm_Exception::Base(kWrongModeMessage);
  }
  if (path == nullptr) {
    throw Xdm_Exception::Base(kNoPathMessage);
  }
  try {
    Xdm_FileReader::Read(path, &designMgr_);
  } catch (...) {
    // A database read in part must not look like a complete one.
    designMgr_.Clear();
    throw;
  }
  open_ = true;
}

void Xdm_Model::CreateTxn(const char*, int) {
  if (!open_) {
    throw Xdm_Exception::Base(kNotOpenMessage);
  }
}

void Xdm_Model::Close() {
  designMgr_.Clear();
  open_ = false;
}
