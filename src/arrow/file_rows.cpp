#include "arrow/file_rows.h"

namespace codeloom {

const TColumns<CFileRow>& FileColumns() {
    static const auto columns =
        TColumns<CFileRow>()
            .Add<&CFileRow::file_id>("file_id",
                                     "By which other tables name the file: 64 bits of a hash of "
                                     "its path and its content.")
            .Add<&CFileRow::path>("path", "Its path, as it came.")
            .Add<&CFileRow::sha256>("sha256",
                                    "The hash of its bytes, in hexadecimal digits; null when it is "
                                    "missing.")
            .Add<&CFileRow::bytes>("bytes", "How long it is; null when it is missing.")
            .Add<&CFileRow::python>("python", "The version of Python that it was read as.")
            .Add<&CFileRow::state>("state",
                                   "`ok`; `unreadable` where some of it can't be decoded and was "
                                   "replaced; `too big`, `too slow`, `missing`, `unknown version` or "
                                   "`duplicate` for what has no rows in other tables.")
            .Add<&CFileRow::reason>("reason", "Why it isn't `ok`, in words; null otherwise.")
            .Add<&CFileRow::rows>("rows",
                                  "How many rows its text has; null where it wasn't analysed, as are "
                                  "the next two.")
            .Add<&CFileRow::lines>("lines", "How many logical lines.")
            .Add<&CFileRow::problems>("problems", "How many problems.");
    return columns;
}

}  // namespace codeloom
