// Every screen of every technology, every role of every row, against references. To write them
// anew after an intended change, run with QEL_WRITE_REFERENCES=1 and look at the difference.

#include <gtest/gtest.h>

#include <QtCore/QFile>
#include <QtCore/QJsonArray>
#include <QtCore/QJsonDocument>
#include <QtCore/QJsonObject>

#include "ui/Window.h"

namespace qel {
namespace {

using testing::Window;

QJsonObject describe(const TableModel& table) {
  QJsonArray rows;
  for (int row = 0; row < table.count(); ++row) {
    QJsonObject roles;
    const auto names = table.roleNames();
    for (auto role = names.begin(); role != names.end(); ++role) {
      if (role.key() == TableModel::tableRole) continue;
      roles[QString::fromLatin1(role.value())] =
          QJsonValue::fromVariant(table.data(table.index(row), role.key()));
    }
    rows.append(roles);
  }
  return {{"title", table.title()},
          {"previousTitle", table.previousTitle()},
          {"blank", table.isBlank()},
          {"rows", rows}};
}

void describeFrom(const Window& window, QJsonArray& screens) {
  screens.append(describe(window.top()));
  const int depth = window.navigation().depth();
  for (int row = 0; row < window.top().count(); ++row) {
    window.top().choose(row);
    if (window.navigation().depth() == depth) continue;
    describeFrom(window, screens);
    window.navigation().back();
  }
}

void compare(const Window& window, const char* reference) {
  QJsonArray screens;
  describeFrom(window, screens);
  window.settle();
  const QByteArray drawn = QJsonDocument(screens).toJson();
  QFile file(QStringLiteral(REFERENCE_DIR "/") + QString::fromLatin1(reference));
  if (qEnvironmentVariableIsSet("QEL_WRITE_REFERENCES")) {
    ASSERT_TRUE(file.open(QIODevice::WriteOnly));
    file.write(drawn);
    FAIL() << "written, not compared";
  }
  ASSERT_TRUE(file.open(QIODevice::ReadOnly)) << reference;
  const auto expected = QJsonDocument::fromJson(file.readAll()).array();
  ASSERT_EQ(screens.size(), expected.size());
  for (qsizetype i = 0; i < screens.size(); ++i) {
    EXPECT_EQ(screens[i], expected[i])
        << QJsonDocument(screens[i].toObject()).toJson().toStdString();
  }
}

TEST(Screens, beforeAnyReport) {
  const Window window;
  compare(window, "before-any-report.json");
}

TEST(Screens, afterReports) {
  const Window window;
  MetricStore& store = window.store();
  const Dictionary cell = {
      {"timestamp", "2017-07-14 02:40:00 UTC"}, {"pci", 321},     {"rsrp", -86}, {"rsrq", -14.5F},
      {"plmn", Bytes{0x00, 0xF1, 0x10}},        {"barred", false}};
  store.myLTERRCStateDict = {{"state", "KLTE_RRC_STATE_CONNECTED"}};
  store.myLTESCellInfoDict = store.myUMTSCellInfoDict = store.myGSMScellInfoDict = cell;
  store.myLTEEMMContextDict = {{"guti", Dictionary{{"mmec", 26}}}, {"tai_list", List{1, 2}}};
  store.myGMMContextDict = {{"gmm_state", "KGMM_STATE_REGISTERED"}};
  store.myMMContextDict = {{"mm_state", "KMM_STATE_IDLE"}};
  store.myGSMGPRSConfigDict = cell;
  store.myLTE.EutraNbrs = {cell, {{"pci", 5}}};
  store.myLTE.RsrpRsrqSinr = {cell, {{"pci", 5}}};
  store.myLTE.CAStatusList.clear();
  store.myUMTS.rXInfo = {cell, cell};
  store.myCommon.activeBearer = {{{"apn", "internet"}}};
  store.myCommon.simContents = {{{"ef_id", 28423}, {"content", Bytes(9, 0x10)}}};
  compare(window, "after-reports.json");
}

}  // namespace
}  // namespace qel
