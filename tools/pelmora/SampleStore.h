#pragma once

#include "tools/pelmora/SampleFolder.h"

namespace pelmora {

/// Fills the folder with what a person might keep: containers with all kinds of rules, documents
/// of many types, names and sizes, shared and tagged items, and the dictionary of tags.
platform::Failure makeSampleStore(const std::string& root);

} // namespace pelmora
