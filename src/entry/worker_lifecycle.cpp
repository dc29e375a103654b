// Construction, copying and destruction of the worker.
#include <cstdlib>
#include <new>
#include <utility>

#include "jdf/ticket_handles.h"
#include "pdf/zipped_jdf_file_system.h"
#include "vorlan/LD_JDF.h"

LD_TicketHandles::LD_TicketHandles() : handles_(new LD_JDFHandles) {}
LD_TicketHandles::~LD_TicketHandles() { delete handles_; }
LD_TicketHandles::LD_TicketHandles(const LD_TicketHandles& other)
    : handles_(other.handles_ ? new LD_JDFHandles(*other.handles_) : new LD_JDFHandles) {}
LD_TicketHandles::LD_TicketHandles(LD_TicketHandles&& other) noexcept : handles_(other.handles_) {
    other.handles_ = nullptr;
}
LD_TicketHandles& LD_TicketHandles::operator=(const LD_TicketHandles& other) {
    if (this != &other) *this = LD_TicketHandles(other);
    return *this;
}
LD_TicketHandles& LD_TicketHandles::operator=(LD_TicketHandles&& other) noexcept {
    if (this != &other) {
        delete handles_;
        handles_ = other.handles_;
        other.handles_ = nullptr;
    }
    return *this;
}

LD_JDF::LD_JDF() : recordShare_(std::make_shared<int>(0)) {}

LD_JDF::LD_JDF(int (*progress)(float, void*), int (*filePath)(char*, int, void*), void* data) : LD_JDF() {
    ProgressCallback = progress;
    FilePathCallback = filePath;
    userData = data;
}

LD_JDF::~LD_JDF() { destroy(); }

// Every member copies and moves as what it is: callbacks, scalars and borrowed texts as values,
// record lists as pointer lists (the records are shared, and released by the last worker that
// shares them: recordShare_), the ticket handles as handles of the same document. A moved-from
// worker shares nothing any more and releases nothing.
LD_JDF::LD_JDF(const LD_JDF& other) = default;
LD_JDF::LD_JDF(LD_JDF&& other) noexcept = default;

LD_JDF& LD_JDF::operator=(const LD_JDF& other) {
    if (this != &other) *this = LD_JDF(other);
    return *this;
}

LD_JDF& LD_JDF::operator=(LD_JDF&& other) noexcept {
    if (this != &other) {
        this->~LD_JDF();
        new (this) LD_JDF(std::move(other));
    }
    return *this;
}

void LD_JDF::destroy() noexcept {
    // Records an early pipeline exit left behind are released by the last worker sharing them,
    // so a long-running host does not leak a job's model.
    if (recordShare_ && recordShare_.use_count() == 1) {
        releaseAllRecords();
        if (ticketDataPath != dataPath) std::free(ticketDataPath);
        std::free(jdfPath);
        std::free(dataPath);
        destroyZippedJDFFileSystem(zipFileSystem);
    }
    jdfPath = dataPath = ticketDataPath = nullptr;
    zipFileSystem = nullptr;
    recordShare_.reset();
}

LDError LD_JDF::exitWith(LDError code) {
    lastError = code;
    return code;
}

LDError LD_JDF::JDF_GetLastErrorCode() { return lastError; }
LDError LD_JDF::JDF_ValidateJDFForAPPE() { return LD_OK; }
LDError LD_JDF::createLayoutPerVersion(bool) { return LD_OK; }
void LD_JDF::JDF_Release(long long) {}
void LD_JDF::JDF_ChangeSourceFileNameInJDF(wchar_t*, wchar_t*) {}
