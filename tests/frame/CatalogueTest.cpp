#include "frame/Catalogue.h"

#include <gtest/gtest.h>

#include <set>

namespace quendal {
namespace {

TEST(CatalogueTest, EveryClassOnceWithItsFamily) {
  const auto catalogue = Catalogue();
  ASSERT_EQ(catalogue.size(), 48u);
  std::set<std::string_view> names;
  int labels = 0, consignments = 0, rows = 0;
  for (const auto& entry : catalogue) {
    EXPECT_TRUE(entry.className.starts_with("cls")) << entry.className;
    EXPECT_TRUE(names.insert(entry.className).second) << "twice: " << entry.className;
    EXPECT_FALSE(entry.carrier.empty());
    EXPECT_FALSE(entry.retailerOrFile.empty());
    switch (entry.family) {
      case Family::Label:
        ++labels;
        // Label classes are the ones named ...SCM (and one ...SCMLSCP).
        EXPECT_NE(entry.className.find("SCM"), std::string_view::npos) << entry.className;
        break;
      case Family::Consignment:
        ++consignments;
        break;
      case Family::Rows:
        ++rows;
        break;
    }
  }
  EXPECT_EQ(labels, 29);
  EXPECT_EQ(consignments, 11);
  EXPECT_EQ(rows, 8);
  EXPECT_EQ(FindClass("Quendal.clsTNTDAet11")->family, Family::Consignment);
  EXPECT_EQ(FindClass("clseParcelManifestEODxml")->family, Family::Rows);
}

TEST(CatalogueTest, CreateObjectBuildsEveryBuiltClassAndExplainsTheRest) {
  for (const auto& entry : Catalogue()) {
    const Created created = CreateObject(entry.Identifier());
    if (entry.factory) {
      ASSERT_TRUE(created.object) << entry.className;
      EXPECT_EQ(created.object->ClassName(), entry.Identifier());
      switch (entry.family) {
        case Family::Label:
          EXPECT_TRUE(as<LabelInterface>(created.object)) << entry.className;
          break;
        case Family::Consignment:
          EXPECT_TRUE(as<ConsignmentInterface>(created.object)) << entry.className;
          break;
        case Family::Rows:
          EXPECT_TRUE(as<RowInterface>(created.object)) << entry.className;
          break;
      }
    } else {
      EXPECT_FALSE(created.object);
      EXPECT_EQ(created.reason, entry.Identifier() + " is in the catalogue but not built yet");
    }
  }
}

TEST(CatalogueTest, UnknownIdentifiersAreRefusedWithAReason) {
  EXPECT_EQ(CreateObject("Quendal.clsNoSuchThing").reason,
            "no class Quendal.clsNoSuchThing in the catalogue");
  EXPECT_FALSE(CreateObject("clsStarTrackDAcln").object);
  EXPECT_EQ(FindClass("Quendal.clsstartrackdacln"), nullptr);  // identifiers are exact
}

}  // namespace
}  // namespace quendal
