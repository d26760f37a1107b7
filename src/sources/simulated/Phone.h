// The simulated phone: its serving cell, its connection and its registration.
#pragma once

#include <cstdint>

#include "sources/simulated/Aggregation.h"
#include "sources/simulated/CellChoice.h"
#include "sources/simulated/Changes.h"
#include "sources/simulated/Connection.h"
#include "sources/simulated/RadioScene.h"
#include "sources/simulated/Registration.h"
#include "sources/simulated/Traffic.h"

namespace qel::sources {

// Switched on where the scene is. One thread.
class Phone {
 public:
  Phone(std::uint64_t seed, const RadioScene& scene, std::uint64_t timeMs);

  // The next moment of the scene.
  void step(const RadioScene& scene, std::uint64_t timeMs, Changes& changes);

  std::size_t servingIndex() const { return _serving; }
  const Cell& serving() const { return cells()[_serving]; }
  Technology technology() const { return layerOf(serving()).technology; }
  const Connection& connection() const { return _connection; }
  const Aggregation& aggregation() const { return _aggregation; }
  const Registration& registration() const { return _registration; }
  bool inCall() const { return _connection.connected() && _connection.purpose() == Purpose::call; }

 private:
  void change(std::size_t cell, std::uint64_t timeMs, Changes& changes);
  void chooseCell(const RadioScene& scene, std::uint64_t timeMs, Changes& changes);

  std::size_t _serving;
  Traffic _traffic;
  CellChoice _choice;
  Connection _connection;
  Aggregation _aggregation;
  Registration _registration;
};

// True when the cell can be heard and its answers understood.
bool radioUsable(std::size_t cell, const RadioScene& scene);

}  // namespace qel::sources
