# The parts of the platform's policy that the service's own refers to, cut down to what lets it be
# compiled: names, macros and rules as the platform has them, without their other contents.

class process
class file
class dir
class capability
class system
class fd
class binder
class hwservice_manager
class property_service
class udp_socket
class icmp_socket
class rawip_socket
class netlink_route_socket
class netlink_generic_socket

sid kernel

common file { ioctl read write create getattr setattr lock append map open watch execute execute_no_trans entrypoint search }
common socket { ioctl read write create getattr setattr lock append map bind connect getopt setopt shutdown }

class process { transition siginh noatsecure rlimitinh getattr }
class file inherits file
class dir inherits file
class capability { sys_module net_admin net_raw }
class system { module_load }
class fd { use }
class binder { call transfer impersonate set_context_mgr }
class hwservice_manager { add find list }
class property_service { set }
class udp_socket inherits socket
class icmp_socket inherits socket
class rawip_socket inherits socket
class netlink_route_socket inherits socket { nlmsg_read nlmsg_write }
class netlink_generic_socket inherits socket

sensitivity s0;
dominance { s0 }
category c0;
level s0:c0;
mlsconstrain process transition (h1 dom h2);

define(`r_file_perms', `{ getattr open read ioctl lock map watch }')
define(`rx_file_perms', `{ r_file_perms execute execute_no_trans }')
define(`rw_file_perms', `{ r_file_perms append write }')
define(`r_dir_perms', `{ open getattr read search ioctl lock }')
define(`create_socket_perms_no_ioctl', `{ read getattr write setattr lock append bind connect getopt setopt shutdown create map }')
define(`create_socket_perms', `{ create_socket_perms_no_ioctl ioctl }')
define(`unpriv_sock_ioctls', `{ 0x8912 0x8b01 }')
define(`priv_sock_ioctls', `{ 0x8914 0x8be0-0x8bff }')

define(`init_daemon_domain', `
allow init $1_exec:file rx_file_perms;
allow init $1:process transition;
allow $1 $1_exec:file { entrypoint read execute getattr open map };
type_transition init $1_exec:process $1;')
define(`hwbinder_use', `
allow $1 hwservicemanager:binder { call transfer };
allow hwservicemanager $1:binder { call transfer };')
define(`add_hwservice', `
allow $1 $2:hwservice_manager { add find };
allow $1 hidl_base_hwservice:hwservice_manager add;
neverallow { domain -$1 } $2:hwservice_manager add;')
define(`binder_call', `
allow $1 $2:binder { call transfer };
allow $2 $1:binder transfer;
allow $1 $2:fd use;')
define(`get_prop', `allow $1 $2:file r_file_perms;')
define(`set_prop', `
get_prop($1, $2)
allow $1 $2:property_service set;')
define(`vendor_internal_prop', `type $1, property_type;')

attribute domain;
attribute appdomain;
attribute coredomain;
attribute exec_type;
attribute file_type;
attribute fs_type;
attribute sysfs_type;
attribute property_type;
attribute vendor_file_type;
attribute hwservice_manager_type;
attribute protected_hwservice;

type kernel, domain, coredomain;
type init, domain, coredomain;
type vendor_init, domain;
type shell, domain, coredomain;
type system_server, domain, coredomain;
type hwservicemanager, domain, coredomain;
type platform_app, domain, appdomain, coredomain;
type priv_app, domain, appdomain, coredomain;
type system_app, domain, appdomain, coredomain;
type untrusted_app, domain, appdomain;
type sysfs, fs_type, sysfs_type;
type system_lib_file, file_type;
type vendor_file, vendor_file_type, file_type;
type vendor_shell_exec, exec_type, vendor_file_type, file_type;
type vendor_toolbox_exec, exec_type, vendor_file_type, file_type;
type hwservicemanager_prop, property_type;
type vendor_default_prop, property_type;
type hidl_base_hwservice, hwservice_manager_type;

# What "protected" keeps out: the untrusted apps and nobody else.
neverallow untrusted_app protected_hwservice:hwservice_manager find;
