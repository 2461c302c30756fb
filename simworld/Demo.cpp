#include "Scenario.h"

namespace HyraSim {

// A small host: two providers serving three arrays, three exported containers
// (gold already mounted), and one container whose provider is not registered,
// so the daemon does not export it.
const char* DemoScenario() {
  return R"json({
  "daemon": { "running": true, "logLevel": 4, "dumpRequests": 0, "unbindPeriod": 300000000,
              "faultInjection": { "enabled": false, "rules": [] },
              "spaceEfficiencyManipulation": true, "activations": [], "providerFaults": [] },
  "arrays": [
    { "id": "array-a", "name": "Array A", "vendorId": "ACME", "modelId": "M100",
      "protocolEndpoints": [
        { "localUID": "pe-a1", "type": "NFS", "ipAddress": "192.0.2.10", "serverMount": "/exports/a1",
          "accessible": true, "configured": true },
        { "localUID": "pe-a2", "type": "SCSI", "lunId": "lun-0001", "accessible": true, "configured": true },
        { "localUID": "pe-a3", "type": "NFS4x", "addresses": ["192.0.2.11", "192.0.2.12"],
          "serverMount": "/exports/a3", "accessible": true, "configured": false } ] },
    { "id": "array-b", "name": "Array B", "vendorId": "ACME", "modelId": "M200",
      "protocolEndpoints": [
        { "localUID": "pe-b1", "type": "SCSI", "lunId": "lun-0101", "accessible": true, "configured": true },
        { "localUID": "pe-b2", "type": "NFS4x", "addresses": [], "serverMount": "/exports/b2",
          "accessible": false, "configured": true } ] },
    { "id": "array-c", "name": "Array C", "vendorId": "ACME", "modelId": "X10",
      "protocolEndpoints": [
        { "localUID": "pe-c1", "type": "NFS", "ipAddress": "198.51.100.20", "serverMount": "/exports/c1",
          "accessible": true, "configured": true },
        { "localUID": "pe-c2", "type": "SCSI", "lunId": "lun-0201", "accessible": true, "configured": true } ] } ],
  "containers": [
    { "name": "gold", "id": "6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f", "vpUrl": "https://vp1.example.test:8443/kiro",
      "maxTarnSizeMB": 2097152, "arrays": ["array-a"],
      "tarns": [
        { "uuid": "0c9e2d1a-3b4f-4a5e-8f70-112233445566", "logicalSizeMB": 10240, "committedSizeMB": 2048,
          "unsharedSizeMB": 512, "storageProfile": "gold-policy", "blockSize": 4096,
          "metadata": [["owner", "ops"], ["tier", "1"]], "accessibility": 3 },
        { "uuid": "5d2f7a10-6b1c-4e3d-9a8b-7c6d5e4f3a2b", "logicalSizeMB": 4096, "committedSizeMB": 128,
          "unsharedSizeMB": 64, "storageProfile": null, "blockSize": 4096, "metadata": [], "accessibility": 3,
          "configTarn": { "name": "vm-config-1", "policy": "", "vmUuid": "8a7b6c5d-4e3f-4a2b-9c1d-0e1f2a3b4c5d",
                          "mounted": false } } ] },
    { "name": "silver", "id": "9b8a7c6d-5e4f-4a3b-8c2d-1e0f9a8b7c6d", "vpUrl": "https://vp1.example.test:8443/kiro",
      "maxTarnSizeMB": 1048576, "arrays": ["array-a", "array-b"],
      "tarns": [
        { "uuid": "3e4f5a6b-7c8d-4e9f-a0b1-c2d3e4f5a6b7", "logicalSizeMB": 20480, "committedSizeMB": 20480,
          "unsharedSizeMB": null, "storageProfile": "silver-policy", "blockSize": 8192,
          "metadata": [["app", "db"]], "accessibility": 2 },
        { "uuid": "4a5b6c7d-8e9f-4a0b-b1c2-d3e4f5a6b7c8", "logicalSizeMB": 1024, "committedSizeMB": 0,
          "unsharedSizeMB": 0, "storageProfile": null, "blockSize": 4096, "metadata": [], "accessibility": 1 } ] },
    { "name": "bronze", "id": "2c3d4e5f-6a7b-4c8d-9e0f-a1b2c3d4e5f6", "vpUrl": "https://vp2.example.test:8443/kiro",
      "maxTarnSizeMB": 524288, "arrays": ["array-c"],
      "tarns": [
        { "uuid": "7f8e9d0c-1b2a-4c3d-8e4f-5a6b7c8d9e0f", "logicalSizeMB": 51200, "committedSizeMB": 10240,
          "unsharedSizeMB": 4096, "storageProfile": "bronze-policy", "blockSize": 4096,
          "metadata": [["owner", "qa"], ["backup", "nightly"], ["tier", "3"]], "accessibility": 3 } ] },
    { "name": "legacy", "id": "1a2b3c4d-5e6f-4a7b-8c9d-0e1f2a3b4c5d", "vpUrl": "https://vp9.example.test:8443/kiro",
      "maxTarnSizeMB": 1048576, "arrays": ["array-c"],
      "tarns": [
        { "uuid": "6e5d4c3b-2a19-4087-b6a5-948372615049", "logicalSizeMB": 2048, "committedSizeMB": 2048,
          "unsharedSizeMB": 2048, "storageProfile": "legacy-policy", "blockSize": 512,
          "metadata": [["retired", "yes"]], "accessibility": 0 } ] } ],
  "host": {
    "providers": [
      { "name": "vp1", "url": "https://vp1.example.test:8443/kiro",
        "arrays": [ { "arrayId": "array-a", "isActive": true, "priority": 1 },
                    { "arrayId": "array-b", "isActive": false, "priority": 2 } ] },
      { "name": "vp2", "url": "https://vp2.example.test:8443/kiro",
        "arrays": [ { "arrayId": "array-c", "isActive": true, "priority": 1 } ] } ],
    "mounted": [ { "name": "gold", "id": "6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f", "arrays": ["array-a"] } ],
    "kiroContext": null }
}
)json";
}

}  // namespace HyraSim
