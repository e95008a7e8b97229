// Rows read as code from a place on, whatever they are.
//   in     a place after a string whose end is in doubt
//   out    of each row, how well it fits there as code
#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>

#include "tokenizer/rows.h"

namespace codeloom {

class CReading {
  public:
    // Reads from `begin` on, the rows after the string at `pos`.
    CReading(CLexer& lexer, size_t pos, size_t begin);

    int RowCount() const { return _fRowCount; }  // comments don't count
    bool IsAtEnd() const { return _fIsAtEnd; }
    bool HasReadTriple() const { return _fHasReadTriple; }
    // One of the rows can't be code.
    bool IsBroken() const { return _fIsBroken; }
    size_t Pos() const { return _fPos; }

    // Nothing is known of the brackets around the string.
    void ForgetBrackets() { _fInBrackets = _fKnowsBrackets = false; }

    // How well the next row fits; less than zero for one that can't be code.
    int ReadRow();

  private:
    int _Fit(bool is_broken) const;
    int _FitOfQuotes(const CRowToken& token) const;
    bool _IsOutOfPlace() const;
    void _Reset();
    void _NoteIndent();

    static constexpr int kCode = 1;
    static constexpr int kBrokenCode = -3;
    static constexpr int kNoCode = -6;
    static constexpr int kOpenEnd = -12;
    static constexpr int kQuotes = 3;

    std::string_view _fText;
    CRowReader _fReader;
    CTokenRow _fRow;
    size_t _fPos;
    bool _fInBrackets;     // that were opened before
    bool _fKnowsBrackets;  // no others than those that the rows open
    int32_t _fIndent;      // how deep the next statement may be
    int _fRowCount = 0;
    bool _fIsBroken = false;
    bool _fIsAfterBroken = false;  // the row before is broken
    bool _fHasReadTriple = false;
    bool _fIsAtEnd = false;
};

}  // namespace codeloom
