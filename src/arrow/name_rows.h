// Rows about the names of a text: occurrences, scopes, symbols.
#pragma once

#include "arrow/columns.h"
#include "arrow/tables.h"

namespace codeloom {

struct COccurrenceRow {
    uint32_t line;
    CNumbered name;
    ERole role;
    CRange range;
    uint32_t scope;
    std::optional<EResolution> resolution;
    std::optional<uint32_t> home;
    bool is_definition;
    bool in_f_string;
    bool in_quotes;
    bool in_comment;
    std::optional<CRange> object;
};

struct CScopeRow {
    uint32_t scope;
    EScopeKind kind;
    CNumbered name;
    std::optional<uint32_t> parent;
    CRange range;
};

struct CSymbolRow {
    uint32_t scope;
    CNumbered name;
    bool is_local;
    bool is_global;
    bool is_free;
    bool is_declared_global;
    bool is_nonlocal;
    bool is_referenced;
    bool is_assigned;
    bool is_parameter;
    bool is_imported;
    bool is_annotated;
    bool is_type_parameter;
    bool is_namespace;
};

class COccurrenceSource {
  public:
    using CRow = COccurrenceRow;
    static const TColumns<CRow>& Columns();
    static size_t Count(const CFileAnalysis& analysis) { return analysis.names.occurrences.items.size(); }
    explicit COccurrenceSource(const CTextFacts& text)
        : _fText(text), _fQueries(text.analysis.names, text.text, text.version) {}
    CRow Of(uint32_t i);

  private:
    const CTextFacts& _fText;
    CNameQueries _fQueries;
    uint32_t _fLine = 0;
};

class CScopeSource {
  public:
    using CRow = CScopeRow;
    static const TColumns<CRow>& Columns();
    static size_t Count(const CFileAnalysis& analysis) { return analysis.names.scopes.scopes.size(); }
    explicit CScopeSource(const CTextFacts& text) : _fText(text) {}
    CRow Of(uint32_t i) const;

  private:
    const CTextFacts& _fText;
};

// The symbols of a scope are in their order; those that a text doesn't mention are left out.
class CSymbolSource {
  public:
    using CRow = CSymbolRow;
    static const TColumns<CRow>& Columns();
    static size_t Count(const CFileAnalysis& analysis);
    explicit CSymbolSource(const CTextFacts& text);
    CRow Of(uint32_t i) const;

  private:
    const CTextFacts& _fText;
    std::vector<uint32_t> _fMentioned;
};

}  // namespace codeloom
