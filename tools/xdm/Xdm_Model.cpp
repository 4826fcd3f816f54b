#include "xdm/Xdm_Model.h"

#include "xdm/Xdm_Exception.h"

// No database format is readable yet, so no file can be opened and nothing pretends otherwise.
bool Xdm_Model::CanOpen(const char*) { return false; }

Xdm_Model::Xdm_Model(const char*, const char*, const char*, bool) {}

Xdm_Model::~Xdm_Model() = default;

void Xdm_Model::Open(const char*, int) { throw Xdm_Exception::Base(kUnavailableMessage); }

void Xdm_Model::CreateTxn(const char*, int) { throw Xdm_Exception::Base(kNotOpenMessage); }
