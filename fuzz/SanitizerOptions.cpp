// Options of the sanitizers in fuzz targets, unless the environment sets others. Most of the time went into
// remembering who had allocated what, and into memory that was no longer in the cache. So ASan finds a use
// after free only while at most 64 KiB have been freed since then. The tests run the corpora with its default
// options. ASan clears large blocks in place, since new pages from the kernel take longer.
// ASAN_OPTIONS=malloc_context_size=30 tells more about a finding.
extern "C" const char* __asan_default_options() {
  return "malloc_context_size=1:max_malloc_fill_size=0"
         ":quarantine_size_mb=0:thread_local_quarantine_size_kb=64:clear_shadow_mmap_threshold=1073741824";
}

extern "C" const char* __ubsan_default_options() { return "print_stacktrace=1"; }
