// The library's session globals. All start zeroed and live as long as the library is loaded.
#include "velk/cim.h"
#include "velk/package_table.h"
#include "velk/request_state.h"

const CMPIBroker *ZEB_VMWarePackageInstallationBroker = nullptr;

velk::PackageRecord pkgInstance[velk::kMaxPackages];
int pkgnum = 0;
int PkgSeq[velk::kMaxPackages];
velk::PayloadResult payload_result[10];

int filelocation = 0;
int totalstatus = 0;
int is_sync_install = 0;
int is_async_install = 0;
int invoke_client = 0;
int g_is_backup_update = 0;
int g_is_noreboot_update = 0;
int Velkchild_thread_num = 0;
int ga_is_thread_running = 0;
char instanceID[velk::kInstanceIdSize];
char update_file_location[4100];
pthread_mutex_t mutex = PTHREAD_MUTEX_INITIALIZER;
