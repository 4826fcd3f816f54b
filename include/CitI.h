// Base interfaces, result codes and identifier helpers shared by the host and the module.
#pragma once

#include <cstdint>
#include <string_view>

#include "Port/XUID.h"

// Declares `name()`, at namespace scope, returning the identifier of a GUID text. The
// identifier is a function-local static, built on first use and kept until unload.
#define QUILLON_XUID_FROM_TEXT(name, text)                \
  inline const ::Port::XUID& name() {                     \
    static const ::Port::XUID id{std::string_view(text)}; \
    return id;                                            \
  }
// Declares the static `Iid()` of an interface identified by GUID text.
#define QUILLON_INTERFACE_ID(text)                        \
  static const ::Port::XUID& Iid() {                      \
    static const ::Port::XUID id{std::string_view(text)}; \
    return id;                                            \
  }
// Declares `Iid()` of an interface whose identifier is listed in Identifiers.h.
#define QUILLON_INTERFACE_ID_OF(idFunction) \
  static const ::Port::XUID& Iid() { return idFunction(); }

namespace CitI {

// Every interface operation returns a 64-bit result.
using Result = std::int64_t;
inline constexpr Result kOk = 1;
inline constexpr Result kFail = 0;
inline constexpr Result kInvalidArg = 0x1100000000000003;  // missing or wrong-kind argument
inline constexpr Result kNullOut = 0x1000000200000011;     // null out-parameter (some look-ups)
inline constexpr Result kNotImpl = -1;                     // operation not provided

// Slot 0 of every interface; slot 1 is the virtual destructor. QueryInterface never adds a
// reference: a caller that keeps the pointer takes one through the reference-count interface.
class IInterface {
 public:
  static constexpr Port::XUID Iid() { return {0xC569A98287C54D45ull, 0x8A2C17B796723BDCull}; }
  virtual IInterface* QueryInterface(const Port::XUID& id) = 0;
  virtual ~IInterface() = default;
};

class IFactory : public IInterface {
 public:
  static constexpr Port::XUID Iid() { return {0xCE41BD1486B2417Full, 0xA70435C0E5294564ull}; }
  // Null unless `classId` is exactly the factory's class; otherwise a new object's IInterface
  // carrying one reference for the caller.
  virtual IInterface* CreateInstance(const Port::XUID& classId) = 0;
};

}  // namespace CitI

namespace CommonI {

// The reference-count interface of the factories.
class IRefCount : public CitI::IInterface {
 public:
  static constexpr Port::XUID Iid() { return {0xF35246530FB84605ull, 0xA6C16E80946A2CDDull}; }
  virtual CitI::Result AddRef() = 0;
  virtual CitI::Result Release() = 0;
  virtual CitI::Result GetRefCount(std::uint32_t* count) = 0;
};

}  // namespace CommonI

namespace UtilI {

class ITclCollectable;
inline constexpr Port::XUID kTclCollectableId{0xDAE8C38B4C444839ull, 0x93666C2227A85B8Eull};

}  // namespace UtilI

namespace Prjrep {

// The reference-count interface of every other counted object.
class IRefCountV1 : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID("{566CB84B-9321-4486-9F02-9C0F505504E0}")
  virtual CitI::Result AddRef() = 0;
  virtual CitI::Result Release() = 0;
  virtual std::uint32_t GetRefCount() = 0;
};

class IRefCount : public IRefCountV1 {
 public:
  QUILLON_INTERFACE_ID("{80b45faf-a340-43e6-b60b-0435fadea5f3}")
};

}  // namespace Prjrep
