// The host library's components that the module reaches by interface, and their registration.
#pragma once

#include "CitI.h"
#include "Identifiers.h"

namespace Host {

// Registers a factory for every host component class below whose class identifier has no
// factory yet: the file-name helper and the base services under the identifiers the module
// uses (Vad::ClassIds::HostFileNameHelper, HostBaseServices), the others under ClassIds. A host
// calls it once at start; calling it again changes nothing, and a factory that a host or a test
// registered itself under one of these identifiers is kept. True when every host class has a
// factory afterwards.
bool RegisterHostComponents();

// Removes the factories registered under the host component class identifiers, whoever
// registered them.
void UnregisterHostComponents();

namespace ClassIds {

QUILLON_XUID_FROM_TEXT(FileType, "{FAA67F0D-D484-428B-95A5-2C46A5B744C3}")
QUILLON_XUID_FROM_TEXT(FileComponent, "{B140F90C-BFB1-42B9-B838-F36C15D33CA4}")
QUILLON_XUID_FROM_TEXT(SourceLibrary, "{292B85AE-C904-4B8A-8C11-3A27B6039A1E}")
QUILLON_XUID_FROM_TEXT(DataStore, "{E98FA08D-F77E-40CF-8AD3-13F875D35B1C}")
QUILLON_XUID_FROM_TEXT(EventReceiver, "{FB20DF33-BCA7-4C49-ACB1-986E59743EEE}")
QUILLON_XUID_FROM_TEXT(PropertyInstance, "{295684F7-40A5-4820-8FD6-D4D852E0279E}")

}  // namespace ClassIds

}  // namespace Host
