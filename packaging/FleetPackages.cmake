# The packages of fleet/, which are the same for all architectures.
foreach(component IN ITEMS fleet facts metrics report)
    string(TOUPPER ${component} key)
    set(CPACK_DEBIAN_${key}_PACKAGE_ARCHITECTURE all)
endforeach()

set(reads_machine "cimhost, lease-warranty-provider, ostrel-reference-agent")
set(needs_common "lease-warranty-fleet-common (= ${PROJECT_VERSION}-${CPACK_DEBIAN_PACKAGE_RELEASE}), python3 (>= 3.11)")

law_package(fleet lease-warranty-fleet-common
    DOCUMENTS fleet.md
    DEPENDS "python3 (>= 3.11)"
    DESCRIPTION "leases and warranties of many computers: common files
The Python modules that lease-warranty-facts, lease-warranty-metrics and
lease-warranty-report share. Among the documents are an Ansible playbook that
sets the leases and warranties of many computers from a CSV file, alerting
rules for Prometheus and a dashboard for Grafana.")
set(CPACK_DEBIAN_FLEET_PACKAGE_SUGGESTS "ansible-core, prometheus")

law_package(facts lease-warranty-facts
    DOCUMENTS lease-warranty-export.md
    DEPENDS "${needs_common}, ${reads_machine}"
    DESCRIPTION "lease and warranty data of this computer as JSON and Ansible fact
The command lease-warranty-export, and a fact for Ansible that calls it. They
return leases, warranties, asset identification and agent identity.")

law_package(metrics lease-warranty-metrics
    DOCUMENTS lease-warranty-metrics.md
    DEPENDS "${needs_common}, ${reads_machine}, adduser"
    DESCRIPTION "lease and warranty data of this computer for Prometheus
A timer and a service that write start and end of leases and warranties, asset
identification and agent identity for the textfile collector of
prometheus-node-exporter.")
# Only suggested, because node_exporter listens on the network.
set(CPACK_DEBIAN_METRICS_PACKAGE_SUGGESTS prometheus-node-exporter)

law_package(report lease-warranty-report
    DOCUMENTS lease-warranty-report.md
    DEPENDS "${needs_common}"
    DESCRIPTION "report on the leases and warranties of many computers
The command lease-warranty-report reads Ansible's facts cache, or JSON that
lease-warranty-export wrote on each computer, and writes one HTML page: a time
line of end dates, a table to sort and filter, and computers without data.")
