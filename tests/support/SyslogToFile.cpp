// Loaded before the C library: what a program says to the system log goes to the file that
// QEL_SYSLOG_FILE names, a line a message, as the C library would have it.

#include <syslog.h>

#include <cstdarg>
#include <cstdio>
#include <cstdlib>

extern "C" {

void vsyslog(int /*priority*/, const char* format, va_list values) {
  const char* name = std::getenv("QEL_SYSLOG_FILE");
  std::FILE* file = name ? std::fopen(name, "ae") : nullptr;
  if (!file) return;
  std::vfprintf(file, format, values);
  std::fputc('\n', file);
  std::fclose(file);
}

void syslog(int priority, const char* format, ...) {
  va_list values;
  va_start(values, format);
  vsyslog(priority, format, values);
  va_end(values);
}

// What the two are called in a program that was compiled with checks.
void __vsyslog_chk(int priority, int /*flag*/, const char* format, va_list values) {
  vsyslog(priority, format, values);
}

void __syslog_chk(int priority, int /*flag*/, const char* format, ...) {
  va_list values;
  va_start(values, format);
  vsyslog(priority, format, values);
  va_end(values);
}
}
