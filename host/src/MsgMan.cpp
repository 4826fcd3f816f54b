#include "Port/MsgMan.h"

#include "Port/MsgDispatcher.h"

namespace {

struct TypeText {
  const char* name;
  const char* prefix;
};

// Indexed by Port_MsgMan::MsgType.
constexpr TypeText kTypeTexts[Port_MsgMan::kMsgTypeCount] = {
    {"error", "ERROR: "},
    {"warning", "WARNING: "},
    {"info", "INFO: "},
    {"status", "STATUS: "},
    {"internal", "INTERNAL ERROR: "},
    {"fatal", "FATAL ERROR: "},
    {"user fatal", "FATAL: "},
    {"debug", "DEBUG: "},
};
constexpr TypeText kUnknownTypeText = {"unknown", "MESSAGE: "};

const TypeText& TextsOf(Port_MsgMan::MsgType type) {
  return Port_MsgMan::isValidType(type) ? kTypeTexts[type] : kUnknownTypeText;
}

}  // namespace

const char* Port_MsgMan::typeName(MsgType type) { return TextsOf(type).name; }
const char* Port_MsgMan::typePrefix(MsgType type) { return TextsOf(type).prefix; }

// A destroyed manager left registered would be called through a dangling pointer.
Port_MsgMan::~Port_MsgMan() { Port_MsgDispatcher::removeMsgMan(this); }
