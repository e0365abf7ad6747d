// The host database's layout.
//
// The file is recognised by its application id and carries its schema
// version in user_version; a file with another application id, or with a
// newer version than this library knows, is refused without being touched.
//
// Layers: tables with a `layer` column hold the stored configuration in
// layer 0 and the running state in layer 1. The tool's changes to standard
// switches go to both layers; a reboot deletes layer 1 (and the ENS state);
// the restore operations copy layer 0 back into layer 1. For distributed
// switches layer 0 is the distributed switch cache (DefaultDVSCacheFile).
//
// Tables (names are compared byte for byte, case-sensitively):
//  meta(key, value)          'next_seq': the next value of the one ordering
//                             counter that every `seq` column draws from;
//                             'ens_node': "1" once the ENS activation node
//                             was set since boot, else "0".
//  pnic(seq, name)           physical NICs: hardware, never layered.
//  vswitch                   standard switches: ports, MTU, CDP status,
//                             system flag, teaming policy (PolicyCodec JSON).
//  portgroup                 port groups: owning `switch` name, VLAN id,
//                             teaming policy (a new one lacks the 0x10 flag).
//                             Names are unique per layer on the whole host.
//  link(layer, pnic, switch) a pnic linked to a standard switch.
//  client(portgroup, name)   virtual NICs on a port group, one port each.
//                             Not layered: they reattach to the port group
//                             of that name whenever it exists.
//  dvswitch                  distributed switches: switch name (`name`),
//                             portset name, switch id, UUID text, class,
//                             version, ports, MTU.
//  dvs_uplink                uplinks of a distributed switch; `port_id` is
//                             the DVPort an uplink was added to, or NULL.
//  dvport(dvs, port_id, connection_id)   DVPorts of a distributed switch
//                             (by switch name); not layered.
//  dvport_client             clients of a DVPort.
//  dvport_event              test observation events raised on DVPorts.
//  opaque                    opaque switches; never changed by the tool and
//                             kept across reboots.
//  ens(portset, intr, fast_switch)  portsets with ENS active (running only).
//  ens_event                 uplink reassociations, in order.
//  uplink_timeout, lag_timeout      layer 0: stored records; layer 1: the
//                             records loaded into the running state.
//  fault                     armed failures: the operation's name, the
//                             object name it is restricted to (NULL: any),
//                             message and detailed message, calls to let
//                             pass first, calls still to fail, the wait
//                             before a call fails or goes on (ms), whether
//                             it goes on (pass) after the wait, whether
//                             every call fails (always), calls it fired on.
//
// Versions: 2 added the fault's delay_ms, pass, always and fired. A host
// of version 1 is brought to version 2 when it is opened for writing, and
// read through a view that adds those columns when it is only read.
#pragma once

#include <cstdint>

namespace TarnCtl::Store {

constexpr int32_t kApplicationId = 0x54524e48;  // "TRNH"
constexpr int kSchemaVersion = 2;

// Creates every table of an empty database (run inside a transaction).
extern const char* const kSchemaSql;
// Brings a version 1 host to version 2 (run inside a transaction).
extern const char* const kFaultColumnsSince2;
// For a version 1 host that is only read: a temporary view over its faults
// with the columns of version 2.
extern const char* const kFaultViewOfVersion1;

}  // namespace TarnCtl::Store
