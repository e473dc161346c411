/// A result of the management library while it is being made.
///
///     Result result(1);
///     result.addObject(classType);
///     result.put("Name", "7*1111-AAA*0000001");
///     return result.release();
///
/// For one thread.
#ifndef APPLIANCE_RESULT_H
#define APPLIANCE_RESULT_H

#include <cstddef>
#include <string>

#include "libapi.h"

namespace appliance {

class Result {
public:
    /// @param most  how many objects there may be
    /// @throws std::bad_alloc
    explicit Result(std::size_t most = 0);
    ~Result();
    Result(const Result&) = delete;
    Result& operator=(const Result&) = delete;

    /// Begins the next object, of which there are not more than @p most.
    void addObject(int classType);

    /// A property of the object begun last.
    /// @throws std::length_error the record has no room for it
    void put(const std::string& key, const std::string& value);

    /// Hands the result over to who calls free().
    apiProp* release(int rc = API_SUCCESS);

    static void free(apiProp* header);

private:
    apiProp* m_header;
};

}  // namespace appliance

#endif
