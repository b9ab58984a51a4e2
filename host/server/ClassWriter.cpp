// Constants of the MOF are written as values of instances are. An element that is NULL is left out
// of its list, as the schema does when it counts the entries of ValueMap and Values.
#include "host/server/ClassWriter.h"

#include <algorithm>
#include <iterator>

#include "base/Ascii.h"
#include "host/server/CimError.h"
#include "host/server/ElementWriter.h"

namespace cmpihost::server {

namespace {

bool isReal(mof::Type type) {
    return type == mof::Type::Real32 || type == mof::Type::Real64;
}

/// A constant in a type that it fits. How wide an integer is makes no difference to its digits.
struct ConstantValue {
    mof::Type type;

    Value operator()(std::monostate) const { return {}; }
    Value operator()(bool constant) const { return Value::fromBoolean(constant); }
    Value operator()(std::uint64_t constant) const {
        return isReal(type) ? real(static_cast<double>(constant)) : Value::fromUnsigned(constant);
    }
    Value operator()(std::int64_t constant) const {
        return isReal(type) ? real(static_cast<double>(constant)) : Value::fromSigned(constant);
    }
    Value operator()(double constant) const { return real(constant); }
    Value operator()(mof::Character constant) const {
        return Value::fromUnsigned(constant.code, CMPI_char16);
    }
    Value operator()(const std::string& constant) const { return Value(constant); }

  private:
    Value real(double number) const {
        return Value::fromReal(number, type == mof::Type::Real32 ? CMPI_real32 : CMPI_real64);
    }
};

/// VALUE or VALUE.ARRAY; nothing for NULL.
void writeInitializer(std::string& xml, const mof::Initializer& initializer, mof::Type type,
                      bool array) {
    if (array) xml += "<VALUE.ARRAY>";
    for (const mof::Scalar& item : initializer.items)
        writeValue(xml, std::visit(ConstantValue{type}, item), {});
    if (array) xml += "</VALUE.ARRAY>";
}

bool isNullConstant(const mof::Initializer& initializer) {
    return !initializer.array && initializer.items.size() == 1 &&
           std::holds_alternative<std::monostate>(initializer.items.front());
}

/// The type that a constant has by itself.
mof::Type typeOfConstant(const mof::Scalar& constant) {
    switch (constant.index()) {
        case 1:
            return mof::Type::Boolean;
        case 2:
            return mof::fits(constant, mof::Type::UInt32) ? mof::Type::UInt32 : mof::Type::UInt64;
        case 3:
            return mof::fits(constant, mof::Type::SInt32) ? mof::Type::SInt32 : mof::Type::SInt64;
        case 4:
            return mof::Type::Real64;
        case 5:
            return mof::Type::Char16;
        default:
            return mof::Type::String;
    }
}

/// The type that the MOF declares for a qualifier, unless its constants are of another one.
mof::Type typeOf(const mof::Qualifier& qualifier, const mof::QualifierType* declared) {
    if (!qualifier.value) return declared == nullptr ? mof::Type::Boolean : declared->type;
    const std::vector<mof::Scalar>& items = qualifier.value->items;
    const bool fitting =
        declared != nullptr && std::all_of(items.begin(), items.end(), [&](const auto& item) {
            return mof::fits(item, declared->type);
        });
    if (fitting) return declared->type;
    return items.empty() ? mof::Type::String : typeOfConstant(items.front());
}

void writeFlavors(std::string& xml, const Inheritance& inheritance, bool translatable) {
    if (!inheritance.overridable) xml += " OVERRIDABLE=\"false\"";
    if (!inheritance.toSubclass) xml += " TOSUBCLASS=\"false\"";
    if (translatable) xml += " TRANSLATABLE=\"true\"";
}

std::size_t entries(const mof::Qualifier& qualifier) {
    const auto& items = qualifier.value->items;
    return static_cast<std::size_t>(std::count_if(
        items.begin(), items.end(),
        [](const mof::Scalar& item) { return !std::holds_alternative<std::monostate>(item); }));
}

/// Writes the members of one class.
class MembersWriter {
  public:
    MembersWriter(std::string& xml, const mof::Class& owner, const QualifierTypes& types,
                  const ClassView& view)
        : xml_(xml), owner_(owner), types_(types), view_(view) {}

    void writeQualifiers(const std::vector<ResolvedQualifier>& qualifiers) const {
        if (!view_.qualifiers) return;
        const bool misfit = valueNamesMisfit(qualifiers);
        for (const ResolvedQualifier& each : qualifiers) {
            if (!shows(each.from)) continue;
            if (misfit && base::equalsIgnoreCase(each.declared->name, "Values")) continue;
            writeQualifier(each);
        }
    }

    void writeProperty(const ResolvedFeature& property) const {
        if (!shows(property.from) || !isListed(property.declared->name)) return;
        const mof::Feature& declared = *property.declared;
        const bool reference = declared.type == mof::Type::Reference;
        const char* const tag = reference        ? "PROPERTY.REFERENCE"
                                : declared.array ? "PROPERTY.ARRAY"
                                                 : "PROPERTY";
        beginFeature(tag, declared);
        writeOrigin(property);
        xml_ += '>';
        writeQualifiers(property.qualifiers);
        const mof::Initializer* const value = property.defaultValue;
        if (value != nullptr && !reference && !isNullConstant(*value))
            writeInitializer(xml_, *value, declared.type, declared.array);
        end(tag);
    }

    void writeMethod(const ResolvedMethod& method) const {
        if (!shows(method.result.from)) return;
        beginFeature("METHOD", *method.result.declared);
        writeOrigin(method.result);
        xml_ += '>';
        writeQualifiers(method.result.qualifiers);
        for (const ResolvedFeature& parameter : method.parameters) writeParameter(parameter);
        end("METHOD");
    }

  private:
    bool shows(const mof::Class* from) const { return !view_.localOnly || from == &owner_; }

    bool isListed(const std::string& name) const {
        return !view_.properties ||
               std::any_of(view_.properties->begin(), view_.properties->end(),
                           [&](const auto& each) { return base::equalsIgnoreCase(each, name); });
    }

    /// Whether the numbers and the names of values are of different lengths, as they may be where
    /// the schema does not look at them. Names without a number mean nothing, and clients choke.
    static bool valueNamesMisfit(const std::vector<ResolvedQualifier>& qualifiers) {
        const mof::Qualifier* const numbers = findQualifier(qualifiers, "ValueMap");
        const mof::Qualifier* const names = findQualifier(qualifiers, "Values");
        return numbers != nullptr && names != nullptr && numbers->value && names->value &&
               entries(*numbers) != entries(*names);
    }

    void writeQualifier(const ResolvedQualifier& qualifier) const {
        const mof::Qualifier& declared = *qualifier.declared;
        const mof::QualifierType* const known = types_.find(declared.name);
        const mof::Type type = typeOf(declared, known);
        xml_ += "<QUALIFIER";
        writeAttribute(xml_, "NAME", declared.name);
        writeAttribute(xml_, "TYPE", mof::nameOf(type));
        if (qualifier.from != &owner_) xml_ += " PROPAGATED=\"true\"";
        writeFlavors(xml_, qualifier.inheritance, types_.isTranslatable(declared));
        xml_ += '>';
        if (declared.value) {
            if (!isNullConstant(*declared.value))
                writeInitializer(xml_, *declared.value, type, declared.value->array);
        } else if (type == mof::Type::Boolean) {
            xml_ += "<VALUE>TRUE</VALUE>";
        }
        end("QUALIFIER");
    }

    void writeParameter(const ResolvedFeature& parameter) const {
        const mof::Feature& declared = *parameter.declared;
        const bool reference = declared.type == mof::Type::Reference;
        const char* const tag = reference && declared.array ? "PARAMETER.REFARRAY"
                                : reference                 ? "PARAMETER.REFERENCE"
                                : declared.array            ? "PARAMETER.ARRAY"
                                                            : "PARAMETER";
        beginFeature(tag, declared);
        xml_ += '>';
        writeQualifiers(parameter.qualifiers);
        end(tag);
    }

    void beginFeature(const char* tag, const mof::Feature& declared) const {
        xml_ += '<';
        xml_ += tag;
        writeAttribute(xml_, "NAME", declared.name);
        if (declared.type == mof::Type::Reference) {
            writeAttribute(xml_, "REFERENCECLASS", declared.referenceClass);
        } else {
            writeAttribute(xml_, "TYPE", mof::nameOf(declared.type));
        }
    }

    void writeOrigin(const ResolvedFeature& feature) const {
        if (view_.classOrigin) writeAttribute(xml_, "CLASSORIGIN", feature.origin->name);
        if (feature.from != &owner_) xml_ += " PROPAGATED=\"true\"";
    }

    void end(const char* tag) const {
        xml_ += "</";
        xml_ += tag;
        xml_ += '>';
    }

    std::string& xml_;
    const mof::Class& owner_;
    const QualifierTypes& types_;
    const ClassView& view_;
};

struct ScopeRow {
    const char* word;
    const char* attribute;
};
constexpr ScopeRow scopeRows[] = {
    {"class", " CLASS=\"true\""},          {"association", " ASSOCIATION=\"true\""},
    {"reference", " REFERENCE=\"true\""},  {"property", " PROPERTY=\"true\""},
    {"method", " METHOD=\"true\""},        {"parameter", " PARAMETER=\"true\""},
    {"indication", " INDICATION=\"true\""}};

void writeScope(std::string& xml, const std::vector<std::string>& scopes) {
    const auto has = [&](std::string_view word) {
        return std::any_of(scopes.begin(), scopes.end(),
                           [&](const auto& each) { return base::equalsIgnoreCase(each, word); });
    };
    xml += "<SCOPE";
    for (const ScopeRow& row : scopeRows)
        if (has("any") || has(row.word)) xml += row.attribute;
    xml += "></SCOPE>";
}

}  // namespace

void checkClassBytes(std::size_t bytes, const std::string& instead) {
    constexpr std::size_t most = 4U << 20U;
    if (bytes > most)
        throw CimError(
            cimServerLimitsExceeded,
            "these classes are more than the server sends at once, 4 MiB; ask for " + instead);
}

void writeClass(std::string& xml, const ResolvedClass& described, const QualifierTypes& types,
                const ClassView& view) {
    const mof::Class& declared = *described.declared;
    xml += "<CLASS";
    writeAttribute(xml, "NAME", declared.name);
    if (!declared.superclass.empty()) writeAttribute(xml, "SUPERCLASS", declared.superclass);
    xml += '>';
    const MembersWriter members(xml, declared, types, view);
    members.writeQualifiers(described.qualifiers);
    for (const ResolvedFeature& property : described.properties) members.writeProperty(property);
    for (const ResolvedMethod& method : described.methods) members.writeMethod(method);
    xml += "</CLASS>";
}

void writeQualifierDeclaration(std::string& xml, const mof::QualifierType& type) {
    xml += "<QUALIFIER.DECLARATION";
    writeAttribute(xml, "NAME", type.name);
    writeAttribute(xml, "TYPE", mof::nameOf(type.type));
    writeAttribute(xml, "ISARRAY", type.array ? "true" : "false");
    writeFlavors(xml,
                 {type.flavor.toSubclass.value_or(true), type.flavor.overridable.value_or(true)},
                 type.flavor.translatable);
    xml += '>';
    writeScope(xml, type.scopes);
    if (type.defaultValue && !isNullConstant(*type.defaultValue))
        writeInitializer(xml, *type.defaultValue, type.type, type.array);
    xml += "</QUALIFIER.DECLARATION>";
}

}  // namespace cmpihost::server
