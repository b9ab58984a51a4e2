#ifndef HOST_SERVER_BASIC_CREDENTIALS_H
#define HOST_SERVER_BASIC_CREDENTIALS_H

#include <optional>
#include <string>
#include <string_view>

namespace cmpihost::server {

/// A name with its password, which is wiped out of memory at the end of the object's life.
struct BasicCredentials {
    BasicCredentials(std::string_view theName, std::string_view thePassword);
    ~BasicCredentials();
    BasicCredentials(BasicCredentials&& other) noexcept;
    BasicCredentials& operator=(BasicCredentials&&) = delete;

    std::string name;
    std::string password;
};

/// Reads the value of a header Authorization of the scheme Basic. None: it is of another scheme, is
/// longer than any honest one (512 bytes), is not base64 in its strict form, or holds no colon, no
/// name or a control character.
std::optional<BasicCredentials> readBasicCredentials(std::string_view header);

}  // namespace cmpihost::server

#endif
