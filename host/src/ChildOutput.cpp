#include "Port/ChildOutput.h"

namespace Port {

// Defined here so that the class's vtable and type information live once, in the host library.
ChildOutput::~ChildOutput() = default;

}  // namespace Port
