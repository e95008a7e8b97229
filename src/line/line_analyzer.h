// line/: one logical line through parser, walkers and hints.
//   in     a CRawLogical
//   out    its records, each with its place, appended to those of the text; its fault; the limit it hit
//   keeps  the parsers, their trees and the walkers, with their storage
//   start  at CLineAnalyzer::Analyze
#pragma once

#include <cstdint>
#include <memory>
#include <span>

#include "names/records.h"
#include "names/walk_limits.h"
#include "syntax/fault.h"
#include "syntax/language.h"
#include "tokenizer/raw_logical.h"

namespace codeloom {

class CFalseHints;
class CTreeObserver;

struct CLineResult {
    CFault fault;  // a line with a fault leaves no records
    ELimit limit = ELimit::kNone;
};

// How a line is to be analysed.
struct CLineRequest {
    bool in_async_def = false;
    bool first_in_def = false;
    CRecords* records = nullptr;         // null when only the fault is wanted
    CFalseHints* false_hints = nullptr;  // of the file; null when all that looks like a hint is one
    CTreeObserver* observer = nullptr;   // null when nobody wants to see the trees
    bool asks_for_more = false;          // HasMoreToTell will be asked
};

// Not for two threads at once.
class CLineAnalyzer {
  public:
    // `language` must outlive it.
    explicit CLineAnalyzer(const CLanguage& language);
    ~CLineAnalyzer();

    CLineResult Analyze(const CRawLogical& line, const CLineRequest& request);

    // The same, with places in the file. `records` and `false_hints` may be null.
    CLineResult Analyze(const CRawLogical& line, CRecords* records, CFalseHints* false_hints = nullptr) {
        return Analyze(line, {line.in_async_def, line.first_in_def, records, false_hints});
    }

    // Of the last line that was analysed, without a fault: where the records of the line itself end, then
    // those of each logical embedded in it.
    std::span<const uint32_t> RecordEnds() const;

    // Of the last line, whose request announced the question: what its records say isn't all that there is to
    // tell. It hit a limit or may hit one in a walk over every node, or what is embedded in it has records
    // that are kept from the line.
    bool HasMoreToTell() const;

  private:
    class CImpl;
    std::unique_ptr<CImpl> _fImpl;
};

}  // namespace codeloom
