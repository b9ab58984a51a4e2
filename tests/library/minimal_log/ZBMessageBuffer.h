#ifndef MINIMAL_LOG_ZBMESSAGEBUFFER_H
#define MINIMAL_LOG_ZBMESSAGEBUFFER_H

#include <ostream>
#include <sstream>
#include <string>

namespace ZBLog {

/// Unlike the framework's: it is an output stream instead of having one, inserts no pointers by
/// itself, and gives its text away.
class ZBMessageBuffer : public std::ostream {
  public:
    ZBMessageBuffer();
    ~ZBMessageBuffer() override;

    ZBMessageBuffer& operator<<(const char* text);
    std::string str(ZBMessageBuffer&);
    std::string str(std::ostream&);

  private:
    std::stringbuf gathered_;
};

}  // namespace ZBLog

#endif
