// The messages of the phone's mix as plain structs, read and written with protozero.
#pragma once

#include <cstdint>
#include <optional>
#include <protozero/types.hpp>
#include <string>
#include <string_view>
#include <vector>

namespace qel::bench::plain {

// Every field of the schemas, of those messages and of the ones within them.

struct RsrpRsrqSinr {
  enum class Tag : protozero::pbf_tag_type {
    phyCellId = 1,
    rsrp0 = 4,
    rsrp1 = 5,
    rsrq0 = 7,
    rsrq1 = 8,
    sinr0 = 10,
    sinr1 = 11,
  };

  std::optional<std::uint32_t> phyCellId;
  std::optional<std::int32_t> rsrp0;
  std::optional<std::int32_t> rsrp1;
  std::optional<std::int32_t> rsrq0;
  std::optional<std::int32_t> rsrq1;
  std::optional<std::int32_t> sinr0;
  std::optional<std::int32_t> sinr1;
};

struct KCellularLteRsrpRsrqSinr {
  enum class Tag : protozero::pbf_tag_type {
    timestamp = 1,
    callId = 3,
    lastXSeconds = 6,
    lastYSamples = 7,
    samplePeriodMs = 8,
    durationMs = 10,
    numSamples = 11,
    avgValues = 14,
    instValues = 15,
  };

  std::optional<std::uint64_t> timestamp;
  std::optional<std::string> callId;
  std::optional<std::uint32_t> lastXSeconds;
  std::optional<std::uint32_t> lastYSamples;
  std::optional<std::uint32_t> samplePeriodMs;
  std::optional<std::uint32_t> durationMs;
  std::optional<std::uint32_t> numSamples;
  std::optional<RsrpRsrqSinr> avgValues;
  std::vector<RsrpRsrqSinr> instValues;
};

struct TxPowerInfo {
  enum class Tag : protozero::pbf_tag_type {
    pucchTxPower = 1,
    puschTxPower = 2,
    subframeIndex = 3,
  };

  std::optional<std::int32_t> pucchTxPower;
  std::optional<std::int32_t> puschTxPower;
  std::optional<std::uint32_t> subframeIndex;
};

struct KCellularLteTxPower {
  enum class Tag : protozero::pbf_tag_type {
    timestamp = 1,
    txPowerInfo = 2,
  };

  std::optional<std::uint64_t> timestamp;
  std::vector<TxPowerInfo> txPowerInfo;
};

struct EgwErrcNbrEutraMeas {
  enum class Tag : protozero::pbf_tag_type {
    nbrEarfcn = 1,
    nbrPhysCellId = 2,
    freqBandInd = 3,
    nbrRsrp = 4,
    nbrRsrq = 5,
  };

  std::optional<std::uint32_t> nbrEarfcn;
  std::optional<std::uint32_t> nbrPhysCellId;
  std::optional<std::uint32_t> freqBandInd;
  std::optional<std::int32_t> nbrRsrp;
  std::optional<std::int32_t> nbrRsrq;
};

struct KCellularLteNbrEutraCellMeas {
  enum class Tag : protozero::pbf_tag_type {
    timestamp = 1,
    measNbrEutra = 2,
  };

  std::optional<std::uint64_t> timestamp;
  std::vector<EgwErrcNbrEutraMeas> measNbrEutra;
};

struct KCellularLteRrcState {
  enum class Tag : protozero::pbf_tag_type {
    timestamp = 1,
    state = 2,
    prevState = 3,
    prevStateDurMs = 4,
    cause = 5,
  };

  std::optional<std::uint64_t> timestamp;
  std::optional<std::int32_t> state;
  std::optional<std::int32_t> prevState;
  std::optional<std::uint32_t> prevStateDurMs;
  std::optional<std::int32_t> cause;
};

struct KCellularLteScellInfo {
  enum class Tag : protozero::pbf_tag_type {
    timestamp = 1,
    phyCellId = 2,
    dlFreq = 3,
    ulFreq = 4,
    dlBw = 5,
    ulBw = 6,
    cellId = 7,
    freqBandInd = 8,
    trackingAreaCode = 9,
    numMncDigits = 10,
    selPlmnMcc = 11,
    selPlmnMnc = 12,
    tddSfAssignment = 14,
    tddSsfPatterns = 15,
  };

  std::optional<std::uint64_t> timestamp;
  std::optional<std::uint32_t> phyCellId;
  std::optional<std::uint32_t> dlFreq;
  std::optional<std::uint32_t> ulFreq;
  std::optional<std::uint32_t> dlBw;
  std::optional<std::uint32_t> ulBw;
  std::optional<std::uint32_t> cellId;
  std::optional<std::uint32_t> freqBandInd;
  std::optional<std::uint32_t> trackingAreaCode;
  std::optional<std::uint32_t> numMncDigits;
  std::optional<std::uint32_t> selPlmnMcc;
  std::optional<std::uint32_t> selPlmnMnc;
  std::optional<std::uint32_t> tddSfAssignment;
  std::optional<std::uint32_t> tddSsfPatterns;
};

struct NbrEutra {
  enum class Tag : protozero::pbf_tag_type {
    earfcn = 1,
    qRxlevMin = 2,
    qQualMin = 3,
    qOffset = 4,
    pmax = 5,
    dlBw = 6,
    thresXHighP = 7,
    thresXLowP = 8,
    thresXHighQ = 9,
    thresXLowQ = 10,
    priority = 11,
    frameType = 12,
    band = 13,
  };

  std::optional<std::uint32_t> earfcn;
  std::optional<std::int32_t> qRxlevMin;
  std::optional<std::int32_t> qQualMin;
  std::optional<std::int32_t> qOffset;
  std::optional<std::int32_t> pmax;
  std::optional<std::uint32_t> dlBw;
  std::optional<std::uint32_t> thresXHighP;
  std::optional<std::uint32_t> thresXLowP;
  std::optional<std::uint32_t> thresXHighQ;
  std::optional<std::uint32_t> thresXLowQ;
  std::optional<std::uint32_t> priority;
  std::optional<std::int32_t> frameType;
  std::optional<std::uint32_t> band;
};

struct KCellularLteSelReselCellInfo {
  enum class Tag : protozero::pbf_tag_type {
    timestamp = 1,
    multiBandInfo = 2,
    imsEmergencySupport = 3,
    acBarringForEmergency = 4,
    moSignallingAcBarringFactor = 5,
    moSignallingAcBarringTime = 6,
    moSignallingAcBarringForSpecialAc = 7,
    moDataAcBarringFactor = 8,
    moDataAcBarringTime = 9,
    moDataAcBarringForSpecialAc = 10,
    qRxLevMin = 11,
    qQualMin = 12,
    qHyst = 13,
    sNonIntraSearchP = 14,
    sNonIntraSearchQ = 15,
    sIntraSearchP = 16,
    sIntraSearchQ = 17,
    threshServingLowP = 18,
    threshServingLowQ = 19,
    priorityOperatingFreq = 20,
    nbrEutra = 21,
  };

  std::optional<std::uint64_t> timestamp;
  std::vector<std::uint32_t> multiBandInfo;
  std::optional<std::uint32_t> imsEmergencySupport;
  std::optional<std::uint32_t> acBarringForEmergency;
  std::optional<std::uint32_t> moSignallingAcBarringFactor;
  std::optional<std::uint32_t> moSignallingAcBarringTime;
  std::optional<std::uint32_t> moSignallingAcBarringForSpecialAc;
  std::optional<std::uint32_t> moDataAcBarringFactor;
  std::optional<std::uint32_t> moDataAcBarringTime;
  std::optional<std::uint32_t> moDataAcBarringForSpecialAc;
  std::optional<std::int32_t> qRxLevMin;
  std::optional<std::int32_t> qQualMin;
  std::optional<std::uint32_t> qHyst;
  std::optional<std::uint32_t> sNonIntraSearchP;
  std::optional<std::uint32_t> sNonIntraSearchQ;
  std::optional<std::uint32_t> sIntraSearchP;
  std::optional<std::uint32_t> sIntraSearchQ;
  std::optional<std::uint32_t> threshServingLowP;
  std::optional<std::uint32_t> threshServingLowQ;
  std::optional<std::uint32_t> priorityOperatingFreq;
  std::vector<NbrEutra> nbrEutra;
};

struct KCellularTrackingAreaId {
  enum class Tag : protozero::pbf_tag_type {
    encodedPlmn = 1,
    tac = 2,
  };

  std::optional<std::string> encodedPlmn;
  std::optional<std::uint32_t> tac;
};

struct Guti {
  enum class Tag : protozero::pbf_tag_type {
    mmegi = 1,
    mmec = 2,
    mTmsi = 3,
  };

  std::optional<std::uint32_t> mmegi;
  std::optional<std::uint32_t> mmec;
  std::optional<std::uint32_t> mTmsi;
};

struct KCellularEmmContext {
  enum class Tag : protozero::pbf_tag_type {
    timestamp = 1,
    regStatus = 2,
    updateStatus = 3,
    ueOpMode = 4,
    taiList = 5,
    guti = 6,
    rejectCause = 7,
    regProc = 8,
    t3412DurS = 9,
    isImsVoiceSupported = 10,
    isEmergBearerSupported = 11,
  };

  std::optional<std::uint64_t> timestamp;
  std::optional<std::int32_t> regStatus;
  std::optional<std::int32_t> updateStatus;
  std::optional<std::int32_t> ueOpMode;
  std::vector<KCellularTrackingAreaId> taiList;
  std::optional<Guti> guti;
  std::optional<std::int32_t> rejectCause;
  std::optional<std::int32_t> regProc;
  std::optional<std::uint32_t> t3412DurS;
  std::optional<bool> isImsVoiceSupported;
  std::optional<bool> isEmergBearerSupported;
};

struct BearerContext {
  enum class Tag : protozero::pbf_tag_type {
    cid = 1,
    nsapi = 2,
    apn = 3,
    pdpType = 4,
    pdpAddr = 5,
    primaryDnsType = 6,
    primaryDnsAddr = 7,
    secondaryDnsType = 8,
    secondaryDnsAddr = 9,
    isAddrIratMobile = 10,
  };

  std::optional<std::uint32_t> cid;
  std::optional<std::uint32_t> nsapi;
  std::optional<std::string> apn;
  std::optional<std::int32_t> pdpType;
  std::optional<std::string> pdpAddr;
  std::optional<std::int32_t> primaryDnsType;
  std::optional<std::string> primaryDnsAddr;
  std::optional<std::int32_t> secondaryDnsType;
  std::optional<std::string> secondaryDnsAddr;
  std::optional<bool> isAddrIratMobile;
};

struct KCellularActivatedBearerContexts {
  enum class Tag : protozero::pbf_tag_type {
    timestamp = 1,
    bearerContextCount = 2,
    bearerContexts = 3,
  };

  std::optional<std::uint64_t> timestamp;
  std::optional<std::uint32_t> bearerContextCount;
  std::vector<BearerContext> bearerContexts;
};

// A new element at the end. Most lists have a few, so room for these is made at once.
template <class Element>
Element& another(std::vector<Element>& list) {
  if (list.empty()) list.reserve(4);
  return list.emplace_back();
}

// What is there lands on top of `message`. Throws protozero::exception on damaged bytes.
void read(std::string_view data, KCellularLteRsrpRsrqSinr& message);
void read(std::string_view data, KCellularLteTxPower& message);
void read(std::string_view data, KCellularLteNbrEutraCellMeas& message);
void read(std::string_view data, KCellularLteRrcState& message);
void read(std::string_view data, KCellularLteScellInfo& message);
void read(std::string_view data, KCellularLteSelReselCellInfo& message);
void read(std::string_view data, KCellularEmmContext& message);
void read(std::string_view data, KCellularActivatedBearerContexts& message);

// Appends to `out`.
void write(const KCellularLteRsrpRsrqSinr& message, std::string& out);
void write(const KCellularLteTxPower& message, std::string& out);
void write(const KCellularLteNbrEutraCellMeas& message, std::string& out);
void write(const KCellularLteRrcState& message, std::string& out);
void write(const KCellularLteScellInfo& message, std::string& out);
void write(const KCellularLteSelReselCellInfo& message, std::string& out);
void write(const KCellularEmmContext& message, std::string& out);
void write(const KCellularActivatedBearerContexts& message, std::string& out);

}  // namespace qel::bench::plain
