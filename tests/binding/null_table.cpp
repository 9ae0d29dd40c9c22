// A library that exports a stubs table which is not there (yet), as some Tcl libraries do.
extern "C" const void* tclStubsPtr;
[[gnu::visibility("default")]] const void* tclStubsPtr = nullptr;
