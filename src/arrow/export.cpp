// Tables as structures of the Arrow C interfaces. Whoever gets such a structure may move parts of it away and
// release them later, so each part holds the table for itself.
#include <cerrno>
#include <new>

#include "arrow/table.h"

namespace codeloom {

namespace {

using CTablePtr = std::shared_ptr<const CTable>;

template <class Node>
void ReleaseIfHeld(Node& node) {
    if (node.release != nullptr) node.release(&node);
}

// What a structure points to: its children, its dictionary, and the table that its buffers and names are of.
template <class Node>
struct TOwned {
    CTablePtr table;
    std::vector<Node> children;
    std::vector<Node*> child_pointers;
    Node dictionary = {};
    std::vector<const void*> buffers;

    explicit TOwned(CTablePtr owned_table, size_t child_count = 0)
        : table(std::move(owned_table)), children(child_count) {
        for (Node& child : children) child_pointers.push_back(&child);
    }
    TOwned(const TOwned&) = delete;
    TOwned& operator=(const TOwned&) = delete;
    // Those that were moved away have no `release` any more.
    ~TOwned() {
        for (Node& child : children) ReleaseIfHeld(child);
        ReleaseIfHeld(dictionary);
    }
};

template <class Node>
void Release(Node* node) {
    delete static_cast<TOwned<Node>*>(node->private_data);
    node->release = nullptr;
}

// From now on releasing the node frees `owned`.
template <class Node>
void Hand(std::unique_ptr<TOwned<Node>> owned, Node& node) {
    node.n_children = static_cast<int64_t>(owned->children.size());
    node.children = owned->child_pointers.data();
    node.dictionary = owned->dictionary.release == nullptr ? nullptr : &owned->dictionary;
    node.release = Release<Node>;
    node.private_data = owned.release();
}

void ExportType(const CTablePtr& table, const CColumn& column, const char* name, bool is_nullable,
                ArrowSchema& out) {
    auto owned = std::make_unique<TOwned<ArrowSchema>>(table);
    if (column.Dictionary() != nullptr) ExportType(table, *column.Dictionary(), "", false, owned->dictionary);
    out = {};
    out.format = column.Format();
    out.name = name;
    out.flags = is_nullable ? kArrowNullable : 0;
    Hand(std::move(owned), out);
}

void ExportSchema(const CTablePtr& table, ArrowSchema& out) {
    auto owned = std::make_unique<TOwned<ArrowSchema>>(table, table->fields.size());
    for (size_t i = 0; i < table->fields.size(); ++i) {
        const CTable::CField& field = table->fields[i];
        ExportType(table, *field.column, field.name.c_str(), field.is_nullable, owned->children[i]);
    }
    out = {};
    out.format = "+s";
    out.name = "";
    Hand(std::move(owned), out);
}

void ExportColumn(const CTablePtr& table, const CColumn& column, ArrowArray& out) {
    auto owned = std::make_unique<TOwned<ArrowArray>>(table);
    owned->buffers = {column.Validity()};
    for (const void* buffer : column.Buffers()) owned->buffers.push_back(buffer != nullptr ? buffer : "");
    if (column.Dictionary() != nullptr) ExportColumn(table, *column.Dictionary(), owned->dictionary);
    out = {};
    out.length = static_cast<int64_t>(column.Count());
    out.null_count = static_cast<int64_t>(column.NullCount());
    out.n_buffers = static_cast<int64_t>(owned->buffers.size());
    out.buffers = owned->buffers.data();
    Hand(std::move(owned), out);
}

void ExportRows(const CTablePtr& table, ArrowArray& out) {
    auto owned = std::make_unique<TOwned<ArrowArray>>(table, table->fields.size());
    for (size_t i = 0; i < table->fields.size(); ++i)
        ExportColumn(table, *table->fields[i].column, owned->children[i]);
    owned->buffers = {nullptr};
    out = {};
    out.length = static_cast<int64_t>(table->count);
    out.n_buffers = 1;
    out.buffers = owned->buffers.data();
    Hand(std::move(owned), out);
}

// The stream's own part.
struct CStreamed {
    CTablePtr table;
    bool is_at_end = false;
};

CStreamed& StreamedOf(ArrowArrayStream* stream) {
    return *static_cast<CStreamed*>(stream->private_data);
}

template <class Make>
int ErrorOf(Make make) noexcept {
    try {
        make();
        return 0;
    } catch (const std::bad_alloc&) {
        return ENOMEM;
    } catch (...) {
        return EIO;
    }
}

int GetSchema(ArrowArrayStream* stream, ArrowSchema* out) {
    return ErrorOf([&] { ExportSchema(StreamedOf(stream).table, *out); });
}

int GetNext(ArrowArrayStream* stream, ArrowArray* out) {
    CStreamed& streamed = StreamedOf(stream);
    if (streamed.is_at_end) {
        *out = {};
        return 0;
    }
    streamed.is_at_end = true;
    return ErrorOf([&] { ExportRows(streamed.table, *out); });
}

const char* GetLastError(ArrowArrayStream*) {
    return nullptr;
}

void ReleaseStream(ArrowArrayStream* stream) {
    delete &StreamedOf(stream);
    stream->release = nullptr;
}

}  // namespace

void ExportStream(std::shared_ptr<const CTable> table, ArrowArrayStream& out) {
    out = {GetSchema, GetNext, GetLastError, ReleaseStream, new CStreamed{std::move(table)}};
}

}  // namespace codeloom
