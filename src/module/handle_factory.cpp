// Handle creation and release.
#include <nlssm/nlssm.h>

// A handle stays alive in the host's table; only the destroy callback
// releases it.
extern "C" int64_t NLSSMDestroy(NLSSMHandle *) {
  return 0;
}

// Handle creation is not available in this build: the host is told so.
extern "C" int64_t NLSSMCreate(void *, int64_t, void *, NLSSMHandle **) {
  return NLSSM_E_UNSUPPORTED;
}

extern "C" int64_t NLSSMDestroyCallback(void *) {
  return NLSSM_E_UNSUPPORTED;
}
