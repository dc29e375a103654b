// The print server's job-management client calls, answered by the local durable attribute store.
// Every call returns 0 on success.
#pragma once

#include <cstdint>

struct KAVM_Connection;
struct JOBM_Session;

enum JobClientResult : int {
    JOB_CLIENT_OK = 0,
    JOB_CLIENT_BAD_ARGUMENT = 1,
    JOB_CLIENT_STORE_UNAVAILABLE = 2,
    JOB_CLIENT_NO_SUCH_ATTRIBUTE = 3,
    JOB_CLIENT_WRITE_FAILED = 4,
};

// Connects to the store (the host, user, client name, password and the two numbers are accepted
// for the call's shape; the store is local). *connection receives the handle.
int KAVM_connectUTF8(const char* host, const char* user, const char* clientName, const char* password,
                     int timeout, int port, KAVM_Connection** connection, int flags);
// The job id of a job number (the number itself).
int KAVM_getJobId(KAVM_Connection* connection, int jobNumber, int64_t* jobId, int flags);
int JOBM_openSession(KAVM_Connection* connection, JOBM_Session** session, int flags);
// *value points into the session and stays valid until the next call on the same session.
int JOBM_getJobAttribute(JOBM_Session* session, int64_t jobId, const char* name, char** value, int flags);
int JOBM_setJobAttribute(JOBM_Session* session, int64_t jobId, const char* name, const char* value, int flags);
int JOBM_closeSession(JOBM_Session* session, int flags);
int INIT_disconnectFromServer(KAVM_Connection* connection, int flags);
