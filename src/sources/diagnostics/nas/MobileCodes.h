// What the reports on 2G's and 3G's registration call things, as the message schemas number them.
#pragma once

#include <cstdint>

namespace qel::diagnostics {

enum MobileRegistration : std::int32_t {
  kRegisteredNormal = 0,
  kRegistrationFailed = 1,
  kRegisteredLimited = 2,
  kWithoutService = 3,
  kNotRegisteredYet = 4,
  kRegistrationDisabled = 5,
  kServiceDetached = 6,
  kRegistering = 11,
};

enum MmUpdate : std::int32_t { kMmUpdated = 1, kMmNotUpdated = 2, kMmRoamingNotAllowed = 3 };
enum GmmUpdate : std::int32_t { kGmmUpdated = 0, kGmmNotUpdated = 1, kGmmRoamingNotAllowed = 2 };

enum ProcedureFailure : std::int32_t {
  kNoFailure = 0,
  kRejectedByNetwork = 11,
  kAuthenticationRejected = 12,
};

enum MobileProcedure : std::int32_t {
  kLocationUpdate = 0,
  kAttach = 1,
  kRoutingAreaUpdate = 2,
  kCombinedUpdate = 3,
  kCombinedAttach = 4,
  kNetworkDetach = 5,
  kServiceRequest = 6,
};

}  // namespace qel::diagnostics
