/*
 * host_export.h - the public headers as seen by the stand-in host libraries.
 *
 * The libraries are compiled with hidden visibility; every function declared
 * in the public headers (pu_*, kf_*, host_*) is declared here with default
 * visibility, so exactly those names are exported and the libraries' C++
 * internals are not.
 */
#ifndef DPX_HOST_EXPORT_H
#define DPX_HOST_EXPORT_H

#include <stddef.h>
#include <stdint.h>

#pragma GCC visibility push(default)
#include "dpx_camel.h"
#include "dpx_standin_host.h"
#pragma GCC visibility pop

#endif /* DPX_HOST_EXPORT_H */
