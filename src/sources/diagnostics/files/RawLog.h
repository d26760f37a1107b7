// A raw log: what a diagnostics port sent, frame after frame, in a file or from a pipe.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>

#include "recording/FileBytes.h"
#include "sources/SourceError.h"
#include "sources/diagnostics/packets/PacketReader.h"
#include "sources/diagnostics/port/FrameReader.h"

namespace qel::diagnostics {

// Plain or gzip. Holds a few pieces of it, however long it is. One thread.
class RawLog {
 public:
  // "-" is standard input. Nothing when it cannot be opened or is a device; `error` then says why.
  static std::unique_ptr<RawLog> open(const std::string& path, sources::SourceError& error);

  // Hands the packets of the next piece to the sink. False at the end: of the log, or by a fault.
  bool read(PacketSink& sink);

  // As errors name it.
  const std::string& name() const { return _name; }
  // Why it ended early: one line, "FILE: WHY". Empty at the end of the log.
  const sources::SourceError& fault() const { return _fault; }
  const FrameReader::Counts& frames() const { return _frames.counts(); }
  const PacketReader::Counts& packets() const { return _packets.counts(); }
  // When the file was last written to, or when a pipe was opened.
  std::uint64_t writtenMs() const { return _writtenMs; }

 private:
  // The sink changes from call to call.
  class Forward final : public PacketSink {
   public:
    void log(const LogPacket& packet) override { to->log(packet); }
    void event(const ModemEvent& event) override { to->event(event); }
    void answer(ByteView packet) override { to->answer(packet); }
    PacketSink* to = nullptr;
  };

  RawLog(std::string name, std::uint64_t writtenMs, std::unique_ptr<FileBytes> bytes);
  void end();

  const std::string _name;
  const std::uint64_t _writtenMs;
  const std::unique_ptr<FileBytes> _bytes;
  std::string_view _left;
  FrameReader _frames;
  Forward _forward;
  PacketReader _packets{_forward};
  sources::SourceError _fault;
};

// Whether a file holds at least one frame. Looks at the first 16 MiB of it.
bool checkRawLog(const std::string& path, sources::SourceError& error);

}  // namespace qel::diagnostics
