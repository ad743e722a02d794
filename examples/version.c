/* Loads the module through its constructor on a minimal host and prints the
 * version record: the smallest complete use of the C interface. */
#include <nlssm/host.h>
#include <nlssm/nlssm.h>

#include <stdio.h>
#include <stdlib.h>

/* A host whose pools are plain malloc blocks that remember their allocations. */
typedef struct Block {
  struct Block *next;
} Block;
typedef struct Pool {
  void *slots[5];
  Block *blocks;
} Pool;

static void pool_destroy(void *self) {
  Pool *pool = self;
  while (pool->blocks) {
    Block *next = pool->blocks->next;
    free(pool->blocks);
    pool->blocks = next;
  }
  free(pool);
}

static void *pool_allocate(void *self, uint64_t size, uint32_t flags) {
  Pool *pool = self;
  Block *block = flags & NLSHOST_ALLOC_ZERO_FILL ? calloc(1, sizeof(Block) + size)
                                                 : malloc(sizeof(Block) + size);
  if (!block) return NULL;
  block->next = pool->blocks;
  pool->blocks = block;
  return block + 1;
}

static void pool_free(void *self, void *memory) {
  (void)self;
  (void)memory;
}

static void *create_pool(void *host, const NLSHostPoolOptions *options, void *journal,
                         const char *name) {
  (void)host;
  (void)options;
  (void)journal;
  (void)name;
  Pool *pool = calloc(1, sizeof *pool);
  if (!pool) return NULL;
  pool->slots[NLSHOST_SLOT_POOL_DESTROY] = (void *)pool_destroy;
  pool->slots[NLSHOST_SLOT_POOL_ALLOCATE] = (void *)pool_allocate;
  pool->slots[NLSHOST_SLOT_POOL_FREE] = (void *)pool_free;
  return pool;
}

int main(void) {
  void *host[8] = {0};
  host[NLSHOST_SLOT_CREATE_POOL] = (void *)create_pool;
  qvextent(host);

  NLSSMModule *module = qvnlssm(host, NULL);
  if (!module) {
    fprintf(stderr, "qvnlssm failed\n");
    return 1;
  }
  int64_t major, minor, patch;
  version(module, &major, &minor, &patch);
  printf("module interface %lld.%lld.%lld\n", (long long)major, (long long)minor, (long long)patch);
  reqVersion(module, &major, &minor, &patch);
  printf("requires host %lld.%lld.%lld\n", (long long)major, (long long)minor, (long long)patch);

  NLSSMVersionInfo info;
  qvvercn1(&info);
  printf("version %s\nbuild %s\nbuilt %s (%lld)\ndepends on %s %s, %s %s\n", info.version,
         info.buildId, info.buildDate, (long long)info.buildTime, info.nlsExtension,
         info.nlsSignature, info.loaderExtension, info.loaderSignature);
  NLSSMRealDestroy(module);
  return 0;
}
