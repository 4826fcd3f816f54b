// A netlist database opened for reading. The model owns its design manager and, through it, every
// design, view, block and property; destroying the model releases them all, so no pointer obtained
// from it may be used afterwards.
//
// Every failure is thrown as Xdm_Exception::Base.
#pragma once

#include "xdm/Xdm_DesignMgr.h"

class Xdm_Model {
 public:
  static constexpr int kOpenForReading = 2;  // file mode of Open
  static constexpr int kTxnRead = 1;         // transaction type of CreateTxn

  static constexpr const char* kUnavailableMessage = "netlist database support is not available";
  static constexpr const char* kNotOpenMessage = "no netlist database is open";

  // True when `path` names a readable netlist database.
  static bool CanOpen(const char* path);

  // `client`, `application` and `version` identify the reader to the database ("SnxParser",
  // "SnxParser", "1.1"); callers pass false for `keepHistory`.
  Xdm_Model(const char* client, const char* application, const char* version, bool keepHistory);
  Xdm_Model(const Xdm_Model&) = delete;
  Xdm_Model& operator=(const Xdm_Model&) = delete;
  ~Xdm_Model();

  // Reads the database at `path`; throws when it cannot be read.
  void Open(const char* path, int mode);
  // Starts a transaction on the open database; throws when none is open.
  void CreateTxn(const char* name, int type);

  // Never null; empty until a database has been opened.
  Xdm_DesignMgr* GetDesignMgr() { return &designMgr_; }

 private:
  Xdm_DesignMgr designMgr_;
};
