// Documents: creation of new JDF documents and atomic writing.
#include "platform/jdf/jdf_doc.h"

#include "platform/os/file_system.h"

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <sstream>
#include <string>

#include <fcntl.h>
#include <sys/types.h>
#include <sys/stat.h>
#include <unistd.h>

#include "platform/jdf/deferred_output.h"
#include "platform/jdf/exception.h"

namespace JDF {
namespace {

// Indentation grows with depth, so output of a deeply nested tree would grow with the square of
// its depth: beyond this depth documents are written without indentation.
constexpr int kMaxIndentedDepth = 100;

// Indented, unless the tree nests deeper than kMaxIndentedDepth.
unsigned formatFor(const pugi::xml_document& doc) {
    int depth = 0;
    pugi::xml_node n = doc.first_child();
    while (n) {
        if (n.first_child()) {
            n = n.first_child();
            if (++depth > kMaxIndentedDepth) return pugi::format_raw;
            continue;
        }
        while (n && !n.next_sibling()) {
            n = n.parent();
            --depth;
        }
        if (n) n = n.next_sibling();
    }
    return pugi::format_indent;
}

// Writes to a file descriptor, starting write-back of every full chunk while the rest is still
// being serialised, so that the closing fsync has little left to wait for.
class FdWriter : public pugi::xml_writer {
public:
    explicit FdWriter(int fd) : fd_(fd) {}
    void write(const void* data, size_t size) override {
        const char* p = static_cast<const char*>(data);
        while (ok_ && size > 0) {
            ssize_t n = ::write(fd_, p, size);
            if (n < 0 && errno == EINTR) continue;
            if (n <= 0) {
                ok_ = false;
                break;
            }
            p += n;
            size -= static_cast<size_t>(n);
            written_ += static_cast<off_t>(n);
        }
#ifdef SYNC_FILE_RANGE_WRITE
        if (ok_ && written_ - flushed_ >= kChunk) {
            ::sync_file_range(fd_, flushed_, written_ - flushed_, SYNC_FILE_RANGE_WRITE);
            flushed_ = written_;
        }
#endif
    }
    bool ok() const { return ok_; }

private:
    static constexpr off_t kChunk = 4 << 20;
    int fd_;
    bool ok_ = true;
    off_t written_ = 0, flushed_ = 0;
};

// Current time, or SOURCE_DATE_EPOCH when set, as an xs:dateTime in UTC.
std::string timeStamp() {
    std::time_t t = std::time(nullptr);
    if (const char* epoch = std::getenv("SOURCE_DATE_EPOCH")) {
        char* end = nullptr;
        long long v = std::strtoll(epoch, &end, 10);
        if (end != epoch && *end == '\0') t = static_cast<std::time_t>(v);
    }
    std::tm tm{};
    gmtime_r(&t, &tm);
    char buf[40];
    std::strftime(buf, sizeof buf, "%Y-%m-%dT%H:%M:%S+00:00", &tm);
    return buf;
}

}  // namespace

KElement XMLDoc::GetRoot() const {
    if (!doc_) return {};
    return KElement(doc_->doc.document_element(), doc_);
}

std::string XMLDoc::ToString() const {
    if (!doc_) return {};
    std::ostringstream out;
    pugi::xml_writer_stream writer(out);
    detail::saveDocument(*doc_, writer, formatFor(doc_->doc));
    return out.str();
}

bool XMLDoc::Write2File(const WString& fileName) const {
    if (!doc_ || fileName.empty()) return false;
    return vorlan::os::replaceFileAtomically(fileName.getUTF8(), [this](int fd) {
        FdWriter writer(fd);
        detail::saveDocument(*doc_, writer, formatFor(doc_->doc));
        return writer.ok();
    });
}

JDFDoc::JDFDoc(int type) : XMLDoc(std::make_shared<detail::DocumentState>()) {
    if (type != 0) throw JDFException("JDFDoc: only JDF documents (0) can be created");
    pugi::xml_document& d = doc_->doc;
    pugi::xml_node decl = d.append_child(pugi::node_declaration);
    decl.append_attribute("version").set_value("1.0");
    decl.append_attribute("encoding").set_value("UTF-8");
    pugi::xml_node root = d.append_child("JDF");
    root.append_attribute("xmlns").set_value("http://www.CIP4.org/JDFSchema_1_1");
    root.append_attribute("Version").set_value("1.3");
    pugi::xml_node audit = root.append_child("AuditPool").append_child("Created");
    std::string auditId = doc_->NewID("a");
    std::string nodeId = doc_->NewID("n");
    root.append_attribute("ID").set_value(nodeId.c_str());
    root.append_attribute("JobPartID").set_value(nodeId.c_str());
    root.append_attribute("Status").set_value("Waiting");
    audit.append_attribute("ID").set_value(auditId.c_str());
    audit.append_attribute("AgentName").set_value("vorlan");
    audit.append_attribute("TimeStamp").set_value(timeStamp().c_str());
    root.append_child("ResourcePool");
    root.append_child("ResourceLinkPool");
    doc_->IDsChanged();
}

JDFNode JDFDoc::GetJDFRoot() const {
    KElement root = GetRoot();
    return root.GetLocalName() == L"JDF" ? JDFNode(root) : JDFNode();
}

}  // namespace JDF
