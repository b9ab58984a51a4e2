#ifndef ZBLOG_ZBMESSAGEBUFFER_H
#define ZBLOG_ZBMESSAGEBUFFER_H

#include <ostream>
#include <string>
#include <type_traits>

namespace ZBLog {

/// Gathers the text of one record:
///
///     ZBMessageBuffer buffer;
///     use(buffer.str(buffer << "some text"));
///     use(buffer.str(buffer << " path=" << path));
///
/// Taking the text empties the buffer, so that it can gather the next one. One object serves one
/// thread. Construction and insertion may throw std::bad_alloc.
class __attribute__((visibility("default"))) ZBMessageBuffer {
  public:
    ZBMessageBuffer();
    ~ZBMessageBuffer();
    ZBMessageBuffer(const ZBMessageBuffer&) = delete;
    ZBMessageBuffer& operator=(const ZBMessageBuffer&) = delete;

    /// Appends `text`; null appends nothing.
    ZBMessageBuffer& operator<<(const char* text);

    /// The buffer as an output stream, for all that is not plain text. It lives as long as the
    /// buffer and appends to the same text.
    operator std::ostream&();

    /// Takes the text gathered so far. The argument is what the insertions return; it is there so
    /// that they come first. The text is valid until the next call of str on this buffer, or the
    /// buffer's end.
    const std::string& str(ZBMessageBuffer& inserted);
    const std::string& str(std::ostream& inserted);

  private:
    class MessageStream;
    MessageStream* stream_;
};

/// Inserts the address, not the content, of an object, as streams print pointers.
template <class Object,
          std::enable_if_t<!std::is_same_v<std::remove_cv_t<Object>, char>, bool> = true>
inline std::ostream& operator<<(ZBMessageBuffer& buffer, Object* pointer) {
    return static_cast<std::ostream&>(buffer) << static_cast<const void*>(pointer);
}

}  // namespace ZBLog

#endif
