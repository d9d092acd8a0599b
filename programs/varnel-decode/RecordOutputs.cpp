#include "programs/varnel-decode/RecordOutputs.h"

#include "host/captures/PcapEncoders.h"
#include "host/captures/StreamEncoders.h"
#include "programs/varnel-decode/MessageEncoder.h"
#include "programs/varnel-decode/ProgramError.h"

namespace varnel {

RecordOutputs::RecordOutputs(const Options& options) {
  add(options.recordsPath, std::make_unique<RecordStreamWriter>());
  add(options.pcapPath, std::make_unique<PcapWriter>());
  add(options.framedPath, std::make_unique<FramedWriter>());
  add(options.messagesPath, std::make_unique<MessageEncoder>(options.messagesAs));
}

void RecordOutputs::add(const std::optional<std::string>& path, std::unique_ptr<CaptureEncoder> encoder) {
  if (path) _targets.push_back({*path, std::move(encoder), std::make_unique<OutputFile>(*path)});
}

void RecordOutputs::open() {
  for (Target& target : _targets) {
    check(target, target.file->open());
    write(target, target.encoder->beginning());
  }
}

void RecordOutputs::write(const CaptureRecord& record) {
  for (Target& target : _targets)
    if (target.file) write(target, target.encoder->encode(record));
}

void RecordOutputs::write(Target& target, ByteView bytes) {
  if (target.file && !bytes.empty()) check(target, target.file->write(bytes));
}

// The reader of a pipe may leave; this is not reported.
void RecordOutputs::check(Target& target, std::error_code failure) {
  if (!failure) return;
  target.file.reset();
  if (failure != std::errc::broken_pipe) tell("cannot write " + target.path + ": " + failure.message());
}

bool RecordOutputs::finish(const std::string& captureName) {
  bool isDone = true;
  for (Target& target : _targets) {
    if (target.file) check(target, target.file->finish());
    isDone &= target.file != nullptr;
    if (!target.file) continue;
    if (const auto remark = target.encoder->remark(captureName, target.path)) tell(*remark);
  }
  return isDone;
}

}  // namespace varnel
