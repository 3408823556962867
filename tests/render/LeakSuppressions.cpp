// Fontconfig, under Pango, keeps font patterns for the life of the process where the leak checker
// cannot see them; they are the same few whatever the chart.
extern "C" __attribute__((visibility("default"))) const char* __lsan_default_suppressions() {
    return "leak:libfontconfig.so\n";
}
