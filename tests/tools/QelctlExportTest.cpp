#include <sys/stat.h>

#include <csignal>
#include <filesystem>
#include <nlohmann/json.hpp>

#include "messages/lte_neighbours.h"
#include "messages/nas.h"
#include "metrics/MetricValidator.h"
#include "recording/EventLine.h"
#include "recording/Mark.h"
#include "tools/Exported.h"
#include "tools/Qelctl.h"
#include "tools/RunningQelctl.h"

namespace qel::testing {
namespace {

namespace fs = std::filesystem;

std::string neighbours() {
  KCellularLteNbrEutraCellMeas message;
  message.setTimestamp(1500000000123);
  for (unsigned i = 0; i < 2; ++i) {
    auto cell = std::make_shared<EgwErrcNbrEutraMeas>();
    cell->setNbrEarfcn(1300);
    cell->setNbrRsrp(static_cast<std::int32_t>(50 + i));
    message.addMeasNbrEutra(cell);
  }
  RecordedEvent event{
      1500000001007,
      RecordedKind::metric,
      {{"kKeyMetricID", MetricValidator::K_LTE_INTRARAT_MEAS}, {"kKeyPayload", message.data()}}};
  return eventLine(event) + "\n";
}

std::string contentOf(const std::string& path) {
  std::ifstream stream(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(stream), {}};
}

TEST(QelctlExport, writesAHeaderWithUnitsAndARowForEachEntry) {
  const TemporaryRecording recording(neighbours());
  const Folder folder;
  ASSERT_EQ(
      qelctl({"export", recording.path(), "--format", "csv", "--out", folder / "out"}).exitCode, 0);
  EXPECT_EQ(contentOf(folder / "out/KCellularLteNbrEutraCellMeas.csv"),
            "time_utc,timestamp,list,entry,nbr_earfcn,nbr_phys_cell_id,freq_band_ind,"
            "nbr_rsrp [dBm],nbr_rsrq [dB]\r\n"
            "2017-07-14T02:40:01.007Z,2017-07-14T02:40:00.123Z,meas_nbr_eutra,0,1300,,,-90,\r\n"
            "2017-07-14T02:40:01.007Z,2017-07-14T02:40:00.123Z,meas_nbr_eutra,1,1300,,,-89,\r\n");
  struct stat status {};
  ASSERT_EQ(::stat((folder / "out/happenings.csv").c_str(), &status), 0);
  EXPECT_EQ(status.st_mode & 0777U, 0600U);
}

TEST(QelctlExport, tellsWhatHappenedAndWhatWasMarked) {
  const RecordedEvent mark = markEvent(1500000000000, 1);
  const TemporaryRecording recording(eventLine(mark) + "\n" + neighbours());
  const Folder folder;
  ASSERT_EQ(qelctl({"export", recording.path(), "--format", "sqlite", "--out", folder / "out.db"})
                .exitCode,
            0);
  const auto tables = readSqlite(folder / "out.db");
  const ExportedRow expected = {
      {"time_utc", "2017-07-14T02:40:00.000Z"}, {"kind", "mark"}, {"text", "Mark 1"}};
  EXPECT_EQ(tables.at("happenings").rows, std::vector<ExportedRow>{expected});
}

TEST(QelctlHappenings, tellsMarks) {
  const TemporaryRecording recording(eventLine(markEvent(1500000000000, 7)) + "\n");
  const Outcome outcome = qelctl({"happenings", recording.path(), "--json"});
  const auto line = nlohmann::json::parse(outcome.out);
  EXPECT_EQ(line["kind"], "mark");
  EXPECT_EQ(line["text"], "Mark 7");
  EXPECT_EQ(line["time_ms"], 1500000000000);
}

TEST(QelctlExport, tellsTheHappeningsThatHappeningsTells) {
  const Folder folder;
  ASSERT_EQ(
      qelctl({"export", QEL_SIMULATED_DRIVE, "--format", "csv", "--out", folder / "out"}).exitCode,
      0);
  const auto rows = readCsv(folder / "out").at("happenings").rows;
  const auto lines = linesOf(qelctl({"happenings", QEL_SIMULATED_DRIVE, "--json"}).out);
  ASSERT_GT(lines.size(), 100U);
  ASSERT_EQ(rows.size(), lines.size());
  for (std::size_t i = 0; i < rows.size(); ++i) {
    const auto line = nlohmann::json::parse(lines[i]);
    EXPECT_EQ(rows[i].at("kind"), line["kind"].get<std::string>());
    EXPECT_EQ(rows[i].at("text"), line["text"].get<std::string>());
    if (line["kind"] != "cell") continue;
    EXPECT_EQ(rows[i].at("to_code"), line["to"]["code"].dump()) << lines[i];
    EXPECT_EQ(rows[i].contains("from_code"), !line["from"].is_null()) << lines[i];
  }
}

std::string subscriber() {
  KCellularMmCommonInfo message;
  message.setImsi(Bytes{8, 0x09, 0x10, 0x10, 0x21, 0x43, 0x65, 0x87, 0x09});
  return metricLine(MetricValidator::K_CELLULAR_MM_INFO, message);
}

TEST(QelctlExport, hidesIdentitiesUnlessItIsAsked) {
  const TemporaryRecording recording(subscriber() + subscriber());
  const Folder folder;
  const std::string kImsi = "<080910102143658709>";
  const auto imsisIn = [&](const std::string& name, std::vector<std::string> more) {
    std::vector<std::string> words = {"export", recording.path(), "--format",
                                      "csv",    "--out",          folder / name};
    words.insert(words.end(), more.begin(), more.end());
    EXPECT_EQ(qelctl(words).exitCode, 0);
    std::vector<std::string> imsis;
    const auto tables = readCsv(folder / name);
    for (const auto& row : tables.at("KCellularMmCommonInfo").rows) imsis.push_back(row.at("imsi"));
    return imsis;
  };
  EXPECT_EQ(imsisIn("kept", {"--keep-identities"}), (std::vector<std::string>{kImsi, kImsi}));
  const auto hidden = imsisIn("hidden", {});
  ASSERT_EQ(hidden.size(), 2U);
  EXPECT_NE(hidden[0], kImsi);
  EXPECT_EQ(hidden[0], hidden[1]) << "one pseudonym for one value";
}

TEST(QelctlExport, replacesNothingUnlessItIsForced) {
  const TemporaryRecording recording(neighbours());
  const Folder folder;
  for (const auto& [format, name] : {std::pair("csv", "out"), std::pair("sqlite", "out.db")}) {
    std::vector<std::string> words = {"export", recording.path(), "--format",
                                      format,   "--out",          folder / name};
    ASSERT_EQ(qelctl(words).exitCode, 0);
    const Outcome refused = qelctl(words);
    EXPECT_EQ(refused.exitCode, 74);
    EXPECT_TRUE(refused.err.ends_with(" (--force replaces what is there)\n")) << refused.err;
    words.emplace_back("--force");
    EXPECT_EQ(qelctl(words).exitCode, 0);
  }
  // What an export before left is no part of this one.
  std::ofstream(folder / "out/KCellularMmContext.csv") << "time_utc,timestamp\r\n";
  for (const char* name : {"expenses.csv", "picked.csv", "KCellularMmContext.txt"}) {
    std::ofstream(folder / ("out/" + std::string(name))) << "time_utc,timestamp\r\n";
  }
  ASSERT_EQ(
      qelctl({"export", recording.path(), "--format", "csv", "--out", folder / "out", "--force"})
          .exitCode,
      0);
  for (const char* name : {"expenses.csv", "picked.csv", "KCellularMmContext.txt"}) {
    EXPECT_TRUE(fs::remove(folder / ("out/" + std::string(name)))) << "of somebody else";
  }
  EXPECT_EQ(readCsv(folder / "out").size(), 2U);
}

TEST(QelctlExport, touchesNoFileBesideTheOneItMakes) {
  const TemporaryRecording recording(neighbours());
  const Folder folder;
  std::ofstream(folder / "out.db.part") << "of somebody else";
  ASSERT_EQ(qelctl({"export", recording.path(), "--format", "sqlite", "--out", folder / "out.db"})
                .exitCode,
            0);
  EXPECT_EQ(contentOf(folder / "out.db.part"), "of somebody else");
  EXPECT_EQ(folder.names(), (std::set<std::string>{"out.db", "out.db.part"}));
}

TEST(QelctlExport, hasNoFormulasForASpreadsheet) {
  std::string lines;
  const std::vector<std::string> names = {"=1+cmd|x!A1", "+1", "-1", "@a", "\ta", "\ra", "a=1", ""};
  for (const std::string& name : names) {
    auto bearer = std::make_shared<BearerContext>();
    bearer->setCid(5);
    bearer->setApn(name);
    KCellularActivatedBearerContexts message;
    message.addBearerContexts(bearer);
    lines += metricLine(MetricValidator::K_CELLULAR_ACTIVE_BEARER, message);
  }
  const TemporaryRecording recording(lines);
  const Folder folder;
  for (const auto& [format, name] : {std::pair("csv", "out"), std::pair("sqlite", "out.db")}) {
    ASSERT_EQ(qelctl({"export", recording.path(), "--format", format, "--out", folder / name,
                      "--keep-identities"})
                  .exitCode,
              0);
  }
  const auto files = readCsv(folder / "out");
  const auto tables = readSqlite(folder / "out.db");
  const auto& rows = files.at("KCellularActivatedBearerContexts").rows;
  ASSERT_EQ(rows.size(), names.size());
  for (std::size_t i = 0; i < names.size(); ++i) {
    EXPECT_EQ(rows[i].at("apn"), (i < 6 ? "'" : "") + names[i]);
    EXPECT_EQ(tables.at("KCellularActivatedBearerContexts").rows[i].at("apn"), names[i]);
  }
}

TEST(QelctlExport, leavesNothingBehindWhenALineIsBad) {
  const Folder folder;
  const TemporaryRecording nonsense(neighbours() + "nonsense\n");
  const TemporaryRecording undecodable(
      neighbours() + metricLine(MetricValidator::K_LTE_RRC_STATE, Bytes{0x08}),
      "undecodable.jsonl");
  for (const TemporaryRecording* recording : {&nonsense, &undecodable}) {
    for (const auto& [format, name] : {std::pair("csv", "out"), std::pair("sqlite", "out.db")}) {
      std::vector<std::string> words = {"export", recording->path(), "--format",
                                        format,   "--out",           folder / name};
      const Outcome outcome = qelctl(words);
      EXPECT_EQ(outcome.exitCode, 65);
      EXPECT_TRUE(outcome.err.starts_with("qelctl: " + recording->path() + ":2: ")) << outcome.err;
      EXPECT_EQ(folder.names(), std::set<std::string>());
      words.emplace_back("--skip-bad");
      EXPECT_EQ(qelctl(words).exitCode, 0);
      fs::remove_all(folder / name);
    }
  }
}

TEST(QelctlExport, leavesNothingBehindWhenTheDiskIsFull) {
  const Folder folder;
  for (const auto& [format, name] : {std::pair("csv", "out"), std::pair("sqlite", "out.db")}) {
    const Outcome outcome =
        run("/bin/sh", {"-c", "ulimit -f 40; exec \"$0\" \"$@\"", QEL_QELCTL, "export",
                        QEL_SIMULATED_DRIVE, "--format", format, "--out", folder / name});
    EXPECT_EQ(outcome.exitCode, 74) << outcome.err;
    EXPECT_EQ(linesOf(outcome.err).size(), 1U) << outcome.err;
    EXPECT_EQ(folder.names(), std::set<std::string>());
  }
}

TEST(QelctlExport, leavesNothingBehindWhenItIsInterrupted) {
  const Folder folder;
  const std::string pipe = folder / "pipe.jsonl";
  ASSERT_EQ(::mkfifo(pipe.c_str(), 0600), 0);
  for (const auto& [format, name] : {std::pair("csv", "out"), std::pair("sqlite", "out.db")}) {
    RunningQelctl running({"export", pipe, "--format", format, "--out", folder / name});
    std::ofstream writer(pipe);
    writer << neighbours() << std::flush;
    ASSERT_TRUE(eventually([&] { return folder.names().size() == 2; }));
    running.signal(SIGINT);
    EXPECT_EQ(running.waitForEnd(), -SIGINT);
    EXPECT_EQ(folder.names(), std::set<std::string>{"pipe.jsonl"});
  }
}

TEST(QelctlExport, showsOnATerminalHowFarItIs) {
  const Folder folder;
  const std::string pipe = folder / "pipe.jsonl";
  ASSERT_EQ(::mkfifo(pipe.c_str(), 0600), 0);
  RunningQelctl running({"export", pipe, "--format", "csv", "--out", folder / "out"},
                        RunningQelctl::Streams::terminal);
  std::ofstream writer(pipe);
  const auto isShown = [&] {
    writer << neighbours() << std::flush;
    return running.out().find(pipe + ": ") != std::string::npos;
  };
  EXPECT_TRUE(eventually(isShown));
  writer.close();
  EXPECT_EQ(running.waitForEnd(), 0);
  EXPECT_NE(running.out().find(" in 1 table, 0 happenings, identities hidden"), std::string::npos)
      << running.out();
}

TEST(QelctlExport, refusesWhatItCannotDo) {
  const TemporaryRecording recording(neighbours());
  const Folder folder;
  const auto exitCodeOf = [](const std::vector<std::string>& words) {
    const Outcome outcome = qelctl(words);
    EXPECT_EQ(linesOf(outcome.err).size(), 1U) << outcome.err;
    return outcome.exitCode;
  };
  EXPECT_EQ(exitCodeOf({"export", recording.path(), "--format", "xml", "--out", folder / "x"}), 64);
  EXPECT_EQ(exitCodeOf({"export", recording.path(), "--format", "csv"}), 64);
  EXPECT_EQ(exitCodeOf({"export", folder / "none", "--format", "csv", "--out", folder / "x"}), 66);
  EXPECT_EQ(exitCodeOf({"export", recording.path(), "--format", "csv", "--out", folder / "a/b"}),
            74);
  EXPECT_EQ(exitCodeOf({"export", recording.path(), "--format", "sqlite", "--out", folder / "a/b"}),
            74);
  for (const char* format : {"csv", "sqlite"}) {
    EXPECT_EQ(exitCodeOf({"export", recording.path(), "--format", format, "--out", recording.path(),
                          "--force"}),
              64);
  }
  EXPECT_EQ(contentOf(recording.path()), neighbours());
}

}  // namespace
}  // namespace qel::testing
