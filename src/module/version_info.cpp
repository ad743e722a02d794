// The module's version record, handed out word by word by qvvercn1.
#include <nlssm/nlssm.h>

#include <cstring>

namespace {

// The build tooling's opaque signatures: carried, never interpreted.
constexpr NLSSMVersionInfo kVersionInfo = {
    "V.03.01M0P09072016",
    "nlssmbld-main",  // build host and branch, 13 characters
    "",
    1473301560,
    "qvnls",
    "N7L4S2Q",
    "qvext",
    "X3-E9T1-LDR8-K2Q5M",
    "",
    "version",
    "::",
    "",
    "KAL_VERSION_HOTFIX_NUMBER=                                       ",
    "H0TF1X7NLSSM2",
    "VERCON_IMAGE_DESCRIPTION=                                        ",
    "hdlno",
    "Wed Sep  7 22:26:00 EDT 2016",
    {},
};

}  // namespace

extern "C" void qvvercn1(void *destination) {
  std::memcpy(destination, &kVersionInfo, sizeof kVersionInfo);
}
