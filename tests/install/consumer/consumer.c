/* The module's C interface alone: the version record. */
#include <nlssm/nlssm.h>

#include <stdio.h>
#include <string.h>

int main(void) {
  NLSSMVersionInfo info;
  memset(&info, 0, sizeof info);
  qvvercn1(&info);
  if (info.imageName == NULL) return 1;
  printf("ok %s\n", info.imageName);
  return 0;
}
