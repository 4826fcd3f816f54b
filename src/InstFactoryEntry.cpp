// The module's only exported function.
extern "C" __attribute__((visibility("default"))) void InstFactoryEntry() {}
