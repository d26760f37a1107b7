#include "fleet/collect/WithDatabase.h"

namespace qel::testing {
namespace {

// The extension is in no package of Debian: in its place stands what notes down how it is called.
constexpr const char* kExtension =
    "SET allow_system_table_mods = on;"
    " INSERT INTO pg_extension (oid, extname, extowner, extnamespace, extrelocatable, extversion)"
    " VALUES (99999, 'timescaledb', 10, 2200, false, '2.0');"
    " CREATE TABLE public.calls (name text, day interval);"
    " CREATE FUNCTION public.create_hypertable(relation regclass, time_column_name name,"
    " chunk_time_interval interval, create_default_indexes boolean) RETURNS void LANGUAGE sql AS"
    " 'INSERT INTO public.calls VALUES (relation::text || ''.'' || time_column_name,"
    " chunk_time_interval)';"
    " CREATE SCHEMA timescaledb_information;"
    " CREATE TABLE timescaledb_information.hypertables"
    " (hypertable_schema name, hypertable_name name);"
    " CREATE FUNCTION public.drop_chunks(relation regclass, older_than timestamptz,"
    " newer_than timestamptz) RETURNS SETOF text LANGUAGE sql AS 'SELECT ''none'''";

using Hypertables = WithDatabase;

TEST_F(Hypertables, areAskedForWhereTheExtensionIs) {
  database->ask(kExtension);
  const Outcome outcome =
      qelctl({"collect", "--prepare", "--database", database->address("owner")});
  EXPECT_EQ(outcome.err, "qelctl: database: 34 tables made, 0 columns added, hypertables\n");
  EXPECT_EQ(database->ask("SELECT count(*), count(DISTINCT name), min(day) FROM public.calls"),
            "31|31|1 day");
  EXPECT_EQ(database->ask("SELECT count(*) FROM public.calls WHERE name = 'qelwatch.event.time'"),
            "1");
  EXPECT_EQ(database->ask("SELECT count(*) FROM pg_class WHERE relispartition"), "0");
  database->ask("GRANT qelwatch_collector TO collector; SELECT qelwatch.drop_day('2026-01-01')");
  const auto program = collector();
  send(kRrcTopic, rrcState(1) + rrcState(1));
  ASSERT_TRUE(haveCome(1)) << program->err();
  EXPECT_TRUE(end(*program).ends_with(": 1 events stored, 1 came again\n")) << program->err();
}

TEST_F(Hypertables, areNotMadeOfWhatIsThere) {
  prepare();
  database->ask(kExtension);
  const Outcome outcome =
      qelctl({"collect", "--prepare", "--database", database->address("owner")});
  EXPECT_EQ(outcome.err, "qelctl: database: 0 tables made, 0 columns added, partitions by day\n");
  EXPECT_EQ(database->ask("SELECT count(*) FROM public.calls"), "0");
}

}  // namespace
}  // namespace qel::testing
