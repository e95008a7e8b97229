#include "face/settings.h"

#include "host/errors.h"
#include "syntax/language.h"

namespace codeloom {

void CheckVersion(int version) {
    if (!IsKnownVersion(version)) RaiseHost(PyExc_ValueError, "unknown version of the language");
}

CFileSettings SettingsFor(int version, bool false_hints) {
    CheckVersion(version);
    CFileSettings settings;
    settings.version = version;
    settings.false_hints = false_hints;
    settings.wants_records = false;
    return settings;
}

}  // namespace codeloom
