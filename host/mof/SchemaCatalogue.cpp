#include "host/mof/SchemaCatalogue.h"

#include "host/mof/Names.h"

namespace cmpihost {

namespace {

CMPIType elementType(mof::Type type) {
    switch (type) {
        case mof::Type::Boolean:
            return CMPI_boolean;
        case mof::Type::String:
            return CMPI_string;
        case mof::Type::Char16:
            return CMPI_char16;
        case mof::Type::DateTime:
            return CMPI_dateTime;
        case mof::Type::UInt8:
            return CMPI_uint8;
        case mof::Type::SInt8:
            return CMPI_sint8;
        case mof::Type::UInt16:
            return CMPI_uint16;
        case mof::Type::SInt16:
            return CMPI_sint16;
        case mof::Type::UInt32:
            return CMPI_uint32;
        case mof::Type::SInt32:
            return CMPI_sint32;
        case mof::Type::UInt64:
            return CMPI_uint64;
        case mof::Type::SInt64:
            return CMPI_sint64;
        case mof::Type::Real32:
            return CMPI_real32;
        case mof::Type::Real64:
            return CMPI_real64;
        case mof::Type::Reference:
            return CMPI_ref;
    }
    return CMPI_null;
}

ClassDeclaration declarationOf(const Schema& schema, const mof::Class& source) {
    ClassDeclaration result;
    result.name = source.name;
    result.superclass = source.superclass;
    result.association = schema.isAssociation(source.name);
    for (const mof::Feature* property : schema.properties(source.name)) {
        result.properties.push_back({property->name, cmpiType(*property),
                                     schema.isKey(source.name, property->name),
                                     property->referenceClass});
    }
    return result;
}

}  // namespace

CMPIType cmpiType(const mof::Feature& property) {
    const CMPIType type = elementType(property.type);
    return property.array ? static_cast<CMPIType>(type | CMPI_ARRAY) : type;
}

SchemaCatalogue::SchemaCatalogue(const Schema& schema) {
    for (const std::string& name : schema.classNames()) {
        declarations_.emplace(lowered(name), declarationOf(schema, *schema.find(name)));
    }
}

const ClassDeclaration* SchemaCatalogue::find(std::string_view className) const {
    const auto found = declarations_.find(lowered(className));
    return found == declarations_.end() ? nullptr : &found->second;
}

}  // namespace cmpihost
