// The first form of a line that its version of the language doesn't have.
#pragma once

#include <cstdint>

#include "syntax/forms.h"

namespace codeloom {

class CFormNotes {
  public:
    explicit CFormNotes(int forms_version) : _fVersion(forms_version) {}

    void Reset() { _fFound = nullptr; }
    void Note(const CForm& form, uint32_t token_i) {
        if (_fFound != nullptr || form.version <= _fVersion) return;
        _fFound = &form;
        _fToken_i = token_i;
    }

    const CForm* Found() const { return _fFound; }  // null when there is none
    uint32_t Token() const { return _fToken_i; }

  private:
    int _fVersion;
    const CForm* _fFound = nullptr;
    uint32_t _fToken_i = 0;
};

}  // namespace codeloom
