// Settings the sanitizer runtime reads when this binary starts (only the
// sanitizer build has that runtime; elsewhere nothing calls these).
//
// No leak check: the embedded interpreter keeps its objects in arenas the
// leak checker does not scan, so every library object a live Python object
// owns would be reported. `make leakcheck` runs this binary under valgrind.
extern "C" const char *__asan_default_options() { return "detect_leaks=0"; }
extern "C" const char *__ubsan_default_options() { return "print_stacktrace=1:halt_on_error=1"; }
