// Job attributes on the print server: each call connects, opens a session, makes one request
// and closes everything it opened.
#include "entry/job_attributes.h"
#include "platform/jobstore/job_client.h"
#include "vorlan/LD_JDF.h"

namespace {

constexpr const char* kLoopback = "127.0.0.1";
constexpr const char* kUser = "admin";
constexpr const char* kClientName = "Quillet";

// Runs request inside a connection and session; true exactly when the request gave 0.
template <typename Request>
bool withJobSession(int jobNumber, Request request) {
    KAVM_Connection* connection = nullptr;
    if (KAVM_connectUTF8(kLoopback, kUser, kClientName, "", -1, -1, &connection, 0) != 0) return false;
    bool ok = false;
    int64_t jobId = 0;
    if (KAVM_getJobId(connection, jobNumber, &jobId, 0) == 0) {
        JOBM_Session* session = nullptr;
        if (JOBM_openSession(connection, &session, 0) == 0) {
            ok = request(session, jobId) == 0;
            JOBM_closeSession(session, 0);
        }
    }
    INIT_disconnectFromServer(connection, 0);
    return ok;
}

}  // namespace

bool LD_JDF::getJobAttribute(const char* name, char** value) {
    if (!name || !value) return false;
    // The session's copy dies with the session, so the worker keeps its own for the caller.
    return withJobSession(jobNumber, [&](JOBM_Session* session, int64_t jobId) {
        char* found = nullptr;
        int result = JOBM_getJobAttribute(session, jobId, name, &found, 0);
        if (result == 0) {
            jobAttributeValue_ = found ? found : "";
            *value = jobAttributeValue_.data();
        }
        return result;
    });
}

bool vorlan::setJobAttributeOf(int jobNumber, const char* name, const char* value) {
    if (!name || !value) return false;
    return withJobSession(jobNumber, [&](JOBM_Session* session, int64_t jobId) {
        return JOBM_setJobAttribute(session, jobId, name, value, 0);
    });
}

bool LD_JDF::setJobAttribute(const char* name, const char* value) {
    return vorlan::setJobAttributeOf(jobNumber, name, value);
}
