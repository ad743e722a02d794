// The extension-version entry and the forwarders of messages and statuses to
// the host's message object. Each forwarder reads the operation from the
// object's slot and passes its variable arguments on as one va_list.
#include <cstdarg>

#include "nlssm/host.h"
#include "nlssm/nlssm.h"

namespace {

// The object's operation in slot n, or null when there is no object.
template <typename Fn>
Fn host_op(void *object, int n) {
  return object == nullptr ? nullptr : reinterpret_cast<Fn>(NLSSM_HOST_SLOT(object, n));
}

}  // namespace

extern "C" {

void *Exported_QVHandle = nullptr;

int64_t qvextent(void *hostHandle) {
  Exported_QVHandle = hostHandle;
  return 0;
}

int64_t qvextver(void *hostHandle, int64_t *major, int64_t *minor) {
  if (major != nullptr) *major = 6;
  if (minor != nullptr) *minor = 1;
  return qvextent(hostHandle);
}

// Without an object (or operation) the buffer forms report the missing
// argument and write nothing; the journal forms have nothing to write to
// and succeed; no locale is found.
int64_t qvlMessageToBuf(void *messageObject, void *a1, void *a2, void *a3, void *a4, void *a5,
                        ...) {
  auto op = host_op<NLSHostMessageToBufFn>(messageObject, NLSHOST_SLOT_MESSAGE_TO_BUF);
  if (op == nullptr) return NLSSM_E_NULL_ARGUMENT;
  va_list args;
  va_start(args, a5);
  const int64_t result = op(messageObject, a1, a2, a3, a4, a5, args);
  va_end(args);
  return result;
}

int64_t qvlMessageToJnl(void *hostObject, uint32_t messageNumber, void *a1, void *a2, ...) {
  auto op = host_op<NLSHostMessageToJnlFn>(hostObject, NLSHOST_SLOT_MESSAGE_TO_JNL);
  if (op == nullptr) return 0;
  va_list args;
  va_start(args, a2);
  const int64_t result = op(hostObject, messageNumber, a1, a2, args);
  va_end(args);
  return result;
}

int64_t qvlStatusToBuf(void *hostObject, uint32_t status, void *a1, void *a2, void *a3, ...) {
  auto op = host_op<NLSHostStatusToBufFn>(hostObject, NLSHOST_SLOT_STATUS_TO_BUF);
  if (op == nullptr) return NLSSM_E_NULL_ARGUMENT;
  va_list args;
  va_start(args, a3);
  const int64_t result = op(hostObject, status, a1, a2, a3, args);
  va_end(args);
  return result;
}

int64_t qvlStatusToJnl(void *hostObject, uint32_t messageNumber, uint32_t status, ...) {
  auto op = host_op<NLSHostStatusToJnlFn>(hostObject, NLSHOST_SLOT_STATUS_TO_JNL);
  if (op == nullptr) return 0;
  va_list args;
  va_start(args, status);
  const int64_t result = op(hostObject, messageNumber, status, args);
  va_end(args);
  return result;
}

int64_t qvlGetLocale(void *hostObject, ...) {
  auto op = host_op<NLSHostGetLocaleFn>(hostObject, NLSHOST_SLOT_GET_LOCALE);
  if (op == nullptr) return 0;
  va_list args;
  va_start(args, hostObject);
  const int64_t result = op(hostObject, args);
  va_end(args);
  return result;
}

}  // extern "C"
