// Saving documents: name protection, atomic linearised save, output path preparation.
#include "pdf/pdf_save.h"

#include "platform/os/file_system.h"

#include <qpdf/QPDFWriter.hh>

#include <cstdio>
#include <exception>
#include <fstream>
#include <set>
#include <system_error>
#include <unistd.h>
#include <vector>

namespace vorlan::pdf {
namespace {

std::string escapedName(const std::string& name) {
    std::string out;
    out.reserve(name.size() + 4);
    for (char c : name) {
        if (c == '#') out += "#23";
        else out += c;
    }
    return out;
}

// The inverse of escapedName: every "#23" becomes '#' again.
std::string unescapedName(const std::string& name) {
    std::string out;
    out.reserve(name.size());
    for (size_t i = 0; i < name.size(); ++i) {
        out += name[i];
        if (name.compare(i, 3, "#23") == 0) i += 2;
    }
    return out;
}

using NameMap = std::string (*)(const std::string&);

bool needsEscape(const std::string& name) { return name.find('#') != std::string::npos; }

// Renames names (values and keys) that hold '#' inside one object's direct parts; indirect
// references are left to their own visit.
void renameDirect(QPDFObjectHandle root, NameMap rename) {
    std::vector<QPDFObjectHandle> stack{root};
    while (!stack.empty()) {
        QPDFObjectHandle o = stack.back();
        stack.pop_back();
        if (o.isStream()) o = o.getDict();
        if (o.isDictionary()) {
            std::vector<std::string> renamedKeys;
            std::vector<std::pair<std::string, QPDFObjectHandle>> renamedValues;
            for (auto& [key, value] : o.ditems()) {
                if (needsEscape(key)) renamedKeys.push_back(key);
                if (value.isIndirect()) continue;
                if (value.isName() && needsEscape(value.getName())) {
                    renamedValues.emplace_back(key, QPDFObjectHandle::newName(rename(value.getName())));
                } else if (value.isDictionary() || value.isArray()) {
                    stack.push_back(value);
                }
            }
            for (auto& [key, value] : renamedValues) o.replaceKey(key, value);
            for (const std::string& key : renamedKeys) {
                QPDFObjectHandle value = o.getKey(key);
                o.removeKey(key);
                o.replaceKey(rename(key), value);
            }
        } else if (o.isArray()) {
            const int n = o.getArrayNItems();
            for (int i = 0; i < n; ++i) {
                QPDFObjectHandle item = o.getArrayItem(i);
                if (item.isIndirect()) continue;
                if (item.isName() && needsEscape(item.getName())) {
                    o.setArrayItem(i, QPDFObjectHandle::newName(rename(item.getName())));
                } else if (item.isDictionary() || item.isArray()) {
                    stack.push_back(item);
                }
            }
        }
    }
}

void renameNames(QPDF& pdf, NameMap rename) {
    // A name object held directly as an indirect object cannot be renamed in place; such names
    // are practically unknown and stay as they are.
    renameDirect(pdf.getTrailer(), rename);
    for (QPDFObjectHandle o : pdf.getAllObjects()) renameDirect(o, rename);
}

}  // namespace

void protectNumberSignsInNames(QPDF& pdf) { renameNames(pdf, escapedName); }

void restoreNumberSignsInNames(QPDF& pdf) { renameNames(pdf, unescapedName); }

std::filesystem::path prepareOutputPath(const std::string& path) {
    namespace fs = std::filesystem;
    if (path.empty()) return {};
    std::error_code ec;
    fs::path absolute = fs::absolute(fs::path(path), ec);
    if (ec) return {};
    absolute = absolute.lexically_normal();
    if (absolute.native().size() > kMaxOutputPath || !absolute.has_filename()) return {};
    fs::path folder = absolute.parent_path();
    fs::create_directories(folder, ec);
    if (ec || !fs::is_directory(folder, ec)) return {};
    if (fs::is_directory(absolute, ec)) return {};
    if (fs::exists(absolute, ec)) {
        // An existing file (perhaps the input itself) is never truncated here: it must be
        // writable, and the save replaces it by renaming.
        if (::access(absolute.c_str(), W_OK) != 0) return {};
        return absolute;
    }
    {
        std::ofstream probe(absolute, std::ios::binary | std::ios::trunc);
        if (!probe) return {};
    }
    fs::remove(absolute, ec);
    return absolute;
}

bool saveDocument(QPDF& pdf, const std::filesystem::path& path, bool linearise) {
    if (path.empty()) return false;
    bool protectedNames = false;
    const bool saved = vorlan::os::replaceFileAtomically(path, [&](int fd) {
        FILE* file = ::fdopen(::dup(fd), "wb");
        if (!file) return false;
        bool written = false;
        try {
            protectNumberSignsInNames(pdf);
            protectedNames = true;
            QPDFWriter writer(pdf, path.c_str(), file, false);
            writer.setLinearization(linearise);
            // The writer keeps an encrypted input's encryption. Its key is derived from the
            // file ID, which must then be known before the content it would be computed from.
            writer.setDeterministicID(!pdf.isEncrypted());
            writer.write();
            written = true;
        } catch (const std::exception&) {
        }
        return (std::fclose(file) == 0) && written;
    });
    if (!protectedNames) return saved;
    try {
        restoreNumberSignsInNames(pdf);
    } catch (const std::exception&) {
        return false;
    }
    return saved;
}

}  // namespace vorlan::pdf
