#pragma once

#include "face/bind_items.h"

namespace codeloom {

// Binds occurrences, scopes and symbols.
void BindNameItems(nanobind::module_& module);

// Binds signatures, parameters and hints.
void BindSignatureItems(nanobind::module_& module);
void BindSignaturesOfAnalysis(nanobind::class_<CAnalysis>& analysis);

// Binds what an analysis, and a line of it, answers about names.
void BindNamesOfAnalysis(nanobind::class_<CAnalysis>& analysis);
void BindNamesOfLine(nanobind::class_<CLineItem>& line);

}  // namespace codeloom
