#include "file/method_hints.h"

#include <algorithm>
#include <optional>
#include <string_view>
#include <vector>

#include "names/record_kinds.h"
#include "tokenizer/comment_hint.h"

namespace codeloom {

namespace {

// `# type: (int) -> str`
bool HasFunctionHint(const CRawLogical& logical) {
    return std::any_of(logical.tokens.begin(), logical.tokens.end(), [&](const CRawToken& token) {
        if (token.type != kTokenId_COMMENT) return false;
        const std::optional<std::string_view> hint = HintInComment(logical.Text(token));
        return hint && hint->find_first_not_of(" \t") == hint->find('(');
    });
}

}  // namespace

void LeaveSelfOut(const CRawLogical& logical, CRecords& records, size_t first) {
    if (!logical.is_method || !HasFunctionHint(logical)) return;
    std::vector<CRecord> arguments;
    std::vector<CRecord*> hints;
    for (size_t record_i = first; record_i < records.records.size(); ++record_i) {
        CRecord& record = records.records[record_i];
        if (!record.of_arg) continue;
        if (record.kind == kSetKind) arguments.push_back(record);
        if (record.kind == kTypeHintKind && records.Name(record) != "return") hints.push_back(&record);
    }
    const bool all_but_last =
        hints.size() + 1 == arguments.size() &&
        std::equal(hints.begin(), hints.end(), arguments.begin(),
                   [](const CRecord* hint, const CRecord& argument) { return hint->name == argument.name; });
    if (!all_but_last) return;
    for (size_t hint_i = 0; hint_i < hints.size(); ++hint_i) {
        const CRecord& meant = arguments[hint_i + 1];
        hints[hint_i]->name = meant.name;
        hints[hint_i]->start = meant.start;
        hints[hint_i]->end = meant.end;
    }
}

}  // namespace codeloom
