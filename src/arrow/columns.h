// The columns of a table, declared: each has a name, a meaning, and a field of a row from which it is taken.
// The field's type is the column's type:
//
//   uint32_t      32-bit integer        int64_t            64-bit integer
//   bool          boolean               std::string_view   text
//   TRepeated     dictionary-coded text      CNumbered   the same, by its number in the text's table of names
//   an enum with words (file/kind_words.h)                 dictionary-coded text
//   CRange        four columns: row, column, end_row, end_column
//   std::optional of one of them: the same, and may be null
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <type_traits>
#include <vector>

#include "arrow/column.h"
#include "file/kind_words.h"
#include "file/row_index.h"

namespace codeloom {

// A text that comes in many rows.
template <class Text>
struct TRepeated {
    Text text;
};
using CRepeated = TRepeated<std::string_view>;

// A name, by its number in the table that the text's names are in.
struct CNumbered {
    uint32_t number;
};

template <class Field>
struct TColumnOf {
    static_assert(std::is_enum_v<Field>);
    using CMade = CWordColumn;
    static std::unique_ptr<CMade> Make() { return std::make_unique<CMade>(WordsOf<Field>()); }
    static void Add(CMade& column, Field kind) { column.Add(NumberOf(kind)); }
};

template <class Column>
struct TPlainColumnOf {
    using CMade = Column;
    static std::unique_ptr<CMade> Make() { return std::make_unique<CMade>(); }
};

template <>
struct TColumnOf<uint32_t> : TPlainColumnOf<TNumberColumn<int32_t>> {
    static void Add(CMade& column, uint32_t number) { column.Add(static_cast<int32_t>(number)); }
};

template <>
struct TColumnOf<int64_t> : TPlainColumnOf<TNumberColumn<int64_t>> {
    static void Add(CMade& column, int64_t number) { column.Add(number); }
};

template <>
struct TColumnOf<bool> : TPlainColumnOf<CBoolColumn> {
    static void Add(CMade& column, bool value) { column.Add(value); }
};

template <>
struct TColumnOf<std::string_view> : TPlainColumnOf<CTextColumn> {
    static void Add(CMade& column, std::string_view text) { column.Add(text); }
};

template <class Text>
struct TColumnOf<TRepeated<Text>> : TPlainColumnOf<CNameColumn> {
    static void Add(CNameColumn& column, const TRepeated<Text>& repeated) { column.Add(repeated.text); }
};

template <>
struct TColumnOf<CNumbered> : TPlainColumnOf<CPooledColumn> {
    static void Add(CPooledColumn& column, const CNumbered& name) { column.Add(name.number); }
};

template <class Field>
struct TColumnOf<std::optional<Field>> {
    using CMade = typename TColumnOf<Field>::CMade;
    static std::unique_ptr<CMade> Make() { return TColumnOf<Field>::Make(); }
    static void Add(CMade& column, const std::optional<Field>& field) {
        if (field)
            TColumnOf<Field>::Add(column, *field);
        else
            column.AddNull();
    }
};

template <class Field>
inline constexpr bool kIsOptional = false;
template <class Field>
inline constexpr bool kIsOptional<std::optional<Field>> = true;

template <class Row>
struct TColumnSpec {
    std::string name;
    const char* meaning;
    bool is_nullable;
    bool is_source;  // source text at length, which a table may do without
    std::unique_ptr<CColumn> (*make)();
    void (*append)(CColumn& column, const std::vector<Row>& rows);
};

template <class Row>
class TColumns {
  public:
    template <auto kField>
    TColumns& Add(const char* name, const char* meaning) {
        return _Add(name, meaning, [](const Row& row) -> const auto& { return row.*kField; });
    }

    template <auto kField>
    TColumns& AddSource(const char* name, const char* meaning) {
        Add<kField>(name, meaning);
        _fSpecs.back().is_source = true;
        return *this;
    }

    // `prefix` comes before the names of the four columns.
    template <auto kField>
    TColumns& AddRange(const char* prefix, const char* meaning) {
        const std::string before(prefix);
        _Add(before + "row", meaning, [](const Row& row) { return _Part<&CRange::row>(row.*kField); });
        _Add(before + "column", "Its first column, in characters.",
             [](const Row& row) { return _Part<&CRange::column>(row.*kField); });
        _Add(before + "end_row", "The row of its end.",
             [](const Row& row) { return _Part<&CRange::end_row>(row.*kField); });
        return _Add(before + "end_column", "The column after its last character.",
                    [](const Row& row) { return _Part<&CRange::end_column>(row.*kField); });
    }

    const std::vector<TColumnSpec<Row>>& Specs() const { return _fSpecs; }

  private:
    template <auto kPart>
    static uint32_t _Part(const CRange& range) {
        return range.*kPart;
    }
    template <auto kPart>
    static std::optional<uint32_t> _Part(const std::optional<CRange>& range) {
        return range ? std::optional((*range).*kPart) : std::nullopt;
    }

    template <class Take>
    TColumns& _Add(std::string name, const char* meaning, Take) {
        using Field = std::remove_cvref_t<std::invoke_result_t<Take, const Row&>>;
        using CMade = typename TColumnOf<Field>::CMade;
        _fSpecs.push_back({std::move(name), meaning, kIsOptional<Field>, false,
                           []() -> std::unique_ptr<CColumn> { return TColumnOf<Field>::Make(); },
                           [](CColumn& column, const std::vector<Row>& rows) {
                               auto& made = static_cast<CMade&>(column);
                               for (const Row& row : rows) TColumnOf<Field>::Add(made, Take()(row));
                           }});
        return *this;
    }

    std::vector<TColumnSpec<Row>> _fSpecs;
};

}  // namespace codeloom
