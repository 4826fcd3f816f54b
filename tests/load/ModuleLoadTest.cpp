// Loads the module the way a host does: dlopen, InstFactoryEntry, then objects only through the
// registry and interfaces.
#include <dlfcn.h>
#include <gtest/gtest.h>

#include "Identifiers.h"
#include "Prjrep/AutoPtr.h"
#include "RavA/Factory.h"

namespace {

class LoadedModule : public testing::Test {
 protected:
  static void SetUpTestSuite() {
    handle_ = dlopen(QUILLON_MODULE_PATH, RTLD_NOW | RTLD_LOCAL);
    ASSERT_NE(handle_, nullptr) << dlerror();
    auto entry = reinterpret_cast<void (*)()>(dlsym(handle_, "InstFactoryEntry"));
    ASSERT_NE(entry, nullptr) << dlerror();
    entry();
  }
  static void* handle_;
};
void* LoadedModule::handle_ = nullptr;

}  // namespace

TEST_F(LoadedModule, ExportsOnlyTheEntry) {
  // Symbols of the module's own classes stay hidden.
  EXPECT_EQ(dlsym(handle_, "_ZN3Vad8DbObjectD0Ev"), nullptr);
  EXPECT_EQ(dlsym(handle_, "_ZN3Vad11InstFactoryEntryEv"), nullptr);
}

TEST_F(LoadedModule, EveryRegisteredClassCanBeCreatedThroughTheRegistry) {
  std::vector<Port::XUID> classes = RavA::Factory::RegisteredClasses();
  for (const Port::XUID& id : classes) {
    Prjrep::AutoRelease<CitI::IInterface> object(RavA::Factory::CreateInstance(id));
    ASSERT_NE(object.Get(), nullptr) << id.ToString();
    EXPECT_EQ(object->QueryInterface(CitI::IInterface::Iid()), object.Get()) << id.ToString();
    EXPECT_EQ(Prjrep::RefCountOf(object.Get()), 1u) << id.ToString();
  }
}
