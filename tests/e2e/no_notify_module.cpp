// A module with only one of the two entry points an effect must export.
extern "C" void PluginInfo(void*, void*, void*) {}
