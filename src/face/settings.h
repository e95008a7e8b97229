// What hosts say of a text, checked.
#pragma once

#include "file/file_analysis.h"

namespace codeloom {

// Raises ValueError for a version that isn't known.
void CheckVersion(int version);

// Settings for problems alone; raises as CheckVersion.
CFileSettings SettingsFor(int version, bool false_hints);

}  // namespace codeloom
