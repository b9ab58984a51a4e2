// As little as a logging layer of another make may offer: what the provider needs beyond it shows
// here.
#include "ZBMessageBuffer.h"

namespace ZBLog {

ZBMessageBuffer::ZBMessageBuffer() : std::ostream(nullptr) {
    rdbuf(&gathered_);
}

ZBMessageBuffer::~ZBMessageBuffer() = default;

ZBMessageBuffer& ZBMessageBuffer::operator<<(const char* text) {
    static_cast<std::ostream&>(*this) << text;
    return *this;
}

std::string ZBMessageBuffer::str(ZBMessageBuffer& inserted) {
    return str(static_cast<std::ostream&>(inserted));
}

std::string ZBMessageBuffer::str(std::ostream&) {
    std::string text = gathered_.str();
    gathered_.str("");
    return text;
}

}  // namespace ZBLog
