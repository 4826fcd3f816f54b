// A port record of the port extractor, handed out as IHdlPort.
#pragma once

#include <cstdint>
#include <utility>

#include "IHdlPort.h"
#include "Prjrep/TFace.h"

class PepExtractor;
struct PepPort;

namespace Vad {

// Has no reference count of its own: the port iterator that hands it out keeps it alive (see
// CPepPortIter), and destroying the IHdlPort face does nothing.
class CPepPort final {
 public:
  // `record` belongs to `extractor` (which may be null when the record is owned elsewhere) and
  // must outlive this wrapper; `position` is 1-based.
  CPepPort(const PepPort* record, const PepExtractor* extractor, std::uint32_t position);
  ~CPepPort();
  CPepPort(const CPepPort&) = delete;
  CPepPort& operator=(const CPepPort&) = delete;

  // IHdlPort and IInterface answer the IHdlPort face.
  CitI::IInterface* QueryInterface(const Port::XUID& id);
  IHdlPort* Face() { return &face_; }
  const PepExtractor* Extractor() const { return extractor_; }

  CitI::Result GetName(Port::StringBase* out) const;
  std::uint32_t GetPosition() const { return position_; }
  CitI::Result GetTypeName(Port::StringBase* out) const;
  std::int32_t GetDirection() const;
  std::int32_t GetRangeSpan() const;
  bool HasRange() const;
  std::int32_t GetRangeLow() const;
  std::int32_t GetRangeHigh() const;

 private:
  class CPepPort_IHdlPort final : public Prjrep::TFace<IHdlPort, CPepPort> {
   public:
    using TFace::TFace;
    CitI::Result getName(Port::StringBase* out) override { return owner()->GetName(out); }
    std::uint32_t getPosition() override { return owner()->GetPosition(); }
    CitI::Result getTypeName(Port::StringBase* out) override { return owner()->GetTypeName(out); }
    std::int32_t getDirection() override { return owner()->GetDirection(); }
    std::int32_t getRangeSpan() override { return owner()->GetRangeSpan(); }
    bool hasRange() override { return owner()->HasRange(); }
    std::int32_t getRangeLow() override { return owner()->GetRangeLow(); }
    std::int32_t getRangeHigh() override { return owner()->GetRangeHigh(); }
  };

  // Both bounds as written: left, right.
  std::pair<std::int32_t, std::int32_t> Bounds() const;

  const PepPort* record_;
  const PepExtractor* extractor_;
  std::uint32_t position_;
  CPepPort_IHdlPort face_{this};
};

}  // namespace Vad
