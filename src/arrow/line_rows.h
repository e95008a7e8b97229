// Rows about the lines of a text: problems, lines, records, limits.
#pragma once

#include "arrow/columns.h"
#include "arrow/tables.h"

namespace codeloom {

struct CProblemRow {
    TRepeated<std::string> code;
    ESeverity severity;
    std::optional<uint32_t> line;
    CRange range;
    std::string_view message;
    std::optional<std::string_view> hint;
    std::optional<std::string_view> text;
};

struct CLineRow {
    uint32_t line;
    ELogicalType kind;
    CRange range;
    std::optional<uint32_t> indent;
    std::string_view text;
};

struct CRecordRow {
    uint32_t line;
    ERecordKind kind;
    CNumbered name;
    std::string_view payload;
    bool of_argument;
    std::optional<CRange> range;
};

struct CLimitRow {
    uint32_t line;
    ELimit kind;
};

class CProblemSource {
  public:
    using CRow = CProblemRow;
    static const TColumns<CRow>& Columns();
    static size_t Count(const CFileAnalysis& analysis) { return analysis.problems.size(); }
    explicit CProblemSource(const CTextFacts& text) : _fText(text) {}
    CRow Of(uint32_t i) const;

  private:
    const CTextFacts& _fText;
};

class CLineSource {
  public:
    using CRow = CLineRow;
    static const TColumns<CRow>& Columns();
    static size_t Count(const CFileAnalysis& analysis) { return analysis.lines.size(); }
    explicit CLineSource(const CTextFacts& text) : _fText(text) {}
    CRow Of(uint32_t i) const;

  private:
    const CTextFacts& _fText;
};

class CRecordSource {
  public:
    using CRow = CRecordRow;
    static const TColumns<CRow>& Columns();
    static size_t Count(const CFileAnalysis& analysis) { return analysis.records.records.size(); }
    explicit CRecordSource(const CTextFacts& text) : _fText(text) {}
    CRow Of(uint32_t i);

  private:
    const CTextFacts& _fText;
    uint32_t _fLine = 0;
};

class CLimitSource {
  public:
    using CRow = CLimitRow;
    static const TColumns<CRow>& Columns();
    static size_t Count(const CFileAnalysis& analysis) { return analysis.limits.size(); }
    explicit CLimitSource(const CTextFacts& text) : _fText(text) {}
    CRow Of(uint32_t i) const;

  private:
    const CTextFacts& _fText;
};

}  // namespace codeloom
