// What the job's data path is, and where its ticket and PDFs lie in the job folder.
#include <cctype>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <string>

#include "platform/os/file_system.h"
#include "platform/os/text.h"
#include "vorlan/LD_JDF.h"

namespace fs = std::filesystem;
using vorlan::os::narrow;
using vorlan::os::widen;

namespace {

wchar_t* wideResult(const fs::path& path) { return vorlan::os::wideCopy(path.string().c_str()); }

fs::path joined(const wchar_t* folder, const std::string& name) { return fs::path(narrow(folder)) / name; }

}  // namespace

bool LD_JDF::checkForPDF(wchar_t* path) {
    if (!path) return false;
    std::string file = narrow(path);
    FILE* in = std::fopen(file.c_str(), "rb");
    if (!in) return false;
    char head[302] = {};
    size_t got = std::fread(head, 1, 300, in);
    std::fclose(in);
    (void)got;  // the zeroed buffer ends the text at the first zero byte either way
    return std::strstr(head, "%PDF") != nullptr;
}

wchar_t* LD_JDF::resolveDataFilePath(const char* path) {
    if (!path) return nullptr;
    std::string resolved(path);
    // The data folder differs from the data file in the character before a four-character
    // extension ("job.0001" -> "jobD0001"); shorter paths have no such character and stay as given.
    if (resolved.size() >= 5) resolved[resolved.size() - 5] = 'D';
    return vorlan::os::wideCopy(resolved.c_str());
}

InputDataFileTypes LD_JDF::analizeDataFile(const char* path, wchar_t* out) {
    if (!path || !out) return INPUT_UNKNOWN;
    const size_t capacity = std::strlen(path) + 1;
    auto copyOut = [&](const wchar_t* text) {
        std::wcsncpy(out, text, capacity - 1);
        out[capacity - 1] = L'\0';
    };

    wchar_t* given = vorlan::os::wideCopy(path);
    if (given && checkForPDF(given)) {
        copyOut(given);
        std::free(given);
        return INPUT_PDF;
    }
    std::free(given);

    wchar_t* resolved = resolveDataFilePath(path);
    if (!resolved) return INPUT_UNKNOWN;
    copyOut(resolved);
    std::free(resolved);

    uint32_t attributes = vorlan::os::fileAttributes(narrow(out));
    if (attributes == vorlan::os::FILE_ATTRIBUTES_INVALID) return INPUT_MISSING;
    if (attributes == vorlan::os::FILE_ATTRIBUTE_FOLDER) return INPUT_FOLDER;
    if (attributes == vorlan::os::FILE_ATTRIBUTE_COMPRESSED) return INPUT_COMPRESSED;
    if (checkForPDF(out)) return INPUT_PDF;
    lastError = LD_FILE_NOT_FOUND;
    return INPUT_UNKNOWN;
}

bool LD_JDF::checkExtention(const char* fileName, char* extension) {
    if (!fileName || !extension) return false;
    size_t length = std::strlen(fileName);
    if (length < 3) return false;
    return vorlan::os::equalsIgnoreCaseAscii(fileName + length - 3, extension);
}

char* LD_JDF::extractFileNameFromPath(const char* path) {
    if (!path) {
        lastError = LD_INVALID_INPUT;
        return nullptr;
    }
    const char* name = path;
    for (const char* p = path; *p; ++p)
        if (*p == '\\' || *p == '/') name = p + 1;
    return strdup(name);
}

char* LD_JDF::createNewTempDirFilePath(const char* fileName, const char* subFolder) {
    fs::path made = fs::path(jobFolder ? jobFolder : "") / (subFolder ? subFolder : "") / (fileName ? fileName : "");
    return strdup(made.string().c_str());
}

wchar_t* LD_JDF::getNativeFilePath(wchar_t* path) {
    if (!path) {
        lastError = LD_FAILED;
        return nullptr;
    }
    std::string text = narrow(path);
    for (char& c : text)
        if (c == '\\') c = '/';
    bool windowsDrive = text.size() >= 2 && std::isalpha(static_cast<unsigned char>(text[0])) && text[1] == ':';
    if (!text.empty() && text[0] != '/' && !windowsDrive) {
        // A relative path means nothing to the press: anchor it at the current folder.
        std::error_code ec;
        fs::path absolute = fs::absolute(text, ec);
        if (!ec) text = absolute.lexically_normal().string();
    }
    // Every URL gets exactly three slashes: POSIX paths bring their own leading one.
    std::string url = (!text.empty() && text[0] == '/' ? "file://" : "file:///") + text;
    lastError = LD_OK;
    return vorlan::os::wideCopy(url.c_str());
}

wchar_t* LD_JDF::findFileByExtentionInDir(wchar_t* folder, wchar_t* extension) {
    if (!folder || !extension) return nullptr;
    std::string wanted = narrow(extension);
    for (const auto& entry : vorlan::os::listFolder(narrow(folder))) {
        if (checkExtention(entry.name.c_str(), wanted.data())) return wideResult(joined(folder, entry.name));
    }
    return nullptr;
}

wchar_t* LD_JDF::findFileByNameInDir(wchar_t* folder, wchar_t* name) {
    if (!folder || !name) return nullptr;
    for (const auto& entry : vorlan::os::listFolder(narrow(folder))) {
        // Sub-folders are searched first, depth-first; symbolic links to folders are not followed.
        if (entry.isFolder) {
            std::wstring sub = widen(joined(folder, entry.name).string().c_str());
            if (wchar_t* hit = findFileByNameInDir(sub.data(), name)) return hit;
        }
        std::wstring listed = widen(entry.name.c_str());
        if (vorlan::os::equalsIgnoreCase(listed.c_str(), name)) return wideResult(joined(folder, entry.name));
    }
    return nullptr;
}

wchar_t* LD_JDF::findTicketFileInDir(wchar_t* folder, const wchar_t* url) {
    if (!folder || !url) return nullptr;
    char* narrowUrl = getCharFromWChar(url);
    char* name = extractFileNameFromPath(narrowUrl);
    std::free(narrowUrl);
    wchar_t* wideName = getWCharFromChar(name);
    std::free(name);
    removePercentTwenty(wideName);
    wchar_t* found = findFileByNameInDir(folder, wideName);
    std::free(wideName);
    return found;
}
