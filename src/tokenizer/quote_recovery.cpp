#include "tokenizer/quote_recovery.h"

#include <algorithm>
#include <vector>

#include "tokenizer/prose_end.h"
#include "tokenizer/quote_context.h"
#include "tokenizer/reading.h"

namespace codeloom {

namespace {

// What is odd about the closing quotes of a string, if they close it.
struct COddity {
    bool is_after_code;
    bool is_before_operand;
    bool is_any;

    COddity(std::string_view text, size_t pos, const CStringStart& start, size_t end) {
        const size_t next = SkipBlanks(text, end);
        is_after_code = EndsBeforeString(text.substr(pos, end - start.quote_length - pos + 1));
        is_before_operand = CannotFollowString(text, next);
        is_any = is_after_code || is_before_operand || HardlyFollowsString(text, next, end) ||
                 HardlyBeginsCode(text, SkipToNextRow(text, next));
    }
};

// One of the first rows, before the next string, can't be code.
bool BeginsBroken(CReading reading) {
    constexpr int kFirstRows = 4;
    while (!reading.IsBroken()) {
        if (reading.RowCount() == kFirstRows || reading.HasReadTriple() || reading.IsAtEnd()) return false;
        reading.ReadRow();
    }
    return true;
}

// Weighs two readings of the same rows, one of which finds strings where the other finds code.
class CBalance {
  public:
    // Takes the rows up to `end` for the second reading, or with a `side` of -1 against the first.
    void Add(CReading& reading, size_t end, int side) {
        while (!reading.IsAtEnd() && reading.Pos() < end) _AddRow(reading, side);
    }
    void AddRows(CReading& reading, int row_count, int side) {
        while (!reading.IsAtEnd() && reading.RowCount() < row_count) _AddRow(reading, side);
    }
    void Add(size_t pos, int weight) {
        if (weight != 0) _fSigns.push_back({pos, weight});
    }

    // More than zero when the second reading fits better. A fault further on turns both readings inside out,
    // so all that follows a row is worth no more than a fault.
    int Value() {
        std::stable_sort(_fSigns.begin(), _fSigns.end(),
                         [](const CSign& one, const CSign& other) { return one.pos < other.pos; });
        int value = 0;
        for (auto sign = _fSigns.rbegin(); sign != _fSigns.rend(); ++sign)
            value = std::clamp(value, -kFault, kFault) + sign->weight;
        return value;
    }

  private:
    static constexpr int kFault = 12;

    struct CSign {
        size_t pos;
        int weight;
    };

    void _AddRow(CReading& reading, int side) {
        const size_t pos = reading.Pos();
        Add(pos, side * reading.ReadRow());
    }

    std::vector<CSign> _fSigns;
};

// The rows fit much better as code from `prose_end` on, within the string at `pos`, than from its end at
// `end` on, and there they don't fit.
bool FitsBetterUnclosed(CLexer& lexer, size_t pos, size_t prose_end, size_t end, bool is_before_operand,
                        size_t& looked_at) {
    constexpr int kEnoughRows = 60;
    constexpr int kMuch = 4;
    constexpr int kOperandWeight = 6;
    CReading closed(lexer, pos, end);
    CReading unclosed(lexer, pos, prose_end);
    unclosed.ForgetBrackets();
    CBalance balance;
    if (is_before_operand) balance.Add(end, kOperandWeight);
    balance.AddRows(closed, kEnoughRows, -1);
    balance.Add(unclosed, closed.Pos(), 1);
    looked_at = std::max({looked_at, closed.Pos(), unclosed.Pos()});
    return (is_before_operand || closed.IsBroken()) && balance.Value() > kMuch;
}

}  // namespace

size_t FindUnclosedTripleEnd(CLexer& lexer, size_t pos, const CStringStart& start, const CStringEnd& found,
                             size_t& looked_at) {
    const std::string_view text = lexer.Text();
    if (!found.is_closed) return FindProseEnd(lexer, pos, text.size(), looked_at);
    const size_t closing_row = pos + RowStart(text.substr(pos), found.end - pos);
    if (closing_row == pos) return 0;
    const COddity oddity(text, pos, start, found.end);
    if (!oddity.is_any) return 0;
    const bool is_at_once = oddity.is_after_code || oddity.is_before_operand;
    if (!is_at_once && !BeginsBroken(CReading(lexer, pos, found.end))) return 0;

    const size_t prose_end = FindProseEnd(lexer, pos, closing_row, looked_at);
    const bool is_unclosed =
        FitsBetterUnclosed(lexer, pos, prose_end, found.end, oddity.is_before_operand, looked_at);
    return is_unclosed ? prose_end : 0;
}

}  // namespace codeloom
