#ifndef TESTS_SUPPORT_COMPUTER_SYSTEM_SERVICE_H
#define TESTS_SUPPORT_COMPUTER_SYSTEM_SERVICE_H

#include "host/broker/Broker.h"

#include <string>
#include <vector>

/// The computer systems that another provider of the same object manager would serve.
namespace cmpihost {

/// Serves instances of KORVA_ComputerSystem with the keys Name and CreationClassName. Settings are
/// changed only while no request runs; requests may run on several threads at once.
class ComputerSystemService final : public UpcallService {
  public:
    static constexpr const char* className = "KORVA_ComputerSystem";

    /// One computer system of that name.
    explicit ComputerSystemService(std::string hostName);
    /// One computer system a name; none is fine.
    explicit ComputerSystemService(std::vector<std::string> names);

    void setNames(std::vector<std::string> names);
    /// Every enumeration fails with `rc`; CMPI_RC_OK: none does.
    void failEnumerations(CMPIrc rc);
    /// The k-th getNext (from 1) of every enumeration fails with `rc`; 0: none does.
    void failAtNext(unsigned k, CMPIrc rc = CMPI_RC_ERR_FAILED);

    UpcallAnswer perform(Broker& broker, const OperationRequest& request) override;

  private:
    UpcallAnswer enumerate(const OperationRequest& request) const;
    UpcallAnswer find(const OperationRequest& request) const;

    std::vector<std::string> names_;
    CMPIrc enumerationRc_ = CMPI_RC_OK;
    unsigned failAt_ = 0;
    CMPIrc failRc_ = CMPI_RC_ERR_FAILED;
};

}  // namespace cmpihost

#endif
