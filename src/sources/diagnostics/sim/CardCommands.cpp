#include "sources/diagnostics/sim/CardCommands.h"

#include <algorithm>
#include <array>

#include "sources/Metrics.h"
#include "sources/diagnostics/sim/KeptFiles.h"

namespace qel::diagnostics {
namespace {

using Application = CardChannel::Application;
using Directory = CardChannel::Directory;

// ETSI TS 102 221, table 10.5.
enum Instruction : std::uint8_t {
  kManageChannel = 0x70,
  kSelect = 0xA4,
  kGetResponse = 0xC0,
  kReadBinary = 0xB0,
  kReadRecord = 0xB2,
};

struct Command {
  explicit Command(const CardExchange& exchange)
      : kind(exchange.header[0]),
        instruction(exchange.header[1]),
        p1(exchange.header[2]),
        p2(exchange.header[3]) {}

  // Without encryption, on one of the first four channels; the old cards' class has but one.
  bool isPlain() const { return kind == kOldClass || (kind & 0xFC) == 0; }
  std::size_t channel() const { return kind == kOldClass ? 0 : kind & 3U; }

  // Between a file's selection and the last read of it come its description and other reads alone.
  bool leavesFile() const {
    const bool reads = instruction == kReadBinary || instruction == kReadRecord;
    return isPlain() && (reads || instruction == kGetResponse);
  }

  static constexpr std::uint8_t kOldClass = 0xA0;

  std::uint8_t kind;
  std::uint8_t instruction;
  std::uint8_t p1;
  std::uint8_t p2;
};

CardChannel freshChannel() {
  CardChannel channel;
  channel.directory = Directory::master;
  return channel;
}

// Where a read begins, and of which file; 0: of the one that is selected.
struct Place {
  std::uint32_t shortIdentifier = 0;
  std::size_t offset = 0;  // of records: how many are in front
};

std::optional<Place> placeOf(const Command& command) {
  constexpr std::uint8_t kByNumber = 4;
  if (command.instruction == kReadBinary) {
    if ((command.p1 & 0x80) != 0) return Place{command.p1 & 0x1FU, command.p2};
    return Place{0, static_cast<std::size_t>(command.p1) << 8 | command.p2};
  }
  if ((command.p2 & 7) != kByNumber || command.p1 == 0) return std::nullopt;
  return Place{static_cast<std::uint32_t>(command.p2 >> 3), command.p1 - 1U};
}

// The files of other applications have numbers that mean something else there. Until an
// application was seen to be selected, the first channel is taken to have the one of telephony.
bool isTelephony(const CardChannel& channel, std::size_t number) {
  switch (channel.directory) {
    case Directory::gsm:
      return true;
    case Directory::unknown:
    case Directory::application:
      return channel.application == Application::usim ||
             (channel.application == Application::unknown && number == 0);
    default:
      return false;
  }
}

bool isOfRoot(std::uint32_t identifier) { return identifier >> 8 == 0x2F; }

// The file that a command reads; 0 for none that is kept. What is read once more, or later, without
// being selected again may be another file, whose selection was not seen: it is left alone.
std::uint32_t fileOf(const Command& command, const CardChannel& channel) {
  const auto place = placeOf(command);
  if (!place) return 0;
  if (place->shortIdentifier != 0) {
    if (channel.directory == Directory::master) return fileOfRoot(place->shortIdentifier);
    const bool usim =
        channel.directory == Directory::application && channel.application == Application::usim;
    return usim ? fileOfUsim(place->shortIdentifier) : 0;
  }
  if (!isKept(channel.file) || place->offset < channel.readTo) return 0;
  return isOfRoot(channel.file) || isTelephony(channel, command.channel()) ? channel.file : 0;
}

void selectFile(std::uint32_t identifier, CardChannel& channel) {
  constexpr std::uint32_t kMaster = 0x3F00;
  constexpr std::uint32_t kApplication = 0x7FFF;
  constexpr std::uint32_t kGsm = 0x7F20;
  const std::uint32_t high = identifier >> 8;
  channel.file = 0;
  channel.readTo = 0;
  if (identifier == kMaster) {
    channel.directory = Directory::master;
  } else if (identifier == kApplication) {
    channel.directory = Directory::application;
  } else if (identifier == kGsm) {
    channel.directory = Directory::gsm;
  } else if (high == 0x7F || high == 0x5F) {
    channel.directory = Directory::other;
  } else {
    channel.file = identifier;
  }
}

void selectApplication(ByteView name, CardChannel& channel) {
  constexpr std::array<std::uint8_t, 7> kUsim = {0xA0, 0, 0, 0, 0x87, 0x10, 0x02};
  const bool usim =
      name.size() >= kUsim.size() && std::equal(kUsim.begin(), kUsim.end(), name.begin());
  channel.application = usim ? Application::usim : Application::other;
  channel.directory = Directory::application;
  channel.file = 0;
}

void select(const Command& command, ByteView data, CardChannel& channel) {
  constexpr std::uint8_t kParent = 3;
  constexpr std::uint8_t kByName = 4;
  constexpr std::uint8_t kPathFromRoot = 8;
  if (command.p1 == kByName) return selectApplication(data, channel);
  if (command.p1 == kParent) {
    channel.directory = Directory::other;
    channel.file = 0;
    return;
  }
  if (command.p1 == kPathFromRoot) channel.directory = Directory::master;
  for (; data.size() >= 2; data = data.subspan(2)) {
    selectFile(static_cast<std::uint32_t>(data[0]) << 8 | data[1], channel);
  }
}

// Channels are closed by their number; which one was opened the card says.
void manageChannel(const Command& command, ByteView data, SimPicture& sim) {
  const bool opens = command.p1 == 0;
  const std::size_t number = opens && !data.empty() ? data[0] : command.p2;
  if (number != 0 && number < sim.channels.size()) {
    sim.channels[number] = freshChannel();
  }
}

// Behind what was read before; a piece further on says nothing without those between.
bool put(std::uint32_t identifier, std::size_t offset, ByteView data, SimPicture& sim) {
  auto file = std::ranges::find(sim.files, identifier, &SimFile::identifier);
  const std::size_t known = file == sim.files.end() ? 0 : file->content.size();
  if (data.empty() || offset > known || offset + data.size() > SimFile::kMostBytes) return false;
  if (file == sim.files.end()) file = sim.files.insert(file, SimFile{identifier, {}});
  file->content.resize(std::max(known, offset + data.size()));
  std::ranges::copy(data, file->content.begin() + static_cast<std::ptrdiff_t>(offset));
  return true;
}

// Another card: what is known of the one before holds no longer.
void forgetOtherCard(ByteView iccid, Picture& picture) {
  const auto& files = picture.sim.files;
  const auto known = std::ranges::find(files, kIccidFile, &SimFile::identifier);
  if (known == files.end() || std::ranges::equal(known->content, iccid)) return;
  picture.sim.files.clear();
  picture.nas.common.imsi.clear();
}

// 31.102, clause 4.2.2: a length, then the identity with its type in the lowest bits.
void takeImsi(Picture& picture, Told& told) {
  constexpr std::size_t kBytes = 9;
  constexpr std::uint8_t kTypeImsi = 1;
  const auto file = std::ranges::find(picture.sim.files, kImsiFile, &SimFile::identifier);
  const Bytes& content = file->content;
  if (content.size() != kBytes || content[0] == 0 || content[0] >= kBytes) return;
  if ((content[1] & 7) != kTypeImsi) return;
  picture.nas.common.imsi = content;
  told.tell(metric::kMmCommonInfo);
}

void takeRead(const Command& command, CardChannel& channel, Picture& picture, Told& told) {
  const std::uint32_t identifier = fileOf(command, channel);
  const auto place = placeOf(command);
  if (place && place->shortIdentifier != 0) channel.file = identifier;
  const Bytes& data = picture.sim.exchange.data;
  if (identifier == 0 || !place) return;
  const bool records = command.instruction == kReadRecord;
  const std::size_t offset = records ? place->offset * data.size() : place->offset;
  channel.readTo = place->offset + (records ? 1 : data.size());
  if (identifier == kIccidFile && offset == 0) forgetOtherCard(data, picture);
  if (!put(identifier, offset, data, picture.sim)) return;
  told.tell(metric::kSimFiles);
  if (identifier == kImsiFile) takeImsi(picture, told);
}

}  // namespace

bool isDataKept(const SimPicture& sim) {
  const Command command(sim.exchange);
  if (!command.isPlain()) return false;
  const CardChannel& channel = sim.channels[command.channel()];
  switch (command.instruction) {
    case kSelect:
    case kManageChannel:
      return true;
    case kReadBinary:
    case kReadRecord:
      return fileOf(command, channel) != 0;
    default:
      return false;
  }
}

void takeCommand(Picture& picture, Told& told, std::uint8_t firstStatus) {
  constexpr std::uint8_t kDone = 0x90;
  constexpr std::uint8_t kDoneAndMore = 0x91;  // the card has a wish
  constexpr std::uint8_t kAnswerWaits = 0x61;
  constexpr std::uint8_t kOldAnswerWaits = 0x9F;
  SimPicture& sim = picture.sim;
  const Command command(sim.exchange);
  const bool isOnFirstFour = (command.kind & 0x40) == 0;
  if (isOnFirstFour && !command.leavesFile()) sim.channels[command.channel()].file = 0;
  if (!command.isPlain()) return;
  CardChannel& channel = sim.channels[command.channel()];
  const bool done = firstStatus == kDone || firstStatus == kDoneAndMore;
  const bool selected = done || firstStatus == kAnswerWaits || firstStatus == kOldAnswerWaits;
  if (command.instruction == kSelect && selected && sim.exchange.toCard) {
    select(command, sim.exchange.data, channel);
  } else if (command.instruction == kManageChannel && done) {
    manageChannel(command, sim.exchange.data, sim);
  } else if ((command.instruction == kReadBinary || command.instruction == kReadRecord) && done &&
             !sim.exchange.toCard) {
    takeRead(command, channel, picture, told);
  }
}

void takeReset(SimPicture& sim) { sim.channels.fill(freshChannel()); }

void loseTrack(SimPicture& sim) {
  sim.exchange = {};
  for (CardChannel& channel : sim.channels) channel.file = 0;
}

}  // namespace qel::diagnostics
