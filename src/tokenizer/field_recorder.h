// The fields of an f-string or t-string as logical lines of their own.
#pragma once

#include <cstddef>
#include <string_view>
#include <vector>

#include "tokenizer/fstring_scanner.h"
#include "tokenizer/raw_logical.h"
#include "tokenizer/spare_logicals.h"

namespace codeloom {

// Every field leaves a logical line, also a broken one, with a token then that no grammar takes: the sign
// that ends a field without a sound expression, or the "{" of a field that isn't closed.
class CFieldRecorder : public CFieldListener {
  public:
    // Adds to `logicals`, which get their tokens, but no positions yet. `text` is the file's.
    CFieldRecorder(std::string_view text, std::vector<CRawLogical>& logicals, CSpareLogicals& spare)
        : _fText(text), _fLogicals(logicals), _fSpare(spare) {}

    // Scanning was given up: no open field will be closed.
    void GiveUp();

    void BeginField(size_t brace_pos) override;
    void AddFieldToken(size_t pos, const CLexedToken& token) override;
    void EndExpression(size_t pos, bool is_sound) override;
    void EndField() override { _fOpen.pop_back(); }
    void AddLoneBrace(size_t pos) override;

  private:
    struct COpenField {
        size_t logical_i;
        size_t brace_pos;
    };

    CRawLogical& _Add();
    CRawToken _SignAt(size_t pos) const;
    std::vector<CRawToken>& _InnermostTokens() { return _fLogicals[_fOpen.back().logical_i].tokens; }

    std::string_view _fText;
    std::vector<CRawLogical>& _fLogicals;
    CSpareLogicals& _fSpare;
    std::vector<COpenField> _fOpen;
};

}  // namespace codeloom
