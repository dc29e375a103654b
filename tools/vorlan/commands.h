// The host's commands; each returns the process exit status.
#pragma once

#include "cli_support.h"

namespace vorlan::cli {

int runConsume(Args args);
int runValid(Args args);
int runAutoimpose(Args args);
int runScanXmp(Args args);
int runJobAttr(Args args);
int runInspect(Args args);
int runConvertPdf(Args args);
int runRewriteSeps(Args args);
int runProof(Args args);

}  // namespace vorlan::cli
