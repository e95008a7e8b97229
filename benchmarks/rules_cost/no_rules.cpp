// The rules of lines and blocks, doing nothing. The linker takes these instead of the library's own.

#include "rules/text_checker.h"

namespace codeloom {

void CTextChecker::Enter(const CRawLogical&) {}
void CTextChecker::_Check(const CRawLogical&, const CTree&) {}
void CTextChecker::Leave(const CRawLogical&, bool) {}
void CTextChecker::Finish() {}

}  // namespace codeloom
