// Keys as a broker may hand them out: with any state, any status, and no name. All that reads keys
// takes the same ones for absent.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "ProviderUtilities.h"

namespace {

using Utilities = VA::ProviderUtilities;

/// What the one key of a path is to its broker; hdl of the path.
struct Key {
    CMPIData data;
    CMPIrc rc;
    CMPIString* name;
};

CMPIData tell(const CMPIObjectPath* self, CMPIStatus* status) {
    const Key& key = *static_cast<const Key*>(self->hdl);
    *status = {key.rc, nullptr};
    return key.data;
}

/// What a broker answers when it is asked for an instance; hdl of the broker.
struct NewInstance {
    CMPIInstance* instance;
    CMPIrc rc;
};

class Keys : public testing::Test {
  protected:
    Keys() {
        strings.getCharPtr = [](const CMPIString* self, CMPIStatus*) {
            return static_cast<const char*>(self->hdl);
        };
        paths.getKey = [](const CMPIObjectPath* self, const char*, CMPIStatus* status) {
            return tell(self, status);
        };
        paths.getKeyAt = [](const CMPIObjectPath* self, CMPICount, CMPIString** given,
                            CMPIStatus* status) {
            *given = static_cast<const Key*>(self->hdl)->name;
            return tell(self, status);
        };
        paths.getKeyCount = [](const CMPIObjectPath*, CMPIStatus*) { return CMPICount{1}; };
        instances.setProperty = [](const CMPIInstance* self, const char* given, const CMPIValue*,
                                   CMPIType) {
            static_cast<std::vector<std::string>*>(self->hdl)->push_back(given);
            return CMPIStatus{CMPI_RC_OK, nullptr};
        };
        services.newInstance = [](const CMPIBroker* self, const CMPIObjectPath*,
                                  CMPIStatus* status) {
            const NewInstance& answer = *static_cast<const NewInstance*>(self->hdl);
            *status = {answer.rc, nullptr};
            return answer.instance;
        };
    }

    /// The ways in which the key is read: as a text or a reference by its name, by the index into
    /// a moniker, and by the index into a new instance.
    std::string readers() {
        std::string found;
        std::string text = "untouched";
        if (Utilities::getKeyProperty(&path, "k", text)) found += "text ";
        EXPECT_EQ(text, found.empty() ? "untouched" : "v");
        const CMPIObjectPath* reference = nullptr;
        if (Utilities::getKeyProperty(&path, "k", &reference)) found += "reference ";
        EXPECT_EQ(reference != nullptr, found == "reference ");
        VA::Moniker moniker;
        Utilities::transformObjectPathToMoniker(&path, moniker);
        for (unsigned int keys = moniker.getKeyCount(); keys > 0; --keys) found += "moniker ";
        properties.clear();
        EXPECT_EQ(Utilities::createInstance(&broker, &path), &instance);
        for (const std::string& property : properties) found += "property " + property;
        return found;
    }

    void setText() {
        key.data.type = CMPI_string;
        key.data.value.string = &value;
    }
    void setReference() {
        key.data.type = CMPI_ref;
        key.data.value.ref = &path;
    }
    void expectAbsent(const char* why) {
        setText();
        EXPECT_EQ(readers(), "") << why;
        setReference();
        EXPECT_EQ(readers(), "") << why;
    }

    CMPIStringFT strings = {};
    CMPIObjectPathFT paths = {};
    CMPIInstanceFT instances = {};
    char nameText[2] = "k";
    char valueText[2] = "v";
    CMPIString name = {nameText, &strings};
    CMPIString value = {valueText, &strings};
    Key key = {{}, CMPI_RC_OK, &name};
    CMPIObjectPath path = {&key, &paths};
    std::vector<std::string> properties;
    CMPIInstance instance = {&properties, &instances};
    CMPIBrokerEncFT services = {};
    NewInstance made = {&instance, CMPI_RC_OK};
    CMPIBroker broker = {&made, nullptr, &services, nullptr, nullptr};
};

TEST_F(Keys, WithAValueAreReadInEveryWay) {
    for (const int state : {CMPI_goodValue, CMPI_keyValue}) {
        key.data.state = static_cast<CMPIValueState>(state);
        setText();
        EXPECT_EQ(readers(), "text moniker property k");
        setReference();
        EXPECT_EQ(readers(), "reference property k");
    }
}

TEST_F(Keys, InAStateWithoutAValueAreReadInNone) {
    for (const int state : {CMPI_nullValue, CMPI_notFound, CMPI_badValue}) {
        for (const int mark : {CMPI_goodValue, CMPI_keyValue}) {
            key.data.state = static_cast<CMPIValueState>(state | mark);
            expectAbsent(std::to_string(key.data.state).c_str());
        }
    }
}

TEST_F(Keys, ThatTheBrokerFailsToGiveAreReadInNone) {
    for (const CMPIrc rc :
         {CMPI_RC_ERR_FAILED, CMPI_RC_ERR_NOT_FOUND, CMPI_RC_ERR_NO_SUCH_PROPERTY}) {
        key.rc = rc;
        expectAbsent(std::to_string(rc).c_str());
    }
}

TEST_F(Keys, WithoutANameAreNotReadByTheirIndex) {
    CMPIString nothing = {nullptr, &strings};
    for (CMPIString* none : {static_cast<CMPIString*>(nullptr), &nothing}) {
        key.name = none;
        setText();
        EXPECT_EQ(readers(), "text ");
    }
}

TEST_F(Keys, AreNotSetOnAnInstanceThatComesWithAnError) {
    setText();
    made.rc = CMPI_RC_ERR_FAILED;
    EXPECT_EQ(Utilities::createInstance(&broker, &path), nullptr);
    EXPECT_TRUE(properties.empty());
}

TEST_F(Keys, WithANullPointerForAValueHaveNoTextAndAreNoReference) {
    for (const int type : {CMPI_string, CMPI_chars, CMPI_dateTime, CMPI_ref}) {
        key.data = {};
        key.data.type = static_cast<CMPIType>(type);
        std::string text;
        const CMPIObjectPath* reference = nullptr;
        EXPECT_FALSE(Utilities::getKeyProperty(&path, "k", text)) << type;
        EXPECT_FALSE(Utilities::getKeyProperty(&path, "k", &reference)) << type;
    }
}

}  // namespace
