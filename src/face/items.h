// The small objects that an analysis shows. Each is an index into what the pass over its text found.
#pragma once

#include <string>
#include <utility>

#include "face/source_file.h"
#include "file/kind_words.h"

namespace codeloom {

inline CRange RangeOfBytes(const CSourceFile& file, uint32_t start, uint32_t end) {
    return file.RangeOf(start, end);
}

// An object of the host around a new Class, made without a look for its class.
template <class Class, class... Arguments>
nb::object NewObject(Arguments&&... arguments) {
    static const nb::handle type = nb::type<Class>();
    nb::object made = nb::inst_alloc(type);
    new (nb::inst_ptr<Class>(made)) Class{std::forward<Arguments>(arguments)...};
    nb::inst_mark_ready(made);
    return made;
}

// What every item has. `operator==` of items compares what they show.
struct CItem {
    CSourceFilePtr file;
    uint32_t i = 0;

    CItem(CSourceFilePtr item_file, uint32_t item_i) : file(std::move(item_file)), i(item_i) {}
};

struct CProblemItem : CItem {
    using CItem::CItem;
    static constexpr const char* kSequence = "problems";  // the attribute of an analysis that holds them

    const CProblem& Data() const { return file->Problems()[i]; }
    std::string_view Message() const { return Data().message; }
    std::string Code() const { return CodeText(Data().code); }
    CRange Range() const { return RangeOfBytes(*file, Data().start, Data().end); }
    nb::object Related() const;
    // "path:row:column: CL201 message"
    nb::str Text() const;
    bool operator==(const CProblemItem& other) const;
    size_t Hash() const;
};

struct CLineItem : CItem {
    using CItem::CItem;
    static constexpr const char* kSequence = "lines";

    CLine Data() const { return file->Line(i); }
    std::string_view Text() const;
    CRange Range() const;
    int Indent() const;
    bool operator==(const CLineItem& other) const;
    size_t Hash() const;
};

struct CRecordItem : CItem {
    using CItem::CItem;
    static constexpr const char* kSequence = "records";

    const CRecord& Data() const { return file->WithRecords().records.records[i]; }
    std::string_view Name() const { return file->WithRecords().records.Name(Data()); }
    std::string_view Payload() const { return file->WithRecords().records.Value(Data()); }
    bool HasPlace() const { return Data().start < Data().end; }
    CRange Range() const { return RangeOfBytes(*file, Data().start, Data().end); }
    // The payload by its form: none, a text, a token's index, (module, name) or (type, value).
    nb::object Value() const;
    // "arg literal a  int: 1"
    std::string Text() const;
    CLineItem Line() const { return {file, file->WithRecords().LineOfRecord(i)}; }
    bool operator==(const CRecordItem& other) const;
    size_t Hash() const;
};

struct CLimitItem : CItem {
    using CItem::CItem;
    static constexpr const char* kSequence = "limits";

    const CLineLimit& Data() const { return file->WithRecords().limits[i]; }
    const char* Message() const;
    CLineItem Line() const { return {file, Data().line}; }
    bool operator==(const CLimitItem& other) const;
    size_t Hash() const;
};

// A sequence of items, or a slice of one.
template <class Item_>
struct TItems {
    using CItemType = Item_;

    CSourceFilePtr file;
    size_t first = 0;
    ptrdiff_t step = 1;
    size_t count = 0;

    size_t Size() const { return count; }
    size_t IndexOf(size_t i) const { return first + i * static_cast<size_t>(step); }
    Item_ At(size_t i) const { return Item_(file, static_cast<uint32_t>(IndexOf(i))); }

    nb::object Item(size_t i) const { return NewObject<Item_>(file, static_cast<uint32_t>(IndexOf(i))); }

    nb::object Slice(size_t slice_first, ptrdiff_t slice_step, size_t slice_count) const {
        return nb::cast(
            TItems{file, slice_count == 0 ? 0 : IndexOf(slice_first), step * slice_step, slice_count});
    }

    // The slice of all items that these are.
    nb::object AsSlice() const {
        const ptrdiff_t stop = static_cast<ptrdiff_t>(first) + step * static_cast<ptrdiff_t>(count);
        return nb::slice(nb::int_(first), stop < 0 ? nb::none() : nb::object(nb::int_(stop)), nb::int_(step));
    }

    bool operator==(const TItems& other) const {
        if (count != other.count) return false;
        for (size_t i = 0; i < count; ++i)
            if (!(At(i) == other.At(i))) return false;
        return true;
    }

    size_t Hash() const { return count == 0 ? 0 : At(0).Hash() * 31 + count; }
};

using CProblemItems = TItems<CProblemItem>;
using CLineItems = TItems<CLineItem>;
using CRecordItems = TItems<CRecordItem>;
using CLimitItems = TItems<CLimitItem>;

// All of a text, and those of one line.
CProblemItems ProblemsOf(const CSourceFilePtr& file);
CProblemItems ProblemsOf(const CLineItem& line);
CLineItems LinesOf(const CSourceFilePtr& file);
CRecordItems RecordsOf(const CSourceFilePtr& file);
CRecordItems RecordsOf(const CLineItem& line);
CLimitItems LimitsOf(const CSourceFilePtr& file);

}  // namespace codeloom
