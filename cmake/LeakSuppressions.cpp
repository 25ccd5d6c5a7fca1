// Fontconfig keeps its font configuration for the life of the process; the
// leak checker of sanitizer builds is told so, and reports only our leaks.
extern "C" const char* __lsan_default_suppressions() { return "leak:libfontconfig.so\n"; }
