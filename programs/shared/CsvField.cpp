#include "programs/shared/CsvField.h"

#include "host/Printable.h"

namespace varnel {

std::string csvField(std::string_view value) {
  std::string text = printable(value, "\t\r\n");
  if (text.find_first_of(",\"\r\n") == std::string::npos) return text;
  std::string quoted = "\"";
  for (const char character : text) {
    if (character == '"') quoted += '"';
    quoted += character;
  }
  return quoted + '"';
}

}  // namespace varnel
