#include "MsgCapture.h"

#include <cstdlib>
#include <cwchar>
#include <string>
#include <vector>

#include "Port/InitObjects.h"
#include "Port/MsgDispatcher.h"

namespace Vad {

MsgCapture::MsgCapture() : Port_MsgManDefault(nullptr) {
  std::vector<Port_MsgMan*> managers;
  Port_MsgDispatcher::getAllMsgMans(managers);
  for (Port_MsgMan* manager : managers) {
    m_savedManagers[manager] = manager->isEnabled();
    Port_MsgDispatcher::removeMsgMan(manager);
  }
  Port_MsgDispatcher::addMsgMan(this);
  enable();
}

MsgCapture::~MsgCapture() {
  Port_MsgDispatcher::removeMsgMan(this);
  for (const auto& [manager, wasEnabled] : m_savedManagers) {
    Port_MsgDispatcher::addMsgMan(manager);
    if (wasEnabled) {
      manager->enable();
    } else {
      manager->disable();
    }
  }
  Port_MsgDispatcher::getDefaultMsgMan()->enable();
}

void MsgCapture::writeMsgLines(MsgType type, const wchar_t* const* lines, int count) {
  if (type != kError && type != kWarning && type != kInfo) return;
  for (int i = 0; i < count; ++i) {
    // As many bytes as the line has characters: a character that needs more is cut off there.
    std::string buffer(std::wcslen(lines[i]), '\0');
    std::size_t written = std::wcstombs(buffer.data(), lines[i], buffer.size());
    if (written == static_cast<std::size_t>(-1)) continue;
    buffer.resize(written);
    m_capturedText.Append(buffer);
  }
}

void MsgCapture::writeMsgEnd(MsgType) {}

}  // namespace Vad
