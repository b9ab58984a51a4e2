#include "host/cli/Json.h"
#include "host/cli/Printer.h"

namespace cmpihost {

namespace {

class JsonPrinter final : public Printer {
  public:
    JsonPrinter(std::ostream& stream, const Schema& schema) : stream_(stream), schema_(schema) {}

    void print(const std::vector<InstanceValue>& instances) override {
        JsonValue list = JsonValue::array();
        for (const InstanceValue& instance : instances) {
            list.push_back(instanceJson(instance, schema_));
        }
        writeJson(list, stream_);
    }

    void print(const std::vector<ObjectPathValue>& paths) override {
        JsonValue list = JsonValue::array();
        for (const ObjectPathValue& path : paths) list.push_back(pathJson(path, schema_));
        writeJson(list, stream_);
    }

  private:
    std::ostream& stream_;
    const Schema& schema_;
};

}  // namespace

std::unique_ptr<Printer> makeJsonPrinter(std::ostream& stream, const Schema& schema) {
    return std::make_unique<JsonPrinter>(stream, schema);
}

}  // namespace cmpihost
