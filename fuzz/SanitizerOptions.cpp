// What the sanitizers of a fuzz target do unless the environment tells otherwise. Most of the time went into
// remembering who had allocated what, and into memory that no cache held any more. So ASan tells of a use
// after free while no more than 64 KiB have been freed since; the corpora run under its defaults in the
// tests. What it keeps of large blocks it clears in place, for the kernel takes longer to give it new pages.
// ASAN_OPTIONS=malloc_context_size=30 tells more of a finding.
extern "C" const char* __asan_default_options() {
  return "malloc_context_size=1:max_malloc_fill_size=0"
         ":quarantine_size_mb=0:thread_local_quarantine_size_kb=64:clear_shadow_mmap_threshold=1073741824";
}

extern "C" const char* __ubsan_default_options() { return "print_stacktrace=1"; }
