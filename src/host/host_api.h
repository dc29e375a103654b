// What the command-line host may use of the library beside its public API (include/vorlan): the
// PDF operations it offers as commands, auto-imposition, the job attribute store, result-code
// names and text conversion.
//
// The host is built with include/ and this folder alone on its include path, so this header is
// its one way into the library's internals: a host source that includes anything else of src/
// fails to compile. Every header named here includes only standard headers and headers beside
// itself.
#pragma once

#include "../autoimpose/auto_imposition.h"
#include "../entry/result_codes.h"
#include "../pdf/separation_layers.h"
#include "../pdf/separation_rewrite.h"
#include "../platform/jobstore/job_store.h"
#include "../platform/os/text.h"
