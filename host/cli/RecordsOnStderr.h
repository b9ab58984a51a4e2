#pragma once

namespace cmpihost {

/// Makes the provider's logging library write every record to the standard error of this process,
/// by a configuration that it finds in the environment. To be made before the library is loaded;
/// the configuration stays readable, and the variable ZBLOG_CONF set, until the object goes.
/// Not for use by several threads, as the environment is not.
class RecordsOnStderr {
  public:
    /// Throws std::system_error.
    RecordsOnStderr();
    ~RecordsOnStderr();
    RecordsOnStderr(const RecordsOnStderr&) = delete;
    RecordsOnStderr& operator=(const RecordsOnStderr&) = delete;

  private:
    int descriptor_;
};

}  // namespace cmpihost
