// The library's entry point on Windows. Elsewhere the loader needs none.
#include <windows.h>

/// Static objects are built and destroyed by the runtime around this call: there is nothing else to
/// do here, and under the loader's lock nothing else would be safe.
/// @return always TRUE: loading never fails because of this library.
extern "C" BOOL WINAPI DllMain(HINSTANCE inModule, DWORD inReason, LPVOID /*inReserved*/) {
  // The library keeps nothing per thread, so the host's threads need not call in here as they come
  // and go.
  if (inReason == DLL_PROCESS_ATTACH) DisableThreadLibraryCalls(inModule);
  return TRUE;
}
