/* What the services of host_services.c count. */

struct HostCalls {
  int synced;
  int entries; /* of NLS2_ReleaseLocale */
  int exits;
  int locked;
  int unlocked;
};

__attribute__((visibility("default"))) struct HostCalls hostCalls(void);
