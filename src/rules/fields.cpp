#include "rules/fields.h"

#include <algorithm>

#include "tokenizer/fstring_scanner.h"
#include "tokenizer/lexer.h"

namespace codeloom {

namespace {

class CFieldReader final : public CFieldListener {
  public:
    explicit CFieldReader(CStringFields& fields) : _fFields(fields) {}

    void BeginField(size_t brace_pos) override {
        const bool in_spec = !_fOpen.empty() && _fOpen.back().in_spec;
        const int level = in_spec ? _fOpen.back().level + 1 : 1;
        _fFields.levels = std::max(_fFields.levels, level);
        const auto start = static_cast<uint32_t>(brace_pos + 1);
        const auto in_strings = std::count_if(_fOpen.begin(), _fOpen.end(),
                                              [](const COpenField& field) { return !field.in_spec; });
        _fFields.string_levels = std::max(_fFields.string_levels, static_cast<int>(in_strings) + 1);
        _fOpen.push_back({_fFields.expressions.size(), level, false});
        _fFields.expressions.push_back({start, start});
    }
    void AddFieldToken(size_t /*pos*/, const CLexedToken& token) override {
        _fFields.has_comment |= token.type == kTokenId_COMMENT;
    }
    void EndExpression(size_t pos, bool /*is_sound*/) override {
        _fFields.expressions[_fOpen.back().expression_i].end = static_cast<uint32_t>(pos);
        _fOpen.back().in_spec = true;
    }
    void EndField() override { _fOpen.pop_back(); }
    void AddLoneBrace(size_t /*pos*/) override {}

  private:
    struct COpenField {
        size_t expression_i;
        int level;
        bool in_spec;
    };

    CStringFields& _fFields;
    std::vector<COpenField> _fOpen;
};

}  // namespace

bool CStringFields::IsInExpression(uint32_t offset) const {
    return std::any_of(expressions.begin(), expressions.end(),
                       [&](const CSpan& span) { return span.start <= offset && offset < span.end; });
}

CStringFields ReadFields(const CRawLogical& line, const CRawToken& string) {
    CStringFields fields;
    CFieldReader reader(fields);
    // The text ends with the token, so that nothing reaches further.
    CLexer lexer(line.file_text.substr(0, line.EndOf(string)));
    const CStringStart start = ReadStringStart(line.file_text, string.start);
    CFstringScanner(lexer, &reader, 0).Scan(string.start + start.ContentOffset(), start);
    return fields;
}

}  // namespace codeloom
