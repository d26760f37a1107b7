// Follows what comes to a list and goes from it.
#pragma once

#include <vector>

#include "history/HappeningLog.h"
#include "history/KnownPlace.h"

namespace qel {

// Connections (bearer contexts) and secondary carriers, each of which every report lists anew. Two
// entries are one when their numbers and names are.
class ListFollower {
 public:
  // No longer list is followed; what is beyond that is not looked at.
  static constexpr std::size_t kMostEntries = 64;

  void followBearers(const Report& report, HappeningLog& log) { follow(_bearers, report, log); }
  void followCarriers(const Report& report, HappeningLog& log) { follow(_carriers, report, log); }

 private:
  struct Followed {
    HappeningKind kind;
    std::optional<Technology> technology;
    KnownPlace list;
    std::array<KnownPlace, 3> numbers;
    KnownPlace name;
    KnownPlace type;
    KnownPlace state;
    std::vector<ToldEntry> known;
    std::vector<ToldEntry> now;
  };

  static void follow(Followed& followed, const Report& report, HappeningLog& log);
  static void read(Followed& followed, const Dictionary& record);

  Followed _bearers{HappeningKind::bearer,
                    std::nullopt,
                    KnownPlace("bearer_contexts"),
                    {KnownPlace("cid"), KnownPlace("nsapi"), KnownPlace("")},
                    KnownPlace("apn"),
                    KnownPlace("pdp_type"),
                    KnownPlace(""),
                    {},
                    {}};
  Followed _carriers{HappeningKind::carrier,
                     Technology::lte,
                     KnownPlace("scc_list"),
                     {KnownPlace("index"), KnownPlace("pci"), KnownPlace("dl_earfcn")},
                     KnownPlace(""),
                     KnownPlace("dl_rf_band"),
                     KnownPlace("state"),
                     {},
                     {}};
};

}  // namespace qel
