// PROJ contexts and objects released with their owner; contexts that keep
// PROJ's own reports quiet, since its failures become our exceptions.
#pragma once

#include <proj.h>

#include <memory>

struct OmbProjContextDeleter {
    void operator()(PJ_CONTEXT* c) const { proj_context_destroy(c); }
};
struct OmbProjObjectDeleter {
    void operator()(PJ* p) const { proj_destroy(p); }
};
using OmbProjContext = std::unique_ptr<PJ_CONTEXT, OmbProjContextDeleter>;
using OmbProjObject = std::unique_ptr<PJ, OmbProjObjectDeleter>;

inline OmbProjContext Omb_quietProjContext() {
    OmbProjContext context(proj_context_create());
    proj_log_level(context.get(), PJ_LOG_NONE);
    return context;
}
