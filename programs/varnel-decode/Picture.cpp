#include "programs/varnel-decode/Picture.h"

#include <stdexcept>

#include "programs/varnel-decode/FileOutput.h"
#include "programs/varnel-decode/ProgramError.h"

namespace varnel {

void Picture::finish(const std::string& inputName) {
  for (const auto& [path, value] : _recorder.unplotted()) {
    std::string line = "no value of " + inputName;
    line.append(" under '").append(path).append("' begins with a number (one is '").append(value);
    tell(line + "'), so no line shows it");
  }
  if (_recorder.isEmpty())
    throw std::runtime_error(inputName + " has no number under the paths to plot, so " + _file +
                             " was not written; --format paths shows what there is");
  const std::string svg = drawPlot(_recorder.plot(inputName));
  writeFile(_file, {reinterpret_cast<const std::uint8_t*>(svg.data()), svg.size()});
}

}  // namespace varnel
