// Functions and views of the schema.
#include "fleet/collect/FleetSchema.h"

namespace qel::fleet {
namespace {

// The rest of a body that looks at each partitioned table of the schema.
constexpr std::string_view kEachParent =
    "  FOR parent IN SELECT relname FROM pg_class WHERE relnamespace = 'qelwatch'::regnamespace\n"
    "      AND relkind = 'p' ORDER BY relname LOOP\n"
    "    part := parent || '_' || to_char(day, 'YYYYMMDD');\n";

constexpr std::string_view kHead =
    " LANGUAGE plpgsql SECURITY DEFINER SET search_path = pg_catalog, pg_temp AS $$\n"
    "DECLARE\n"
    "  today date := (now() AT TIME ZONE 'UTC')::date;\n"
    "  since timestamptz := day::timestamp AT TIME ZONE 'UTC';\n"
    "  until timestamptz := (day + 1)::timestamp AT TIME ZONE 'UTC';\n"
    "  parent name;\n"
    "  part text;\n"
    "BEGIN\n";

// What lies in the default partition moves along. Nothing may come there meanwhile.
std::string makeDay(Partitions partitions) {
  std::string sql = "CREATE OR REPLACE FUNCTION qelwatch.make_day(day date) RETURNS boolean" +
                    std::string(kHead) + "  IF day < today - " + std::to_string(kDaysBack) +
                    " OR day > today + " + std::to_string(kDaysAhead) +
                    " THEN RETURN false; END IF;\n";
  if (partitions == Partitions::days) {
    sql += "  PERFORM pg_advisory_xact_lock(hashtext('qelwatch.make_day'));\n" +
           std::string(kEachParent) +
           "    CONTINUE WHEN to_regclass(format('qelwatch.%I', part)) IS NOT NULL;\n"
           "    EXECUTE format('LOCK TABLE qelwatch.%I IN SHARE ROW EXCLUSIVE MODE',"
           " parent || '_default');\n"
           "    EXECUTE format('CREATE TABLE qelwatch.%I (LIKE qelwatch.%I INCLUDING DEFAULTS)',"
           " part, parent);\n"
           "    EXECUTE format('WITH moved AS (DELETE FROM qelwatch.%I WHERE time >= %L AND"
           " time < %L RETURNING *) INSERT INTO qelwatch.%I SELECT * FROM moved',"
           " parent || '_default', since, until, part);\n"
           "    EXECUTE format('ALTER TABLE qelwatch.%I ATTACH PARTITION qelwatch.%I"
           " FOR VALUES FROM (%L) TO (%L)', parent, part, since, until);\n"
           "  END LOOP;\n";
  }
  return sql + "  RETURN true;\nEND $$;\n";
}

std::string dropDay(Partitions partitions) {
  const std::string sql = "CREATE OR REPLACE FUNCTION qelwatch.drop_day(day date) RETURNS void";
  if (partitions == Partitions::days) {
    return sql + std::string(kHead) + std::string(kEachParent) +
           "    EXECUTE format('DROP TABLE IF EXISTS qelwatch.%I', part);\n"
           "  END LOOP;\nEND $$;\n";
  }
  return sql +
         " LANGUAGE sql AS $$\n"
         "  SELECT drop_chunks(format('%I.%I', hypertable_schema, hypertable_name)::regclass,\n"
         "    older_than => (day + 1)::timestamp AT TIME ZONE 'UTC',\n"
         "    newer_than => day::timestamp AT TIME ZONE 'UTC')\n"
         "  FROM timescaledb_information.hypertables WHERE hypertable_schema = 'qelwatch'\n"
         "$$;\n";
}

constexpr std::string_view kPhones =
    "CREATE OR REPLACE VIEW qelwatch.phones AS\n"
    "SELECT phone, first_seen, last_event, status, status_time FROM qelwatch.phone\n"
    "  LEFT JOIN LATERAL (SELECT time AS last_event FROM qelwatch.event\n"
    "    WHERE event.phone = phone.phone AND time > now() - interval '7 days'\n"
    "    ORDER BY time DESC LIMIT 1) AS newest ON true\n"
    "  LEFT JOIN LATERAL (SELECT status, time AS status_time FROM qelwatch.status\n"
    "    WHERE status.phone = phone.phone ORDER BY time DESC LIMIT 1) AS said ON true;\n";

// What a stream has lost only grows, in whatever order that was said and stored.
constexpr std::string_view kStreams =
    "CREATE OR REPLACE VIEW qelwatch.streams AS\n"
    "SELECT phone, stream, first_event, last_event, events, newest,\n"
    "    newest - distinct_numbers AS missing, dropped, lost, too_large\n"
    "  FROM (SELECT phone, stream, min(time) AS first_event, max(time) AS last_event,\n"
    "      count(*) AS events, max(number) AS newest,\n"
    "      count(DISTINCT number) AS distinct_numbers\n"
    "    FROM qelwatch.event GROUP BY phone, stream) AS counted\n"
    "  LEFT JOIN LATERAL (SELECT max(dropped) AS dropped, max(lost) AS lost,\n"
    "      max(too_large) AS too_large FROM qelwatch.queue\n"
    "    WHERE queue.phone = counted.phone AND queue.stream = counted.stream) AS said ON true;\n";

// The report of the same phone before this one, of a day at most: a query that asks for some days
// reads no others.
std::string reportBefore(std::string_view table, std::string_view columns) {
  return "LATERAL (SELECT " + std::string(columns) + " FROM " + withSchema(table) +
         " AS old\n    WHERE old.phone = report.phone AND old.time <= report.time\n"
         "      AND old.time > report.time - interval '1 day'\n"
         "      AND (old.time, old.stream, old.number) < (report.time, report.stream, "
         "report.number)"
         "\n    ORDER BY old.time DESC, old.stream DESC, old.number DESC LIMIT 1) AS before\n";
}

// Reports come again and again: a change is one that differs from the one before. A handover is one
// while the RRC state reported last was connected.
std::string cellChanges() {
  return "CREATE OR REPLACE VIEW qelwatch.lte_cell_changes AS\n"
         "SELECT report.phone, report.time, before.cell_id AS from_cell_id,\n"
         "    before.phy_cell_id AS from_pci, before.dl_freq AS from_earfcn,\n"
         "    report.cell_id AS to_cell_id, report.phy_cell_id AS to_pci,\n"
         "    report.dl_freq AS to_earfcn,\n"
         "    COALESCE(rrc.state = 'KLTE_RRC_STATE_CONNECTED', false) AS connected\n"
         "  FROM qelwatch.lte_scell_info AS report CROSS JOIN " +
         reportBefore("lte_scell_info", "cell_id, phy_cell_id, dl_freq") +
         "  LEFT JOIN LATERAL (SELECT state FROM qelwatch.lte_rrc_state AS state\n"
         "    WHERE state.phone = report.phone AND state.time < report.time\n"
         "      AND state.time > report.time - interval '1 day'\n"
         "    ORDER BY state.time DESC, state.stream DESC, state.number DESC LIMIT 1) AS rrc ON "
         "true"
         "\n  WHERE (report.cell_id, report.phy_cell_id, report.dl_freq)\n"
         "    IS DISTINCT FROM (before.cell_id, before.phy_cell_id, before.dl_freq);\n";
}

std::string rejectsOf(std::string_view table, std::string_view domain, std::string_view condition) {
  return "SELECT report.phone, report.time, '" + std::string(domain) +
         "' AS domain, report.reject_cause AS cause\n  FROM " + withSchema(table) +
         " AS report LEFT JOIN " + reportBefore(table, "reject_cause") + "    ON true\n  WHERE " +
         std::string(condition) + " AND report.reject_cause IS DISTINCT FROM before.reject_cause\n";
}

}  // namespace

std::string functions(Partitions partitions) { return makeDay(partitions) + dropDay(partitions); }

std::string views() {
  const std::string isRejected = "report.reject_cause <> 'KNAS_MM_REJ_CAUSE_NONE'";
  return std::string(kPhones) + std::string(kStreams) + cellChanges() +
         "CREATE OR REPLACE VIEW qelwatch.rejects AS\n" +
         rejectsOf(
             "emm_context", "EMM",
             "report.reject_cause <> 'EMM_CAUSE_NO_CAUSE' AND COALESCE(report.entry, 0) = 0") +
         "UNION ALL\n" + rejectsOf("mm_context", "MM", isRejected) + "UNION ALL\n" +
         rejectsOf("gmm_context", "GMM", isRejected) + ";\n";
}

}  // namespace qel::fleet
