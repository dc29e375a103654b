#include "platform/jobstore/job_client.h"

#include <new>
#include <string>

#include "platform/jobstore/job_store.h"

using vorlan::jobstore::JobAttributeStore;

struct KAVM_Connection {
    JobAttributeStore store;
};

struct JOBM_Session {
    KAVM_Connection* connection;
    std::string lastValue;  // what the last read handed out
};

int KAVM_connectUTF8(const char*, const char*, const char*, const char*, int, int, KAVM_Connection** connection,
                     int) {
    if (!connection) return JOB_CLIENT_BAD_ARGUMENT;
    *connection = nullptr;
    auto* made = new (std::nothrow) KAVM_Connection{JobAttributeStore(JobAttributeStore::defaultFolder())};
    if (!made) return JOB_CLIENT_STORE_UNAVAILABLE;
    if (!made->store.open()) {
        delete made;
        return JOB_CLIENT_STORE_UNAVAILABLE;
    }
    *connection = made;
    return JOB_CLIENT_OK;
}

int KAVM_getJobId(KAVM_Connection* connection, int jobNumber, int64_t* jobId, int) {
    if (!connection || !jobId) return JOB_CLIENT_BAD_ARGUMENT;
    *jobId = jobNumber;
    return JOB_CLIENT_OK;
}

int JOBM_openSession(KAVM_Connection* connection, JOBM_Session** session, int) {
    if (!connection || !session) return JOB_CLIENT_BAD_ARGUMENT;
    *session = new (std::nothrow) JOBM_Session{connection, {}};
    return *session ? JOB_CLIENT_OK : JOB_CLIENT_STORE_UNAVAILABLE;
}

int JOBM_getJobAttribute(JOBM_Session* session, int64_t jobId, const char* name, char** value, int) {
    if (!session || !name || !value) return JOB_CLIENT_BAD_ARGUMENT;
    auto found = session->connection->store.get(jobId, name);
    if (!found) return JOB_CLIENT_NO_SUCH_ATTRIBUTE;
    session->lastValue = *found;
    *value = session->lastValue.data();
    return JOB_CLIENT_OK;
}

int JOBM_setJobAttribute(JOBM_Session* session, int64_t jobId, const char* name, const char* value, int) {
    if (!session || !name || !value) return JOB_CLIENT_BAD_ARGUMENT;
    return session->connection->store.set(jobId, name, value) ? JOB_CLIENT_OK : JOB_CLIENT_WRITE_FAILED;
}

int JOBM_closeSession(JOBM_Session* session, int) {
    delete session;
    return JOB_CLIENT_OK;
}

int INIT_disconnectFromServer(KAVM_Connection* connection, int) {
    delete connection;
    return JOB_CLIENT_OK;
}
