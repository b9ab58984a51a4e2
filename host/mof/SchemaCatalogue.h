#pragma once

#include <map>
#include <string>
#include <string_view>

#include "host/broker/ClassCatalogue.h"
#include "host/mof/Schema.h"

namespace cmpihost {

/// A schema as the broker asks for it. Takes what it needs when it is made, so the schema may go.
class SchemaCatalogue final : public ClassCatalogue {
  public:
    explicit SchemaCatalogue(const Schema& schema);

    const ClassDeclaration* find(std::string_view className) const override;

  private:
    std::map<std::string, ClassDeclaration> declarations_;
};

/// The CMPI type of a declared property, with CMPI_ARRAY for an array.
CMPIType cmpiType(const mof::Feature& property);

}  // namespace cmpihost
