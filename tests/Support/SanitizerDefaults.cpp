// What the sanitizers are told unless the environment says otherwise. Qt is not instrumented: what it does between its
// own threads would look like races, and Qt Quick keeps textures of its software renderer until the program ends.

extern "C" const char* __tsan_default_options();
extern "C" const char* __tsan_default_options()
{
  return "ignore_noninstrumented_modules=1";
}

extern "C" const char* __lsan_default_suppressions();
extern "C" const char* __lsan_default_suppressions()
{
  return "leak:libQt6Quick.so";
}
