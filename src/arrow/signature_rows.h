// Rows about the functions of a text and its type hints: signatures, parameters, hints.
#pragma once

#include "arrow/columns.h"
#include "arrow/tables.h"

namespace codeloom {

struct CSignatureRow {
    uint32_t signature;
    uint32_t line;
    CRepeated name;
    CRange range;
    bool is_async;
    bool is_method;
    uint32_t parameters;
    std::optional<std::string_view> return_hint;
};

struct CParameterRow {
    uint32_t signature;
    uint32_t position;
    CRepeated name;
    EParameterKind kind;
    CRange range;
    std::optional<std::string_view> default_value;
    std::optional<std::string_view> hint;
};

struct CHintRow {
    uint32_t line;
    EHintKind kind;
    CRepeated name;
    std::string_view text;
    CRange range;
    bool in_comment;
};

class CSignatureSource {
  public:
    using CRow = CSignatureRow;
    static const TColumns<CRow>& Columns();
    static size_t Count(const CFileAnalysis& analysis) { return analysis.signatures.items.size(); }
    explicit CSignatureSource(const CTextFacts& text) : _fText(text) {}
    CRow Of(uint32_t i) const;

  private:
    const CTextFacts& _fText;
};

class CParameterSource {
  public:
    using CRow = CParameterRow;
    static const TColumns<CRow>& Columns();
    static size_t Count(const CFileAnalysis& analysis) { return analysis.signatures.parameters.size(); }
    explicit CParameterSource(const CTextFacts& text) : _fText(text) {}
    CRow Of(uint32_t i);

  private:
    const CTextFacts& _fText;
    uint32_t _fSignature = 0;
};

class CHintSource {
  public:
    using CRow = CHintRow;
    static const TColumns<CRow>& Columns();
    static size_t Count(const CFileAnalysis& analysis) { return analysis.signatures.hints.size(); }
    explicit CHintSource(const CTextFacts& text) : _fText(text) {}
    CRow Of(uint32_t i) const;

  private:
    const CTextFacts& _fText;
};

}  // namespace codeloom
