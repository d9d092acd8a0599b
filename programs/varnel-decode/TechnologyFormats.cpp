#include "programs/varnel-decode/TechnologyFormats.h"

#include "LogGenerator/LogGenerator.h"

namespace varnel {

NumberFormats numberFormatsOf(const std::vector<std::string>& technologies, const Services& services) {
  NumberFormats formats;
  for (const std::string& name : technologies)
    formats.add(LogGenerator::generatorFromTechnology(name, services)->numberFormats());
  return formats;
}

}  // namespace varnel
