// A netlist database opened for reading. The model owns its design manager and, through it, every
// design, view, block and property; destroying the model releases them all, so no pointer obtained
// from it may be used afterwards.
//
// The database is a file in the JSON format described in Xdm_FileFormat.h.
//
// Every failure is thrown as Xdm_Exception::Base.
#pragma once

#include "xdm/Xdm_DesignMgr.h"

class Xdm_Model {
 public:
  static constexpr int kOpenForReading = 2;  // file mode of Open
  static constexpr int kTxnRead = 1;         // transaction type of CreateTxn

  static constexpr const char* kNotOpenMessage = "no netlist database is open";
  static constexpr const char* kWrongModeMessage = "a netlist database opens only for reading (mode 2)";
  static constexpr const char* kNoPathMessage = "no netlist database file was named";

  // True when `path` names a readable regular file holding a JSON document with the netlist
  // database marker and version; false for a null path. Reads the whole file; never throws.
  static bool CanOpen(const char* path);

  // `client`, `application` and `version` identify the reader to the database ("SnxParser",
  // "SnxParser", "1.1"); callers pass false for `keepHistory`.
  Xdm_Model(const char* client, const char* application, const char* version, bool keepHistory);
  Xdm_Model(const Xdm_Model&) = delete;
  Xdm_Model& operator=(const Xdm_Model&) = delete;
  ~Xdm_Model();

  // Reads the database at `path`; `mode` must be kOpenForReading. Whatever was open before is
  // closed first: its designs are destroyed, so pointers into them must not be used afterwards.
  // When Open throws, the design manager is left empty and no database is open.
  void Open(const char* path, int mode);
  // Starts a transaction on the open database (reading needs nothing more); throws when none
  // is open.
  void CreateTxn(const char* name, int type);

  // Never null; empty until a database has been opened.
  Xdm_DesignMgr* GetDesignMgr() { return &designMgr_; }

 private:
  void Close();

  Xdm_DesignMgr designMgr_;
  bool open_ = false;
};
