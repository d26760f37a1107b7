#include "metrics/EntryList.h"

#include <gtest/gtest.h>

#include "messages/lte_serving.h"
#include "metrics/Feed.h"

namespace qel {
namespace {

using testing::FedValidator;

constexpr auto kTxPower = MetricValidator::K_LTE_TX_POWER;

KCellularLteTxPower reportOf(std::initializer_list<int> powers) {
  KCellularLteTxPower report;
  for (const int power : powers) {
    auto entry = std::make_shared<TxPowerInfo>();
    entry->setPuschTxPower(power);
    report.addTxPowerInfo(entry);
  }
  return report;
}

EntryList listOf(std::initializer_list<int> powers) {
  EntryList list;
  for (const int power : powers) list.push_back({{"pusch_tx_power", power}});
  return list;
}

TEST(EntryList, holdsTheNewestOfReportsThatNobodyLookedAt) {
  FedValidator validator;
  validator.feed(kTxPower, reportOf({1, 2, 3}));
  validator.feed(kTxPower, reportOf({4}));
  validator.feed(kTxPower, reportOf({5, 6}));
  EXPECT_EQ(validator->myLTE.TxPower, listOf({5, 6}));
}

TEST(EntryList, changesWithEveryReportThatIsLookedAt) {
  FedValidator validator;
  using Powers = std::initializer_list<int>;
  for (const Powers& powers : {Powers{1, 2}, Powers{3}, Powers{}, Powers{4, 5, 6}}) {
    validator.feed(kTxPower, reportOf(powers));
    EXPECT_EQ(validator->myLTE.TxPower, listOf(powers));
    EXPECT_EQ(validator->myLTE.TxPower.size(), powers.size());
  }
}

TEST(EntryList, isTheSameAtEveryLook) {
  FedValidator validator;
  validator.feed(kTxPower, reportOf({1, 2}));
  const EntryList& list = validator->myLTE.TxPower;
  const Dictionary* first = list.begin();
  EXPECT_EQ(list.size(), 2U);
  EXPECT_EQ(list.begin(), first);
  EXPECT_EQ(&list[1], first + 1);
  EXPECT_EQ(list.end(), first + 2);
}

TEST(EntryList, keepsACopyAsItWasWhateverIsReportedLater) {
  FedValidator validator;
  validator.feed(kTxPower, reportOf({1, 2}));
  const LTE copied = validator->myLTE;
  MetricStore store;
  store = *validator.validator;
  validator.feed(kTxPower, reportOf({3}));
  EXPECT_EQ(copied.TxPower, listOf({1, 2}));
  EXPECT_EQ(store.myLTE.TxPower, listOf({1, 2}));
  EXPECT_EQ(validator->myLTE.TxPower, listOf({3}));
}

TEST(EntryList, forgetsTheReportWhenItIsClearedOrReplaced) {
  FedValidator validator;
  validator.feed(kTxPower, reportOf({1, 2}));
  validator->myLTE.TxPower.clear();
  EXPECT_TRUE(validator->myLTE.TxPower.empty());
  validator.feed(kTxPower, reportOf({1, 2}));
  validator->myLTE.TxPower = listOf({7});
  EXPECT_EQ(validator->myLTE.TxPower, listOf({7}));
}

TEST(EntryList, canBeChangedInPlace) {
  FedValidator validator;
  validator.feed(kTxPower, reportOf({1}));
  validator->myLTE.TxPower.push_back({{"pusch_tx_power", 2}});
  for (Dictionary& entry : validator->myLTE.TxPower) entry.set("pusch_tx_power", 9);
  EXPECT_EQ(validator->myLTE.TxPower, listOf({9, 9}));
}

}  // namespace
}  // namespace qel
