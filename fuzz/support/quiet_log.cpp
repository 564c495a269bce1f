// The engine logs every step of every request; a fuzzer runs millions of
// them, so only fatal messages reach standard error unless the caller chose
// a level (OCRAR_LOG_LEVEL) itself.
#include <cstdlib>

extern "C" int LLVMFuzzerInitialize(int*, char***) {
  setenv("OCRAR_LOG_LEVEL", "7", 0);
  return 0;
}
