/*
 * TarnLib: the client library of the tarn daemon (Tarnd).
 *
 * Conventions for the whole interface:
 * - Open the library with TarnLib_Init(0, 0) before any other call and pair every
 *   successful TarnLib_Init with one TarnLib_Exit.
 * - A status is a 32-bit integer: 0 is success, anything else an error code whose
 *   text TarnLib_Err2String gives. Functions that answer a bool succeed on true.
 * - Texts passed in are NUL-terminated and owned by the caller; the library
 *   copies what it keeps.
 * - Records passed out are allocated by the library and released by the caller
 *   with the matching TarnLib_Free... function, which accepts NULL. The block of
 *   TarnLib_UnsharedChunksTarn is released with free(). Texts inside a record
 *   live as long as the record.
 * - On failure a result pointer is left as the caller set it, except for
 *   TarnLib_QueryAllConfigTarns, whose result must be released in any case.
 */
#ifndef TARNLIB_TARNLIB_H
#define TARNLIB_TARNLIB_H

#include <stdbool.h>
#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

typedef int32_t TarnLib_Status;

enum {
  TARNLIB_OK = 0,
  TARNLIB_CONTAINER_ID_TEXT_SIZE = 37, /* 36 characters and the terminating NUL */
};

/* Opening and closing. Both arguments are 0. */
bool TarnLib_Init(int32_t flags, int32_t options);
void TarnLib_Exit(void);

/* The text of a status; never NULL, valid until the next call on this thread. */
const char* TarnLib_Err2String(TarnLib_Status status);

/* Fault injection: rules are keyed by (operation, fault); the operation "*" is the
 * wildcard. frequency and maxTimeMs are -1 when not given; both -1 in a modify
 * remove the rule. */
bool TarnLib_SetFaultInjectionEnabled(bool enabled);
bool TarnLib_AddFaultInjectionRule(const char* operation, const char* fault, int32_t frequency,
                                   int32_t maxTimeMs);
bool TarnLib_ModifyFaultInjectionRule(const char* operation, const char* fault,
                                      int32_t frequency, int32_t maxTimeMs);

/* Debug switches; a NULL pointer leaves that setting unchanged. */
TarnLib_Status TarnLib_DebugCommand(const int32_t* logLevel, const int32_t* dumpObjects,
                                    const int32_t* unbindPeriodUs);
TarnLib_Status TarnLib_SetSPMSpaceEfficiencyManipulationEnabled(bool enabled);

/* Provider activation. activation is a 64-byte block, zeroed by the caller. */
enum { TARNLIB_ACTIVATION_BLOCK_SIZE = 64 };
TarnLib_Status TarnLib_ActivateProvider(const char* arrayId, const char* providerName,
                                        const char* activeProviderUrl, void* activation);
TarnLib_Status TarnLib_DeactivateProvider(const char* arrayId, const char* providerName);

/* One array of a provider fault. */
typedef struct KiroFaultArrayEntry {
  const char* arrayId; /* borrowed from the caller */
  bool isActive;
  int32_t reserved; /* not read by the library */
} KiroFaultArrayEntry;

/* Makes the daemon treat a provider's connection as being in status (online,
 * offline, syncError, unknown or default). */
TarnLib_Status TarnLib_VendorProviderInjectFault(const char* providerName, const char* url,
                                                 const char* status, int32_t arrayCount,
                                                 const KiroFaultArrayEntry* arrays);

/* Extended error record, returned by value. */
enum { TARNLIB_ERROR_TEXT_SIZE = 256 };
typedef struct TarnLib_ErrorEx {
  TarnLib_Status status;
  char text[TARNLIB_ERROR_TEXT_SIZE]; /* NUL-terminated, empty on success */
} TarnLib_ErrorEx;

bool TarnLib_ErrorExIsSuccess(const TarnLib_ErrorEx* error);
/* The record's text; lives as long as the record. */
const char* TarnLib_ErrorExStr(const TarnLib_ErrorEx* error);

/* Records of the exported storage containers. */
typedef enum ProtocolEndpointType {
  PROTOCOL_ENDPOINT_SCSI = 0,  /* firstText: LUN id */
  PROTOCOL_ENDPOINT_NFS = 1,   /* firstText: IP address, secondText: server mount */
  PROTOCOL_ENDPOINT_NFS4X = 2, /* firstText: server mount; addresses in the record */
} ProtocolEndpointType;

typedef struct ProtocolEndpointAddress {
  int32_t type; /* a ProtocolEndpointType */
  char* firstText;
  char* secondText; /* NULL where the type has none */
} ProtocolEndpointAddress;

typedef struct ProtocolEndpointRecord {
  char* localUID;
  int32_t reserved1;
  int32_t reserved2;
  char** nfs4xAddresses;
  int32_t nfs4xAddressCount;
  int32_t reserved3;
  int32_t reserved4;
  ProtocolEndpointAddress* address;
  uint8_t isAccessible; /* non-zero: true */
  uint8_t isConfigured; /* non-zero: true */
} ProtocolEndpointRecord;

typedef struct StorageArrayRecord {
  char* arrayId;
  char* arrayName;
  char* vendorId;
  char* modelId;
  int32_t peCount;
  ProtocolEndpointRecord** protocolEndpoints;
} StorageArrayRecord;

typedef struct StorageContainerRecord {
  char* containerName;
  char* vpUrl;
  char* containerId;
  int32_t arrayCount;
  int64_t maxTarnSizeMB;
  int32_t reserved;
  StorageArrayRecord** arrays;
} StorageContainerRecord;

typedef struct StorageContainerResult {
  uint32_t containerCount;
  StorageContainerRecord** containers;
} StorageContainerResult;

/* Every container the daemon exports, in the daemon's order. Pass 1 and NULL. */
TarnLib_ErrorEx TarnLib_GetStorageContainer(int32_t scope, const char* filter,
                                            StorageContainerResult** result);
void TarnLib_FreeStorageContainerResult(StorageContainerResult* result);

/* Config-tarns of a container. */
typedef struct ConfigTarnEntry {
  char* tarnId;  /* the config-tarn's UUID */
  char* name;    /* its directory name */
  char* vmUuid;
  uint8_t mounted;
} ConfigTarnEntry;

typedef struct QueryResult {
  int32_t entryCount;
  ConfigTarnEntry** entries;
} QueryResult;

/* Pass the container id text, 2147483647, 0, the result place and 0. The result
 * is released with TarnLib_FreeQueryResult whether the query succeeded or not. */
TarnLib_Status TarnLib_QueryAllConfigTarns(const char* containerId, int32_t maxEntries,
                                           int32_t offset, QueryResult** result,
                                           int32_t flags);
void TarnLib_FreeQueryResult(QueryResult* result);

/* True when id is a valid container id; normalized then holds its normal form
 * (lower-case 8-4-4-4-12 hexadecimal). normalized has
 * TARNLIB_CONTAINER_ID_TEXT_SIZE bytes and is never written beyond them. */
bool TarnLib_NormalizeContainerIdString(const char* id, char* normalized);

/* Volume records; containerId is in normal form. */
typedef struct TarnInfo {
  char* uuid;
  char* storageProfile; /* NULL when the volume has none */
  int64_t logicalSizeMB;
  int32_t accessibility;
} TarnInfo;

typedef struct TarnSpaceStatsInfo {
  int64_t logicalSizeMB;
  int64_t committedSizeMB;
  int64_t unsharedSizeMB; /* meaningful only when unsharedSizeValid */
  bool unsharedSizeValid;
} TarnSpaceStatsInfo;

typedef struct TarnMetadataEntry {
  char* key;
  char* value;
  struct TarnMetadataEntry* next; /* NULL at the end */
} TarnMetadataEntry;

typedef struct TarnMetadata {
  TarnMetadataEntry* first; /* NULL when there is no entry */
} TarnMetadata;

TarnLib_Status TarnLib_GetTarnInfo(const char* containerId, const char* uuid, TarnInfo** info);
void TarnLib_FreeTarnInfo(TarnInfo* info);
TarnLib_Status TarnLib_SpaceStatsForTarn(const char* containerId, const char* uuid,
                                         TarnSpaceStatsInfo** stats);
void TarnLib_FreeTarnSpaceStatsInfo(TarnSpaceStatsInfo* stats);
TarnLib_Status TarnLib_GetTarnMetadata(const char* containerId, const char* uuid,
                                       TarnMetadata** metadata);
void TarnLib_FreeTarnMetadata(TarnMetadata* metadata);

/* The unshared chunks of a volume. Pass 0 for offset, length, chunkLimit, flags
 * and reserved. The block starts with the block size in bytes as an int64_t,
 * followed by the chunk count (int64_t); release it with free(). */
TarnLib_Status TarnLib_UnsharedChunksTarn(const char* containerId, const char* uuid,
                                          uint64_t offset, uint64_t length, uint32_t chunkLimit,
                                          uint32_t flags, uint32_t reserved, void** block);

#ifdef __cplusplus
}
#endif

#endif /* TARNLIB_TARNLIB_H */
