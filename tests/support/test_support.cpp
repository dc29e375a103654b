#include "test_support.h"

#include <array>
#include <atomic>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <random>
#include <sstream>
#include <vector>

#include <sys/wait.h>
#include <unistd.h>

namespace fs = std::filesystem;

namespace vorlan::test {

fs::path corpusDir() {
    const char* env = std::getenv("VORLAN_SHARED_DIR");
    fs::path shared = env && *env ? fs::path(env) : fs::path(VORLAN_SHARED_DIR_DEFAULT);
    std::error_code ec;
    fs::path corpus = shared / "corpus";
    if (fs::is_directory(corpus / "jdf", ec)) return fs::weakly_canonical(corpus, ec);
    return {};
}

TempDir::TempDir() {
    static std::atomic<unsigned> counter{0};
    std::random_device rd;
    for (;;) {
        std::ostringstream name;
        name << "vorlan-test-" << ::getpid() << "-" << counter++ << "-" << rd();
        path_ = fs::temp_directory_path() / name.str();
        if (fs::create_directory(path_)) break;
    }
}

TempDir::~TempDir() {
    std::error_code ec;
    fs::remove_all(path_, ec);
}

DieLibraryHome::DieLibraryHome(const std::string& library) {
    writeFile(home_ / "DieLib" / "AutoDieLib.xml", library);
    setenv("VORLAN_HOME", home_.path().c_str(), 1);
}

DieLibraryHome::~DieLibraryHome() { unsetenv("VORLAN_HOME"); }

void writeFile(const fs::path& file, const std::string& bytes) {
    if (file.has_parent_path()) fs::create_directories(file.parent_path());
    std::ofstream out(file, std::ios::binary | std::ios::trunc);
    out << bytes;
}

std::string readFile(const fs::path& file) {
    std::ifstream in(file, std::ios::binary);
    std::ostringstream text;
    text << in.rdbuf();
    return text.str();
}

int runCommand(const std::string& command, std::string* output) {
    FILE* pipe = ::popen((command + " 2>&1").c_str(), "r");
    if (!pipe) return -1;
    std::array<char, 4096> chunk{};
    std::string text;
    size_t n;
    while ((n = std::fread(chunk.data(), 1, chunk.size(), pipe)) > 0) text.append(chunk.data(), n);
    int status = ::pclose(pipe);
    if (output) *output = text;
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
}

std::vector<std::string> filesFailingJdfSchema(const std::vector<fs::path>& files, std::string* report) {
    const fs::path xsd = corpusDir() / "jdf-schema" / "xmllint-patched" / "JDF_1.8" / "JDF.xsd";
    EXPECT_TRUE(fs::exists(xsd)) << xsd;
    EXPECT_TRUE(haveProgram("xmllint")) << "xmllint (libxml2-utils) is needed to check the schema";
    std::string command = "xmllint --noout --schema '" + xsd.string() + "'";
    for (const fs::path& f : files) command += " '" + f.string() + "'";
    std::string output;
    runCommand(command + " 2>&1", &output);
    std::vector<std::string> failing;
    for (const fs::path& f : files)
        if (output.find(f.string() + " validates") == std::string::npos) failing.push_back(f.string());
    if (report) *report = output;
    return failing;
}

bool haveProgram(const std::string& name) {
    return runCommand("command -v " + name + " >/dev/null") == 0;
}

std::string minimalPdf(const std::string& content, int pages) {
    // Objects: catalog, page tree, the pages (3 …), then the content stream they share.
    const std::string stream = std::to_string(pages + 3) + " 0 R";
    std::string kids;
    std::vector<std::string> objects = {"<< /Type /Catalog /Pages 2 0 R >>", ""};
    for (int p = 0; p < pages; ++p) {
        kids += (p ? " " : "") + std::to_string(p + 3) + " 0 R";
        objects.push_back("<< /Type /Page /Parent 2 0 R /MediaBox [0 0 200 100] /Contents " + stream +
                          " /Resources << >> >>");
    }
    objects[1] = "<< /Type /Pages /Kids [" + kids + "] /Count " + std::to_string(pages) + " >>";
    objects.push_back("<< /Length " + std::to_string(content.size()) + " >>\nstream\n" + content + "\nendstream");
    return handWrittenPdf(objects);
}

int xpathCount(const fs::path& file, const std::string& xpath) {
    // Single-quoted for the shell; quotes inside end the quoting, add one, and start it again.
    auto quoted = [](const std::string& text) {
        std::string out = "'";
        for (char c : text) out += c == '\'' ? std::string("'\\''") : std::string(1, c);
        return out + "'";
    };
    std::string out;
    if (runCommand("xmllint --xpath " + quoted("count(" + xpath + ")") + " " + quoted(file.string()), &out) != 0)
        return -1;
    return std::atoi(out.c_str());
}

std::string handWrittenPdf(const std::vector<std::string>& objects) {
    std::string pdf = "%PDF-1.7\n";
    std::vector<size_t> offsets;
    for (size_t i = 0; i < objects.size(); ++i) {
        offsets.push_back(pdf.size());
        pdf += std::to_string(i + 1) + " 0 obj\n" + objects[i] + "\nendobj\n";
    }
    const size_t xref = pdf.size();
    pdf += "xref\n0 " + std::to_string(objects.size() + 1) + "\n0000000000 65535 f \n";
    for (size_t offset : offsets) {
        char line[24];
        std::snprintf(line, sizeof line, "%010zu 00000 n \n", offset);
        pdf += line;
    }
    pdf += "trailer\n<< /Size " + std::to_string(objects.size() + 1) + " /Root 1 0 R >>\nstartxref\n" +
           std::to_string(xref) + "\n%%EOF\n";
    return pdf;
}

}  // namespace vorlan::test
