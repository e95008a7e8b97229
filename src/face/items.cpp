#include "face/items.h"

#include <algorithm>
#include <charconv>
#include <functional>

#include "host/text.h"

namespace codeloom {

namespace {

size_t HashOf(std::string_view text, size_t more) {
    return std::hash<std::string_view>()(text) * 31 + more;
}

template <class Items>
Items AllOf(const CSourceFilePtr& file, size_t count) {
    return {file, 0, 1, count};
}

nb::object Split(std::string_view payload, size_t at, size_t after, bool may_lack_second) {
    const std::string_view second = payload.substr(after);
    const nb::object shown = may_lack_second && second.empty() ? nb::none() : TextFromUtf8(second);
    return nb::make_tuple(TextFromUtf8(payload.substr(0, at)), shown);
}

}  // namespace

// Problems

nb::object CProblemItem::Related() const {
    nb::list related;
    for (const CRelated& place : Data().related) {
        const CRange range = RangeOfBytes(*file, place.start, place.end);
        related.append(nb::make_tuple(range, TextFromUtf8(place.text)));
    }
    return nb::tuple(related);
}

nb::str CProblemItem::Text() const {
    const CRange range = Range();
    return nb::str("{}:{}:{}: {} {}")
        .format(file->Path(), range.row, range.column, Code().c_str(), TextFromUtf8(Message()));
}

bool CProblemItem::operator==(const CProblemItem& other) const {
    if (file == other.file && i == other.i) return true;
    return Data().code == other.Data().code && Message() == other.Message() && Range() == other.Range() &&
           file->Path().equal(other.file->Path());
}

size_t CProblemItem::Hash() const {
    return HashOf(Message(), Range().row);
}

// Lines

std::string_view CLineItem::Text() const {
    const CLine line = Data();
    return file->Text().substr(line.start, line.end - line.start);
}

CRange CLineItem::Range() const {
    const CLine line = Data();
    return RangeOfBytes(*file, line.start, line.end);
}

int CLineItem::Indent() const {
    const uint32_t start = Data().start;
    const CPlacedRows at = file->RowsAt(start);
    return at.rows.IndentOf(start - at.start);
}

bool CLineItem::operator==(const CLineItem& other) const {
    if (file == other.file && i == other.i) return true;
    return Data().type == other.Data().type && Text() == other.Text() && Range() == other.Range();
}

size_t CLineItem::Hash() const {
    return HashOf(Text(), Range().row);
}

// Records

nb::object CRecordItem::Value() const {
    const std::string_view form = kRecordKinds[NumberOf(RecordKindOf(Data().kind))].payload,
                           payload = Payload();
    if (form == "none" && payload.empty()) return nb::none();
    if (form == "index") {
        uint32_t number = 0;
        const auto parsed = std::from_chars(payload.data(), payload.data() + payload.size(), number);
        if (parsed.ec == std::errc() && parsed.ptr == payload.data() + payload.size())
            return nb::int_(number);
    }
    if (form == "import") {
        if (const size_t blank = payload.rfind(' '); blank != std::string_view::npos)
            return Split(payload, blank, blank + 1, false);
    }
    if (form == "literal") {
        const size_t colon = std::min(payload.find(':'), payload.size());
        const size_t after = std::min(colon + 1, payload.size());
        return Split(payload, colon, after + payload.substr(after).starts_with(' '), true);
    }
    return TextFromUtf8(payload);
}

std::string CRecordItem::Text() const {
    std::string text(Data().of_arg ? "arg " : "");
    text += WordOf(RecordKindOf(Data().kind));
    text.append(" ").append(Name());
    if (!Payload().empty()) text.append("  ").append(Payload());
    return text;
}

bool CRecordItem::operator==(const CRecordItem& other) const {
    if (file == other.file && i == other.i) return true;
    return Data().kind == other.Data().kind && Data().of_arg == other.Data().of_arg &&
           Name() == other.Name() && Payload() == other.Payload() && HasPlace() == other.HasPlace() &&
           (!HasPlace() || Range() == other.Range());
}

size_t CRecordItem::Hash() const {
    return HashOf(Name(), HashOf(Payload(), static_cast<size_t>(Data().kind)));
}

// Limits

const char* CLimitItem::Message() const {
    return Data().limit == ELimit::kTooDeep
               ? "the line is nested too deep for a full walk: names further in have no records"
               : "the line has too many parts for a full walk: names further on have no records";
}

bool CLimitItem::operator==(const CLimitItem& other) const {
    return Data().limit == other.Data().limit && Line() == other.Line();
}

size_t CLimitItem::Hash() const {
    return Line().Hash();
}

// Sequences

CProblemItems ProblemsOf(const CSourceFilePtr& file) {
    return AllOf<CProblemItems>(file, file->Problems().size());
}

CProblemItems ProblemsOf(const CLineItem& line) {
    const size_t first = line.file->FirstProblem(line.i);
    return {line.file, first, 1, line.file->FirstProblem(line.i + 1) - first};
}

CLineItems LinesOf(const CSourceFilePtr& file) {
    return AllOf<CLineItems>(file, file->LineCount());
}

CRecordItems RecordsOf(const CSourceFilePtr& file) {
    return AllOf<CRecordItems>(file, file->WithRecords().records.records.size());
}

CRecordItems RecordsOf(const CLineItem& line) {
    const CFileAnalysis& analysis = line.file->WithRecords();
    const size_t first = analysis.FirstRecord(line.i);
    return {line.file, first, 1, analysis.FirstRecord(line.i + 1) - first};
}

CLimitItems LimitsOf(const CSourceFilePtr& file) {
    return AllOf<CLimitItems>(file, file->WithRecords().limits.size());
}

}  // namespace codeloom
