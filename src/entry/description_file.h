// The version description file the host names for a job ("job<N>.impinfo").
#pragma once

// The job number from the text after the path's last '/', read as "job%d.impinfo": the number
// when that text starts with "job" and digits, whatever follows; -1 otherwise (also without '/').
int jobNumberFromDescriptionPath(const char* impinfoPath);

// Reads the whole file into a zeroed buffer 16 bytes larger than the file (free() it).
// A file that cannot be read leaves *buffer null (the job runs unversioned) and says so on
// standard error. Returns false only when the buffer cannot be allocated.
bool readDescriptionFile(const char* path, char** buffer, long* length);
