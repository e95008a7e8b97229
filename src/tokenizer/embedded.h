// The expressions within a logical line that are logical lines of their own: fields of f-strings, hints in
// quotes, hints in comments.
#pragma once

#include <cstddef>
#include <string_view>
#include <vector>

#include "tokenizer/raw_logical.h"
#include "tokenizer/spare_logicals.h"

namespace codeloom {

// What a logical line holds that can hold embedded ones.
struct CEmbeddingTokens {
    bool has_fields = false;
    bool has_comments = false;
    bool has_strings = false;  // after a ":" or "->", where they may be hints

    bool Any() const { return has_fields || has_comments || has_strings; }
};

class CEmbeddedFinder {
  public:
    explicit CEmbeddedFinder(std::string_view text) : _fText(text) {}

    // Takes back the storage of the embedded logicals.
    void Clear(CRawLogical& logical) { _fSpare.TakeBack(logical.embedded); }

    // Adds the embedded logicals of `logical`, which is complete but for them.
    void Find(CRawLogical& logical, const CEmbeddingTokens& what);

  private:
    // The rows of the token that is looked at, in the text of the file.
    struct CTokenRows {
        int32_t first_row = 0;
        std::vector<size_t> starts;
    };

    void _AddFields(CRawLogical& logical, const CRawToken& token);
    void _AddStringHints(CRawLogical& logical);
    void _AddStringHint(CRawLogical& logical, const CRawToken& token);
    void _AddCommentHint(CRawLogical& logical, const CRawToken& token);
    void _CollectTokens(std::vector<CRawToken>& tokens, size_t pos, size_t end) const;

    void _ReadRows(const CRawLogical& logical, const CRawToken& token);
    CPosition _PositionOf(size_t pos) const;
    void _SetPlaces(CRawLogical& embedded, size_t origin);
    size_t _PosOf(std::string_view part) const { return static_cast<size_t>(part.data() - _fText.data()); }

    std::string_view _fText;
    CSpareLogicals _fSpare;
    CTokenRows _fRows;
    std::vector<size_t> _fHints;
};

}  // namespace codeloom
