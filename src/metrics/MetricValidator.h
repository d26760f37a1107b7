// The dispatcher: takes metric events, decodes them and keeps the newest record of each metric.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>

#include "base/Clock.h"
#include "base/LineBuffer.h"
#include "base/LogSink.h"
#include "base/TimeZone.h"
#include "connection/TeskWrapper.h"
#include "connection/TeskWrapperDelegate.h"
#include "metrics/BandwidthTable.h"
#include "metrics/MetricObserver.h"
#include "metrics/MetricStore.h"

namespace qel {

// Main thread only. A broken contract (no identifier, a payload that cannot be decoded, a timestamp
// that is no number) is a fatal error; an unknown identifier is not.
class MetricValidator final : public MetricStore,
                              public TeskWrapperDelegate,
                              public std::enable_shared_from_this<MetricValidator> {
 public:
  // The one of the process, made on first use: it then takes the shared TeskWrapper, makes it
  // listen and becomes its delegate. It writes to the standard output of that moment.
  static const std::shared_ptr<MetricValidator>& shared();

  // One that listens to `wrapper` (none: it is fed by hand). The zone must outlive it.
  static std::shared_ptr<MetricValidator> create(std::shared_ptr<TeskWrapper> wrapper,
                                                 const TimeZone& zone = systemTimeZone());

  void metricsDidUpdate(const std::optional<Dictionary>& event) override;
  void eventsDidUpdate(const std::optional<Dictionary>& event) override;

  // Decodes and stores one metric. True when its identifier has a handler.
  bool processMetric(const Dictionary& event);

  // Tells it of every metric after the last step, with the clock's time as that of reception. Both
  // must outlive this, or be taken away again: null ends it.
  void setObserver(MetricObserver* observer, const Clock& clock = systemClock());

  // The metric identifiers as events carry them.
  static constexpr std::int64_t K_LTE_CDRX_CONFIG = 3952152;
  static constexpr std::int64_t K_LTE_RRC_STATE = 3952132;
  static constexpr std::int64_t K_LTE_SCELL_INFO = 3948738;
  static constexpr std::int64_t K_LTE_RLF = 3952165;
  static constexpr std::int64_t K_LTE_SEL_RESEL_INFO = 3986190;
  static constexpr std::int64_t K_LTE_SCELL_MEAS = 3986177;
  static constexpr std::int64_t K_LTE_TX_POWER = 3986178;
  static constexpr std::int64_t K_LTE_RSRP_RSRQ_SINR = 3952490;
  static constexpr std::int64_t K_LTE_COMPCARR_INFO = 3986187;
  static constexpr std::int64_t K_LTE_CA_STATUS = 3986195;
  static constexpr std::int64_t K_LTE_INTERRAT_MEAS = 3986192;
  static constexpr std::int64_t K_LTE_INTRARAT_MEAS = 3986191;
  static constexpr std::int64_t K_CELLULAR_MM_INFO = 3986697;
  static constexpr std::int64_t K_CELLULAR_ACTIVE_BEARER = 3986701;
  static constexpr std::int64_t K_LTE_EMM_CTXT = 3986700;
  static constexpr std::int64_t K_CELLULAR_MM_CTXT = 3986698;
  static constexpr std::int64_t K_CELLULAR_GMM_CTXT = 3986699;
  static constexpr std::int64_t K_UMTS_RRC_STATE = 3985682;
  static constexpr std::int64_t K_UMTS_RRC_CONFIG = 3985683;
  static constexpr std::int64_t K_UMTS_SCELL_INFO = 3944460;
  static constexpr std::int64_t K_UMTS_SCELL_MEAS = 3985666;
  static constexpr std::int64_t K_UMTS_TX_POWER = 3985667;
  static constexpr std::int64_t K_UMTS_SEL_RESEL_INFO = 3985668;
  static constexpr std::int64_t K_UMTS_NCELL_MEAS = 3985669;
  static constexpr std::int64_t K_GSM_SCELL_INFO = 3943948;
  static constexpr std::int64_t K_GSM_IDLE_CONFIG = 3985409;
  static constexpr std::int64_t K_GSM_IDLE_SCELL_MEAS = 3985410;
  static constexpr std::int64_t K_GSM_CS_RF_MEAS = 3985411;
  static constexpr std::int64_t K_GSM_NCELL_MEAS = 3985417;
  static constexpr std::int64_t K_GSM_GPRS_CONFIG = 3985420;
  static constexpr std::int64_t K_SIM_FILE_INFO = 3932179;

  std::shared_ptr<TeskWrapper> mySharedTeskInstance;
  std::string metricIDKey = "kKeyMetricID";
  std::string payloadKey = "kKeyPayload";
  std::string profileIDKey = "kKeyProfileID";  // declared with the others; nothing reads it
  std::optional<std::int64_t> metricID;        // of the event in hand
  BandwidthTable dlbwlookup = makeBandwidthTable();

 private:
  MetricValidator(std::shared_ptr<TeskWrapper> wrapper, const TimeZone& zone);
  bool process(const Dictionary& event, LogSink& output);
  void rewriteTimestamp(Dictionary& record);
  void logRecord(std::string_view text, const Dictionary& record, LogSink& output);

  DateTexts _dates;
  MetricObserver* _observer = nullptr;
  const Clock* _clock = &systemClock();
  LineBuffer _line;  // the one being logged
};

}  // namespace qel
