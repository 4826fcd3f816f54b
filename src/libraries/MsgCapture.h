// Silences every message manager of the process while it lives and gathers the messages itself.
#pragma once

#include <map>

#include "Port/MsgManDefault.h"
#include "Port/StringBase.h"

namespace Vad {

// Put one on the stack around calls into a library whose own messages must not reach the user.
// The managers registered when it is made are taken out of the dispatcher and given back, in
// their earlier enabled states, when it is destroyed; the default manager always ends enabled.
class MsgCapture final : public Port_MsgManDefault {
 public:
  MsgCapture();
  ~MsgCapture() override;

  // Lines of errors, warnings and information, appended one after another.
  const Port::StringBase& CapturedText() const { return m_capturedText; }

 private:
  void writeMsgLines(MsgType type, const wchar_t* const* lines, int count) override;
  void writeMsgEnd(MsgType type) override;

  std::map<Port_MsgMan*, bool> m_savedManagers;
  Port::StringBase m_capturedText;
};

}  // namespace Vad
