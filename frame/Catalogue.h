// The class catalogue: one row per class the host can create. Listing,
// creation by programmatic identifier and the "not built yet" answer all
// come from this one table.
#pragma once

#include <memory>
#include <span>
#include <string>
#include <string_view>

#include "frame/Component.h"

namespace quendal {

enum class Family { Label, Consignment, Rows };

std::string_view FamilyName(Family family);  // "label", "consignment", "rows"

using Factory = std::unique_ptr<Component> (*)();

struct CatalogueEntry {
  std::string_view className;  // "clsStarTrackGenericSCM"
  Family family;
  std::string_view carrier;
  std::string_view retailerOrFile;
  Factory factory;  // null while the class is not built

  std::string Identifier() const { return "Quendal." + std::string(className); }
};

std::span<const CatalogueEntry> Catalogue();

// The entry for "Quendal.clsX" (or "clsX"); null when unknown.
const CatalogueEntry* FindClass(std::string_view identifier);

struct Created {
  std::unique_ptr<Component> object;  // null when the class can't be created
  std::string reason;                 // why, when object is null
};

// Creates the class named by its programmatic identifier, "Quendal." + class name.
Created CreateObject(std::string_view identifier);

}  // namespace quendal
