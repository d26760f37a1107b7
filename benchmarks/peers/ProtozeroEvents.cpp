#include "MemorySink.h"
#include "peers/KeptEvents.h"
#include "peers/PeerMessages.h"
#include "peers/PeerWorks.h"

namespace qel::bench {
namespace {

class StructRecord {
 public:
  explicit StructRecord(std::uint32_t metric)
      : _operations(findPlainRecord(metric)), _message(_operations.make()) {}

  std::optional<std::uint64_t> read(ByteView payload) {
    return _operations.read(_message.get(), payload);
  }
  void appendText(std::string_view time, Line& out) const {
    _operations.appendText(_message.get(), time, out);
  }

 private:
  const PlainRecord& _operations;
  std::shared_ptr<void> _message;
};

}  // namespace

Step eventProtozero(const std::vector<Payload>& payloads) {
  setStandardOutput(std::make_shared<MemorySink>());
  return keptEvents<StructRecord>(payloads);
}

}  // namespace qel::bench
