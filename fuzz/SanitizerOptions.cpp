// What the sanitizers of a fuzz target do unless the environment tells otherwise. Most of the time went into
// remembering who had allocated what; ASAN_OPTIONS=malloc_context_size=30 tells it of a finding. What one
// input frees is well below the quarantine.
extern "C" const char* __asan_default_options() {
  return "malloc_context_size=1:max_malloc_fill_size=0"
         ":quarantine_size_mb=1:thread_local_quarantine_size_kb=64";
}

extern "C" const char* __ubsan_default_options() { return "print_stacktrace=1"; }
