#include "PpmWriter.h"

#include "OutputFile.h"

#include <string>
#include <vector>

namespace host {

void writePpm(OutputFile& file, const PictureView& picture) {
    file.write("P6\n" + std::to_string(picture.width) + ' ' + std::to_string(picture.height) + "\n255\n");
    std::vector<unsigned char> row(size_t{picture.width} * 3);
    for (uint32_t y = 0; y < picture.height; ++y) {
        const unsigned char* pixel = picture.row(y);
        for (size_t i = 0; i < row.size(); i += 3, pixel += 4) {
            row[i] = pixel[0];
            row[i + 1] = pixel[1];
            row[i + 2] = pixel[2];
        }
        file.write(row.data(), row.size());
    }
}

} // namespace host
