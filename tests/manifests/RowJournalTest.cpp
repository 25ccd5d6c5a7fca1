// The journal of a row run: records torn by a crash are dropped, and the
// consignments an eParcel run stamped are in the day's file exactly once
// even when its process is killed between Process and Term (SIGKILL, then
// the next run of the class). QUENDAL_KILL_ROUNDS sets the random kills
// (default 8).
#include "manifests/RowJournal.h"

#include <gtest/gtest.h>

#include <map>
#include <random>
#include <thread>

#include "tests/manifests/eParcelFixture.h"
#include "tests/support/Stations.h"

namespace quendal {
namespace {

namespace fs = std::filesystem;
using Strings = std::vector<std::string>;

constexpr std::string_view kManifestClass = "Quendal.clseParcelManifestxml";

TEST(RowJournalTest, ATornRecordAndWhatFollowsAreDropped) {
  test::TempFolder temp;
  std::string bytes;
  {
    RowJournal journal(temp.path(), "kind");
    ASSERT_TRUE(journal.Add("first"));
    ASSERT_TRUE(journal.Add(std::string(3000, 'x')));
    ASSERT_TRUE(journal.Add(""));
    // Left without Clear: another object finds it abandoned once this one is gone.
    const auto files = ListFiles(temp.path());
    ASSERT_EQ(files->size(), 1u);
    bytes = test::ReadText(temp / files->front().name);
    EXPECT_EQ(RowJournal::TakeAbandoned(temp.path(), "kind", [](const Strings&) { return true; }), 0)
        << "a live run's journal is its own";
  }
  EXPECT_EQ(RowJournal::Records(bytes), (Strings{"first", std::string(3000, 'x'), ""}));
  // Cut anywhere inside the second record: only the first is whole.
  for (std::size_t cut : {std::size_t{21}, std::size_t{29}, std::size_t{1000}, std::size_t{3036}})
    EXPECT_EQ(RowJournal::Records(std::string_view(bytes).substr(0, cut)), Strings{"first"}) << cut;
  std::string flipped = bytes;
  flipped[30] ^= 1;
  EXPECT_EQ(RowJournal::Records(flipped), Strings{"first"});

  Strings taken;
  EXPECT_EQ(RowJournal::TakeAbandoned(temp.path(), "other", [&](const Strings& r) {
              taken = r;
              return true;
            }),
            0);
  EXPECT_EQ(RowJournal::TakeAbandoned(temp.path(), "kind", [&](const Strings& r) {
              taken = r;
              return false;  // not moved in: the journal stays
            }),
            0);
  EXPECT_EQ(taken.size(), 3u);
  EXPECT_EQ(RowJournal::TakeAbandoned(temp.path(), "kind", [](const Strings&) { return true; }), 1);
  EXPECT_TRUE(ListFiles(temp.path())->empty());
}

class eParcelKillTest : public test::eParcelFixture {
 protected:
  // `count` consignments awaiting a manifest, numbered from `first`.
  void AddConsignments(int first, int count) {
    auto order = MakeOrder({{"Name", "J SMITH"}, {"Suburb", "RICHMOND"}, {"Postcode", "3121"}});
    for (int id = first; id < first + count; ++id) {
      char no[16];
      std::snprintf(no, sizeof no, "NPP%07d", id);
      AddConNote(id, no, 2, order);
    }
  }
  static std::string NumberOf(int id) {
    char no[16];
    std::snprintf(no, sizeof no, "NPP1%07d", id);
    return no;
  }

  // Starts a run in a child that processes every loaded row, sends each
  // row's result down `results` as it comes back, then waits to be killed
  // (or runs Term when `term`).
  void StartRun(test::Stations& stations, int results, bool term) {
    stations.Start([this, results, term] {
      auto object = CreateObject(kManifestClass).object;
      auto* rows = as<RowInterface>(object);
      Grid columns, grid;
      rows->Init(host.system, 7, columns);
      const std::int32_t loaded = rows->Load("", grid);
      for (std::int32_t row = 0; row < loaded; ++row) {
        LogList log;
        const std::int32_t id = rows->Process(row, log);
        if (::write(results, &id, sizeof id) != sizeof id) return 2;
      }
      if (term) return rows->Term() ? 0 : 1;
      ::pause();
      return 3;
    });
  }

  // The consignment numbers of every day's file, with how often each is there.
  std::map<std::string, int> InDayFiles() {
    std::map<std::string, int> found;
    for (const std::string& name : FilesInFolder()) {
      if (!name.ends_with(".xml")) continue;
      for (const std::string& number : Values(name, "//PCMSConsignment/ConsignmentNumber"))
        ++found[number];
    }
    return found;
  }
  // Journals and locks left in the folder.
  Strings Hidden() const {
    Strings names;
    for (const auto& entry : fs::directory_iterator(dir))
      if (const std::string name = entry.path().filename(); name.ends_with(".pending") || name.ends_with(".lock"))
        names.push_back(name);
    return names;
  }
  // A new run of the class that only ends: it moves in what dead runs left.
  void TermOnly() {
    auto object = CreateObject(kManifestClass).object;
    auto* rows = as<RowInterface>(object);
    Grid columns;
    ASSERT_TRUE(rows->Init(host.system, 7, columns));
    EXPECT_TRUE(rows->Term());
  }
};

std::vector<std::int32_t> ReadAll(int fd) {
  std::vector<std::int32_t> ids;
  std::int32_t id = 0;
  while (::read(fd, &id, sizeof id) == sizeof id) ids.push_back(id);
  return ids;
}

TEST_F(eParcelKillTest, ARunKilledBeforeTermLeavesItsConsignmentsForTheNextRun) {
  ClockOnRealDate();
  AddConsignments(501, 5);
  int pipe[2];
  ASSERT_EQ(::pipe(pipe), 0);
  test::Stations stations;
  StartRun(stations, pipe[1], false);
  ::close(pipe[1]);
  stations.Go();
  std::vector<std::int32_t> ids;
  std::int32_t id = 0;
  while (ids.size() < 5 && ::read(pipe[0], &id, sizeof id) == sizeof id) ids.push_back(id);
  stations.Kill(0);
  EXPECT_EQ(stations.Wait(), std::vector<int>{-SIGKILL});
  ::close(pipe[0]);
  EXPECT_EQ(ids, (std::vector<std::int32_t>{501, 502, 503, 504, 505}));
  EXPECT_TRUE(InDayFiles().empty());  // the run died before writing its file

  TermOnly();
  std::map<std::string, int> expected;
  for (int n = 501; n <= 505; ++n) expected[NumberOf(n)] = 1;
  EXPECT_EQ(InDayFiles(), expected);
  EXPECT_EQ(Hidden(), Strings{});
  // The file is the run's whole document: one header, its manifest number.
  ASSERT_EQ(FilesInFolder(), Strings{"NPP1_1000_EP.xml"});
  EXPECT_EQ(Values("NPP1_1000_EP.xml", "//ManifestNumber"), Strings{"1000"});
  EXPECT_EQ(Values("NPP1_1000_EP.xml", "//ArticleNumber").size(), 10u);

  // A later run that processes them again adds none a second time.
  Run(kManifestClass, {0, 1, 2, 3, 4});
  EXPECT_EQ(InDayFiles(), expected);
}

TEST_F(eParcelKillTest, EveryConsignmentReportedDoneIsOnceInTheFileWheneverTheRunIsKilled) {
  ClockOnRealDate();
  const int rounds = test::EnvCount("QUENDAL_KILL_ROUNDS", 8);
  std::mt19937 random(20240314);
  std::map<std::string, int> done;
  for (int round = 0; round < rounds; ++round) {
    AddConsignments(1000 + round * 10, 6);
    int pipe[2];
    ASSERT_EQ(::pipe(pipe), 0);
    test::Stations stations;
    // Two stations run at once; one is killed at a random moment.
    StartRun(stations, pipe[1], true);
    StartRun(stations, pipe[1], true);
    ::close(pipe[1]);
    stations.Go();
    std::this_thread::sleep_for(std::chrono::microseconds(random() % 30000));
    stations.Kill(random() % 2);
    stations.Wait();
    for (std::int32_t id : ReadAll(pipe[0]))
      if (id != 0) done[NumberOf(id)] = 1;
    ::close(pipe[0]);

    TermOnly();
    const std::map<std::string, int> found = InDayFiles();
    for (const auto& [number, count] : found) EXPECT_EQ(count, 1) << number << " round " << round;
    for (const auto& [number, one] : done)
      EXPECT_TRUE(found.contains(number)) << number << " reported done, not in the file";
    EXPECT_EQ(Hidden(), Strings{}) << "round " << round;
    // The host's stamps died with the children: the next round lists these again.
    for (auto& object : host.conNotes) object->fields["ManifestId"] = Var(1);
  }
  EXPECT_FALSE(done.empty());
}

}  // namespace
}  // namespace quendal
