// Saving documents and preparing the paths they are saved to.
#pragma once

#include <qpdf/QPDF.hh>

#include <filesystem>
#include <string>

namespace vorlan::pdf {

// Longest absolute output path accepted (the platform's path limit).
inline constexpr size_t kMaxOutputPath = 4095;

// Makes an output path absolute (relative to the current folder), creates the folders it needs
// and proves that a file can be written there without touching a file that already exists.
// Empty when the path is empty, too long, or its folder or file cannot be created.
std::filesystem::path prepareOutputPath(const std::string& path);

// Escapes '#' inside every name and dictionary key of the document (as "#23"). qpdf 11.3 writes
// the '#' of decoded names as it stands, which readers take as the start of an escape, so the
// names would come back corrupted. restoreNumberSignsInNames takes the escapes back, so that the
// document reads as before (a name that held "#23" itself keeps it).
void protectNumberSignsInNames(QPDF& pdf);
void restoreNumberSignsInNames(QPDF& pdf);

// Full save with linearisation (unless told otherwise) through a temporary file beside the target
// that is renamed over it, so the target is either the complete new file or untouched (saving
// over the open input is therefore safe). An encrypted document is written with its own
// encryption (algorithm, permissions, passwords); the file ID is deterministic for documents
// without encryption only (with encryption its second part is new on every save). Names are
// protected for the write and restored afterwards. False on any failure. Never throws.
//
// qpdf works out a document's linearisation once: a document changed after a linearised save
// must not be saved linearised again (write it without, and linearise a fresh opening of that).
bool saveDocument(QPDF& pdf, const std::filesystem::path& path, bool linearise = true);

}  // namespace vorlan::pdf
